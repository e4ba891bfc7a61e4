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
# Texts read as numbers as atol reads them in the C locale: blanks, one sign, then
# digits up to the first other character, saturating at the int32 limits; 0xA0 is
# not a blank.
new dims=1
A 8 "0042"
E 3 0
A 8 "  9 apples"
E 3 1
A 8 "-"
E 3 2
A 8 " -7"
E 3 3
A 8 "12abc"
E 3 4
A 8 "abc"
E 3 5
A 8 "+5"
E 3 6
A 8 "\t\n\x0b\x0c\r8"
E 3 7
A 8 "+-3"
E 3 8
A 8 "- 3"
E 3 9
A 8 "3 4"
E 3 10
A 8 "\xa05"
E 3 11
A 8 "2147483647"
E 3 12
A 8 "2147483648"
E 3 13
A 8 "99999999999999999999999"
E 3 14
A 8 "-2147483648"
E 3 15
A 8 "-2147483649"
E 3 16
A 8 "-99999999999999999999999"
E 3 17
A 8 "000000000000000000000000012"
E 3 18
# Reads outside give nothing; a set past the end fills with empty elements, and so does
# a set of 0; negative and unreachable indexes change nothing.
new dims=1
E 2 0
E 4 0
A 13 "a" 5
E 16 "|"
E 2 2
E 3 -1
A 14 0 7
A 14 0 5
A 13 "b" -1
A 13 "b" 2147483647
A 6 "b" 2147483647
E 16 "|"
E 0
# Inserts past the end fill too; deletes outside do nothing.
new dims=1
A 8 "a"
A 7 7 2
A 6 "x" 6
A 6 "n" -1
A 16 -1
A 16 7
E 16 "|"
# Clear keeps the settings; elements set again start keyless.
A 27 2
A 30 1 4
A 57 ";:"
A 21 3 1
A 17
E 27 1
E 51
A 13 "x" 1
E 4 1
E 5 1
