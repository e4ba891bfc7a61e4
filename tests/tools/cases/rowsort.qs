# Row sorts by column and by label; keys travel with their cells.
new x=2 autoselect=1
A appendRowFromList "b,2"
A appendRowFromList "a,3"
A appendRowFromList "c,1"
A setKeyStringAt "key-a" 2
A sortRowsByColumnStringAscending 0
E columnList$( 1
E key$( 0
A sortRowsByColumnValueAscending 1
E columnList$( 0
A sortRowsByColumnValueDescending 1
E columnList$( 0
A sortRowsByColumnStringDescending 0
E columnList$( 0
A setLabel "letter" 0
A setLabel "num" 1
A sortRowsByLabelValueDescending "num"
E columnList$( 0
A sortRowsByLabelStringDescending "LETTER"
E columnList$( 0
A sortRowsByLabelStringAscending "letter"
E columnList$( 0
A sortRowsByLabelValueAscending "num"
E columnList$( 0
A sortRowsByLabelValueAscending "missing"
E columnList$( 0
# Text order of values: 10 before 9; value order: 9 before 10.
new x=1 autoselect=1
A appendRowFromList "10"
A appendRowFromList "9"
A sortRowsByColumnStringAscending 0
E columnList$( 0
A sortRowsByColumnValueAscending 0
E columnList$( 0
# Ties end in the order the first-row-pivot partition steps give them (worked by hand).
new x=2 autoselect=1
A appendRowFromList "2,A"
A appendRowFromList "1,B"
A appendRowFromList "2,C"
A appendRowFromList "1,D"
A sortRowsByColumnValueAscending 0
E columnList$( 1
new x=1 autoselect=1
A appendRowFromList "b"
A appendRowFromList "A"
A appendRowFromList "a"
A sortRowsByColumnStringAscending 0
E columnList$( 0
A caseSensitive
A sortRowsByColumnStringAscending 0
E columnList$( 0
# Three equal keys already in order: the run is reversed end to end.
new x=2 autoselect=1
A appendRowFromList "5,p"
A appendRowFromList "5,q"
A appendRowFromList "5,r"
A appendRowFromList "6,s"
A sortRowsByColumnValueAscending 0
E columnList$( 1
# With two rows visible, table rows 0 and 1 are sorted, whichever rows are selected,
# and the states stay where they were.
new x=1 autoselect=1
A appendRowFromList "4"
A appendRowFromList "3"
A appendRowFromList "2"
A appendRowFromList "1"
A startNewWhere
A selectWhereEqualByColumn 0 2
A selectWhereEqualByColumn 0 1
A sortRowsByColumnValueAscending 0
E list$( "|"
E columnList$( 0
# Columns outside the table, and a one-dimensional array, change nothing.
new x=2 autoselect=1
A appendRowFromList "b,2"
A appendRowFromList "a,1"
A sortRowsByColumnStringAscending 2
A sortRowsByColumnStringAscending -1
E list$( "|"
new dims=1
A appendValue 2
A appendValue 1
A sortRowsByColumnValueAscending 0
E list$( "|"
