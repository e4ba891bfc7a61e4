# The host array file: text cells written, text and number cells read.
dump() { echo "$1: $(wc -c <"$1") bytes"; od -An -tx1 -v "$1"; }
run() { cat >s.qs; "$QUORREL" run s.qs; echo "status $?"; }

echo "== host"
printf 'CNC ARRAY\0\x02\0\0\0\x02\0\0\0\x01\0\0\0\x01\0\0\0\x01\0\0\0\x07\0\0\0\0\0\0\0' >num.mmf
run <<'QS'
new dims=3 x=2 y=2
A 8 "a"
A 9 5
A 8 ""
A 1 "h.mmf"
new dims=1
A 4 "h.mmf"
E 0
E 2 0
E 2 1
E 2 2
A 11 "h.mmf"
E 0
A 4 "num.mmf"
E 0
E 3 0
E 2 1
QS
dump h.mmf
