#!/usr/bin/env bash
# Installs the build into a scratch prefix and uses the installed command there.
# Usage: install_check.sh BUILD_DIR PREFIX
set -eu
build=$1 prefix=$2
rm -rf "$prefix"
cmake --install "$build" --prefix "$prefix" >/dev/null
for f in bin/quorrel lib/libquorrel.so share/man/man1/quorrel.1 \
  share/bash-completion/completions/quorrel; do
  [[ -e $prefix/$f ]] || { echo "not installed: $f"; exit 1; }
done
cd "$prefix"
out=$(printf 'A appendString "x"\nE size(\n' | bin/quorrel run -)
[[ $out == 1 ]] || { echo "installed quorrel printed '$out', expected 1"; exit 1; }
# The completion offers the subcommands.
out=$(bash -c 'source share/bash-completion/completions/quorrel
  COMP_WORDS=(quorrel con); COMP_CWORD=1; _quorrel; echo "${COMPREPLY[*]}"')
[[ $out == convert ]] || { echo "completion of 'con' gave '$out'"; exit 1; }
out=$(bash -c 'source share/bash-completion/completions/quorrel
  COMP_WORDS=(quorrel list rowL); COMP_CWORD=2; _quorrel; echo "${COMPREPLY[*]}"')
[[ $out == 'rowList$' ]] || { echo "completion of 'list rowL' gave '$out'"; exit 1; }
# The kinds offered after --to are the ones the command reads.
out=$(bash -c 'source share/bash-completion/completions/quorrel
  COMP_WORDS=(quorrel inspect --to ""); COMP_CWORD=3; _quorrel; echo "${COMPREPLY[*]}"')
kinds=$(bin/quorrel inspect --to bogus x 2>&1 | sed -n 's/.*(one of \(.*\))$/\1/p' | tr -d ,)
[[ $out == "$kinds" ]] || { echo "completion of --to gave '$out', the command takes '$kinds'"; exit 1; }
if command -v man >/dev/null; then
  man -l share/man/man1/quorrel.1 2>&1 >/dev/null | grep . && { echo "man page warnings"; exit 1; }
fi
echo "installed and working"
