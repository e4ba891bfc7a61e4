# Row selection: AND and OR modes, where-tests by column and label, between tests.
new x=3 autoselect=1
A 34 "ann,120,3"
A 34 "bob,95,2"
A 34 "cy,70,7"
A 34 "dee,95,abc"
A 48 "name" 0
A 48 "score" 1
A 48 "level" 2
E 40
A 78
E 40
E 41 0
A 67 1 95
E 40
E 46 0
A 75 "level" 7
E 46 0
A 61
A 70 1 90
E 46 0
A 64
E 46 0
A 63
E 40
# "abc" has the value 0.
A 72 2 3
E 46 0
A 68 1 95
E 46 0
A 62
A 69 1 90
E 46 0
A 78
A 71 1 95
E 46 0
A 78
A 65 0 "BOB"
E 46 0
A 66 0 "e"
E 46 0
A 78
A 73 "name" "a*"
E 40
A 56
A 73 "name" "a*"
A 74 "name" "y"
E 46 0
A 55
A 78
A 76 "score" 95
E 46 0
A 78
A 77 "level" 2
E 46 0
A 78
A 33 "score" 100
E 46 0
A 35 "score" 95
E 46 0
A 78
A 37 "level" 2
E 46 0
A 78
A 15 1
A 26 90 100
E 46 0
A 78
A 38 "name"
A 49 "b" "d"
E 46 0
# An unknown label picks column -1: each row tests the last cell of the row before.
A 78
A 38 "nolabel"
A 26 0 1000
E 46 0
# New rows start unselected without automatic selection.
new x=2
A 34 "p,1"
E 40
A 63
E 40
