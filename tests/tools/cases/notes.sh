# Notes: one row per kind of note, the script lines (joined by |) that make the
# mistake; each row runs as its own script and its notes are printed. (all.qs keeps
# every row for tests/windows/run_wine_notes.sh.)
printf '\xef\xbb\xbfname,score\r\nann,1\r\n' >bom.csv
rows=('new dims=2 x=2|A setLabel "name" 0|E labSum("scroe")'
  'new dims=2 x=2 autoselect=1|A appendRowFromList "1,2"|E colMax( 5'
  'new dims=2 x=2 autoselect=1|A deleteRow 3'
  'E get( 7'
  'new dims=1|A deleteRow 0'
  'new dims=2 x=1|A appendValue 5|E colSum( 0'
  'new dims=2 x=2|A appendRowFromList "a,b"|A appendRowFromList "c,d"|E rowList$( 0'
  'A loadFromCsv "missing.csv"'
  'new dims=1|A appendValue 2147483647|A appendValue 1|E sum('
  'A appendString "12abc"|E get( 0'
  'A loadFromCsv "bom.csv"|E getFromColumnRow$( 0 0'
  'E get$( 0'
  'new dims=2 x=2 autoselect=1|A appendRowFromList "a,b,c"'
  'A setArrayDimension 12')
for row in "${rows[@]}"; do
  tr '|' '\n' <<<"$row" | tee -a all.qs >n.qs
  "$QUORREL" run --no-warn-files n.qs 2>&1
done | tee notes.txt
# Every kind of note the module has comes from some row above.
sed -n 's/^NOTE([A-Za-z]*, "\([a-z0-9-]*\)".*/\1/p' "$QUORREL_EXAMPLES/../src/array/notes.inc" |
  while read -r id; do grep -q "\[$id\]" notes.txt || echo "no row gives note $id"; done
# A note given again is printed once, then with its count; --no-notes prints none, and
# --notes-fail makes the run's status 3. The log counts a repeated note in powers of ten.
printf 'E get( 9\nE get( 9\nE get( 9\n' >r.qs
"$QUORREL" run r.qs; echo "status $?"
"$QUORREL" run --notes-fail r.qs 2>/dev/null; echo "status $?"
"$QUORREL" run --no-notes r.qs 2>&1 >/dev/null | wc -l
for i in $(seq 25); do echo 'E get( -1'; done >loop.qs
QUORREL_NOTES_LOG=notes.log "$QUORREL" run --no-notes loop.qs >/dev/null && tr -d '\r' <notes.log
