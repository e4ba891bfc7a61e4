# The host array file: text cells written, text and number cells read.
echo "== host"
printf 'CNC ARRAY\0\x02\0\0\0\x02\0\0\0\x01\0\0\0\x01\0\0\0\x01\0\0\0\x07\0\0\0\0\0\0\0' >num.mmf
run <<'QS'
new dims=3 x=2 y=2
A appendString "a"
A appendValue 5
A appendString ""
A saveToHostArray "h.mmf"
new dims=1
A loadFromHostArray "h.mmf"
E size(
E get$( 0
E get$( 1
E get$( 2
A appendElementsFromHostArray "h.mmf"
E size(
A loadFromHostArray "num.mmf"
E size(
E get( 0
E get$( 1
QS
dump h.mmf
