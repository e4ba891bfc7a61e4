# INI saved byte for byte and read back, with comments, bare keys and sections.
echo "== ini"
printf 'junk=1\r\n[S]\r\n// c\r\n  key = v \r\nflag\r\nx\r\nx=\r\n[Other] z\r\na=b=c\r\n' >in.ini
run <<'QS'
new dims=1
A appendString "a"
A setKeyStringAt "k1" 0
A appendValue 5
A saveToIni "t.ini"
A loadFromIni "t.ini"
E size(
E get$( 1
E key$( 0
E key$( 1
A loadFromIni "in.ini"
E size(
E pairList$( ":" "|"
E key$( 1
A appendElementsFromIni "t.ini"
E size(
QS
dump t.ini
