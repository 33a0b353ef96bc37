#!/usr/bin/env bash
# The pages of `nebu doc` in Debian's Chromium, headless, opened from the file system: the index
# and a register page must load their stylesheet, draw their pictures and log no console error.
# usage: doc_browser.sh NEBU DATA_DIR WORK_DIR
# Screenshots stay in WORK_DIR. Exit 77 (skipped, one line saying why) where Chromium is missing
# or cannot start.
set -euo pipefail
nebu=$1 data=$2 work=$3
here=$(cd "$(dirname "$0")" && pwd)
skip() {
  echo "SKIPPED doc_browser: $* (scripts/bootstrap chromium installs it); the pages were not seen"
  exit 77
}
fail() { echo "doc_browser: FAILED: $*"; exit 1; }
browser=$(command -v chromium || command -v chromium-browser || true)
[ -n "$browser" ] || skip "Chromium is not installed"
command -v python3 >/dev/null || skip "python3 is missing"
rm -rf "$work" && mkdir -p "$work"
"$nebu" doc "$data" -o "$work/site" >/dev/null

# chrome URL FLAG...: one headless run with a fresh profile; its log in $work/log.txt.
chrome() {
  local url=$1; shift
  local profile; profile=$(mktemp -d "$work/profile.XXXXXX")
  timeout 120 "$browser" --headless --no-sandbox --disable-gpu --disable-quic --no-first-run \
    --disable-background-networking --disable-component-update --disable-sync \
    --user-data-dir="$profile" --enable-logging=stderr --v=0 "$@" "$url" 2>"$work/log.txt"
}
chrome about:blank --dump-dom >/dev/null || skip "Chromium cannot start here"

# check PAGE WIDTHxHEIGHT R,G,B MIN_PIXELS DOM_TEXT: R,G,B is a fill only style.css gives.
check() {
  local page=$1 size=$2 colour=$3 least=$4 text=$5
  local url="file://$work/site/$page" shot="$work/${page%.html}.png"
  chrome "$url" --dump-dom >"$work/dom.html" || fail "$page: Chromium failed"
  grep -q "CONSOLE" "$work/log.txt" && fail "$page: $(grep CONSOLE "$work/log.txt" | head -1)"
  grep -q "$text" "$work/dom.html" || fail "$page: the page has no $text"
  chrome "$url" --hide-scrollbars --window-size="$size" --screenshot="$shot" >/dev/null ||
    fail "$page: no screenshot"
  local ink pixels
  read -r ink pixels < <(python3 "$here/../../scripts/png_tool.py" ink "$shot" "$colour" |
                         sed 's/ink=\([0-9.]*\) colour=\([0-9]*\)/\1 \2/')
  python3 -c "import sys; sys.exit(0 if $ink > 0.03 else 1)" || fail "$page: blank screenshot"
  [ "$pixels" -ge "$least" ] || fail "$page: only $pixels pixels of $colour: no stylesheet or picture"
  echo "doc_browser: $page: ${ink} of the screenshot inked, $pixels pixels of $colour"
}

# The index: its table header's shade; a register page: the fill of register boxes.
check index.html 1100,800 243,245,247 2000 '<table class="dir"'
check regs-ctrl_regs.csv.html 1100,1600 221,230,241 20000 '<g class="slice"'
echo "doc_browser: passed"
