// How an array compares, searches, saves and selects: one record on every array, set
// from the object's setup record when it is created and changed by the routines since.
#pragma once

#include <cstdint>

namespace quorrel {

// Text comparison of keys, finds, label lookups, selections and sorts.
enum CaseMode : int16_t { CaseInsensitive = 0, CaseSensitive = 1 };
// Whether a probe text is a pattern ('*' any run, '?' one character) or literal.
enum SearchMode : int16_t { SearchLiteral = 0, SearchWildcard = 1 };
// How a save opens its file: create or truncate, or append to it.
enum FileMode : int16_t { FileModeTruncate = 0, FileModeAppend = 1 };
// OR: a where-test adds the rows that pass; AND: it removes the rows that fail.
enum SelectionMode : int32_t { SelectAnd = 0, SelectOr = 1 };

struct ArraySettings {
  CaseMode caseMode = CaseInsensitive;
  SearchMode searchMode = SearchLiteral;
  SelectionMode selectionMode = SelectOr;
  // Rows that a growth adds to the table start selected.
  bool autoSelectNewRows = false;
};

}  // namespace quorrel
