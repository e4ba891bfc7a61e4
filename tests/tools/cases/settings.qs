# The setup record fields of new, and the instance made before any new.
E 26
E 28
new dims=3 x=4 y=5
E 26
E 28
E 29
new dims=7
E 26
new dims=2 x=0
E 28
new x=-5
E 28
new case=7
A 8 "Abc"
E 12 "abc" 0
new case=0
A 8 "Abc"
E 12 "abc" 0
new wildcard=1
A 8 "abc"
E 12 "a*" 0
new autoselect=2 x=2
A 34 "a,b"
E 40
new autoselect=1 x=2
A 34 "a,b"
E 40
new delimiter=";"
E 51
new delimiter=""
E 51
new delimiter="ab"
E 38 "3a2"
# Counts other than 2 and 3 make a one-dimensional array, whatever the boundaries say.
new dims=0 y=6
E 26
E 28
E 29
new dims=4
E 26
new dims=-1
E 26
new dims=1
E 26
# The last dimension has no boundary.
new x=6 y=9
E 28
E 29
new dims=3 x=4 y=5
E 27 2
new dims=3 x=-2 y=0
E 28
E 29
# Any nonzero mode turns it on.
new wildcard=-3
A 8 "Abc"
E 12 "a*" 0
new
A 8 "Abc"
E 12 "a*" 0
new case=7
A 8 "Abc"
E 12 "Abc" 0
