// The editor's menus and display strings, as resource script text made from the rows
// and menus of host/table.inc.
#pragma once

#include <string>

namespace rcgen {

// Throws std::runtime_error naming the row or menu step that cannot be written.
std::string tableResources();

}  // namespace rcgen
