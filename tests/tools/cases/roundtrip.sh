# convert through all four formats and inspect each file on the way: native with
# labels and a key, CSV (texts only), INI (keys, no dimensions), host (3D, no keys)
# and back to native.
cat >make.qs <<'QS'
new x=3
A appendString "ann"
A appendString "120"
A appendValue 3
A appendString "bob"
A appendString "95"
A appendValue 2
A setLabel "name" 0
A setLabel "score" 1
A setLabel "level" 2
A setKeyStringAt "top" 0
A saveToFile "scores.arr"
QS
for line in 'run make.qs' 'inspect scores.arr' 'convert scores.arr scores.csv' \
  'inspect scores.csv' 'convert scores.csv scores.ini' 'inspect scores.ini' \
  'convert scores.ini scores.mmf --to host' 'inspect scores.mmf' \
  'convert scores.mmf back.arr' 'inspect back.arr'; do
  q $line
done
# The extension decides the format unless --to does; an unknown one needs --to.
q convert back.arr upper.INI
head -n 1 upper.INI | od -An -c
q convert scores.csv scores.dat
q convert scores.csv native.csv --to native
head -c 8 native.csv; echo
q convert scores.csv no-such-dir/x.arr
