#include <dlfcn.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <utility>

#include "platform/library.h"

namespace quorrel::platform {

const char* const kModuleFileName = "libquorrel.so";

Library Library::open(const std::string& path) {
  // A bare file name would make dlopen search the library path instead of using it.
  const std::string usable = path.find('/') == std::string::npos ? "./" + path : path;
  void* handle = dlopen(usable.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (!handle) throw std::runtime_error(dlerror());
  return Library(handle);
}

Library Library::self() {
  void* handle = dlopen(nullptr, RTLD_NOW);
  if (!handle) throw std::runtime_error(dlerror());
  return Library(handle);
}

std::optional<Library> Library::systemMenus() {
  return std::nullopt;
}

Library::Library(Library&& other) noexcept : handle_(std::exchange(other.handle_, nullptr)) {}

Library::~Library() {
  if (handle_) dlclose(handle_);
}

void* Library::symbol(const char* name) const {
  return dlsym(handle_, name);
}

void* Library::entryPoint(const char* name, uint16_t) const {
  return symbol(name);
}

std::string programPath() {
  std::error_code error;
  const std::filesystem::path self = std::filesystem::read_symlink("/proc/self/exe", error);
  return error ? std::string() : self.string();
}

void prepareStandardStreams() {}

bool standardOutputReaderGone(int error) {
  if (error == EPIPE) return true;
  // The failed write's errno may have been overwritten since: a pipe without a reader
  // polls as an error.
  struct stat status {};
  if (fstat(STDOUT_FILENO, &status) != 0 || !S_ISFIFO(status.st_mode)) return false;
  pollfd out{STDOUT_FILENO, 0, 0};
  return poll(&out, 1, 0) == 1 && (out.revents & POLLERR) != 0;
}

}  // namespace quorrel::platform
