# Mistakes found in the script text itself: each script stops at its first one and
# reports FILE:LINE; blank and comment lines count as lines.
bad '# a comment' '' 'frobnicate 1'
bad 'a 1'
bad '   ' 'A'
for line in 'E' 'A 79' 'A -1' 'E 60' 'A x1' 'A 9 2147483648' 'A 9 -2147483649' 'A 9 1e3' \
  'A 9 --1' 'A 9 +' 'A 9 99999999999999999999999' 'A 9 0x10' 'A 8 "abc' 'A 8 "abc\"' \
  'A 8 "a\qb"' 'A 8 "a\x4"' 'A 8 "a\xg0"' 'A 8 "a\x00b"' 'A 8 "ab"c' 'A 8 ab"c"' \
  'new dims=3 size=4' 'new dims' 'new =3' 'new x="4"' 'new y=4z' 'new delimiter=;' \
  'new delimiter="a'; do
  bad "$line"
done
bad "new delimiter=\"$(printf '%01024d' 0)\""
printf 'A 8 "a\0b"\n' >bad.qs; q run bad.qs
# Integers span exactly int32 with an optional sign and leading zeros; strings take
# every escape; tabs separate tokens and a line may end in CR LF.
printf '%s\r\n' 'A 9 -2147483648' 'A 9 +2147483647' $'A 9\t007' 'A 9 -0' \
  'A 8 "a\\b\"c\n\r\t"' 'A 8 "\x41\xfF\x01"' 'A 8 ""' 'A +06 "x" 0' 'E list$( "|"' >good.qs
q run --echo good.qs
