# Dimensions, boundaries and index transforms. The default instance is 2D with X 10.
E 26
E 27 1
E 28
E 29
E 30
E 31
E 32
E 33
E 27 0
E 35 23
E 36 23
E 37 23
E 34 2 23
E 39 3 2
E 38 "3,2"
A 57 ";"
E 38 "3;2"
E 38 "3,2"
E 38 ";;7;;1;"
E 38 ""
A 29
A 30 2 3
A 30 1 4
E 26
E 29
E 30
E 32
E 33
E 35 17
E 36 17
E 37 17
E 38 "1;1;1"
E 39 1 1
# Boundaries below 1 and dimensions at or above the count are ignored.
A 30 1 0
A 30 1 -4
E 28
A 30 3 9
E 27 3
A 27 12
E 26
A 27 1
E 26
E 28
E 35 7
E 36 7
A 28
E 26
E 28
E 35 -1
E 36 -1
# Resizing keeps the coordinates of complete rows: k l m / n o p / q r.
new x=3
A 8 "k"
A 8 "l"
A 8 "m"
A 8 "n"
A 8 "o"
A 8 "p"
A 8 "q"
A 8 "r"
A 31 1 5
E 0
E 2 3
E 2 5
E 2 9
E 2 11
E 28
A 31 1 2
E 0
E 2 2
E 2 4
E 2 5
