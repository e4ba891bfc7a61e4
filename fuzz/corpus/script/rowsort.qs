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
