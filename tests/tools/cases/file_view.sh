# inspect on native array files: a table with labels, a list with keys and types,
# long contents cut short, and files that cannot be read.
{
  echo 'new x=9'
  for i in $(seq 198); do echo 'A 8 "x"'; done
  echo 'A 0 "wide.arr"'
  echo 'new dims=1'
  for i in $(seq 42); do echo "A 9 $i"; done
  echo 'A 0 "long.arr"'
} >make.qs
cat >>make.qs <<'QS'
new dims=1
A appendString "alpha"
A appendValue -3
A appendValue 0
A appendString " padded "
A appendString "tab\there"
A setKeyStringAt "k1" 0
A setKeyValueAt 9 1
A saveToFile "list.arr"
new x=3
A appendString "ann"
A appendString "120"
A appendValue 3
A appendString "bob"
A appendString "95"
A saveToFile "part.arr"
QS
for line in 'run make.qs' 'inspect list.arr' 'inspect part.arr' 'inspect wide.arr' \
  'inspect long.arr' 'inspect missing.arr'; do
  q $line
done
printf 'ZUB\0' >junk.bin
q inspect junk.bin
# A pipe and /dev/null are inputs like any other; a byte-order mark counts in the size;
# wide characters take two columns and the quoted cells of plain CSV bring a hint.
mkfifo pipe && { printf 'a,b\n' >pipe & }
q inspect pipe --rows 0
q inspect /dev/null
printf '\xef\xbb\xbfname,city\n日本語,東京都\nab,"x,y"\n' >wide.csv
q inspect wide.csv --width 5
