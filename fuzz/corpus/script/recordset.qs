# The 2D array as a table: row edits from lists, labels, row, column and cell reads.
new x=3 autoselect=1
E 42
E 40
A 34 "ann,120,3"
A 34 "bob,95,2"
A 34 "cy,95,7"
E 40
E 41 0
E 0
E 43 0
E 44
A 48 "name" 0
A 48 "score" 1
A 48 "level" 2
A 48 "nowhere" 3
E 44
E 43 1
E 45 "LEVEL"
E 45 "nope"
E 46 1
E 46 3
E 47 1 2
E 48 0 1
E 49 "level" 2
E 50 "name" 0
E 48 5 5
# Inserting at visible row 1; a missing field leaves an empty element.
A 32 "dee,80" 1
E 40
E 41 1
E 41 2
A 36 "eve,60,1" 3
E 41 3
A 36 "nobody" 4
A 39 0
E 40
E 41 0
E 0
E 41 3
A 34 "a,b,c,d"
E 41 3
A 34 ",x,,y,"
E 41 4
A 57 ";"
E 41 0
E 44
E 46 0
