# Single elements written to files, and whole files read into elements.
dump() { echo "$1: $(wc -c <"$1") bytes"; od -An -tx1 -v "$1"; }
run() { cat >s.qs; "$QUORREL" run s.qs; echo "status $?"; }

echo "== element files"
: >empty.bin
run <<'QS'
new dims=1
A 8 "abc"
A 18 0 "e.bin"
A 19 0 "e.bin"
A 54 "e.bin"
A 18 1 "copy.bin"
A 53 "e.bin" 0
E 0
E 2 0
E 14 "c" 0
A 52 "empty.bin" 2
E 16 ","
A 18 2 "none.bin"
A 18 3 "nope.bin"
QS
dump e.bin
cmp e.bin copy.bin && echo "copy.bin equals e.bin"
dump none.bin
test -e nope.bin || echo "nope.bin was not created"
