# Row sorts by column and by label; keys travel with their cells.
new x=2 autoselect=1
A 34 "b,2"
A 34 "a,3"
A 34 "c,1"
A 20 "key-a" 2
A 42 0
E 46 1
E 4 0
A 40 1
E 46 0
A 41 1
E 46 0
A 43 0
E 46 0
A 48 "letter" 0
A 48 "num" 1
A 45 "num"
E 46 0
A 47 "LETTER"
E 46 0
A 46 "letter"
E 46 0
A 44 "num"
E 46 0
A 44 "missing"
A 42 2
E 46 0
# Text order of values: 10 before 9; value order: 9 before 10.
new x=1 autoselect=1
A 34 "10"
A 34 "9"
A 42 0
E 46 0
A 40 0
E 46 0
# Ties end in the order the first-row-pivot partition steps give them (worked by hand).
new x=2 autoselect=1
A 34 "2,A"
A 34 "1,B"
A 34 "2,C"
A 34 "1,D"
A 40 0
E 46 1
new x=1 autoselect=1
A 34 "b"
A 34 "A"
A 34 "a"
A 42 0
E 46 0
A 51
A 42 0
E 46 0
# Three equal keys already in order: the run is reversed end to end.
new x=2 autoselect=1
A 34 "5,p"
A 34 "5,q"
A 34 "5,r"
A 34 "6,s"
A 40 0
E 46 1
# With two rows visible, table rows 0 and 1 are sorted, whichever rows are selected,
# and the states stay where they were.
new x=1 autoselect=1
A 34 "4"
A 34 "3"
A 34 "2"
A 34 "1"
A 78
A 67 0 2
A 67 0 1
A 40 0
E 16 "|"
E 46 0
# Columns outside the table, and a one-dimensional array, change nothing.
new x=2 autoselect=1
A 34 "b,2"
A 34 "a,1"
A 42 2
A 42 -1
E 16 "|"
new dims=1
A 9 2
A 9 1
A 40 0
E 16 "|"
