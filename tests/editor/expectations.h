// What the editor receives, written out from the documented menus and tables: the
// two menu trees (two spaces per level; a command as ID "Text", a submenu as "Text",
// a separator as -), the action menu texts by code, the action display strings and
// the expression names.
#pragma once

namespace quorrel::editor_test {

// clang-format off
const char* const kActionMenuTree = R"m("File"
  "Save Array"
    25000 "Save to file"
    25001 "Save as MMF1.5 array"
    25002 "Save to CSV file"
    25058 "Save to INI file"
  "Load Array"
    25003 "Load from file"
    25004 "Load from MMF array"
    25005 "Load from CSV file"
    25059 "Load from INI file"
"Add Elements"
  25006 "Insert string at"
  25007 "Insert value at"
  25053 "Insert file at"
  25008 "Append string"
  25009 "Append value"
  25054 "Append file"
  25010 "Append elements from file"
  25011 "Append elements from MMF array"
  25012 "Append elements from CSV file"
  25060 "Append elements from INI file"
"Replace Elements"
  25013 "Set string at"
  25014 "Set value at"
  25052 "Set file at"
"Remove Elements"
  25016 "Delete at"
  25017 "Delete all"
"Save Elements"
  25018 "Save element to file"
  25019 "Append element to file"
"Keys"
  25020 "Set key string at"
  25021 "Set key value at"
"Sorting"
  25022 "Sort strings ascending (ABC)"
  25023 "Sort strings descending (CBA)"
  25024 "Sort values ascending (123)"
  25025 "Sort values descending (321)"
"Dimensioning"
  "Array Dimension"
    25027 "Set array dimension"
    25028 "Use 2D array (dimensions: 2)"
    25029 "Use 3D array (dimensions: 3)"
  "Dimension Boundaries"
    25030 "Set dimension boundary"
    25031 "Resize dimension boundary"
"Recordset (2D Array)"
  "Rows (Records)"
    "Select"
      "Selection mode"
        25061 "AND (Exclusive)"
        25062 "OR (Inclusive)"
      25063 "Select all rows"
      25064 "Invert selection"
      25078 "Start new Where"
      "Where (column index)"
        25065 "Select rows matching"
        25066 "Select rows containing"
        25067 "Select rows equal to"
        25068 "Select rows not equal to"
        25069 "Select rows greater than"
        25070 "Select rows greater than or equal to"
        25071 "Select rows less than"
        25072 "Select rows less than or equal to"
      "Where (label)"
        25073 "Select rows matching"
        25074 "Select rows containing"
        25075 "Select rows equal to"
        25076 "Select rows not equal to"
        25077 "Select rows greater than"
        25033 "Select rows greater than or equal to"
        25035 "Select rows less than"
        25037 "Select rows less than or equal to"
      "Between"
        25015 "Pick column for select between"
        25038 "Pick label for select between"
        -
        25049 "Select rows between strings"
        25026 "Select rows between values"
    "Insert"
      25032 "Insert row from list"
    "Append"
      25034 "Append row from list"
    "Update"
      25036 "Replace row with list"
    "Delete"
      25039 "Delete row"
    "Sorting"
      25042 "Sort rows by column string ascending"
      25043 "Sort rows by column string descending"
      25040 "Sort rows by column value ascending"
      25041 "Sort rows by column value descending"
      25046 "Sort rows by label string ascending"
      25047 "Sort rows by label string descending"
      25044 "Sort rows by label value ascending"
      25045 "Sort rows by label value descending"
  "Columns (Fields)"
    25048 "Set label"
"Settings"
  "String Comparisons"
    25050 "Case Insensitive (A=a)"
    25051 "Case Sensitive (A<a)"
  "Search Mode"
    25055 "Literal"
    25056 "Wildcard"
  25057 "Set list delimiter"
)m";
const char* const kExpressionMenuTree = R"m(27000 "Get size"
27001 "Get capacity"
"Get Elements"
  27002 "Get string at"
  27003 "Get value at"
"Keys"
  27004 "Get key string at"
  27005 "Get key value at"
  27006 "Get index with key string"
  27007 "Get index with key value"
  27008 "Get string with key string"
  27009 "Get string with key value"
  27010 "Get value with key string"
  27011 "Get value with key value"
"Searching"
  27012 "Find element matching string"
  27013 "Find element matching value"
  27014 "Find element containing string"
  27015 "Find element containing value"
