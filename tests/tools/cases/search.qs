# Key lookup and element search under the case and search settings.
new dims=1
A 8 "Apple"
A 9 12
A 8 "banana split"
A 8 "apple"
A 9 0
A 8 "1234"
A 20 "fruit" 0
A 21 7 1
A 20 "05" 2
A 20 "item*" 3
A 21 0 4
A 20 "num" 5
E 6 "FRUIT"
E 7 7
# A string key reads as a number for a value probe; a value key as text.
E 7 5
E 6 "7"
E 6 "nokey"
# The value probe 0 matches the first key without a leading number.
E 7 0
E 8 "fruit"
E 9 7
E 8 "none"
E 10 "NUM"
E 11 7
E 11 8
E 12 "apple" 99
A 51
E 12 "apple" 0
E 6 "FRUIT"
A 50
E 12 "12" 0
E 12 "" 0
E 13 12 0
E 13 0 0
E 13 1234 -5
E 14 "an" 0
E 14 "PLE" 0
E 15 23 0
E 14 "zzz" 0
E 14 "" 0
A 56
E 12 "b*" 0
E 6 "item7"
E 14 "p?i" 0
E 12 "*" 0
A 55
E 12 "b*" 0
# Element 0 has no key, element 2 a None key (set to 0), elements 1 and 3 the same key.
new dims=1
A 8 "a"
A 8 "b"
A 8 "c"
A 8 "d"
A 21 0 2
A 20 "7k" 1
A 20 "7k" 3
E 7 0
E 6 "0"
E 6 ""
E 6 "7K"
E 7 7
E 8 ""
E 8 "x"
E 10 "x"
# Elements are found by their text or leading number; file bytes have no number.
new dims=1
E 6 ""
E 13 0 0
A 8 "42"
A 18 0 "f42"
A 17
A 8 ""
A 8 "  -7 apples"
A 9 9
A 54 "f42"
E 13 0 0
E 13 -7 0
E 13 9 -1
E 13 42 0
A 56
E 12 "*" 0
A 14 -512 0
E 15 -5 0
E 14 "-5120" 0
