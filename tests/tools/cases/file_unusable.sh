# Loads of files that cannot be used: missing, a folder, a wrong header, a version or
# dimension count out of range, no bytes. An append changes nothing; a replacing load
# clears the array, and native and host array loads also set the dimension count to 0,
# leaving the boundaries and labels for when dimensions come back. Each line: size and
# dimension count after the append, then after the replacing load, then X and the labels
# once two dimensions are set again.
printf 'ZUBARRAX\x01\x00\x01\x00\x00\x00' >magic.arr
printf 'ZUBARRAY\x02\x00\x01\x00\x00\x00' >v2.arr
{ printf 'ZUBARRAY\x01\x00\x0b\x00\x00\x00'; head -c 44 /dev/zero; } >d11.arr
printf 'CNC ARRAY!\x02\x00\x00\x00' >magic.mmf
: >empty
try() {  # replacing load, appending load, file
  printf 'new x=4\nA 48 "l" 0\nA 9 7\nA %s "%s"\nE 0\nE 26\nA %s "%s"\nE 0\nE 26\nA 27 2\nE 28\nE 44\n' \
    "$2" "$3" "$1" "$3" >s.qs
  echo "A $1, A $2 on $3: $("$QUORREL" run s.qs | tr '\n' ' ')"
}
for f in missing.arr . magic.arr v2.arr d11.arr empty; do try 3 10 "$f"; done
for f in missing.mmf . magic.mmf empty; do try 4 11 "$f"; done
for f in missing.csv .; do try 5 12 "$f"; done
for f in missing.ini .; do try 59 60 "$f"; done
# A CSV load makes the array two-dimensional even when the file cannot be read; X stays.
printf 'new dims=3 x=4 y=5\nA 12 "missing.csv"\nE 26\nA 9 1\nA 5 "missing.csv"\nE 0\nE 26\nE 28\n' >s.qs
"$QUORREL" run --echo s.qs
