# The demo of the README: the high-score script, then the files it saved.
"$QUORREL" run "$QUORREL_EXAMPLES/highscores.qs"
echo "status $?"
"$QUORREL" inspect highscores.arr
od -An -c highscores.csv
