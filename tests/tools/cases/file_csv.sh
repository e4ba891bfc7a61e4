# CSV saved byte for byte, loaded with padding of short rows, appended.
echo "== csv"
printf 'a\n\nb,c,d\r\ne,f' >rows.csv
run <<'QS'
new x=2
A appendString "name"
A appendString "age"
A appendValue 7
A saveToCsv "t.csv"
new dims=1
A loadFromCsv "t.csv"
E dim(
E boundaryX(
E size(
E get$( 2
E get$( 3
A loadFromCsv "rows.csv"
E boundaryX(
E size(
E list$( "|"
A appendElementsFromCsv "t.csv"
E boundaryX(
E size(
QS
dump t.csv
