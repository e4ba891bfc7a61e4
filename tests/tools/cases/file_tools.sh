# The file tools' safety and reach: folders, - for standard input and output, refused
# overwrites, one warning per kind of loss, RFC 4180 CSV and JSON.
mkdir adir
q inspect adir
q convert adir o.csv
q convert --to csv x.arr adir
cat >make.qs <<'QS'
new x=3
A setLabel "name" 0
A setLabel "note" 1
A appendString "ann"
A appendString "a,b"
A appendValue 7
A appendString "bob"
A appendString "two\r\nlines"
A appendString "say \"hi\""
A appendString "cy"
A setKeyStringAt "k" 0
A saveToFile "t.arr"
new dims=1
A appendString "k=v"
A setKeyStringAt "a=b" 0
A appendString ""
A appendFile "three.bin"
A setKeyValueAt 5 2
A saveToFile "list.arr"
QS
printf 'xyz' >three.bin
q run make.qs
# Each lossy target names what it loses; native keeps everything.
for line in 'convert t.arr t.csv' 'convert t.arr t.ini' \
  'convert t.arr t.mmf --to host' 'convert t.arr copy.arr' 'convert list.arr list.ini' \
  'convert list.arr - --to json'; do
  q $line
done
# The input is never overwritten by mistake.
q convert t.csv t.csv
q convert t.csv ./t.csv --to native --force
q inspect t.csv
# - is standard input for inspect and convert, standard output for convert.
q inspect - <list.arr
"$QUORREL" convert - - --to csv <list.arr | od -An -c
echo "status ${PIPESTATUS[0]}"
# RFC 4180 CSV keeps commas, quotes and line breaks in their cells.
q convert t.arr t.rfc --to csv-rfc4180
od -An -c t.rfc
q convert t.rfc back.arr --from csv-rfc4180
q inspect back.arr --width 0
"$QUORREL" convert back.arr - --to csv-rfc4180 2>/dev/null | cmp - t.rfc && echo same bytes
printf 'a,"b ""c""",d\r\n"x\ny",,"1,2"\r\nlast' >in.csv
q convert in.csv - --from csv-rfc4180 --to json
q convert t.arr - --to json
# inspect: fewer rows, every row, wider cells.
q inspect t.arr --rows 2 --width 6
q inspect t.arr --all
q inspect t.arr --rows 1 --all
q inspect t.arr --rows x
