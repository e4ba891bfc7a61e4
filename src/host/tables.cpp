#include "host/tables.h"

#include <cstddef>
#include <string_view>

#include "host/routines.h"

namespace quorrel::host {
namespace {

// Parameter types, as the host reads them from the information entries.
constexpr uint16_t actionParamType(Param param) {
  return param == Param::Number ? abi::kActionParamNumber
         : param == Param::Text ? abi::kActionParamText
                                : 0;
}
constexpr uint16_t expressionParamType(Param param) {
  return param == Param::Number ? abi::kExpressionParamInteger
         : param == Param::Text ? abi::kExpressionParamText
                                : 0;
}

template <typename Routine>
struct Row {
  uint16_t code;
  uint16_t param1;
  uint16_t param2;
  Routine routine;
};

constexpr Row<abi::ActionRoutine> kActionRows[] = {
#define ACTION(code, name, param1, param2, file, menuText, display, meaning1, meaning2) \
  {code, actionParamType(Param::param1), actionParamType(Param::param2),                \
   &callAction<&act::name, Param::param1, Param::param2, code>},
#include "host/table.inc"
};

// Expressions that share a routine share its host routine too: it names itself in
// notes by the first of them.
constexpr std::string_view kExpressionRoutineNames[] = {
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2) #routine,
#include "host/table.inc"
};
constexpr int32_t firstCodeOf(std::string_view routine) {
  int32_t code = 0;
  while (kExpressionRoutineNames[code] != routine) ++code;
  return code;
}

constexpr Row<abi::ExpressionRoutine> kExpressionRows[] = {
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2) \
  {code, expressionParamType(Param::param1), expressionParamType(Param::param2),      \
   &callExpression<&expr::routine, Param::param1, Param::param2, firstCodeOf(#routine)>},
#include "host/table.inc"
};

// A parameter has a meaning, and only a declared one: the help page and the quorrel
// command print the two side by side.
constexpr bool described(Param param, const char* meaning) {
  return (param == Param::None) == (meaning[0] == '\0');
}
#define ACTION(code, name, param1, param2, file, menuText, display, meaning1, meaning2)   \
  static_assert(described(Param::param1, meaning1) && described(Param::param2, meaning2), \
                "action " #code ": a parameter without its meaning, or the other way round");
#define EXPRESSION(code, name, routine, param1, param2, menuText, meaning1, meaning2)     \
  static_assert(described(Param::param1, meaning1) && described(Param::param2, meaning2), \
                "expression " #code ": a parameter without its meaning, or the other way round");
#include "host/table.inc"

template <typename Routine, std::size_t N>
constexpr bool codesInOrder(const Row<Routine> (&rows)[N]) {
  for (std::size_t i = 0; i < N; ++i) {
    if (rows[i].code != i) return false;
  }
  return true;
}
static_assert(std::size(kActionRows) == abi::kActionCount && codesInOrder(kActionRows));
static_assert(std::size(kExpressionRows) == abi::kExpressionCount && codesInOrder(kExpressionRows));

template <typename Routine, std::size_t N>
constexpr std::array<abi::InfoEntry, N> infoEntries(const Row<Routine> (&rows)[N]) {
  std::array<abi::InfoEntry, N> entries{};
  for (std::size_t i = 0; i < N; ++i) {
    entries[i] = {rows[i].code, 0, {rows[i].param1, rows[i].param2}, {0, 0}};
  }
  return entries;
}

template <typename Routine, std::size_t N>
constexpr std::array<Routine, N + 1> routines(const Row<Routine> (&rows)[N]) {
  std::array<Routine, N + 1> table{};
  for (std::size_t i = 0; i < N; ++i) table[i] = rows[i].routine;
  return table;
}

}  // namespace

constexpr std::array<abi::InfoEntry, abi::kActionCount> ActionInfoTable = infoEntries(kActionRows);
constexpr std::array<abi::InfoEntry, abi::kExpressionCount> ExpressionInfoTable =
    infoEntries(kExpressionRows);
constexpr std::array<abi::InfoEntry, 1> ConditionInfoTable{};

constexpr std::array<abi::ActionRoutine, abi::kActionCount + 1> ActionRoutineTable =
    routines(kActionRows);
constexpr std::array<abi::ExpressionRoutine, abi::kExpressionCount + 1> ExpressionRoutineTable =
    routines(kExpressionRows);
constexpr std::array<abi::ConditionRoutine, 1> ConditionRoutineTable{};

}  // namespace quorrel::host
