# Rows, columns and labels at their edges: text forms of every kind of cell, visible
# rows, refused edits, the size caps, a 1D array, and labels under every mode.
new x=3 autoselect=1
# "0" from a list stays a text; a missing field leaves an empty element.
A 34 "a,0"
E 16 "|"
E 2 1
# Lists split at each delimiter character and join with the whole text.
A 57 ", "
A 36 "x y,,  z" 0
E 41 0
A 57 ","
# Every kind of cell: a value, a text, file bytes (listed as nothing), 0 (stored as
# nothing), a negative value and the empty text.
A 17
A 8 "zz"
A 18 0 "zz.bin"
A 17
A 9 5
A 8 "x"
A 54 "zz.bin"
A 9 0
A 9 -12
A 8 ""
E 41 0
E 41 1
E 46 1
# Rows and columns outside give the empty text.
E 41 2
E 41 -1
E 46 3
E 46 -1
# With no row visible a column lists nothing.
A 78
E 46 0
# Only selected rows are visible: select r1 and r3 of four.
new x=2 autoselect=1
A 34 "r0,0"
A 34 "r1,1"
A 34 "r2,2"
A 34 "r3,3"
A 78
A 65 0 "r1"
A 65 0 "r3"
E 40
E 41 1
E 46 0
# Cell reads take table rows, whatever the row states.
E 48 0 0
E 48 1 1
E 48 0 2
E 48 1 -1
# Append lands at the position of the visible row count; the new last position is
# selected, the others keep their states (r1, r2 and r3 now show).
A 34 "new,9"
E 16 "|"
E 40
E 41 1
# Insert before visible row 2, table row 4.
A 32 "ins,7" 2
E 16 "|"
E 40
# Refused: insert above the row count, replace at the row count; visible row 0 is
# table row 1.
A 32 "no" 5
A 36 "rep" 0
A 36 "x,y" 4
E 16 "|"
# Visible row 2 is table row 4 ("ins"); row 3 is not below the row count.
A 39 2
A 39 3
E 16 "|"
E 40
# With every row visible, a partial row's cell is pushed along by an appended row.
new x=2 autoselect=1
A 34 "a,1"
A 8 "partial"
E 48 0 1
A 34 "b,2"
E 16 "|"
# A row wider than the array's cap of 2^26 elements is never inserted.
new x=2147483647
A 34 "a,b"
A 32 "a,b" 0
E 0
A 30 1 67108864
A 9 1
A 34 "x"
E 0
# The table is one half row, so the append goes at 0.
A 30 1 2
A 34 "x,y"
E 16 "|"
# A negative row falls back to row 0 here: replace writes nothing in a table too wide
# for the cap, delete removes only the cells that are there.
new x=2147483647
A 8 "keep"
A 36 "r" -1
E 16 "|"
A 8 "too"
A 39 -1
E 0
# A one-dimensional array has no table.
new dims=1
A 30 1 3
A 34 "a,b,c"
E 0
E 42
E 40
A 48 "x" 0
E 43 0
E 44
E 45 "x"
# Labels: found folded or exact, literally or by pattern.
new x=2
E 44
E 45 "*"
A 48 "age" 1
E 44
A 48 "name" 0
A 48 "neg" -1
E 45 "AGE"
A 51
E 45 "AGE"
E 45 "age"
A 56
E 45 "a*"
E 45 "*"
E 45 "A*"
A 50
E 45 "A*"
E 45 "?"
# The label list keeps its length until the next label is set.
new x=2
A 48 "a" 0
A 48 "b" 1
A 30 1 4
E 44
E 43 3
A 48 "d" 3
E 44
A 30 1 1
E 45 "d"
A 48 "z" 5
E 44
E 45 "d"
# Tables wider than 2^20 columns keep their labels as they are; 2^20 still gets them.
A 30 1 2147483647
A 48 "b" 1
E 44
A 30 1 1048577
A 48 "b" 1
E 44
A 30 1 1048576
A 48 "b" 1
E 43 1
# The empty text is a label like any other; a column never labelled has none.
new x=3
A 48 "c" 2
A 56
E 45 "*"
A 55
E 45 ""
A 48 "" 0
A 48 "b" 1
E 43 0
E 45 ""
E 44
A 56
E 45 "*"
E 45 "?"
# Replacing it, and dropping it with its column, leave no trace.
A 48 "a" 0
E 45 "*"
A 48 "" 2
A 30 1 2
A 48 "x" 0
A 30 1 3
A 48 "y" 0
E 43 2
A 55
E 45 ""
E 44
# Labels made on a table of no columns exist but are empty.
new x=0
A 48 "x" 0
E 44
E 45 "x"
# Selection commands that test no cell: invert, select all; reversed bounds pass nothing.
new x=1 autoselect=1
A 34 "1"
A 34 "2"
A 34 "3"
A 78
E 40
A 67 0 1
A 67 0 3
A 64
E 40
E 41 0
A 61
A 63
E 40
A 15 0
A 26 3 1
E 40
# Without the automatic selection new rows are not visible, so an append lands at
# table row 0.
new x=2 autoselect=0
A 9 1
A 9 1
A 9 2
A 9 2
A 34 "3,3"
E 40
E 16 "|"
A 78
A 69 0 1
E 40
