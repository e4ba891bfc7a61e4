# Row selection: AND and OR modes, where-tests by column and label, between tests.
new x=3 autoselect=1
A appendRowFromList "ann,120,3"
A appendRowFromList "bob,95,2"
A appendRowFromList "cy,70,7"
A appendRowFromList "dee,95,abc"
A setLabel "name" 0
A setLabel "score" 1
A setLabel "level" 2
E numberOfRows(
A startNewWhere
E numberOfRows(
E rowList$( 0
A selectWhereEqualByColumn 1 95
E numberOfRows(
E columnList$( 0
A selectWhereEqualByLabel "level" 7
E columnList$( 0
A selectionModeAnd
A selectWhereGreaterOrEqualByColumn 1 90
E columnList$( 0
A invertSelection
E columnList$( 0
A selectAllRows
E numberOfRows(
# "abc" has the value 0.
A selectWhereLessOrEqualByColumn 2 3
E columnList$( 0
A selectWhereNotEqualByColumn 1 95
E columnList$( 0
A selectionModeOr
A selectWhereGreaterByColumn 1 90
E columnList$( 0
A startNewWhere
A selectWhereLessByColumn 1 95
E columnList$( 0
A startNewWhere
A selectWhereMatchingByColumn 0 "BOB"
E columnList$( 0
A selectWhereContainingByColumn 0 "e"
E columnList$( 0
A startNewWhere
A selectWhereMatchingByLabel "name" "a*"
E numberOfRows(
A wildcardSearch
A selectWhereMatchingByLabel "name" "a*"
A selectWhereContainingByLabel "name" "y"
E columnList$( 0
A literalSearch
A startNewWhere
A selectWhereNotEqualByLabel "score" 95
E columnList$( 0
A startNewWhere
A selectWhereGreaterByLabel "level" 2
E columnList$( 0
A startNewWhere
A selectWhereGreaterOrEqualByLabel "score" 100
E columnList$( 0
A selectWhereLessByLabel "score" 95
E columnList$( 0
A startNewWhere
A selectWhereLessOrEqualByLabel "level" 2
E columnList$( 0
A startNewWhere
A pickColumnForBetween 1
A selectBetweenValues 90 100
E columnList$( 0
A startNewWhere
A pickLabelForBetween "name"
A selectBetweenStrings "b" "d"
E columnList$( 0
# An unknown label picks column -1: each row tests the last cell of the row before.
A startNewWhere
A pickLabelForBetween "nolabel"
A selectBetweenValues 0 1000
E columnList$( 0
# New rows start unselected without automatic selection.
new x=2
A appendRowFromList "p,1"
E numberOfRows(
A selectAllRows
E numberOfRows(
