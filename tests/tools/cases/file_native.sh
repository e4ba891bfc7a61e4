# The native array file saved byte for byte, loaded and appended.
echo "== native"
run <<'QS'
new x=3
A appendString "ab"
A appendValue 7
A setKeyStringAt "k" 1
A saveToFile "ex.arr"
new dims=1
A loadFromFile "ex.arr"
E dim(
E boundaryX(
E size(
E get$( 0
E get( 1
E key$( 1
E key$( 0
A appendElementsFromFile "ex.arr"
E size(
E get$( 2
E key$( 3
QS
dump ex.arr
