# Rows, columns and labels at their edges: text forms of every kind of cell, visible
# rows, refused edits, the size caps, a 1D array, and labels under every mode.
new x=3 autoselect=1
# "0" from a list stays a text; a missing field leaves an empty element.
A appendRowFromList "a,0"
E list$( "|"
E get$( 1
# Lists split at each delimiter character and join with the whole text.
A setListDelimiter ", "
A replaceRowWithList "x y,,  z" 0
E rowList$( 0
A setListDelimiter ","
# Every kind of cell: a value, a text, file bytes (listed as nothing), 0 (stored as
# nothing), a negative value and the empty text.
A deleteAll
A appendString "zz"
A saveElementToFile 0 "zz.bin"
A deleteAll
A appendValue 5
A appendString "x"
A appendFile "zz.bin"
A appendValue 0
A appendValue -12
A appendString ""
E rowList$( 0
E rowList$( 1
E columnList$( 1
# Rows and columns outside give the empty text.
E rowList$( 2
E rowList$( -1
E columnList$( 3
E columnList$( -1
# With no row visible a column lists nothing.
A startNewWhere
E columnList$( 0
# Only selected rows are visible: select r1 and r3 of four.
new x=2 autoselect=1
A appendRowFromList "r0,0"
A appendRowFromList "r1,1"
A appendRowFromList "r2,2"
A appendRowFromList "r3,3"
A startNewWhere
A selectWhereMatchingByColumn 0 "r1"
A selectWhereMatchingByColumn 0 "r3"
E numberOfRows(
E rowList$( 1
E columnList$( 0
# Cell reads take table rows, whatever the row states.
E getFromColumnRow$( 0 0
E getFromColumnRow$( 1 1
E getFromColumnRow$( 0 2
E getFromColumnRow$( 1 -1
# Append lands at the position of the visible row count; the new last position is
# selected, the others keep their states (r1, r2 and r3 now show).
A appendRowFromList "new,9"
E list$( "|"
E numberOfRows(
E rowList$( 1
# Insert before visible row 2, table row 4.
A insertRowFromList "ins,7" 2
E list$( "|"
E numberOfRows(
# Refused: insert above the row count, replace at the row count; visible row 0 is
# table row 1.
A insertRowFromList "no" 5
A replaceRowWithList "rep" 0
A replaceRowWithList "x,y" 4
E list$( "|"
# Visible row 2 is table row 4 ("ins"); row 3 is not below the row count.
A deleteRow 2
A deleteRow 3
E list$( "|"
E numberOfRows(
# With every row visible, a partial row's cell is pushed along by an appended row.
new x=2 autoselect=1
A appendRowFromList "a,1"
A appendString "partial"
E getFromColumnRow$( 0 1
A appendRowFromList "b,2"
E list$( "|"
# A row wider than the array's cap of 2^26 elements is never inserted.
new x=2147483647
A appendRowFromList "a,b"
A insertRowFromList "a,b" 0
E size(
A setDimensionBoundary 1 67108864
A appendValue 1
A appendRowFromList "x"
E size(
# The table is one half row, so the append goes at 0.
A setDimensionBoundary 1 2
A appendRowFromList "x,y"
E list$( "|"
# A negative row falls back to row 0 here: replace writes nothing in a table too wide
# for the cap, delete removes only the cells that are there.
new x=2147483647
A appendString "keep"
A replaceRowWithList "r" -1
E list$( "|"
A appendString "too"
A deleteRow -1
E size(
# A one-dimensional array has no table.
new dims=1
A setDimensionBoundary 1 3
A appendRowFromList "a,b,c"
E size(
E numberOfCols(
E numberOfRows(
A setLabel "x" 0
E getLabel$( 0
E labelList$(
E getCol( "x"
# Labels: found folded or exact, literally or by pattern.
new x=2
E labelList$(
E getCol( "*"
A setLabel "age" 1
E labelList$(
A setLabel "name" 0
A setLabel "neg" -1
E getCol( "AGE"
A caseSensitive
E getCol( "AGE"
E getCol( "age"
A wildcardSearch
E getCol( "a*"
E getCol( "*"
E getCol( "A*"
A caseInsensitive
E getCol( "A*"
E getCol( "?"
# The label list keeps its length until the next label is set.
new x=2
A setLabel "a" 0
A setLabel "b" 1
A setDimensionBoundary 1 4
E labelList$(
E getLabel$( 3
A setLabel "d" 3
E labelList$(
A setDimensionBoundary 1 1
E getCol( "d"
A setLabel "z" 5
E labelList$(
E getCol( "d"
# Tables wider than 2^20 columns keep their labels as they are; 2^20 still gets them.
A setDimensionBoundary 1 2147483647
A setLabel "b" 1
E labelList$(
A setDimensionBoundary 1 1048577
A setLabel "b" 1
E labelList$(
A setDimensionBoundary 1 1048576
A setLabel "b" 1
E getLabel$( 1
# The empty text is a label like any other; a column never labelled has none.
new x=3
A setLabel "c" 2
A wildcardSearch
E getCol( "*"
A literalSearch
E getCol( ""
A setLabel "" 0
A setLabel "b" 1
E getLabel$( 0
E getCol( ""
E labelList$(
A wildcardSearch
E getCol( "*"
E getCol( "?"
# Replacing it, and dropping it with its column, leave no trace.
A setLabel "a" 0
E getCol( "*"
A setLabel "" 2
A setDimensionBoundary 1 2
A setLabel "x" 0
A setDimensionBoundary 1 3
A setLabel "y" 0
E getLabel$( 2
A literalSearch
E getCol( ""
E labelList$(
# Labels made on a table of no columns exist but are empty.
new x=0
A setLabel "x" 0
E labelList$(
E getCol( "x"
# Reversed bounds pass nothing.
new x=1 autoselect=1
A appendRowFromList "1"
A appendRowFromList "2"
A appendRowFromList "3"
A selectionModeAnd
A pickColumnForBetween 0
A selectBetweenValues 3 1
E numberOfRows(
# Without the automatic selection new rows are not visible, so an append lands at
# table row 0.
new x=2 autoselect=0
A appendValue 1
A appendValue 1
A appendValue 2
A appendValue 2
A appendRowFromList "3,3"
E numberOfRows(
E list$( "|"
A startNewWhere
A selectWhereGreaterByColumn 0 1
E numberOfRows(
