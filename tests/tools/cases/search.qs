# Key lookup and element search under the case and search settings.
new dims=1
A appendString "Apple"
A appendValue 12
A appendString "banana split"
A appendString "apple"
A appendValue 0
A appendString "1234"
A setKeyStringAt "fruit" 0
A setKeyValueAt 7 1
A setKeyStringAt "05" 2
A setKeyStringAt "item*" 3
A setKeyValueAt 0 4
A setKeyStringAt "num" 5
E indexOfKeyStr( "FRUIT"
E indexOfKeyVal( 7
# A string key reads as a number for a value probe; a value key as text.
E indexOfKeyVal( 5
E indexOfKeyStr( "7"
E indexOfKeyStr( "nokey"
# The value probe 0 matches the first key without a leading number.
E indexOfKeyVal( 0
E keyStr$( "fruit"
E keyStr( 7
E keyStr$( "none"
E keyVal$( "NUM"
E keyVal( 7
E keyVal( 8
E findStr( "apple" 99
A caseSensitive
E findStr( "apple" 0
E indexOfKeyStr( "FRUIT"
A caseInsensitive
E findStr( "12" 0
E findStr( "" 0
E findVal( 12 0
E findVal( 0 0
E findVal( 1234 -5
E containsStr( "an" 0
E containsStr( "PLE" 0
E containsVal( 23 0
E containsStr( "zzz" 0
E containsStr( "" 0
A wildcardSearch
E findStr( "b*" 0
E indexOfKeyStr( "item7"
E containsStr( "p?i" 0
E findStr( "*" 0
A literalSearch
E findStr( "b*" 0
# Element 0 has no key, element 2 a None key (set to 0), elements 1 and 3 the same key.
new dims=1
A appendString "a"
A appendString "b"
A appendString "c"
A appendString "d"
A setKeyValueAt 0 2
A setKeyStringAt "7k" 1
A setKeyStringAt "7k" 3
E indexOfKeyVal( 0
E indexOfKeyStr( "0"
E indexOfKeyStr( ""
E indexOfKeyStr( "7K"
E indexOfKeyVal( 7
E keyStr$( ""
E keyStr$( "x"
E keyVal$( "x"
# Elements are found by their text or leading number; file bytes have no number.
new dims=1
E indexOfKeyStr( ""
E findVal( 0 0
A appendString "42"
A saveElementToFile 0 "f42"
A deleteAll
A appendString ""
A appendString "  -7 apples"
A appendValue 9
A appendFile "f42"
E findVal( 0 0
E findVal( -7 0
E findVal( 9 -1
E findVal( 42 0
A wildcardSearch
E findStr( "*" 0
A setValueAt -512 0
E containsVal( -5 0
E containsStr( "-5120" 0
