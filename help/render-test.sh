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
# whatever a code line or table holds. Headless windows are at least 500 px wide, so
# the page is measured in frames of each width (file access lets the harness look in).
widths="400 420 600 800 1280"
cat >"$work/widths.html" <<HTML
<!DOCTYPE html><body><script>
const widths = [${widths// /, }], results = [];
for (const width of widths) {
  const frame = document.createElement("iframe");
  frame.width = width; frame.height = 900; frame.src = "$url";
  frame.onload = () => {
    const page = frame.contentDocument.documentElement;
    results.push(width + ":" + page.scrollWidth + "/" + page.clientWidth);
    if (results.length === widths.length) document.body.setAttribute("data-widths", results.join(" "));
  };
  document.body.appendChild(frame);
}
</script></body>
HTML
timeout 90 "$browser" "${flags[@]}" --allow-file-access-from-files --virtual-time-budget=10000 \
  --dump-dom "file://$(realpath "$work/widths.html")" >"$work/widths.out" 2>"$work/widths.err"
measured=$(grep -o 'data-widths="[^"]*"' "$work/widths.out" | cut -d'"' -f2)
[ -n "$measured" ] || { echo "FAIL: the page could not be measured in frames"; exit 1; }
for measure in $measured; do  # WIDTH:PAGE/WINDOW, both without the scroll bar
  page=${measure#*:}
  if [ "${page%/*}" -gt "${page#*/}" ]; then
    echo "FAIL: in a ${measure%%:*} px window the page is ${page%/*} px wide: $measured"
    exit 1
  fi
done
echo "help page rendered: $work/help.png ($(stat -c %s "$work/help.png") bytes), no console" \
  "messages, no wider than windows of $widths px"
