# CSV saved byte for byte, loaded with padding of short rows, appended.
dump() { echo "$1: $(wc -c <"$1") bytes"; od -An -tx1 -v "$1"; }
run() { cat >s.qs; "$QUORREL" run s.qs; echo "status $?"; }

echo "== csv"
printf 'a\n\nb,c,d\r\ne,f' >rows.csv
run <<'QS'
new x=2
A 8 "name"
A 8 "age"
A 9 7
A 2 "t.csv"
new dims=1
A 5 "t.csv"
E 26
E 28
E 0
E 2 2
E 2 3
A 5 "rows.csv"
E 28
E 0
E 16 "|"
A 12 "t.csv"
E 28
E 0
QS
dump t.csv
