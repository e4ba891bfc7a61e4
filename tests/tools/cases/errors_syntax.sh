# Mistakes found in the script text itself: each script stops at its first one and
# reports FILE:LINE; blank and comment lines count as lines.
bad '# a comment' '' 'frobnicate 1'
bad 'a 1'
bad '   ' 'A'
bad 'E'
bad 'A 79'
bad 'A -1'
bad 'E 60'
bad 'A x1'
bad 'A 9 2147483648'
bad 'A 9 -2147483649'
bad 'A 9 1e3'
bad 'A 9 --1'
bad 'A 9 +'
bad 'A 9 99999999999999999999999'
bad 'A 9 0x10'
bad 'A 8 "abc'
bad 'A 8 "abc\"'
bad 'A 8 "a\qb"'
bad 'A 8 "a\x4"'
bad 'A 8 "a\xg0"'
bad 'A 8 "a\x00b"'
bad 'A 8 "ab"c'
bad 'A 8 ab"c"'
bad 'new dims=3 size=4'
bad 'new dims'
bad 'new =3'
bad 'new x="4"'
bad 'new y=4z'
bad 'new delimiter=;'
bad 'new delimiter="a' 
bad "new delimiter=\"$(printf '%01024d' 0)\""
printf 'A 8 "a\0b"\n' >bad.qs; q run bad.qs
# Integers span exactly int32 with an optional sign and leading zeros; strings take
# every escape; tabs separate tokens and a line may end in CR LF.
printf '%s\r\n' 'A 9 -2147483648' 'A 9 +2147483647' $'A 9\t007' 'A 9 -0' \
  'A 8 "a\\b\"c\n\r\t"' 'A 8 "\x41\xfF\x01"' 'A 8 ""' 'A +06 "x" 0' 'E list$( "|"' >good.qs
q run --echo good.qs
