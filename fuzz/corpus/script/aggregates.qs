# Column and label aggregates over the visible rows.
new x=2 autoselect=1
A 34 "a,4"
A 34 "b,abc"
A 34 "c,-6"
A 48 "k" 0
A 48 "v" 1
E 52 1
E 53 1
E 54 1
E 55 1
E 56 "v"
E 57 "V"
E 58 "v"
E 59 "v"
A 34 "d,30"
A 78
A 65 0 "a"
A 65 0 "d"
E 52 1
E 53 1
E 54 1
E 55 1
E 56 "v"
E 57 "v"
E 58 "v"
E 59 "v"
A 78
E 54 1
E 52 1
E 59 "v"
