# A high-score table kept by a Quorrel object: one row per player, with the
# columns name, score and level. Run it with:  quorrel run examples/highscores.qs
#
# Each E line prints what the expression answers; A lines print nothing. With
# --echo each answer is printed beside its line. 'quorrel list NAME' says what an
# action or expression does.

# A two-dimensional array of 3 columns whose new rows start selected.
new x=3 autoselect=1

# Name the columns, then add the players, one delimited row each.
A setLabel "name" 0
A setLabel "score" 1
A setLabel "level" 2
A appendRowFromList "ann,120,3"
A appendRowFromList "bob,95,2"
A appendRowFromList "cy,310,7"
A appendRowFromList "dee,180,5"
E numberOfRows(
E labelList$(

# Best score first: sort the rows by the "score" label, values descending.
A sortRowsByLabelValueDescending "score"
E rowList$( 0
E columnList$( 0
E labMax( "score"
E labAvg( "score"

# Only the players from level 3 up: start a new selection, then select by label.
A startNewWhere
A selectWhereGreaterOrEqualByLabel "level" 3
E numberOfRows(
E columnList$( 0
E labSum( "score"

# Select every row again and save the table twice: as an array file and as CSV.
A selectAllRows
A saveToFile "highscores.arr"
A saveToCsv "highscores.csv"

# Load the array file into a fresh instance: labels and dimensions come back.
new dims=1 autoselect=1
A loadFromFile "highscores.arr"
E dim(
E labelList$(
E getFromLabelRow$( "name" 1

# The CSV file brings the cells back as texts, without labels.
new dims=1 autoselect=1
A loadFromCsv "highscores.csv"
E numberOfRows(
E rowList$( 0
E getFromColumnRow( 1 3
E labelList$(
