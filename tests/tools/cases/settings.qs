# The setup record fields of new.
new dims=3 x=4 y=5
E dim(
E boundaryX(
E boundaryY(
# The last dimension has no boundary.
E boundary( 2
new dims=7
E dim(
new dims=2 x=0
E boundaryX(
new x=-5
E boundaryX(
new case=7
A appendString "Abc"
E findStr( "abc" 0
new case=0
A appendString "Abc"
E findStr( "abc" 0
new wildcard=1
A appendString "abc"
E findStr( "a*" 0
new autoselect=2 x=2
A appendRowFromList "a,b"
E numberOfRows(
new autoselect=1 x=2
A appendRowFromList "a,b"
E numberOfRows(
new delimiter=";"
E delimiter$(
new delimiter=""
E delimiter$(
new delimiter="ab"
E indexOfDimIndex( "3a2"
# Counts other than 2 and 3 make a one-dimensional array, whatever the boundaries say.
new dims=0 y=6
E dim(
E boundaryX(
E boundaryY(
new dims=4
E dim(
new dims=-1
E dim(
new dims=1
E dim(
new x=6 y=9
E boundaryX(
E boundaryY(
new dims=3 x=-2 y=0
E boundaryX(
E boundaryY(
# Any nonzero mode turns it on.
new wildcard=-3
A appendString "Abc"
E findStr( "a*" 0
new
A appendString "Abc"
E findStr( "a*" 0
