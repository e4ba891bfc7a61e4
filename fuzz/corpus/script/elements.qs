# Element edits, keys and reads through the routine tables.
E 0
E 1
E 2 0
A 8 "apple"
A 9 42
A 9 0
A 7 -7 1
A 6 "first" 0
E 0
E 2 0
E 2 2
E 3 2
# The value 0 is stored as an empty element: empty text, value 0.
E 2 4
E 3 4
E 3 1
A 13 "12abc" 4
E 3 4
# Setting past the end grows the array with empty elements.
A 14 99 7
E 0
E 2 6
E 3 7
A 16 1
E 0
E 2 1
A 16 7
A 16 -1
A 6 "x" -1
E 0
A 20 "k-first" 0
A 21 5 2
A 21 0 1
A 20 "far" 7
E 4 0
E 5 0
E 4 2
E 5 2
# A key set to 0 exists and is empty; an element without a key gives no text.
E 4 1
E 4 3
E 0
A 8 "tab\tq\"\\\x01\xff"
E 2 7
A 17
E 0
E 1
# Capacity grows by half when the size passes half of it.
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
A 9 1
E 1
A 9 1
E 1
E 0
