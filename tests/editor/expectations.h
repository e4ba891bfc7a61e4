// What the editor receives, written out from the documented menus and tables: the
// two menu trees (two spaces per level; a command as ID "Text", a submenu as "Text",
// a separator as -), the action menu texts by code, the action display strings and
// the expression names.
#pragma once

namespace quorrel::editor_test {

const char* const kActionMenuTree = R"m("File")m"
                                    "\n"
                                    R"m(  "Save Array")m"
                                    "\n"
                                    R"m(    25000 "Save to file")m"
                                    "\n"
                                    R"m(    25001 "Save as MMF1.5 array")m"
                                    "\n"
                                    R"m(    25002 "Save to CSV file")m"
                                    "\n"
                                    R"m(    25058 "Save to INI file")m"
                                    "\n"
                                    R"m(  "Load Array")m"
                                    "\n"
                                    R"m(    25003 "Load from file")m"
                                    "\n"
                                    R"m(    25004 "Load from MMF array")m"
                                    "\n"
                                    R"m(    25005 "Load from CSV file")m"
                                    "\n"
                                    R"m(    25059 "Load from INI file")m"
                                    "\n"
                                    R"m("Add Elements")m"
                                    "\n"
                                    R"m(  25006 "Insert string at")m"
                                    "\n"
                                    R"m(  25007 "Insert value at")m"
                                    "\n"
                                    R"m(  25053 "Insert file at")m"
                                    "\n"
                                    R"m(  25008 "Append string")m"
                                    "\n"
                                    R"m(  25009 "Append value")m"
                                    "\n"
                                    R"m(  25054 "Append file")m"
                                    "\n"
                                    R"m(  25010 "Append elements from file")m"
                                    "\n"
                                    R"m(  25011 "Append elements from MMF array")m"
                                    "\n"
                                    R"m(  25012 "Append elements from CSV file")m"
                                    "\n"
                                    R"m(  25060 "Append elements from INI file")m"
                                    "\n"
                                    R"m("Replace Elements")m"
                                    "\n"
                                    R"m(  25013 "Set string at")m"
                                    "\n"
                                    R"m(  25014 "Set value at")m"
                                    "\n"
                                    R"m(  25052 "Set file at")m"
                                    "\n"
                                    R"m("Remove Elements")m"
                                    "\n"
                                    R"m(  25016 "Delete at")m"
                                    "\n"
                                    R"m(  25017 "Delete all")m"
                                    "\n"
                                    R"m("Save Elements")m"
                                    "\n"
                                    R"m(  25018 "Save element to file")m"
                                    "\n"
                                    R"m(  25019 "Append element to file")m"
                                    "\n"
                                    R"m("Keys")m"
                                    "\n"
                                    R"m(  25020 "Set key string at")m"
                                    "\n"
                                    R"m(  25021 "Set key value at")m"
                                    "\n"
                                    R"m("Sorting")m"
                                    "\n"
                                    R"m(  25022 "Sort strings ascending (ABC)")m"
                                    "\n"
                                    R"m(  25023 "Sort strings descending (CBA)")m"
                                    "\n"
                                    R"m(  25024 "Sort values ascending (123)")m"
                                    "\n"
                                    R"m(  25025 "Sort values descending (321)")m"
                                    "\n"
                                    R"m("Dimensioning")m"
                                    "\n"
                                    R"m(  "Array Dimension")m"
                                    "\n"
                                    R"m(    25027 "Set array dimension")m"
                                    "\n"
                                    R"m(    25028 "Use 2D array (dimensions: 2)")m"
                                    "\n"
                                    R"m(    25029 "Use 3D array (dimensions: 3)")m"
                                    "\n"
                                    R"m(  "Dimension Boundaries")m"
                                    "\n"
                                    R"m(    25030 "Set dimension boundary")m"
                                    "\n"
                                    R"m(    25031 "Resize dimension boundary")m"
                                    "\n"
                                    R"m("Recordset (2D Array)")m"
                                    "\n"
                                    R"m(  "Rows (Records)")m"
                                    "\n"
                                    R"m(    "Select")m"
                                    "\n"
                                    R"m(      "Selection mode")m"
                                    "\n"
                                    R"m(        25061 "AND (Exclusive)")m"
                                    "\n"
                                    R"m(        25062 "OR (Inclusive)")m"
                                    "\n"
                                    R"m(      25063 "Select all rows")m"
                                    "\n"
                                    R"m(      25064 "Invert selection")m"
                                    "\n"
                                    R"m(      25078 "Start new Where")m"
                                    "\n"
                                    R"m(      "Where (column index)")m"
                                    "\n"
                                    R"m(        25065 "Select rows matching")m"
                                    "\n"
                                    R"m(        25066 "Select rows containing")m"
                                    "\n"
                                    R"m(        25067 "Select rows equal to")m"
                                    "\n"
                                    R"m(        25068 "Select rows not equal to")m"
                                    "\n"
                                    R"m(        25069 "Select rows greater than")m"
                                    "\n"
                                    R"m(        25070 "Select rows greater than or equal to")m"
                                    "\n"
                                    R"m(        25071 "Select rows less than")m"
                                    "\n"
                                    R"m(        25072 "Select rows less than or equal to")m"
                                    "\n"
                                    R"m(      "Where (label)")m"
                                    "\n"
                                    R"m(        25073 "Select rows matching")m"
                                    "\n"
                                    R"m(        25074 "Select rows containing")m"
                                    "\n"
                                    R"m(        25075 "Select rows equal to")m"
                                    "\n"
                                    R"m(        25076 "Select rows not equal to")m"
                                    "\n"
                                    R"m(        25077 "Select rows greater than")m"
                                    "\n"
                                    R"m(        25033 "Select rows greater than or equal to")m"
                                    "\n"
                                    R"m(        25035 "Select rows less than")m"
                                    "\n"
                                    R"m(        25037 "Select rows less than or equal to")m"
                                    "\n"
                                    R"m(      "Between")m"
                                    "\n"
                                    R"m(        25015 "Pick column for select between")m"
                                    "\n"
                                    R"m(        25038 "Pick label for select between")m"
                                    "\n"
                                    R"m(        -)m"
                                    "\n"
                                    R"m(        25049 "Select rows between strings")m"
                                    "\n"
                                    R"m(        25026 "Select rows between values")m"
                                    "\n"
                                    R"m(    "Insert")m"
                                    "\n"
                                    R"m(      25032 "Insert row from list")m"
                                    "\n"
                                    R"m(    "Append")m"
                                    "\n"
                                    R"m(      25034 "Append row from list")m"
                                    "\n"
                                    R"m(    "Update")m"
                                    "\n"
                                    R"m(      25036 "Replace row with list")m"
                                    "\n"
                                    R"m(    "Delete")m"
                                    "\n"
                                    R"m(      25039 "Delete row")m"
                                    "\n"
                                    R"m(    "Sorting")m"
                                    "\n"
                                    R"m(      25042 "Sort rows by column string ascending")m"
                                    "\n"
                                    R"m(      25043 "Sort rows by column string descending")m"
                                    "\n"
                                    R"m(      25040 "Sort rows by column value ascending")m"
                                    "\n"
                                    R"m(      25041 "Sort rows by column value descending")m"
                                    "\n"
                                    R"m(      25046 "Sort rows by label string ascending")m"
                                    "\n"
                                    R"m(      25047 "Sort rows by label string descending")m"
                                    "\n"
                                    R"m(      25044 "Sort rows by label value ascending")m"
                                    "\n"
                                    R"m(      25045 "Sort rows by label value descending")m"
                                    "\n"
                                    R"m(  "Columns (Fields)")m"
                                    "\n"
                                    R"m(    25048 "Set label")m"
                                    "\n"
                                    R"m("Settings")m"
                                    "\n"
                                    R"m(  "String Comparisons")m"
                                    "\n"
                                    R"m(    25050 "Case Insensitive (A=a)")m"
                                    "\n"
                                    R"m(    25051 "Case Sensitive (A<a)")m"
                                    "\n"
                                    R"m(  "Search Mode")m"
                                    "\n"
                                    R"m(    25055 "Literal")m"
                                    "\n"
                                    R"m(    25056 "Wildcard")m"
                                    "\n"
                                    R"m(  25057 "Set list delimiter")m"
                                    "\n";
const char* const kExpressionMenuTree = R"m(27000 "Get size")m"
                                        "\n"
                                        R"m(27001 "Get capacity")m"
                                        "\n"
                                        R"m("Get Elements")m"
                                        "\n"
                                        R"m(  27002 "Get string at")m"
                                        "\n"
                                        R"m(  27003 "Get value at")m"
                                        "\n"
                                        R"m("Keys")m"
                                        "\n"
                                        R"m(  27004 "Get key string at")m"
                                        "\n"
                                        R"m(  27005 "Get key value at")m"
                                        "\n"
                                        R"m(  27006 "Get index with key string")m"
                                        "\n"
                                        R"m(  27007 "Get index with key value")m"
                                        "\n"
                                        R"m(  27008 "Get string with key string")m"
                                        "\n"
                                        R"m(  27009 "Get string with key value")m"
                                        "\n"
                                        R"m(  27010 "Get value with key string")m"
                                        "\n"
                                        R"m(  27011 "Get value with key value")m"
                                        "\n"
                                        R"m("Searching")m"
                                        "\n"
                                        R"m(  27012 "Find element matching string")m"
                                        "\n"
                                        R"m(  27013 "Find element matching value")m"
                                        "\n"
                                        R"m(  27014 "Find element containing string")m"
                                        "\n"
                                        R"m(  27015 "Find element containing value")m"
                                        "\n"
                                        R"m("Lists")m"
                                        "\n"
                                        R"m(  27051 "Get list delimiter")m"
                                        "\n"
                                        R"m(  -)m"
                                        "\n"
                                        R"m(  27016 "Get element list")m"
                                        "\n"
                                        R"m(  27017 "Get quoted element list")m"
                                        "\n"
                                        R"m(  27018 "Get key list")m"
                                        "\n"
                                        R"m(  27019 "Get quoted key list")m"
                                        "\n"
                                        R"m(  27020 "Get element-key pair list")m"
                                        "\n"
                                        R"m(  27021 "Get quoted element-key pair list")m"
                                        "\n"
                                        R"m("Totals")m"
                                        "\n"
                                        R"m(  27022 "Get maximum value")m"
                                        "\n"
                                        R"m(  27023 "Get minimum value")m"
                                        "\n"
                                        R"m(  27024 "Get summed value")m"
                                        "\n"
                                        R"m(  27025 "Get average value")m"
                                        "\n"
                                        R"m("Dimensioning")m"
                                        "\n"
                                        R"m(  "Array Dimension")m"
                                        "\n"
                                        R"m(    27026 "Get array dimension")m"
                                        "\n"
                                        R"m(  "Dimension Boundaries")m"
                                        "\n"
                                        R"m(    27027 "Get dimension boundary")m"
                                        "\n"
                                        R"m(    27028 "Get maximum value of X")m"
                                        "\n"
                                        R"m(    27029 "Get maximum value of Y")m"
                                        "\n"
                                        R"m(    27030 "Get maximum value of Z")m"
                                        "\n"
                                        R"m(    27031 "Get maximum number of columns")m"
                                        "\n"
                                        R"m(    27032 "Get maximum number of rows")m"
                                        "\n"
                                        R"m(    27033 "Get maximum number of pages")m"
                                        "\n"
                                        R"m(  "Index Transforms (1D<=>nD)")m"
                                        "\n"
                                        R"m(    27034 "Get dimension index from index")m"
                                        "\n"
                                        R"m(    27035 "Get X (dimension: 1) from index")m"
                                        "\n"
                                        R"m(    27036 "Get Y (dimension: 2) from index")m"
                                        "\n"
                                        R"m(    27037 "Get Z (dimension: 3) from index")m"
                                        "\n"
                                        R"m(    27038 "Get index from dimension index")m"
                                        "\n"
                                        R"m(    27039 "Get index from X,Y")m"
                                        "\n"
                                        R"m("Recordset (2D Array)")m"
                                        "\n"
                                        R"m(  "Rows (Records)")m"
                                        "\n"
                                        R"m(    27040 "Number of rows")m"
                                        "\n"
                                        R"m(    27041 "Get row value list")m"
                                        "\n"
                                        R"m(  "Columns (Fields)")m"
                                        "\n"
                                        R"m(    27042 "Number of columns")m"
                                        "\n"
                                        R"m(    "Labels (Fieldnames)")m"
                                        "\n"
                                        R"m(      27043 "Get label")m"
                                        "\n"
                                        R"m(      27044 "Get label value list")m"
                                        "\n"
                                        R"m(    27045 "Get column")m"
                                        "\n"
                                        R"m(    27046 "Get column value list")m"
                                        "\n"
                                        R"m(  "Query")m"
                                        "\n"
                                        R"m(    27047 "Get value from column, row")m"
                                        "\n"
                                        R"m(    27048 "Get string from column, row")m"
                                        "\n"
                                        R"m(    27049 "Get value from label, row")m"
                                        "\n"
                                        R"m(    27050 "Get string from label, row")m"
                                        "\n"
                                        R"m(    "Aggregates")m"
                                        "\n"
                                        R"m(      27052 "Maximum value (column)")m"
                                        "\n"
                                        R"m(      27053 "Minimum value (column)")m"
                                        "\n"
                                        R"m(      27054 "Summed value (column)")m"
                                        "\n"
                                        R"m(      27055 "Average value (column)")m"
                                        "\n"
                                        R"m(      -)m"
                                        "\n"
                                        R"m(      27056 "Maximum value (label)")m"
                                        "\n"
                                        R"m(      27057 "Minimum value (label)")m"
                                        "\n"
                                        R"m(      27058 "Summed value (label)")m"
                                        "\n"
                                        R"m(      27059 "Average value (label)")m"
                                        "\n";

const char* const kActionMenuTexts[79] = {
    "Save to file",
    "Save as MMF1.5 array",
    "Save to CSV file",
    "Load from file",
    "Load from MMF array",
    "Load from CSV file",
    "Insert string at",
    "Insert value at",
    "Append string",
    "Append value",
    "Append elements from file",
    "Append elements from MMF array",
    "Append elements from CSV file",
    "Set string at",
    "Set value at",
    "Pick column for select between",
    "Delete at",
    "Delete all",
    "Save element to file",
    "Append element to file",
    "Set key string at",
    "Set key value at",
    "Sort strings ascending (ABC)",
    "Sort strings descending (CBA)",
    "Sort values ascending (123)",
    "Sort values descending (321)",
    "Select rows between values",
    "Set array dimension",
    "Use 2D array (dimensions: 2)",
    "Use 3D array (dimensions: 3)",
    "Set dimension boundary",
    "Resize dimension boundary",
    "Insert row from list",
    "Select rows greater than or equal to",
    "Append row from list",
    "Select rows less than",
    "Replace row with list",
    "Select rows less than or equal to",
    "Pick label for select between",
    "Delete row",
    "Sort rows by column value ascending",
    "Sort rows by column value descending",
    "Sort rows by column string ascending",
    "Sort rows by column string descending",
    "Sort rows by label value ascending",
    "Sort rows by label value descending",
    "Sort rows by label string ascending",
    "Sort rows by label string descending",
    "Set label",
    "Select rows between strings",
    "Case Insensitive (A=a)",
    "Case Sensitive (A<a)",
    "Set file at",
    "Insert file at",
    "Append file",
    "Literal",
    "Wildcard",
    "Set list delimiter",
    "Save to INI file",
    "Load from INI file",
    "Append elements from INI file",
    "AND (Exclusive)",
    "OR (Inclusive)",
    "Select all rows",
    "Invert selection",
    "Select rows matching",
    "Select rows containing",
    "Select rows equal to",
    "Select rows not equal to",
    "Select rows greater than",
    "Select rows greater than or equal to",
    "Select rows less than",
    "Select rows less than or equal to",
    "Select rows matching",
    "Select rows containing",
    "Select rows equal to",
    "Select rows not equal to",
    "Select rows greater than",
    "Start new Where",
};

const char* const kActionStrings[79] = {
    "11%s: Save to file %s",
    "11%s: Save to MMF Array %s",
    "11%s: Save to CSV file %s",
    "11%s: Load from file %s",
    "11%s: Load from MMF Array %s",
    "11%s: Load from CSV file %s",
    "11%s: Insert string %s at %s",
    "11%s: Insert value %s at %s",
    "11%s: Append string %s",
    "11%s: Append value %s",
    "11%s: Append elements from file %s",
    "11%s: Append elements from MMF Array %s",
    "11%s: Append elements from CSV file %s",
    "11%s: Set string %s at %s",
    "11%s: Set value %s at %s",
    "11%s: Pick col %s for SELECT BETWEEN",
    "11%s: Delete at %s",
    "10%s: Delete all",
    "11%s: Save element %s to file %s",
    "11%s: Append element %s to file %s",
    "11%s: Set key string %s at %s",
    "11%s: Set key value %s at %s",
    "10%s: Sort strings ascending (ABC)",
    "10%s: Sort strings descending (CBA)",
    "10%s: Sort values ascending (123)",
    "10%s: Sort values descending (321)",
    "11%s: SELECT BETWEEN %s AND %s",
    "11%s: Set array dimension to %s",
    "10%s: Set array dimension to 2",
    "10%s: Set array dimension to 3",
    "11%s: Set dimension %s boundary to %s",
    "11%s: Resize dimension %s boundary to %s",
    "11%s: Insert row from list %s at %s",
    "11%s: SELECT WHERE %s >= %s",
    "11%s: Append row from list %s",
    "11%s: SELECT WHERE %s < %s",
    "11%s: Replace row from list %s at %s",
    "11%s: SELECT WHERE %s <= %s",
    "11%s: Pick %s for SELECT BETWEEN",
    "11%s: Delete row %s",
    "11%s: Sort rows by column %s value ascending",
    "11%s: Sort rows by column %s value descending",
    "11%s: Sort rows by column %s string ascending",
    "11%s: Sort rows by column %s string descending",
    "11%s: Sort rows by label %s value ascending",
    "11%s: Sort rows by label %s value descending",
    "11%s: Sort rows by label %s string ascending",
    "11%s: Sort rows by label %s string descending",
    "11%s: Set label to %s at column %s",
    "11%s: SELECT BETWEEN %s AND %s",
    "10%s: Case insensitive (A=a)",
    "10%s: Case sensitive (A<a)",
    "11%s: Set file %s at %s",
    "11%s: Insert file %s at %s",
    "11%s: Append file %s",
    "10%s: Use literal search mode",
    "10%s: Use wildcard search mode",
    "11%s: Set list delimiter to %s",
    "11%s: Save to INI file %s",
    "11%s: Load from INI file %s",
    "11%s: Append elements from INI file %s",
    "10%s: Select rows using AND mode",
    "10%s: Select rows using OR mode",
    "10%s: Select all rows",
    "10%s: Invert selection of rows",
    "11%s: SELECT WHERE col %s LIKE %s",
    "11%s: SELECT WHERE col %s LIKE *%s*",
    "11%s: SELECT WHERE col %s = %s",
    "11%s: SELECT WHERE col %s <> %s",
    "11%s: SELECT WHERE col %s > %s",
    "11%s: SELECT WHERE col %s >= %s",
    "11%s: SELECT WHERE col %s < %s",
    "11%s: SELECT WHERE col %s <= %s",
    "11%s: SELECT WHERE %s LIKE %s",
    "11%s: SELECT WHERE %s LIKE *%s*",
    "11%s: SELECT WHERE %s = %s",
    "11%s: SELECT WHERE %s <> %s",
    "11%s: SELECT WHERE %s > %s",
    "10%s: Start new WHERE (reset selected rows)",
};
const char* const kExpressionNames[60] = {
    "size(",
    "capacity(",
    "get$(",
    "get(",
    "key$(",
    "key(",
    "indexOfKeyStr(",
    "indexOfKeyVal(",
    "keyStr$(",
    "keyStr(",
    "keyVal$(",
    "keyVal(",
    "findStr(",
    "findVal(",
    "containsStr(",
    "containsVal(",
    "list$(",
    "quotedList$(",
    "keyList$(",
    "keyQuotedList$(",
    "pairList$(",
    "pairQuotedList$(",
    "max(",
    "min(",
    "sum(",
    "avg(",
    "dim(",
    "boundary(",
    "boundaryX(",
    "boundaryY(",
    "boundaryZ(",
    "boundaryCol(",
    "boundaryRow(",
    "boundaryPage(",
    "dimIndexOfIndex$(",
    "XOfIndex(",
    "YOfIndex(",
    "ZOfIndex(",
    "indexOfDimIndex(",
    "indexOfXY(",
    "numberOfRows(",
    "rowList$(",
    "numberOfCols(",
    "getLabel$(",
    "labelList$(",
    "getCol(",
    "columnList$(",
    "getFromColumnRow(",
    "getFromColumnRow$(",
    "getFromLabelRow(",
    "getFromLabelRow$(",
    "delimiter$(",
    "colMax(",
    "colMin(",
    "colSum(",
    "colAvg(",
    "labMax(",
    "labMin(",
    "labSum(",
    "labAvg(",
};

}  // namespace quorrel::editor_test
