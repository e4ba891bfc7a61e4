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
# Coordinates of an index in 2D, X 10: negative indexes give negative coordinates, and
# dimensions outside 1..2 give 0.
new
E 34 1 -1
E 34 2 -1
E 34 2 -23
E 34 1 -23
E 34 0 23
E 34 -1 23
E 34 3 23
# 3 * 10^8 * 10 + 1 wraps past 2^32.
E 39 1 300000000
# Counts outside 1..3 are kept but give no coordinates.
A 27 -3
E 26
E 34 1 7
A 27 0
E 27 0
# A 2D array whose X boundary is 0 divides by 0: the answer is 0.
new x=0
E 34 1 5
E 34 2 5
E 39 5 3
# Coordinate lists split at every delimiter character, and runs of them count as one.
new
E 38 ",,3,,,2,,"
E 38 " 3, -2"
E 38 "x,2"
E 38 ",,,"
# The delimiter is a set of characters, not a word; digits can separate too; with no
# delimiter the whole text is one token.
A 57 "ab"
E 38 "3b2"
E 38 "3ba2"
A 57 "0"
E 38 "305"
A 57 ""
E 38 "3,2"
E 38 ""
# Coordinates are not limited to their boundaries.
new x=3
E 38 "5,2"
# Tokens past the last dimension use the boundaries stored above it.
new dims=3 x=10 y=4
A 27 2
E 27 2
E 38 "1,2,3"
A 27 1
E 38 "1,2,3"
# Resizing X to 1 keeps the first element of each complete row: k l m / n o p / q r.
new x=3
A 8 "k"
A 8 "l"
A 8 "m"
A 8 "n"
A 8 "o"
A 8 "p"
A 8 "q"
A 8 "r"
A 31 1 1
E 16 "|"
E 28
# Data that fills at most one row moves nothing.
new x=3
A 8 "a"
A 8 "b"
A 8 "c"
A 31 1 5
E 16 "|"
E 28
# Without an X boundary the blocks are empty: only the boundary changes.
new x=0
A 8 "a"
A 8 "b"
A 8 "c"
A 8 "d"
A 31 1 3
E 16 "|"
E 28
# Refused resizes: a boundary below 1, a dimension below 0 or at the count.
new x=2
A 8 "a"
A 8 "b"
A 8 "c"
A 8 "d"
A 31 1 0
A 31 -1 3
A 31 2 3
E 16 "|"
E 28
# Entry 0 of a 1D array starts at -1: growing it to 1 adds 1 - (-1) = 2 empty elements
# after each element.
new dims=1
A 8 "a"
A 8 "b"
A 8 "c"
A 31 0 1
E 16 "|"
E 27 0
# Shrinking entry 0 by one block (one element) deletes at index 0 once per element, so
# all go; by more than one it would delete at negative indexes, so nothing moves.
new dims=1
A 30 0 2
A 8 "a"
A 8 "b"
A 8 "c"
A 31 0 1
E 0
E 27 0
new dims=1
A 30 0 5
A 8 "a"
A 8 "b"
A 8 "c"
A 31 0 2
E 16 "|"
E 27 0
