#include "catalog.h"

#include "host/abi.h"

namespace quorrel::tool {

// The help page's prose (help/descriptions.txt), compiled in.
extern const char* const kDescriptionsText;

namespace {

constexpr FileUse R = FileUse::Read, W = FileUse::Write, X = FileUse::Extend;

const ActionEntry kActions[abi::kActionCount] = {
    {"saveToFile", W},
    {"saveToHostArray", W},
    {"saveToCsv", W},
    {"loadFromFile", R},
    {"loadFromHostArray", R},
    {"loadFromCsv", R},
    {"insertStringAt"},
    {"insertValueAt"},
    {"appendString"},
    {"appendValue"},
    {"appendElementsFromFile", R},
    {"appendElementsFromHostArray", R},
    {"appendElementsFromCsv", R},
    {"setStringAt"},
    {"setValueAt"},
    {"pickColumnForBetween"},
    {"deleteAt"},
    {"deleteAll"},
    {"saveElementToFile", W, 1},
    {"appendElementToFile", X, 1},
    {"setKeyStringAt"},
    {"setKeyValueAt"},
    {"sortStringsAscending"},
    {"sortStringsDescending"},
    {"sortValuesAscending"},
    {"sortValuesDescending"},
    {"selectBetweenValues"},
    {"setArrayDimension"},
    {"use2D"},
    {"use3D"},
    {"setDimensionBoundary"},
    {"resizeDimensionBoundary"},
    {"insertRowFromList"},
    {"selectWhereGreaterOrEqualByLabel"},
    {"appendRowFromList"},
    {"selectWhereLessByLabel"},
    {"replaceRowWithList"},
    {"selectWhereLessOrEqualByLabel"},
    {"pickLabelForBetween"},
    {"deleteRow"},
    {"sortRowsByColumnValueAscending"},
    {"sortRowsByColumnValueDescending"},
    {"sortRowsByColumnStringAscending"},
    {"sortRowsByColumnStringDescending"},
    {"sortRowsByLabelValueAscending"},
    {"sortRowsByLabelValueDescending"},
    {"sortRowsByLabelStringAscending"},
    {"sortRowsByLabelStringDescending"},
    {"setLabel"},
    {"selectBetweenStrings"},
    {"caseInsensitive"},
    {"caseSensitive"},
    {"setFileAt", R},
    {"insertFileAt", R},
    {"appendFile", R},
    {"literalSearch"},
    {"wildcardSearch"},
    {"setListDelimiter"},
    {"saveToIni", W},
    {"loadFromIni", R},
    {"appendElementsFromIni", R},
    {"selectionModeAnd"},
    {"selectionModeOr"},
    {"selectAllRows"},
    {"invertSelection"},
    {"selectWhereMatchingByColumn"},
    {"selectWhereContainingByColumn"},
    {"selectWhereEqualByColumn"},
    {"selectWhereNotEqualByColumn"},
    {"selectWhereGreaterByColumn"},
    {"selectWhereGreaterOrEqualByColumn"},
    {"selectWhereLessByColumn"},
    {"selectWhereLessOrEqualByColumn"},
    {"selectWhereMatchingByLabel"},
    {"selectWhereContainingByLabel"},
    {"selectWhereEqualByLabel"},
    {"selectWhereNotEqualByLabel"},
    {"selectWhereGreaterByLabel"},
    {"startNewWhere"},
};

// The text after a "name:" prefix, blanks before it skipped.
std::string afterPrefix(std::string_view line, size_t prefix) {
  line.remove_prefix(prefix);
  const size_t start = line.find_first_not_of(' ');
  return std::string(start == std::string_view::npos ? std::string_view{} : line.substr(start));
}

std::string_view nextLine(std::string_view& text) {
  const size_t end = text.find('\n');
  const std::string_view line = text.substr(0, end);
  text = end == std::string_view::npos ? std::string_view{} : text.substr(end + 1);
  return line;
}

}  // namespace

const ActionEntry& actionEntry(int32_t code) {
  return kActions[code];
}

std::optional<int32_t> actionCodeOfName(std::string_view name) {
  for (int32_t code = 0; code < abi::kActionCount; ++code) {
    if (name == kActions[code].name) return code;
  }
  return std::nullopt;
}

std::optional<Description> describe(bool action, int32_t code) {
  const std::string header = (action ? "== A" : "== E") + std::to_string(code);
  std::string_view text = kDescriptionsText;
  while (!text.empty() && nextLine(text) != header) {
  }
  if (text.empty()) return std::nullopt;
  Description description;
  while (!text.empty() && text.substr(0, 3) != "== ") {
    const std::string_view line = nextLine(text);
    if (line.substr(0, 6) == "param:") {
      description.params.push_back(afterPrefix(line, 6));
    } else if (line.substr(0, 4) == "bad:") {
      description.bad = afterPrefix(line, 4);
    } else if (!line.empty()) {
      if (!description.prose.empty()) description.prose += '\n';
      description.prose += line;
    }
  }
  return description;
}

}  // namespace quorrel::tool
