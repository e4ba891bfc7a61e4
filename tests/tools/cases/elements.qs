# Element edits, keys and reads through the routine tables.
E size(
E capacity(
E get$( 0
A appendString "apple"
A appendValue 42
A appendValue 0
A insertValueAt -7 1
A insertStringAt "first" 0
E size(
E get$( 0
E get$( 2
E get( 2
# The value 0 is stored as an empty element: empty text, value 0.
E get$( 4
E get( 4
E get( 1
A setStringAt "12abc" 4
E get( 4
# Setting past the end grows the array with empty elements.
A setValueAt 99 7
E size(
E get$( 6
E get( 7
A deleteAt 1
E size(
E get$( 1
A deleteAt 7
A deleteAt -1
A insertStringAt "x" -1
E size(
A setKeyStringAt "k-first" 0
A setKeyValueAt 5 2
A setKeyValueAt 0 1
A setKeyStringAt "far" 7
E key$( 0
E key( 0
E key$( 2
E key( 2
# A key set to 0 exists and is empty; an element without a key gives no text.
E key$( 1
E key$( 3
E size(
A appendString "tab\tq\"\\\x01\xff"
E get$( 7
A deleteAll
E size(
E capacity(
# Reads outside give nothing; a set past the end fills with empty elements, and so does
# a set of 0; negative and unreachable indexes change nothing.
new dims=1
E get$( 0
E key$( 0
A setStringAt "a" 5
E list$( "|"
E get$( 2
E get( -1
A setValueAt 0 7
A setValueAt 0 5
A setStringAt "b" -1
A setStringAt "b" 2147483647
A insertStringAt "b" 2147483647
E list$( "|"
E size(
# Inserts past the end fill too; deletes outside do nothing.
new dims=1
A appendString "a"
A insertValueAt 7 2
A insertStringAt "x" 6
A insertStringAt "n" -1
A deleteAt -1
A deleteAt 7
E list$( "|"
# Clear keeps the settings; elements set again start keyless.
A setArrayDimension 2
A setDimensionBoundary 1 4
A setListDelimiter ";:"
A setKeyValueAt 3 1
A deleteAll
E boundary( 1
E delimiter$(
A setStringAt "x" 1
E key$( 1
E key( 1
