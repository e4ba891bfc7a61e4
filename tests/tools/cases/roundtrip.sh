# convert through all four formats and inspect each file on the way: native with
# labels and a key, CSV (texts only), INI (keys, no dimensions), host (3D, no keys)
# and back to native.
q() { "$QUORREL" "$@"; echo "status $?"; }
cat >make.qs <<'QS'
new x=3
A 8 "ann"
A 8 "120"
A 9 3
A 8 "bob"
A 8 "95"
A 9 2
A 48 "name" 0
A 48 "score" 1
A 48 "level" 2
A 20 "top" 0
A 0 "scores.arr"
QS
q run make.qs
q inspect scores.arr
q convert scores.arr scores.csv
q inspect scores.csv
q convert scores.csv scores.ini
q inspect scores.ini
q convert scores.ini scores.mmf --to host
q inspect scores.mmf
q convert scores.mmf back.arr
q inspect back.arr
# The extension decides the format unless --to does; an unknown one needs --to.
q convert back.arr upper.INI
head -n 1 upper.INI | od -An -c
q convert scores.csv scores.dat
q convert scores.csv native.csv --to native
head -c 8 native.csv; echo
q convert scores.csv no-such-dir/x.arr
