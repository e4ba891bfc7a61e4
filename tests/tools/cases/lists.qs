# Element, key and pair lists, totals, the list delimiter and element sorts.
new dims=1
A appendValue 5
A appendString "ab"
A appendValue 0
A appendString "c"
A appendString "it's"
E list$( ","
E quotedList$( ","
E list$( ", "
E list$( ""
A setKeyStringAt "k0" 0
A setKeyValueAt 7 2
A setKeyStringAt "kc" 3
E keyList$( ","
E keyQuotedList$( ","
E pairList$( "=" ";"
E pairQuotedList$( "=" ";"
E max(
E min(
E sum(
E avg(
A appendValue -12
E min(
E sum(
E avg(
E delimiter$(
A setListDelimiter "; "
E delimiter$(
A setListDelimiter ""
E delimiter$(
# Sorts move keys with their elements; equal texts may swap.
new dims=1
A appendString "b"
A appendString "A"
A appendString "a"
A setKeyStringAt "kb" 0
A setKeyStringAt "kA" 1
A setKeyStringAt "ka" 2
A sortStringsAscending
E list$( ","
E keyList$( ","
A caseSensitive
A sortStringsAscending
E list$( ","
A sortStringsDescending
E list$( ","
A deleteAll
A appendValue 3
A appendValue 1
A appendValue 2
A sortValuesAscending
E list$( ","
A sortValuesDescending
E list$( ","
A deleteAll
A appendValue 10
A appendValue 9
A sortStringsAscending
E list$( ","
A sortValuesAscending
E list$( ","
A sortStringsDescending
E list$( ","
# Totals: sums wrap and the average divides the wrapped sum, truncating toward zero.
new dims=1
A appendValue 2147483647
A appendValue 1
E max(
E min(
E sum(
E avg(
A appendValue 2147483647
A appendString "2147483647"
E sum(
# None and file bytes count as 0, texts by their leading number.
new dims=1
A appendString "fg"
A saveElementToFile 0 "fg.bin"
A deleteAll
A appendValue -4
A appendValue 0
A appendFile "fg.bin"
A appendString "12abc"
E max(
E min(
E sum(
E avg(
A setStringAt "-9" 3
E max(
E min(
E sum(
E avg(
new dims=1
E max(
E min(
E sum(
E avg(
# Element sorts: ties, None, leading numbers and '_' against both cases.
# 9, 10, "10" by text: pivot 10 (slot 1); 9 swaps with "10", then the left part
# ["10", 10] is already in place. Keys 1, 2, 3 show which 10 is which.
new dims=1
A appendValue 9
A appendValue 10
A appendString "10"
A setKeyValueAt 1 0
A setKeyValueAt 2 1
A setKeyValueAt 3 2
A sortStringsAscending
E list$( ","
E keyList$( ","
# None (a stored 0) sorts as 0 by value and as "" by text.
new dims=1
A appendString "12"
A appendString "5x"
A appendValue 0
A appendValue -1
A sortValuesAscending
E list$( ","
A sortStringsAscending
E list$( ","
# '_' sorts before letters when folded, between the cases when not.
new dims=1
A appendString "a"
A appendString "_"
A appendString "B"
A sortStringsAscending
E list$( ","
A caseSensitive
A sortStringsAscending
E list$( ","
