#include "host/tables.h"

#include <cstddef>

#include "host/routines.h"

namespace quorrel::host {
namespace {

// Parameter types, as the host reads them from the information entries.
constexpr uint16_t kANumber = abi::kActionParamNumber;
constexpr uint16_t kAText = abi::kActionParamText;
constexpr uint16_t kEInteger = abi::kExpressionParamInteger;
constexpr uint16_t kEText = abi::kExpressionParamText;

template <typename Routine>
struct Row {
  uint16_t code;
  uint16_t param1;
  uint16_t param2;
  Routine routine;
};

// One row per action code: code, parameter 1, parameter 2, routine.
constexpr Row<abi::ActionRoutine> kActionRows[] = {
    {0, kAText, 0, act::saveToFile},
    {1, kAText, 0, act::saveAsHostArray},
    {2, kAText, 0, act::saveToCsvFile},
    {3, kAText, 0, act::loadFromFile},
    {4, kAText, 0, act::loadFromHostArray},
    {5, kAText, 0, act::loadFromCsvFile},
    {6, kAText, kANumber, act::insertStringAt},
    {7, kANumber, kANumber, act::insertValueAt},
    {8, kAText, 0, act::appendString},
    {9, kANumber, 0, act::appendValue},
    {10, kAText, 0, act::appendElementsFromFile},
    {11, kAText, 0, act::appendElementsFromHostArray},
    {12, kAText, 0, act::appendElementsFromCsvFile},
    {13, kAText, kANumber, act::setStringAt},
    {14, kANumber, kANumber, act::setValueAt},
    {15, kANumber, 0, act::pickColumnForBetween},
    {16, kANumber, 0, act::deleteAt},
    {17, 0, 0, act::deleteAll},
    {18, kANumber, kAText, act::saveElementToFile},
    {19, kANumber, kAText, act::appendElementToFile},
    {20, kAText, kANumber, act::setKeyStringAt},
    {21, kANumber, kANumber, act::setKeyValueAt},
    {22, 0, 0, act::sortStringsAscending},
    {23, 0, 0, act::sortStringsDescending},
    {24, 0, 0, act::sortValuesAscending},
    {25, 0, 0, act::sortValuesDescending},
    {26, kANumber, kANumber, act::selectRowsBetweenValues},
    {27, kANumber, 0, act::setArrayDimension},
    {28, 0, 0, act::use2DArray},
    {29, 0, 0, act::use3DArray},
    {30, kANumber, kANumber, act::setDimensionBoundary},
    {31, kANumber, kANumber, act::resizeDimensionBoundary},
    {32, kAText, kANumber, act::insertRowFromList},
    {33, kAText, kANumber, act::selectLabelGreaterOrEqual},
    {34, kAText, 0, act::appendRowFromList},
    {35, kAText, kANumber, act::selectLabelLess},
    {36, kAText, kANumber, act::replaceRowWithList},
    {37, kAText, kANumber, act::selectLabelLessOrEqual},
    {38, kAText, 0, act::pickLabelForBetween},
    {39, kANumber, 0, act::deleteRow},
    {40, kANumber, 0, act::sortRowsByColumnValueAscending},
    {41, kANumber, 0, act::sortRowsByColumnValueDescending},
    {42, kANumber, 0, act::sortRowsByColumnStringAscending},
    {43, kANumber, 0, act::sortRowsByColumnStringDescending},
    {44, kAText, 0, act::sortRowsByLabelValueAscending},
    {45, kAText, 0, act::sortRowsByLabelValueDescending},
    {46, kAText, 0, act::sortRowsByLabelStringAscending},
    {47, kAText, 0, act::sortRowsByLabelStringDescending},
    {48, kAText, kANumber, act::setLabel},
    {49, kAText, kAText, act::selectRowsBetweenStrings},
    {50, 0, 0, act::caseInsensitive},
    {51, 0, 0, act::caseSensitive},
    {52, kAText, kANumber, act::setFileAt},
    {53, kAText, kANumber, act::insertFileAt},
    {54, kAText, 0, act::appendFile},
    {55, 0, 0, act::literalSearch},
    {56, 0, 0, act::wildcardSearch},
    {57, kAText, 0, act::setListDelimiter},
    {58, kAText, 0, act::saveToIniFile},
    {59, kAText, 0, act::loadFromIniFile},
    {60, kAText, 0, act::appendElementsFromIniFile},
    {61, 0, 0, act::andMode},
    {62, 0, 0, act::orMode},
    {63, 0, 0, act::selectAllRows},
    {64, 0, 0, act::invertSelection},
    {65, kANumber, kAText, act::selectColumnMatching},
    {66, kANumber, kAText, act::selectColumnContaining},
    {67, kANumber, kANumber, act::selectColumnEqual},
    {68, kANumber, kANumber, act::selectColumnNotEqual},
    {69, kANumber, kANumber, act::selectColumnGreater},
    {70, kANumber, kANumber, act::selectColumnGreaterOrEqual},
    {71, kANumber, kANumber, act::selectColumnLess},
    {72, kANumber, kANumber, act::selectColumnLessOrEqual},
    {73, kAText, kAText, act::selectLabelMatching},
    {74, kAText, kAText, act::selectLabelContaining},
    {75, kAText, kANumber, act::selectLabelEqual},
    {76, kAText, kANumber, act::selectLabelNotEqual},
    {77, kAText, kANumber, act::selectLabelGreater},
    {78, 0, 0, act::startNewWhere},
};

// One row per expression code. 31 to 33 are other names of 28 to 30.
constexpr Row<abi::ExpressionRoutine> kExpressionRows[] = {
    {0, 0, 0, expr::size},
    {1, 0, 0, expr::capacity},
    {2, kEInteger, 0, expr::getString},
    {3, kEInteger, 0, expr::getValue},
    {4, kEInteger, 0, expr::keyString},
    {5, kEInteger, 0, expr::keyValue},
    {6, kEText, 0, expr::indexOfKeyString},
    {7, kEInteger, 0, expr::indexOfKeyValue},
    {8, kEText, 0, expr::stringWithStringKey},
    {9, kEInteger, 0, expr::stringWithValueKey},
    {10, kEText, 0, expr::valueWithStringKey},
    {11, kEInteger, 0, expr::valueWithValueKey},
    {12, kEText, kEInteger, expr::findString},
    {13, kEInteger, kEInteger, expr::findValue},
    {14, kEText, kEInteger, expr::containsString},
    {15, kEInteger, kEInteger, expr::containsValue},
    {16, kEText, 0, expr::list},
    {17, kEText, 0, expr::quotedList},
    {18, kEText, 0, expr::keyList},
    {19, kEText, 0, expr::keyQuotedList},
    {20, kEText, kEText, expr::pairList},
    {21, kEText, kEText, expr::pairQuotedList},
    {22, 0, 0, expr::max},
    {23, 0, 0, expr::min},
    {24, 0, 0, expr::sum},
    {25, 0, 0, expr::avg},
    {26, 0, 0, expr::dim},
    {27, kEInteger, 0, expr::boundary},
    {28, 0, 0, expr::boundaryX},
    {29, 0, 0, expr::boundaryY},
    {30, 0, 0, expr::boundaryZ},
    {31, 0, 0, expr::boundaryX},
    {32, 0, 0, expr::boundaryY},
    {33, 0, 0, expr::boundaryZ},
    {34, kEInteger, kEInteger, expr::dimIndexOfIndex},
    {35, kEInteger, 0, expr::xOfIndex},
    {36, kEInteger, 0, expr::yOfIndex},
    {37, kEInteger, 0, expr::zOfIndex},
    {38, kEText, 0, expr::indexOfDimIndex},
    {39, kEInteger, kEInteger, expr::indexOfXY},
    {40, 0, 0, expr::numberOfRows},
    {41, kEInteger, 0, expr::rowList},
    {42, 0, 0, expr::numberOfCols},
    {43, kEInteger, 0, expr::getLabel},
    {44, 0, 0, expr::labelList},
    {45, kEText, 0, expr::getCol},
    {46, kEInteger, 0, expr::columnList},
    {47, kEInteger, kEInteger, expr::getFromColumnRow},
    {48, kEInteger, kEInteger, expr::getStringFromColumnRow},
    {49, kEText, kEInteger, expr::getFromLabelRow},
    {50, kEText, kEInteger, expr::getStringFromLabelRow},
    {51, 0, 0, expr::delimiter},
    {52, kEInteger, 0, expr::colMax},
    {53, kEInteger, 0, expr::colMin},
    {54, kEInteger, 0, expr::colSum},
    {55, kEInteger, 0, expr::colAvg},
    {56, kEText, 0, expr::labMax},
    {57, kEText, 0, expr::labMin},
    {58, kEText, 0, expr::labSum},
    {59, kEText, 0, expr::labAvg},
};

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
