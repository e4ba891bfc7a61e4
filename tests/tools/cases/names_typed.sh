# Names as people type them: any case, with or without "(", with "()" or an argument
# list in parentheses; left-out unused arguments; near misses; list searching.
cat >typed.qs <<'QS'
new x=2 autoselect=1
A setlabel("qty", 1)
A APPENDROWFROMLIST("a,5")
A appendRowFromList "b,(7)"
E size
E Size()
E labSum("qty")
E labsum( "qty" )
E getFromColumnRow(1, 0)
E getFromColumnRow$( 1 1
E findStr("b")
E list$(")")
QS
q run --echo typed.qs
for line in 'E sizz' 'A appendStrng "x"' 'E appendString' 'E labSum("a", )' 'E labSum("a" 1)'; do
  echo "$line" | q run -
done
q list 'labSum()' | head -1
q list SETLABEL | head -1
q list 'where (column' | cut -c1-40
