# Expressions called by the names the editor shows.
new x=3 autoselect=1
A appendRowFromList "a,b,7"
E size(
E rowList$( 0
E getFromColumnRow( 2 0
E boundaryX(
E dimIndexOfIndex$( 1 5
E delimiter$(
