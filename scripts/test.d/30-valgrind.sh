#!/usr/bin/env bash
# valgrind memcheck of console sessions on the demo board (tests/valgrind/*.nebu: every slave,
# and a short one without reference-clock questions): no leak, no invalid access, every call
# succeeds, and the plug-in is really unmapped when the console unloads it.
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
"$root/scripts/bootstrap" valgrind
dir="$root/build-valgrind"
cmake -S "$root" -B "$dir" -DNEBU_WERROR=ON -DNEBU_BUILD_TESTS=OFF -DNEBU_BUILD_BENCH=OFF \
      -DCMAKE_BUILD_TYPE=Debug >/dev/null
cmake --build "$dir" -j "$(nproc)" --target nebu orvnebu nebu_data
# Each console script of tests/valgrind/ runs in a console of its own. The console exits 1 when
# a call fails, valgrind exits 1 when it found an error or a leak: either way the pass fails.
# glibc's loader (LD_DEBUG=files) reports every object it really unmaps: the plug-in must be one
# of them, since a plug-in that stays mapped keeps what it leaked out of the leak check.
status=0
for script in "$root"/tests/valgrind/*.nebu; do
  name=$(basename "$script" .nebu)
  log="$dir/$name.out" vlog="$dir/$name.valgrind.log" ldlog="$dir/$name.ld"
  rm -f "$ldlog".*
  if ! LD_DEBUG=files LD_DEBUG_OUTPUT="$ldlog" \
       valgrind --tool=memcheck --leak-check=full --errors-for-leak-kinds=definite,indirect \
                --error-exitcode=1 --track-origins=yes --num-callers=30 --log-file="$vlog" \
                "$dir/bin/nebu" --board "$root/boards/demo.json" --data-dir "$root/data/" \
                "$script" >"$log" 2>&1; then
    cat "$log" "$vlog" >&2; echo "30-valgrind: $name: failed" >&2; status=1; continue
  fi
  # The script must really have reached every slave it names: no call failed.
  if grep -q 'rc=0x80000000' "$log"; then
    cat "$log" >&2; echo "30-valgrind: $name: a call of the script failed" >&2; status=1; continue
  fi
  if ! grep -q 'ERROR SUMMARY: 0 errors' "$vlog"; then
    cat "$vlog" >&2; echo "30-valgrind: $name: memcheck errors" >&2; status=1; continue
  fi
  if ! grep -qs 'liborvnebu\.so.*destroying link map' "$ldlog".*; then
    echo "30-valgrind: $name: the plug-in stayed mapped after the console unloaded it" >&2
    status=1; continue
  fi
  echo "30-valgrind: $name: $(grep -o 'rc=0x00000000' "$log" | wc -l) calls, plug-in unmapped," \
       "$(grep -E 'in use at exit|definitely lost' "$vlog" | sed 's/^==[0-9]*== *//' | tr '\n' ' ')"
done
exit $status
