# INI saved byte for byte and read back, with comments, bare keys and sections.
dump() { echo "$1: $(wc -c <"$1") bytes"; od -An -tx1 -v "$1"; }
run() { cat >s.qs; "$QUORREL" run s.qs; echo "status $?"; }

echo "== ini"
printf 'junk=1\r\n[S]\r\n// c\r\n  key = v \r\nflag\r\nx\r\nx=\r\n[Other] z\r\na=b=c\r\n' >in.ini
run <<'QS'
new dims=1
A 8 "a"
A 20 "k1" 0
A 9 5
A 58 "t.ini"
A 59 "t.ini"
E 0
E 2 1
E 4 0
E 4 1
A 59 "in.ini"
E 0
E 20 ":" "|"
E 4 1
A 60 "t.ini"
E 0
QS
dump t.ini
