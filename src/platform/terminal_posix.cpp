// Terminals on POSIX systems.
#include <unistd.h>

#include "platform/terminal.h"

namespace quorrel::platform {

bool isTerminal(std::FILE* stream) {
  return isatty(fileno(stream)) != 0;
}

}  // namespace quorrel::platform
