# Single elements written to files, and whole files read into elements.
echo "== element files"
: >empty.bin
run <<'QS'
new dims=1
A appendString "abc"
A saveElementToFile 0 "e.bin"
A appendElementToFile 0 "e.bin"
A appendFile "e.bin"
A saveElementToFile 1 "copy.bin"
A insertFileAt "e.bin" 0
E size(
E get$( 0
E containsStr( "c" 0
A setFileAt "empty.bin" 2
E list$( ","
A saveElementToFile 2 "none.bin"
A saveElementToFile 3 "nope.bin"
QS
dump e.bin
cmp e.bin copy.bin && echo "copy.bin equals e.bin"
dump none.bin
test -e nope.bin || echo "nope.bin was not created"
