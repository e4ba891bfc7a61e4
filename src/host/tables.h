// The information and routine tables handed to the host. They are built at compile
// time from one row per code in tables.cpp.
#pragma once

#include <array>

#include "host/abi.h"

namespace quorrel::host {

extern const std::array<abi::InfoEntry, abi::kActionCount> ActionInfoTable;
extern const std::array<abi::InfoEntry, abi::kExpressionCount> ExpressionInfoTable;
extern const std::array<abi::InfoEntry, 1> ConditionInfoTable;

// Each routine table ends with a null entry.
extern const std::array<abi::ActionRoutine, abi::kActionCount + 1> ActionRoutineTable;
extern const std::array<abi::ExpressionRoutine, abi::kExpressionCount + 1> ExpressionRoutineTable;
extern const std::array<abi::ConditionRoutine, 1> ConditionRoutineTable;

}  // namespace quorrel::host
