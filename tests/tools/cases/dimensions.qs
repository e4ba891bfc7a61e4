# Dimensions, boundaries and index transforms. The default instance is 2D with X 10.
E dim(
E boundary( 1
E boundaryX(
E boundaryY(
E boundaryZ(
E boundaryCol(
E boundaryRow(
E boundaryPage(
E boundary( 0
E XOfIndex( 23
E YOfIndex( 23
E ZOfIndex( 23
E dimIndexOfIndex$( 2 23
E indexOfXY( 3 2
E indexOfDimIndex( "3,2"
A setListDelimiter ";"
E indexOfDimIndex( "3;2"
E indexOfDimIndex( "3,2"
E indexOfDimIndex( ";;7;;1;"
E indexOfDimIndex( ""
A use3D
A setDimensionBoundary 2 3
A setDimensionBoundary 1 4
E dim(
E boundaryY(
E boundaryZ(
E boundaryRow(
E boundaryPage(
E XOfIndex( 17
E YOfIndex( 17
E ZOfIndex( 17
E indexOfDimIndex( "1;1;1"
E indexOfXY( 1 1
# Boundaries below 1 and dimensions at or above the count are ignored.
A setDimensionBoundary 1 0
A setDimensionBoundary 1 -4
E boundaryX(
A setDimensionBoundary 3 9
E boundary( 3
A setArrayDimension 12
E dim(
A setArrayDimension 1
E dim(
E boundaryX(
E XOfIndex( 7
E YOfIndex( 7
A use2D
E dim(
E boundaryX(
E XOfIndex( -1
E YOfIndex( -1
# Resizing keeps the coordinates of complete rows: k l m / n o p / q r.
new x=8
A appendRowFromList "k,l,m,n,o,p,q,r"
A setDimensionBoundary 1 3
A resizeDimensionBoundary 1 5
E size(
E get$( 3
E get$( 5
E get$( 9
E get$( 11
E boundaryX(
A resizeDimensionBoundary 1 2
E size(
E get$( 2
E get$( 4
E get$( 5
# Coordinates of an index in 2D, X 10: negative indexes give negative coordinates, and
# dimensions outside 1..2 give 0.
new
E dimIndexOfIndex$( 1 -1
E dimIndexOfIndex$( 2 -1
E dimIndexOfIndex$( 2 -23
E dimIndexOfIndex$( 1 -23
E dimIndexOfIndex$( 0 23
E dimIndexOfIndex$( -1 23
E dimIndexOfIndex$( 3 23
# 3 * 10^8 * 10 + 1 wraps past 2^32.
E indexOfXY( 1 300000000
# Counts outside 1..3 are kept but give no coordinates.
A setArrayDimension -3
E dim(
E dimIndexOfIndex$( 1 7
A setArrayDimension 0
E boundary( 0
# A 2D array whose X boundary is 0 divides by 0: the answer is 0.
new x=0
E dimIndexOfIndex$( 1 5
E dimIndexOfIndex$( 2 5
E indexOfXY( 5 3
# Coordinate lists split at every delimiter character, and runs of them count as one.
new
E indexOfDimIndex( " 3, -2"
E indexOfDimIndex( "x,2"
E indexOfDimIndex( ",,,"
# The delimiter is a set of characters, not a word; digits can separate too; with no
# delimiter the whole text is one token.
A setListDelimiter "ab"
E indexOfDimIndex( "3b2"
E indexOfDimIndex( "3ba2"
A setListDelimiter "0"
E indexOfDimIndex( "305"
A setListDelimiter ""
E indexOfDimIndex( "3,2"
E indexOfDimIndex( ""
# Coordinates are not limited to their boundaries.
new x=3
E indexOfDimIndex( "5,2"
# Tokens past the last dimension use the boundaries stored above it.
new dims=3 x=10 y=4
A setArrayDimension 2
E boundary( 2
E indexOfDimIndex( "1,2,3"
A setArrayDimension 1
E indexOfDimIndex( "1,2,3"
# Resizing X to 1 keeps the first element of each complete row: k l m / n o p / q r.
new x=8
A appendRowFromList "k,l,m,n,o,p,q,r"
A setDimensionBoundary 1 3
A resizeDimensionBoundary 1 1
E list$( "|"
E boundaryX(
# Data that fills at most one row moves nothing.
new x=3
A appendString "a"
A appendString "b"
A appendString "c"
A resizeDimensionBoundary 1 5
E list$( "|"
E boundaryX(
# Without an X boundary the blocks are empty: only the boundary changes.
new x=0
A appendString "a"
A appendString "b"
A appendString "c"
A appendString "d"
A resizeDimensionBoundary 1 3
E list$( "|"
E boundaryX(
# Refused resizes: a boundary below 1, a dimension below 0 or at the count.
new x=2
A appendString "a"
A appendString "b"
A appendString "c"
A appendString "d"
A resizeDimensionBoundary 1 0
A resizeDimensionBoundary -1 3
A resizeDimensionBoundary 2 3
E list$( "|"
E boundaryX(
# Entry 0 of a 1D array starts at -1: growing it to 1 adds 1 - (-1) = 2 empty elements
# after each element.
new dims=1
A appendString "a"
A appendString "b"
A appendString "c"
A resizeDimensionBoundary 0 1
E list$( "|"
E boundary( 0
# Shrinking entry 0 by one block (one element) deletes at index 0 once per element, so
# all go; by more than one it would delete at negative indexes, so nothing moves.
new dims=1
A setDimensionBoundary 0 2
A appendString "a"
A appendString "b"
A appendString "c"
A resizeDimensionBoundary 0 1
E size(
E boundary( 0
new dims=1
A setDimensionBoundary 0 5
A appendString "a"
A appendString "b"
A appendString "c"
A resizeDimensionBoundary 0 2
E list$( "|"
E boundary( 0
