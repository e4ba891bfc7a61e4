// The routine of every action and expression, declared in the shape its row in
// table.inc gives it: an action takes the Instance, an expression the array, and each
// then takes its declared parameters; a file action answers what it did. The
// definitions are in routines_*.cpp.
#pragma once

#include "host/routine_support.h"

namespace quorrel::host::act {
#define ACTION(code, name, param1, param2, file, menuText, display, meaning1, meaning2) \
  Signature<ActionAnswer<FileUse::file>, Instance, Param::param1, Param::param2>::Type name;
#include "host/table.inc"
}  // namespace quorrel::host::act

namespace quorrel::host::expr {
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2) \
  Signature<Result, ElementArray&, Param::param1, Param::param2>::Type routine;
#include "host/table.inc"
}  // namespace quorrel::host::expr
