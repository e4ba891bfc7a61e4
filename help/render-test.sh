#!/usr/bin/env bash
# Renders the help page in headless Chromium: takes a screenshot and fails on any console
# message (the page has no scripts, so a message means a missing file or a broken page).
# Exits 77 (skipped) when Chromium is not installed and cannot be installed.
set -u
page=$1 work=$2
mkdir -p "$work"

browser=$(command -v chromium || command -v chromium-browser || true)
if [ -z "$browser" ] && [ "$(id -u)" -eq 0 ] && [ "${QUORREL_NO_INSTALL:-0}" != 1 ]; then
  DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends chromium \
    >"$work/install.log" 2>&1 || true
  browser=$(command -v chromium || true)
fi
if [ -z "$browser" ]; then
  echo "SKIPPED: Chromium is not installed and could not be installed; the help page was not rendered."
  exit 77
fi

profile=$(mktemp -d)
trap 'rm -rf "$profile"' EXIT
flags=(--headless --no-sandbox --disable-gpu --no-first-run --disable-background-networking
       --disable-component-update --disable-sync --user-data-dir="$profile"
       --enable-logging=stderr --v=0 --window-size=1280,1600)
url="file://$(realpath "$page")"

timeout 90 "$browser" "${flags[@]}" --screenshot="$work/help.png" "$url" >"$work/shot.out" 2>"$work/shot.err"
if [ ! -s "$work/help.png" ]; then
  echo "FAIL: no screenshot was taken"; cat "$work/shot.err"; exit 1
fi
timeout 90 "$browser" "${flags[@]}" --dump-dom "$url" >"$work/dom.html" 2>"$work/dom.err"
if grep -h "CONSOLE" "$work/shot.err" "$work/dom.err"; then
  echo "FAIL: the page logged console messages"; exit 1
fi
grep -q 'id="a78"' "$work/dom.html" && grep -q 'id="e59"' "$work/dom.html" || {
  echo "FAIL: the rendered page lacks the last action or expression"; exit 1; }

