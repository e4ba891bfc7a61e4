#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#include <fcntl.h>
#include <io.h>
#include <windows.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <utility>

#include "platform/library.h"

namespace quorrel::platform {

const char* const kModuleFileName = "quorrel.dll";

Library Library::open(const std::string& path) {
  // A bare file name would make LoadLibrary search the system folders instead.
  const std::string usable = path.find_first_of("/\\") == std::string::npos ? "./" + path : path;
  std::string native = usable;
  std::replace(native.begin(), native.end(), '/', '\\');
  HMODULE handle = LoadLibraryA(native.c_str());
  if (!handle) {
    const DWORD code = GetLastError();
    // The dynamic loader's words on Linux, so that output does not depend on the system.
    throw std::runtime_error(
        code == ERROR_MOD_NOT_FOUND || code == ERROR_FILE_NOT_FOUND || code == ERROR_PATH_NOT_FOUND
            ? usable + ": cannot open shared object file: No such file or directory"
            : usable + ": Windows error " + std::to_string(code));
  }
  return Library(handle);
}

Library Library::self() {
  throw std::runtime_error("a program cannot open itself as a library here");
}

std::optional<Library> Library::systemMenus() {
  return Library::open("user32.dll");
}

Library::Library(Library&& other) noexcept : handle_(std::exchange(other.handle_, nullptr)) {}

Library::~Library() {
  if (handle_) FreeLibrary(static_cast<HMODULE>(handle_));
}

void* Library::symbol(const char* name) const {
  return reinterpret_cast<void*>(GetProcAddress(static_cast<HMODULE>(handle_), name));
}

void* Library::entryPoint(const char* name, uint16_t ordinal) const {
  void* byOrdinal = reinterpret_cast<void*>(
      GetProcAddress(static_cast<HMODULE>(handle_), MAKEINTRESOURCEA(ordinal)));
  return byOrdinal == symbol(name) ? byOrdinal : nullptr;
}

std::string programPath() {
  char self[MAX_PATH] = {};
  const DWORD length = GetModuleFileNameA(nullptr, self, sizeof self);
  return length == 0 || length >= sizeof self ? std::string() : std::string(self, length);
}

void prepareStandardStreams() {
  for (FILE* stream : {stdin, stdout, stderr}) _setmode(_fileno(stream), _O_BINARY);
  // The C library writes any character device a byte at a time, the NUL device too, so
  // `quorrel run x.qs > NUL` cost a system call per byte. A console stays unbuffered.
  const HANDLE out = GetStdHandle(STD_OUTPUT_HANDLE);
  DWORD mode = 0;
  if (GetFileType(out) == FILE_TYPE_CHAR && GetConsoleMode(out, &mode) == 0) {
    std::setvbuf(stdout, nullptr, _IOFBF, BUFSIZ);
  }
}

bool standardOutputReaderGone(int error) {
  if (error == EPIPE) return true;
  // The C library maps only some of the system's words for a closed pipe to EPIPE (Wine
  // reports one it leaves as EINVAL), but it keeps the system's code of its last failure.
  switch (_doserrno) {
    case ERROR_BROKEN_PIPE:
    case ERROR_NO_DATA:
    case ERROR_PIPE_NOT_CONNECTED:
      return GetFileType(GetStdHandle(STD_OUTPUT_HANDLE)) == FILE_TYPE_PIPE;
    default:
      return false;
  }
}

}  // namespace quorrel::platform

#if defined(__i386__)
// cdecl, so that its own arguments are the caller's to remove; the routine's three words
// are pushed here and whatever it leaves is measured against the saved stack pointer.
extern "C" uint32_t quorrelCallStdcall(const void* routine, uint32_t first, uint32_t second,
                                       uint32_t third, uint32_t* bytesLeft);
asm(R"(
  .text
  .globl _quorrelCallStdcall
_quorrelCallStdcall:
  pushl %ebp
  movl %esp, %ebp
  pushl %esi
  movl %esp, %esi
  pushl 20(%ebp)
  pushl 16(%ebp)
  pushl 12(%ebp)
  call *8(%ebp)
  movl %esi, %ecx
  subl %esp, %ecx
  movl 24(%ebp), %edx
  movl %ecx, (%edx)
  movl %esi, %esp
  popl %esi
  popl %ebp
  ret
)");

uint32_t quorrel::platform::callStdcall(const void* routine, uint32_t first, uint32_t second,
                                        uint32_t third, uint32_t* bytesLeft) {
  return quorrelCallStdcall(routine, first, second, third, bytesLeft);
}
#endif
