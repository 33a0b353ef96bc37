# Shared by the passes of scripts/test.d (sourced): the pass's name, skipping with a reason,
# installing what a pass needs, CMake with ccache, and ctest with counts for the summary.
set -euo pipefail
pass=$(basename "$0" .sh)
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)
jobs=$(nproc)

# The one line that says why this pass cannot run on this machine; scripts/test goes on.
skip() {
  echo "$pass: skipped: $*"
  exit 77
}
fail() {
  echo "$pass: $*" >&2
  exit 1
}

# need PACKAGE...: installs what is missing; a machine where that fails skips the pass.
need() {
  "$root/scripts/bootstrap" "$@" || skip "cannot install $*"
}

# probe_m32 DIR: skips the pass unless this machine builds and runs a 32-bit (-m32) program.
probe_m32() {
  mkdir -p "$1/probe"
  printf 'int main() { return 0; }\n' >"$1/probe/m32.cpp"
  g++ -m32 -o "$1/probe/m32" "$1/probe/m32.cpp" || skip "g++ -m32 cannot build a probe program"
  "$1/probe/m32" 2>/dev/null || skip "this machine cannot run 32-bit programs (exec of a probe failed)"
}

# configure DIR CMAKE-ARGS...: warnings are errors; ccache when the machine has it (a cold
# cache only costs time: NEBU_CCACHE=0 turns it off).
configure() {
  local dir=$1
  shift
  local launcher=()
  if [ "${NEBU_CCACHE:-1}" != 0 ] && command -v ccache >/dev/null; then
    export CCACHE_BASEDIR=${CCACHE_BASEDIR:-$root}
    launcher=(-DCMAKE_CXX_COMPILER_LAUNCHER=ccache -DCMAKE_C_COMPILER_LAUNCHER=ccache)
  fi
  cmake -S "$root" -B "$dir" -DNEBU_WERROR=ON "${launcher[@]}" "$@" >/dev/null
}

# run_ctest DIR [CTEST-ARGS...]: runs the tests, names each one that timed out, and leaves the
# counts for the summary of scripts/test. A run without tests fails.
run_ctest() {
  local dir=$1
  shift
  local log="$dir/ctest.log" status=0
  (cd "$dir" && ctest --output-on-failure -j "$jobs" "$@") 2>&1 </dev/null | tee "$log" ||
    status=${PIPESTATUS[0]}
  local line total failed skipped
  line=$(grep -E '^[0-9]+% tests passed, [0-9]+ tests? failed out of [0-9]+' "$log" | tail -1 || true)
  [ -n "$line" ] || fail "ctest in $dir ran no test"
  total=$(sed -E 's/.* out of ([0-9]+).*/\1/' <<<"$line")
  failed=$(sed -E 's/.*passed, ([0-9]+) tests? failed.*/\1/' <<<"$line")
  skipped=$(grep -cE '\(Skipped\)$' "$log" || true)
  [ -z "${NEBU_TEST_COUNTS:-}" ] ||
    echo "$((total - failed - skipped)) $failed $skipped" >"$NEBU_TEST_COUNTS"
  grep -E '\*\*\*Timeout' "$log" | sed -E "s/^.*Test +#[0-9]+: ([^ ]+) .*/$pass: timed out: \1/" ||
    true
  echo "$pass: $total tests, $failed failed, $skipped skipped ($dir)"
  [ "$status" -eq 0 ] && [ "$failed" -eq 0 ]
}
