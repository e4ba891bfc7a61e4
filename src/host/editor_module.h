// The module handle from which the editor side loads its menus, strings and dialog.
#pragma once

#include "platform/windows_services.h"

namespace quorrel::host {

// The handle kept when the library was attached. The portable resource services
// serve this module's own resources whatever handle they are given.
HINSTANCE moduleInstance();

}  // namespace quorrel::host
