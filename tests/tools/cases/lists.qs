# Element, key and pair lists, totals, the list delimiter and element sorts.
new dims=1
A 9 5
A 8 "ab"
A 9 0
A 8 "c"
A 8 "it's"
E 16 ","
E 17 ","
E 16 ", "
E 16 ""
A 20 "k0" 0
A 21 7 2
A 20 "kc" 3
E 18 ","
E 19 ","
E 20 "=" ";"
E 21 "=" ";"
E 22
E 23
E 24
E 25
A 9 -12
E 23
E 24
E 25
E 51
A 57 "; "
E 51
A 57 ""
E 51
# Sorts move keys with their elements; equal texts may swap.
new dims=1
A 8 "b"
A 8 "A"
A 8 "a"
A 20 "kb" 0
A 20 "kA" 1
A 20 "ka" 2
A 22
E 16 ","
E 18 ","
A 51
A 22
E 16 ","
A 17
A 9 3
A 9 1
A 9 2
A 24
E 16 ","
A 25
E 16 ","
A 17
A 9 10
A 9 9
A 22
E 16 ","
A 24
E 16 ","
A 23
E 16 ","
A 17
A 9 2147483647
A 9 1
E 24
E 22
# Totals: sums wrap and the average divides the wrapped sum, truncating toward zero.
new dims=1
A 9 2147483647
A 9 1
E 22
E 23
E 24
E 25
A 9 2147483647
A 8 "2147483647"
E 24
# None and file bytes count as 0, texts by their leading number.
new dims=1
A 8 "fg"
A 18 0 "fg.bin"
A 17
A 9 -4
A 9 0
A 54 "fg.bin"
A 8 "12abc"
E 22
E 23
E 24
E 25
A 13 "-9" 3
E 22
E 23
E 24
E 25
new dims=1
E 22
E 23
E 24
E 25
# Element sorts: ties, None, leading numbers and '_' against both cases.
new dims=1
A 8 "b"
A 8 "A"
A 8 "a"
A 51
A 23
E 16 ","
# 9, 10, "10" by text: pivot 10 (slot 1); 9 swaps with "10", then the left part
# ["10", 10] is already in place. Keys 1, 2, 3 show which 10 is which.
new dims=1
A 9 9
A 9 10
A 8 "10"
A 21 1 0
A 21 2 1
A 21 3 2
A 22
E 16 ","
E 18 ","
# None (a stored 0) sorts as 0 by value and as "" by text.
new dims=1
A 8 "12"
A 8 "5x"
A 9 0
A 9 -1
A 24
E 16 ","
A 22
E 16 ","
# '_' sorts before letters when folded, between the cases when not.
new dims=1
A 8 "a"
A 8 "_"
A 8 "B"
A 22
E 16 ","
A 51
A 22
E 16 ","
