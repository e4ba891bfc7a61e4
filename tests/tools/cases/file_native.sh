# The native array file saved byte for byte, loaded and appended.
dump() { echo "$1: $(wc -c <"$1") bytes"; od -An -tx1 -v "$1"; }
run() { cat >s.qs; "$QUORREL" run s.qs; echo "status $?"; }

echo "== native"
run <<'QS'
new x=3
A 8 "ab"
A 9 7
A 20 "k" 1
A 0 "ex.arr"
new dims=1
A 3 "ex.arr"
E 26
E 28
E 0
E 2 0
E 3 1
E 4 1
E 4 0
A 10 "ex.arr"
E 0
E 2 2
E 4 3
QS
dump ex.arr
