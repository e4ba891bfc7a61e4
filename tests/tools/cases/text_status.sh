# Texts print as UTF-8 under a UTF-8 locale and escaped otherwise; cells are cut by
# characters; a byte-order mark is read past; exit statuses for files and --strict.
printf '\xef\xbb\xbfnew dims=1\nA appendString "Zo\xc3\xab \xc3\x91and\xc3\xba \xe2\x82\xac9"\n' >t.qs
printf 'A appendString "bad \xff\xc3\x01"\nA saveToFile "t.arr"\nE get$( 0\n' >>t.qs
q run --echo t.qs
LC_ALL=C q run --echo t.qs 2>/dev/null
q --ascii run t.qs 2>/dev/null
q inspect --width 12 t.arr | tail -3
q inspect --width 3 t.arr
# In a table, valid UTF-8 is plain text; an invalid byte makes a cell quoted.
printf 'Zo\xc3\xab,\xc3\x91and\xc3\xba\nb\xff,x\n' >u.csv
q inspect u.csv | tail -3
printf '\xff\xfeA\0' | q run -
# A failed file action is a warning, and status 1 with --strict.
printf 'A loadFromCsv "none.csv"\n' >f.qs
q run --strict --no-warn-files f.qs
# Texts read as numbers as atol reads them in the C locale: blanks, one sign, then
# digits up to the first other character, saturating at the int32 limits; 0xA0 is not a
# blank. Each line: the number read, then the text.
texts=(0042 '  9 apples' - ' -7' 12abc abc +5 '\t\n\x0b\x0c\r8' +-3 '- 3' '3 4' '\xa05'
  2147483647 2147483648 99999999999999999999999 -2147483648 -2147483649
  -99999999999999999999999 000000000000000000000000012)
printf 'new dims=1\nA appendString "%s"\nE get( 0\n' "${texts[@]}" | "$QUORREL" run --no-notes - |
  paste -d' ' - <(printf '"%s"\n' "${texts[@]}")
