#!/usr/bin/env bash
# valgrind memcheck of the console sessions of the transcripts: no leak, no invalid access, every
# output as written down, and the plug-in really unmapped when the console unloads it.
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
"$root/scripts/bootstrap" valgrind
dir="$root/build-valgrind"
cmake -S "$root" -B "$dir" -DNEBU_WERROR=ON -DNEBU_BUILD_TESTS=OFF -DNEBU_BUILD_BENCH=OFF \
      -DCMAKE_BUILD_TYPE=Debug >/dev/null
cmake --build "$dir" -j "$(nproc)" --target nebu orvnebu nebu_data
# The transcripts of tests/transcripts/ run under memcheck; `nebu check` runs each in a child
# process, which valgrind follows (one log per process). A transcript that differs, an error or
# a leak in any process fails the pass. glibc's loader (LD_DEBUG=files) reports every object it
# really unmaps: the plug-in must be one of them, since a plug-in that stays mapped keeps what
# it leaked out of the leak check.
rm -f "$dir"/check.valgrind.* "$dir"/check.ld.*
if ! LD_DEBUG=files LD_DEBUG_OUTPUT="$dir/check.ld" \
     valgrind --tool=memcheck --leak-check=full --errors-for-leak-kinds=definite,indirect \
              --error-exitcode=1 --track-origins=yes --num-callers=30 \
              --log-file="$dir/check.valgrind.%p" \
              "$dir/bin/nebu" check "$root"/tests/transcripts/*.t >"$dir/check.out" 2>&1; then
  cat "$dir/check.out" >&2
  grep -l 'ERROR SUMMARY: [1-9]' "$dir"/check.valgrind.* | xargs -r cat >&2
  echo "30-valgrind: nebu check failed under memcheck" >&2
  exit 1
fi
if grep -l 'ERROR SUMMARY: [1-9]' "$dir"/check.valgrind.* >&2; then
  echo "30-valgrind: memcheck errors (logs above)" >&2
  exit 1
fi
if ! grep -qs 'liborvnebu\.so.*destroying link map' "$dir"/check.ld.*; then
  echo "30-valgrind: the plug-in stayed mapped after the console unloaded it" >&2
  exit 1
fi
echo "30-valgrind: $(tail -1 "$dir/check.out"), $(ls "$dir"/check.valgrind.* | wc -l) processes," \
     "no memcheck error, plug-in unmapped"
