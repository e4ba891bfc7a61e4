// The system calls under FileHandle and SaveFile, one implementation per system
// (files_posix.cpp, files_windows.cpp). Descriptors are the C runtime's on every system.
#pragma once

#include <cstddef>
#include <cstdint>

namespace quorrel::file_system {

enum class OpenFor { Reading, Truncating, Appending, Rewriting };
enum class Kind { Regular, Pipe, Directory, Other };

// A descriptor, or -1 (errno says why); retries interrupts. Reading opens without
// blocking on a pipe that has no writer yet; readable() then makes reads block again.
int open(const char* path, OpenFor mode);
bool readable(int fd);
int close(int fd);
int sync(int fd);
// At most a gigabyte per call: the counts of some systems' calls are 32-bit.
std::ptrdiff_t read(int fd, char* into, std::size_t count);
std::ptrdiff_t write(int fd, const char* bytes, std::size_t count);
// False when the descriptor cannot be examined.
bool examine(int fd, Kind& kind, int64_t& size);

}  // namespace quorrel::file_system
