# Every format both ways: types and keys shown, damaged files named, JSON read back
# byte for byte, labels as a CSV header, broken RFC 4180 CSV, output chosen by intent.
printf 'xyz' >three.bin
cat >make.qs <<'QS'
new x=3
A setLabel "name" 0
A appendString "ann"
A appendValue 120
A appendString "120"
A appendString ""
A appendValue 0
A appendFile "three.bin"
A appendString "caf\xe9"
A setKeyStringAt "k" 0
A setKeyValueAt 7 1
A saveToFile "t.arr"
QS
q run make.qs
# 120 and "120", "" and an empty element differ; a cut file and trailing bytes are named.
q inspect --keys t.arr
head -c 60 t.arr >cut.arr
q inspect cut.arr --rows 1
cat t.arr three.bin >long.arr
q inspect long.arr --rows 0
q convert t.arr t.mmf 2>/dev/null
head -c 40 t.mmf >cut.mmf
q inspect cut.mmf --rows 0
# JSON by extension, and back: the same bytes. Kinds in any case; a wrong one lists them.
q convert t.arr t.json
q convert --from JSON t.json back.arr --to Native
cmp t.arr back.arr && echo same bytes
q convert t.arr t.out --to xml
q convert t.arr -
# Labels as the first CSV row, written and read; INI after ; comments.
q convert t.arr t.csv --header
head -n 2 t.csv
q inspect t.csv --header --rows 1
q inspect t.arr --to csv-rfc4180 --header --rows 1
printf '; saved by hand\n;\n[s]\nk=v\n' >c.ini
q inspect c.ini
# Broken RFC 4180 CSV: an error naming the line, or a warning and the records before.
printf 'x,y\r\na,"unterminated\r\nb,2\r\n' >bad.csv
q convert bad.csv bad.arr --from csv-rfc4180
q convert bad.csv bad.arr --from csv-rfc4180 --lenient
# -- ends the options.
cp t.csv ./-x.csv
q convert -- -x.csv x.json
# A byte-order mark before a text file is read past, and said so.
printf '\xef\xbb\xbfname,age\nbo,3\n' >bom.csv
"$QUORREL" convert bom.csv - --to csv | od -An -c
# JSON by content or name: a list is a 1-D array; records are a table labelled by their
# names, 32-bit integers as values; other documents name what was expected, and a .json
# name is never read as CSV.
printf ' [1, "a", null]' >list.txt
printf '[{"id": 1, "name": "a"},\n {"name": "b,c", "x": 2.5, "ok": true}, {"id": null}]' >rec.txt
printf '{"a": 1}' >other.json
printf 'a,b\n' >csv.json
for f in list.txt rec.txt other.json csv.json; do q inspect $f; done
q convert rec.txt - --to csv-rfc4180
# A stray quote is named by line and column; --lenient keeps it as a character.
printf 'place,lat\r\nhome,37\xc2\xb036'"'"'37.8"N\r\n"a ""b""",1\r\n' >geo.csv
q inspect geo.csv --from csv-rfc4180 --header
q inspect geo.csv --from csv-rfc4180 --header --lenient
cp list.txt list.csv
q inspect list.csv --rows 0
