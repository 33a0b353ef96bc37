#!/usr/bin/env bash
# The pages of `nebu doc` in headless Chromium (tests/browser/doc_browser.sh), with Chromium
# installed first; where it cannot be installed the pass is skipped with one line saying so.
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
if ! "$root/scripts/bootstrap" chromium >/dev/null 2>&1; then
  echo "SKIPPED 60-doc-browser: Chromium cannot be installed here; the pages were not seen"
  exit 0
fi
# The plain suite's nebu when scripts/test has built it; a build of its own otherwise.
dir="$root/build"
if [ ! -x "$dir/bin/nebu" ]; then
  dir="$root/build-doc"
  cmake -S "$root" -B "$dir" -DNEBU_WERROR=ON -DNEBU_BUILD_TESTS=OFF -DNEBU_BUILD_BENCH=OFF >/dev/null
  cmake --build "$dir" -j "$(nproc)" --target nebu
fi
status=0
bash "$root/tests/browser/doc_browser.sh" "$dir/bin/nebu" "$root/data" "$root/build-doc-browser" ||
  status=$?
# 77: Chromium is there but cannot start; the script has said so.
[ "$status" -eq 77 ] && exit 0
exit "$status"