"Lists"
  27051 "Get list delimiter"
  -
  27016 "Get element list"
  27017 "Get quoted element list"
  27018 "Get key list"
  27019 "Get quoted key list"
  27020 "Get element-key pair list"
  27021 "Get quoted element-key pair list"
"Totals"
  27022 "Get maximum value"
  27023 "Get minimum value"
  27024 "Get summed value"
  27025 "Get average value"
"Dimensioning"
  "Array Dimension"
    27026 "Get array dimension"
  "Dimension Boundaries"
    27027 "Get dimension boundary"
    27028 "Get maximum value of X"
    27029 "Get maximum value of Y"
    27030 "Get maximum value of Z"
    27031 "Get maximum number of columns"
    27032 "Get maximum number of rows"
    27033 "Get maximum number of pages"
  "Index Transforms (1D<=>nD)"
    27034 "Get dimension index from index"
    27035 "Get X (dimension: 1) from index"
    27036 "Get Y (dimension: 2) from index"
    27037 "Get Z (dimension: 3) from index"
    27038 "Get index from dimension index"
    27039 "Get index from X,Y"
"Recordset (2D Array)"
  "Rows (Records)"
    27040 "Number of rows"
    27041 "Get row value list"
  "Columns (Fields)"
    27042 "Number of columns"
    "Labels (Fieldnames)"
      27043 "Get label"
      27044 "Get label value list"
    27045 "Get column"
    27046 "Get column value list"
  "Query"
    27047 "Get value from column, row"
    27048 "Get string from column, row"
    27049 "Get value from label, row"
    27050 "Get string from label, row"
    "Aggregates"
      27052 "Maximum value (column)"
      27053 "Minimum value (column)"
      27054 "Summed value (column)"
      27055 "Average value (column)"
      -
      27056 "Maximum value (label)"
      27057 "Minimum value (label)"
      27058 "Summed value (label)"
      27059 "Average value (label)"
)m";
const char* const kActionMenuTexts[79] = {
    "Save to file", "Save as MMF1.5 array", "Save to CSV file", "Load from file",
    "Load from MMF array", "Load from CSV file", "Insert string at", "Insert value at",
    "Append string", "Append value", "Append elements from file", "Append elements from MMF array",
    "Append elements from CSV file", "Set string at", "Set value at",
    "Pick column for select between", "Delete at", "Delete all", "Save element to file",
    "Append element to file", "Set key string at", "Set key value at",
    "Sort strings ascending (ABC)", "Sort strings descending (CBA)", "Sort values ascending (123)",
    "Sort values descending (321)", "Select rows between values", "Set array dimension",
    "Use 2D array (dimensions: 2)", "Use 3D array (dimensions: 3)", "Set dimension boundary",
    "Resize dimension boundary", "Insert row from list", "Select rows greater than or equal to",
    "Append row from list", "Select rows less than", "Replace row with list",
    "Select rows less than or equal to", "Pick label for select between", "Delete row",
    "Sort rows by column value ascending", "Sort rows by column value descending",
    "Sort rows by column string ascending", "Sort rows by column string descending",
    "Sort rows by label value ascending", "Sort rows by label value descending",
    "Sort rows by label string ascending", "Sort rows by label string descending", "Set label",
    "Select rows between strings", "Case Insensitive (A=a)", "Case Sensitive (A<a)", "Set file at",
    "Insert file at", "Append file", "Literal", "Wildcard", "Set list delimiter",
    "Save to INI file", "Load from INI file", "Append elements from INI file", "AND (Exclusive)",
    "OR (Inclusive)", "Select all rows", "Invert selection", "Select rows matching",
    "Select rows containing", "Select rows equal to", "Select rows not equal to",
    "Select rows greater than", "Select rows greater than or equal to", "Select rows less than",
    "Select rows less than or equal to", "Select rows matching", "Select rows containing",
    "Select rows equal to", "Select rows not equal to", "Select rows greater than",
    "Start new Where"};

