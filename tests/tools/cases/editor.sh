# What the editor receives: the menu trees and, per code, the display string or
# name with the title of its first parameter.
for kind in actions expressions conditions; do
  echo "== menu $kind"
  "$QUORREL" menu "$kind"
  echo "status $?"
done
for kind in actions expressions; do
  echo "== strings $kind"
  "$QUORREL" strings "$kind"
  echo "status $?"
done
