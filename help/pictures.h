// The page's pictures, drawn as inline SVG from arrays the module really made: each one
// reads its numbers and texts back through the module's expressions or from the bytes
// of a file the module saved, so a picture cannot disagree with the object.
#pragma once

#include <map>
#include <string>

#include "quorrel/module.h"

namespace quorrel::help {

// Every picture as HTML by its placeholder name ("INDEX_LAYOUT", "FILE_NATIVE", ...).
// Files the module saves land in the current folder.
std::map<std::string, std::string> drawPictures(const tool::ModuleLoader& module);

}  // namespace quorrel::help