const char* const kActionStrings[79] = {
    "11%s: Save to file %s", "11%s: Save to MMF Array %s", "11%s: Save to CSV file %s",
    "11%s: Load from file %s", "11%s: Load from MMF Array %s", "11%s: Load from CSV file %s",
    "11%s: Insert string %s at %s", "11%s: Insert value %s at %s", "11%s: Append string %s",
    "11%s: Append value %s", "11%s: Append elements from file %s",
    "11%s: Append elements from MMF Array %s", "11%s: Append elements from CSV file %s",
    "11%s: Set string %s at %s", "11%s: Set value %s at %s", "11%s: Pick col %s for SELECT BETWEEN",
    "11%s: Delete at %s", "10%s: Delete all", "11%s: Save element %s to file %s",
    "11%s: Append element %s to file %s", "11%s: Set key string %s at %s",
    "11%s: Set key value %s at %s", "10%s: Sort strings ascending (ABC)",
    "10%s: Sort strings descending (CBA)", "10%s: Sort values ascending (123)",
    "10%s: Sort values descending (321)", "11%s: SELECT BETWEEN %s AND %s",
    "11%s: Set array dimension to %s", "10%s: Set array dimension to 2",
    "10%s: Set array dimension to 3", "11%s: Set dimension %s boundary to %s",
    "11%s: Resize dimension %s boundary to %s", "11%s: Insert row from list %s at %s",
    "11%s: SELECT WHERE %s >= %s", "11%s: Append row from list %s", "11%s: SELECT WHERE %s < %s",
    "11%s: Replace row from list %s at %s", "11%s: SELECT WHERE %s <= %s",
    "11%s: Pick %s for SELECT BETWEEN", "11%s: Delete row %s",
    "11%s: Sort rows by column %s value ascending", "11%s: Sort rows by column %s value descending",
    "11%s: Sort rows by column %s string ascending",
    "11%s: Sort rows by column %s string descending", "11%s: Sort rows by label %s value ascending",
    "11%s: Sort rows by label %s value descending", "11%s: Sort rows by label %s string ascending",
    "11%s: Sort rows by label %s string descending", "11%s: Set label to %s at column %s",
    "11%s: SELECT BETWEEN %s AND %s", "10%s: Case insensitive (A=a)", "10%s: Case sensitive (A<a)",
    "11%s: Set file %s at %s", "11%s: Insert file %s at %s", "11%s: Append file %s",
    "10%s: Use literal search mode", "10%s: Use wildcard search mode",
    "11%s: Set list delimiter to %s", "11%s: Save to INI file %s", "11%s: Load from INI file %s",
    "11%s: Append elements from INI file %s", "10%s: Select rows using AND mode",
    "10%s: Select rows using OR mode", "10%s: Select all rows", "10%s: Invert selection of rows",
    "11%s: SELECT WHERE col %s LIKE %s", "11%s: SELECT WHERE col %s LIKE *%s*",
    "11%s: SELECT WHERE col %s = %s", "11%s: SELECT WHERE col %s <> %s",
    "11%s: SELECT WHERE col %s > %s", "11%s: SELECT WHERE col %s >= %s",
    "11%s: SELECT WHERE col %s < %s", "11%s: SELECT WHERE col %s <= %s",
    "11%s: SELECT WHERE %s LIKE %s", "11%s: SELECT WHERE %s LIKE *%s*",
    "11%s: SELECT WHERE %s = %s", "11%s: SELECT WHERE %s <> %s", "11%s: SELECT WHERE %s > %s",
    "10%s: Start new WHERE (reset selected rows)"};
const char* const kExpressionNames[60] = {
    "size(", "capacity(", "get$(", "get(", "key$(", "key(", "indexOfKeyStr(", "indexOfKeyVal(",
    "keyStr$(", "keyStr(", "keyVal$(", "keyVal(", "findStr(", "findVal(", "containsStr(",
    "containsVal(", "list$(", "quotedList$(", "keyList$(", "keyQuotedList$(", "pairList$(",
    "pairQuotedList$(", "max(", "min(", "sum(", "avg(", "dim(", "boundary(", "boundaryX(",
    "boundaryY(", "boundaryZ(", "boundaryCol(", "boundaryRow(", "boundaryPage(",
    "dimIndexOfIndex$(", "XOfIndex(", "YOfIndex(", "ZOfIndex(", "indexOfDimIndex(", "indexOfXY(",
    "numberOfRows(", "rowList$(", "numberOfCols(", "getLabel$(", "labelList$(", "getCol(",
    "columnList$(", "getFromColumnRow(", "getFromColumnRow$(", "getFromLabelRow(",
    "getFromLabelRow$(", "delimiter$(", "colMax(", "colMin(", "colSum(", "colAvg(", "labMax(",
    "labMin(", "labSum(", "labAvg("};

// clang-format on

}  // namespace quorrel::editor_test
