#!/usr/bin/env bash
# The pages of `nebu doc` in headless Chromium (tests/browser/doc_browser.sh): the index and a
# register page, opened from the file system, must render their stylesheet and pictures.
source "$(dirname "$0")/common.bash"
need chromium
# The Linux pass's nebu when it has built one; a build of its own otherwise.
dir="$root/build"
if [ ! -x "$dir/bin/nebu" ]; then
  dir="$root/build-doc"
  configure "$dir" -DNEBU_BUILD_TESTS=OFF -DNEBU_BUILD_BENCH=OFF
  cmake --build "$dir" -j "$jobs" --target nebu
fi
status=0
output=$(bash "$root/tests/browser/doc_browser.sh" "$dir/bin/nebu" "$root/data" \
  "$root/build-doc-browser" 2>&1) || status=$?
# 77: Chromium is installed but cannot start here; the script's one line says so.
[ "$status" -eq 77 ] && skip "$(tail -1 <<<"$output")"
echo "$output"
exit "$status"
