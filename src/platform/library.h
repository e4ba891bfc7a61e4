// A shared library opened by path, as a host program opens the extension module, and
// the few other things a host program does differently on each system. One
// implementation per system (library_posix.cpp, library_windows.cpp); target
// quorrel_library, which only host programs link, never the module.
#pragma once

#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>

namespace quorrel::platform {

class Library {
 public:
  // Opens the library at `path`; a bare file name means the current folder, never the
  // system's search path. Throws std::runtime_error with the loader's reason, in the
  // same words on every system for a missing file.
  static Library open(const std::string& path);
  // This program and what it links in (POSIX only; throws elsewhere).
  static Library self();
  // The library that holds the system's menu services (GetMenuItemCount and its
  // kind), where the system has them; elsewhere the module brings its own.
  static std::optional<Library> systemMenus();

  Library(Library&& other) noexcept;
  Library& operator=(Library&& other) = delete;
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;
  ~Library();

  // Null when the library does not export it.
  void* symbol(const char* name) const;
  // An entry point as a host on this system finds it: on Windows by its ordinal, where
  // the name must lead to the same function; elsewhere by name. Null when missing.
  void* entryPoint(const char* name, uint16_t ordinal) const;

 private:
  explicit Library(void* handle) : handle_(handle) {}
  void* handle_;
};

// The running program's own file; empty when the system does not say.
std::string programPath();
// The module's file name on this system.
extern const char* const kModuleFileName;

// Standard streams carry bytes unchanged (no CR LF translation), and standard output is
// buffered wherever it is no terminal.
void prepareStandardStreams();

// Whether standard output failed because its reader went away (a pipe closed by `head`
// or `more`), which is no fault of the program's; `error` is the errno of the failure.
// Windows has no EPIPE for it: its C library keeps the system's own reason.
bool standardOutputReaderGone(int error);

// 32-bit Windows hosts call every routine stdcall: the routine removes its own
// arguments. callStdcall pushes three words, calls `routine` and tells how many bytes
// it left on the stack, which a plain C++ call would hide. Defined only where
// kRoutinesAreStdcall holds.
#if defined(_WIN32) && defined(__i386__)
inline constexpr bool kRoutinesAreStdcall = true;
#else
inline constexpr bool kRoutinesAreStdcall = false;
#endif
uint32_t callStdcall(const void* routine, uint32_t first, uint32_t second, uint32_t third,
                     uint32_t* bytesLeft);

}  // namespace quorrel::platform
