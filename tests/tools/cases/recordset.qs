# The 2D array as a table: row edits from lists, labels, row, column and cell reads.
new x=3 autoselect=1
E numberOfCols(
E numberOfRows(
A appendRowFromList "ann,120,3"
A appendRowFromList "bob,95,2"
A appendRowFromList "cy,95,7"
E numberOfRows(
E rowList$( 0
E size(
E getLabel$( 0
A setLabel "name" 0
A setLabel "score" 1
A setLabel "level" 2
A setLabel "nowhere" 3
E labelList$(
E getLabel$( 1
E columnList$( 1
E getFromColumnRow( 1 2
E getFromColumnRow$( 0 1
E getFromLabelRow( "level" 2
E getFromLabelRow$( "name" 0
E getFromColumnRow$( 5 5
# Inserting at visible row 1; a missing field leaves an empty element.
A insertRowFromList "dee,80" 1
E numberOfRows(
E rowList$( 1
E rowList$( 2
A replaceRowWithList "eve,60,1" 3
E rowList$( 3
A replaceRowWithList "nobody" 4
A deleteRow 0
E numberOfRows(
E rowList$( 0
E size(
E rowList$( 3
A appendRowFromList "a,b,c,d"
E rowList$( 3
A appendRowFromList ",x,,y,"
E rowList$( 4
A setListDelimiter ";"
E rowList$( 0
E labelList$(
E columnList$( 0
