// The setup dialog as the module's resource template lays it out, drawn as inline SVG.
#pragma once

#include <string>

namespace quorrel::help {

// The picture and a legend naming each numbered field; empty when this build has no
// dialog tables.
std::string setupDialogPicture();

}  // namespace quorrel::help
