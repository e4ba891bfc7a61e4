# The command line: misuse exits 2, unreadable files and modules exit 1.
q
q frobnicate
q run
q run a.qs b.qs
q shell extra
q inspect
q convert only-one
q convert a b --to xml
q run x.qs --to csv
q menu widgets
q strings conditions
q --bogus run x.qs
q run x.qs --module
q run missing.qs
q run .
echo 'E 0' >ok.qs
q --module ./no-such-module.so run ok.qs
q run ok.qs --module=./no-such-module.so
# Help goes to standard output with status 0, for the command and each subcommand.
for c in "" run shell inspect convert menu strings; do
  "$QUORREL" $c --help | head -n 1
  echo "status ${PIPESTATUS[0]}"
done
# The shell goes on after an error, ends at the end of its input and then exits 2.
printf 'E 0\nbad line\nA 9 5\nE 0\nE 2 0\n' | q shell
