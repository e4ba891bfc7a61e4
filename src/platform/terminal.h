// Whether a standard stream is a terminal, where a person reads or types: the quorrel
// command then shows progress, refuses to print binary formats, and edits lines. One
// implementation per system (terminal_posix.cpp, terminal_windows.cpp).
#pragma once

#include <cstdio>

namespace quorrel::platform {

bool isTerminal(std::FILE* stream);

}  // namespace quorrel::platform
