#!/usr/bin/env bash
# Devices and unreadable files, which only a POSIX system has: a clear message and
# exit status 1, never a crash. Usage: posix_files.sh QUORREL WORKDIR
set -u
quorrel=$1 work=$2
rm -rf "$work" && mkdir -p "$work" && cd "$work" || exit 1
fail=0
check() {  # expected-status expected-stderr (a pattern) command...; stdout to $out
  local status=$1 expected=$2 err got
  shift 2
  err=$("$quorrel" "$@" 2>&1 >"${out:-/dev/null}")
  got=$?
  [[ $got == "$status" && $err == $expected ]] && return
  echo "quorrel $*${out:+ >$out}: status $got, stderr '$err'; expected $status, '$expected'"
  fail=1
}
# A device is read as a pipe is: one without end stops at a start that is no array file.
check 1 "quorrel: /dev/zero is not a native array, host array, CSV, INI or JSON file" \
  convert /dev/zero o.arr
# A file action that fails is named with the step that failed; the run goes on.
printf 'A 8 "x"\nA 0 "/dev/null/x.arr"\nA 0 "/dev/full"\n' >t.qs
check 0 't.qs:2: warning: saveToFile "/dev/null/x.arr": could not open it (Not a directory)
t.qs:3: warning: saveToFile "/dev/full": could not write it (No space left on device)' run t.qs
# Output that cannot be written is an error, whether found while running or at the end;
# binary output to a terminal needs --force.
printf 'E size(\n' >size.qs
for command in list "inspect t.qs --from csv" "convert t.qs - --to json --from csv" "run size.qs" \
  --help "menu --help" -V; do
  out=/dev/full check 1 "quorrel: cannot write standard output*" $command
done
# A command copied away from its module says where it looked and how to name it.
cp "$quorrel" ./copied
err=$(./copied list 2>&1 >/dev/null)
if [[ $? != 1 || $err != *"$PWD/libquorrel.so"*"--module PATH"* ]]; then
  echo "a copied quorrel: '$err'"; fail=1
fi
if command -v script >/dev/null; then
  err=$(script -qec "$quorrel convert t.qs - --to native --from csv" /dev/null | tr -d '\r')
  if [[ $err != "quorrel: convert will not write a native array file to a terminal"* ]]; then
    echo "binary output to a terminal: $err"
    fail=1
  fi
  # A long command notes its progress on a terminal (at once here, not after 2 s).
  err=$(script -qec "(sleep 1; cat t.qs) | QUORREL_PROGRESS_AFTER=0 $quorrel convert --from csv - p.arr" \
    /dev/null | tr -d '\r')
  if [[ $err != *"quorrel: converting - ("*" bytes)... "*"s"* ]]; then
    echo "no progress note: $err"
    fail=1
  fi
  err=$(script -qec "QUORREL_PROGRESS_AFTER=0 $quorrel inspect --from csv t.qs" /dev/null | tr -d '\r')
  [[ $err == *"quorrel: inspecting t.qs ($(wc -c <t.qs) bytes)... 0s"* ]] || { echo "no size: $err"; fail=1; }
fi
if [[ $(id -u) != 0 ]]; then
  printf 'a,b\r\n' >locked.csv && chmod 000 locked.csv
  check 1 "quorrel: cannot read locked.csv: Permission denied" inspect locked.csv
  printf 'E size(\n' >locked.qs && chmod 000 locked.qs
  check 1 "quorrel: cannot read locked.qs: Permission denied" run locked.qs
else
  echo "(as root every file is readable: the unreadable-file check is skipped)"
fi
exit $fail
