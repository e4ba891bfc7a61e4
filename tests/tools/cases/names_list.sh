# Actions by name, the list of every action and expression, one entry's description,
# --echo and --warn-files, and the shell's own commands with piped input.
for line in list 'list setLabel' 'list 17' 'list labSum' 'list lunchbox'; do
  q $line
done
"$QUORREL" list | awk 'length > 120 { print "past 120 columns: " $0 }'
cat >named.qs <<'QS'
new x=2 autoselect=1
A setLabel "qty" 1
A appendRowFromList "ann,120"
A appendRowFromList "bob,109"
E numberOfRows(
  E labSum( "qty"
A saveToCsv "no-such-folder/t.csv"
A loadFromIni "missing.ini"
A appendElementToFile 0 "."
A saveToFile "ok.arr"
E size(
QS
q run named.qs
q run --echo --warn-files named.qs
printf 'help\nhelp E0\nA appendValue 5\nshow\nA loadFromCsv "none.csv"\nE size(\nquit\nE size(\n' |
  q shell
printf 'A loadFromCsv "none.csv"\n' | q shell --no-warn-files
q inspect --echo ok.arr