# The page must read at any window width from 400 px: nothing wider than the window,
# whatever a code line, table or picture holds, and every picture drawn with a box that
# is not empty. Headless windows are at least 500 px wide, so the page is measured in
# frames of each width (file access lets the harness look in).
harness() {  # NAME WINDOW-WIDTH SCRIPT: runs SCRIPT in a page of frames, dumps its DOM
  printf '<!DOCTYPE html><body style="margin:0"><script>%s</script></body>\n' "$3" >"$work/$1.html"
  timeout 90 "$browser" "${flags[@]/--window-size=1280,1600/--window-size=$2,1600}" \
    --allow-file-access-from-files --virtual-time-budget=10000 \
    --dump-dom "file://$(realpath "$work/$1.html")" >"$work/$1.out" 2>"$work/$1.err"
}
frame='function frame(width, height, hash, onload) {
  const f = document.createElement("iframe");
  f.width = width; f.height = height; f.style.border = "0"; f.style.display = "block";
  f.src = "'"$url"'" + hash; f.onload = () => onload(f.contentDocument);
  document.body.appendChild(f);
}'
widths="400 420 600 800 1280"
harness widths 1280 "$frame
const widths = [${widths// /, }], results = [];
for (const width of widths) frame(width, 900, '', (doc) => {
  const page = doc.documentElement, pictures = doc.querySelectorAll('svg.picture');
  let bad = 0;
  for (const svg of pictures) {
    const box = svg.getBoundingClientRect();
    if (!(box.width > 0 && box.height > 0) || box.right > page.clientWidth + 0.5) bad++;
  }
  results.push(width + ':' + page.scrollWidth + '/' + page.clientWidth + ':' + pictures.length + ':' + bad);
  if (results.length === widths.length) document.body.setAttribute('data-widths', results.join(' '));
});"
measured=$(grep -o 'data-widths="[^"]*"' "$work/widths.out" | cut -d'"' -f2)
[ -n "$measured" ] || { echo "FAIL: the page could not be measured in frames"; exit 1; }
for measure in $measured; do  # WIDTH:PAGE/WINDOW:PICTURES:BAD, widths without the scroll bar
  IFS=: read -r width size pictures bad <<<"$measure"
  if [ "${size%/*}" -gt "${size#*/}" ]; then
    echo "FAIL: in a $width px window the page is ${size%/*} px wide: $measured"; exit 1
  fi
  if [ "$pictures" -lt 10 ] || [ "$bad" -ne 0 ]; then
    echo "FAIL: in a $width px window $bad of $pictures pictures are empty or too wide: $measured"
    exit 1
  fi
done

# Typing into the find box narrows the contents to the entries that match, and clearing
# it brings the contents back.
harness find 1280 "$frame
frame(1280, 900, '', (doc) => {
  const input = doc.getElementById('find'), type = (text) => {
    input.value = text; input.dispatchEvent(new Event('input'));
    return doc.querySelectorAll('#found li').length;
  };
  const shown = !doc.getElementById('find-box').hidden, sum = type('sum'), both = type('sum label');
  const none = type('zzqx'), cleared = type('') + ':' + doc.getElementById('contents').hidden;
  document.body.setAttribute('data-find', [shown, sum, both, none, cleared].join(' '));
});"
found=$(grep -o 'data-find="[^"]*"' "$work/find.out" | cut -d'"' -f2)
read -r shown sum both none cleared <<<"$found"
if [ "$shown" != true ] || [ "${sum:-0}" -lt 2 ] || [ "${both:-0}" -lt 1 ] || [ "$both" -ge "$sum" ] ||
   [ "$none" != 0 ] || [ "$cleared" != 0:false ]; then
  echo "FAIL: the find box did not narrow the contents (shown, 'sum', 'sum label', 'zzqx', cleared): $found"
  exit 1
fi

# Screenshots of the top and of the pictures at 420 and 1,280 px, to look at.
for width in 420 1280; do
  for place in top dimensions setup; do
    hash=$([ $place = top ] || echo "#$place")
    printf '<!DOCTYPE html><body style="margin:0"><iframe src="%s%s" width="%s" height="1400" style="border:0;display:block"></iframe></body>\n' \
      "$url" "$hash" "$width" >"$work/shot-$place-$width.html"
    timeout 90 "$browser" "${flags[@]/--window-size=1280,1600/--window-size=$((width < 500 ? 500 : width)),1400}" \
      --allow-file-access-from-files --virtual-time-budget=5000 \
      --screenshot="$work/help-$place-$width.png" "file://$(realpath "$work/shot-$place-$width.html")" \
      >/dev/null 2>&1
    [ -s "$work/help-$place-$width.png" ] || { echo "FAIL: no screenshot at $width px of $place"; exit 1; }
  done
done

# The page prints: every picture fits a printed page (one at most 900 px high at a printed
# column's 700 px), and pictures are kept whole across page breaks.
harness print 1280 "$frame
frame(700, 900, '', (doc) => {
  let bad = [];
  for (const figure of doc.querySelectorAll('figure.picture')) {
    const height = figure.getBoundingClientRect().height;
    if (height > 900 || getComputedStyle(figure).breakInside !== 'avoid') bad.push(Math.round(height));
  }
  document.body.setAttribute('data-print', bad.length ? bad.join(',') : 'ok');
});"
printed=$(grep -o 'data-print="[^"]*"' "$work/print.out" | cut -d'"' -f2)
[ "$printed" = ok ] || { echo "FAIL: pictures that a printed page would cut: $printed"; exit 1; }
timeout 90 "$browser" "${flags[@]}" --no-pdf-header-footer --print-to-pdf="$work/help.pdf" "$url" \
  >/dev/null 2>"$work/pdf.err"
pages=$(grep -ao '/Type */Pages\?' "$work/help.pdf" 2>/dev/null | grep -vc Pages)
[ "${pages:-0}" -gt 1 ] || { echo "FAIL: the page did not print"; cat "$work/pdf.err"; exit 1; }

echo "help page rendered: $work/help-*.png, no console messages, no wider than windows of" \
  "$widths px, every picture drawn, the find box narrows the contents, printed on $pages pages"
