# The command line: misuse exits 2, unreadable files and modules exit 1.
echo 'E 0' >ok.qs
for line in '' frobnicate inpsect help 'run -e 0 ok.qs' run 'run a.qs b.qs' 'shell extra' inspect 'convert only-one' \
  'run x.qs --to csv' 'menu widgets' 'strings conditions' \
  '--bogus run x.qs' 'run x.qs --module' 'run missing.qs' 'run .' \
  '--module ./no-such-module.so run ok.qs' 'run ok.qs --module=./no-such-module.so'; do
  q $line
done
# Help goes to standard output with status 0, for the command and each subcommand.
for c in "" run shell inspect convert menu strings; do
  "$QUORREL" $c --help | head -n 1
  echo "status ${PIPESTATUS[0]}"
done
"$QUORREL" -V | sed 's/ [0-9][0-9.]*$/ VERSION/'
# -e gives the script one line each, and show works in run as in the shell.
q run --echo -e 'A appendValue 5' -e 'show --width 4' -e 'E size(' -e 'E siez('
# The shell goes on after an error, ends at the end of its input and then exits 2.
printf 'E 0\nbad line\nA 9 5\nE 0\nE 2 0\n' | q shell
