# The demo of the README: the high-score script, then the files it saved.
q run "$QUORREL_EXAMPLES/highscores.qs"
"$QUORREL" inspect highscores.arr
od -An -c highscores.csv
