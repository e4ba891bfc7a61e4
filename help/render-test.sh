#!/usr/bin/env bash
# Renders the help page in headless Chromium and fails on any console message (a message
# means a missing file or a broken page), on a page or picture wider than the window, on
# a picture drawn empty, on a find box that does not narrow the contents, and on a page
# that does not print or would cut a picture. Takes screenshots at 420 and 1,280 px.
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

profiles=$(mktemp -d)
trap 'rm -rf "$profiles"' EXIT
url="file://$(realpath "$page")"

# chrome NAME WIDTH HEIGHT ARG...: one headless run with a profile of its own; its
# output in NAME.out and NAME.err. Runs at once hang here, so they go one by one.
chrome() {
  local name=$1 width=$2 height=$3
  shift 3
  timeout 120 "$browser" --headless --no-sandbox --disable-gpu --no-first-run \
    --disable-background-networking --disable-component-update --disable-sync \
    --user-data-dir="$profiles/$name" --enable-logging=stderr --v=0 \
    --window-size="$width,$height" --allow-file-access-from-files "$@" \
    >"$work/$name.out" 2>"$work/$name.err"
}
# harness NAME SCRIPT: runs SCRIPT in an empty page that loads the help page in frames
# (headless windows are at least 500 px wide, so narrower windows are frames), and
# dumps its DOM, where SCRIPT leaves its findings.
harness() {
  printf '<!DOCTYPE html><body style="margin:0"><script>%s\n%s</script></body>\n' "$frame" "$2" \
    >"$work/$1.html"
  chrome "$1" 1280 1000 --virtual-time-budget=10000 --dump-dom "file://$(realpath "$work/$1.html")"
}
frame='function frame(width, height, hash, onload) {
  const f = document.createElement("iframe");
  f.width = width; f.height = height; f.style.border = "0"; f.style.display = "block";
  f.src = "'"$url"'" + hash; f.onload = () => onload(f.contentDocument);
  document.body.appendChild(f);
}'
finding() { grep -o "data-$2=\"[^\"]*\"" "$work/$1.out" | cut -d'"' -f2; }

# One page of frames checks three things at once. The page must read at any window width
# from 400 px: nothing wider than the window, whatever a code line, table or picture
# holds, and every picture drawn with a box that is not empty.
widths="400 420 600 800 1280"
checks="const widths = [${widths// /, }], results = [];
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
# Typing into the find box narrows the contents to the entries that match, and clearing
# it brings the contents back.
checks+="
frame(1280, 900, '', (doc) => {
  const input = doc.getElementById('find'), type = (text) => {
    input.value = text; input.dispatchEvent(new Event('input'));
    return doc.querySelectorAll('#found li').length;
  };
  const shown = !doc.getElementById('find-box').hidden, sum = type('sum'), both = type('sum label');
  const none = type('zzqx'), cleared = type('') + ':' + doc.getElementById('contents').hidden;
  document.body.setAttribute('data-find', [shown, sum, both, none, cleared].join(' '));
});"
# Printed, every picture fits a page (at most 900 px high in a printed column's 700 px)
# and is kept whole across page breaks.
checks+="
frame(700, 900, '', (doc) => {
  let bad = [];
  for (const figure of doc.querySelectorAll('figure.picture')) {
    const height = figure.getBoundingClientRect().height;
    if (height > 900 || getComputedStyle(figure).breakInside !== 'avoid') bad.push(Math.round(height));
  }
  document.body.setAttribute('data-print', bad.length ? bad.join(',') : 'ok');
});"
harness checks "$checks"
chrome pdf 1280 1600 --no-pdf-header-footer --print-to-pdf="$work/help.pdf" "$url"
chrome dom 1280 1600 --dump-dom "$url"

# Screenshots at 420 and 1,280 px of the top, the pictures of the dimensions and the
# setup dialog, one above the other.
for width in 420 1280; do
  for place in "" "#dimensions" "#setup"; do
    printf '<iframe src="%s%s" width="%s" height="1200" style="border:0;display:block"></iframe>\n' \
      "$url" "$place" "$width"
  done >"$work/shot-$width.html"
  chrome "shot-$width" $((width < 500 ? 500 : width)) 3600 --virtual-time-budget=5000 \
    --screenshot="$work/help-$width.png" "file://$(realpath "$work/shot-$width.html")"
done

if grep -h "CONSOLE" "$work"/*.err; then
  echo "FAIL: the page logged console messages"; exit 1
fi
grep -q 'id="a78"' "$work/dom.out" && grep -q 'id="e59"' "$work/dom.out" || {
  echo "FAIL: the rendered page lacks the last action or expression"; exit 1; }

measured=$(finding checks widths)
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

found=$(finding checks find)
read -r shown sum both none cleared <<<"$found"
if [ "$shown" != true ] || [ "${sum:-0}" -lt 2 ] || [ "${both:-0}" -lt 1 ] || [ "$both" -ge "$sum" ] ||
   [ "$none" != 0 ] || [ "$cleared" != 0:false ]; then
  echo "FAIL: the find box did not narrow the contents (shown, 'sum', 'sum label', 'zzqx', cleared): $found"
  exit 1
fi

printed=$(finding checks print)
[ "$printed" = ok ] || { echo "FAIL: pictures that a printed page would cut: $printed"; exit 1; }
pages=$(grep -ao '/Type */Pages\?' "$work/help.pdf" 2>/dev/null | grep -vc Pages)
[ "${pages:-0}" -gt 1 ] || { echo "FAIL: the page did not print"; cat "$work/pdf.err"; exit 1; }

for width in 420 1280; do
  [ -s "$work/help-$width.png" ] || { echo "FAIL: no screenshot at $width px"; exit 1; }
done
echo "help page rendered: screenshots $work/help-*.png, no console messages, no wider than" \
  "windows of $widths px, every picture drawn, the find box narrows the contents," \
  "printed on $pages pages"
