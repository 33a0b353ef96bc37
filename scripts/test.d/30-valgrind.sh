#!/usr/bin/env bash
# valgrind memcheck of one console session over every slave of the demo board
# (tests/valgrind/session.nebu): no leak, no invalid access, and every call of it succeeds.
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
"$root/scripts/bootstrap" valgrind
dir="$root/build-valgrind"
cmake -S "$root" -B "$dir" -DNEBU_WERROR=ON -DNEBU_BUILD_TESTS=OFF -DNEBU_BUILD_BENCH=OFF \
      -DCMAKE_BUILD_TYPE=Debug >/dev/null
cmake --build "$dir" -j "$(nproc)" --target nebu orvnebu nebu_data
log="$dir/session.out"
# The console exits 1 when a call fails, valgrind exits 1 when it found an error or a leak:
# either way the pass fails.
valgrind --tool=memcheck --leak-check=full --errors-for-leak-kinds=definite,indirect \
         --error-exitcode=1 --track-origins=yes --num-callers=30 --log-file="$dir/valgrind.log" \
         "$dir/bin/nebu" --board "$root/boards/demo.json" --data-dir "$root/data/" \
         "$root/tests/valgrind/session.nebu" >"$log" 2>&1 \
  || { cat "$log" "$dir/valgrind.log" >&2; echo "30-valgrind: failed" >&2; exit 1; }
# The session must really have reached every slave: one rc line per exported call, none failed.
if grep -q 'rc=0x80000000' "$log"; then
  cat "$log" >&2; echo "30-valgrind: a call of the session failed" >&2; exit 1
fi
grep -q 'ERROR SUMMARY: 0 errors' "$dir/valgrind.log" \
  || { cat "$dir/valgrind.log" >&2; echo "30-valgrind: memcheck errors" >&2; exit 1; }
echo "30-valgrind: $(grep -o 'rc=0x00000000' "$log" | wc -l) calls, $(grep -E 'in use at exit|definitely lost' "$dir/valgrind.log" | sed 's/^==[0-9]*== *//' | tr '\n' ' ')"
