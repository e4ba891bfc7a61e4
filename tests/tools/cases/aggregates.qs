# Column and label aggregates over the visible rows.
new x=2 autoselect=1
A appendRowFromList "a,4"
A appendRowFromList "b,abc"
A appendRowFromList "c,-6"
A setLabel "k" 0
A setLabel "v" 1
E colMax( 1
E colMin( 1
E colSum( 1
E colAvg( 1
E labMax( "v"
E labMin( "V"
E labSum( "v"
E labAvg( "v"
A appendRowFromList "d,30"
A startNewWhere
A selectWhereMatchingByColumn 0 "a"
A selectWhereMatchingByColumn 0 "d"
E colMax( 1
E colMin( 1
E colSum( 1
E colAvg( 1
E labMax( "v"
E labMin( "v"
E labSum( "v"
E labAvg( "v"
A startNewWhere
E colSum( 1
E colMax( 1
E labAvg( "v"
