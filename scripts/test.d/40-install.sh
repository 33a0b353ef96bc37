#!/usr/bin/env bash
# Installs OrvNebu into a temporary prefix, builds the example host (examples/host) against the
# installed tree with find_package and with pkg-config, runs both on the installed demo board,
# runs the installed console, and does it all again after moving the installed tree.
#   40-install.sh                   build in build-install/ first (the extra pass of scripts/test)
#   40-install.sh --build-dir DIR   install what DIR has built (the ctest)
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
build=
cxxflags=
if [ "${1:-}" = "--build-dir" ]; then
  build=$2
  # The outside programs are built the way that build was (-m32 in the 32-bit pass).
  cxxflags=$(sed -n 's/^CMAKE_CXX_FLAGS:[A-Z]*=//p' "$build/CMakeCache.txt")
  # ctest counts 77 as skipped; the extra pass of scripts/test installs pkg-config.
  command -v pkg-config >/dev/null || { echo "40-install: no pkg-config, skipped"; exit 77; }
else
  "$root/scripts/bootstrap" pkgconf
  build="$root/build-install"
  cmake -S "$root" -B "$build" -DNEBU_WERROR=ON -DNEBU_BUILD_TESTS=OFF -DNEBU_BUILD_BENCH=OFF >/dev/null
  cmake --build "$build" -j "$(nproc)"
fi
work=$(mktemp -d /tmp/orvnebu-install.XXXXXX)
trap 'rm -rf "$work"' EXIT
fail() { echo "40-install: $*" >&2; exit 1; }

expect() {  # expect WHAT EXPECTED ACTUAL
  [ "$2" = "$3" ] || fail "$1: expected
$2
got
$3"
}

cmake --install "$build" --prefix "$work/prefix" >/dev/null
for f in bin/nebu lib/liborvnebu.so lib/libOrvCore.so lib/libOrvJtag.so lib/libOrvUtil.so \
         lib/libnebu_board.so include/orvnebu/orvnebu.h include/orvnebu/host/OrvCore.h \
         include/orvnebu/hostsim/Sim.h include/orvnebu/hostsim/board/Board.h \
         share/orvnebu/boards/demo.json share/orvnebu/data/orvnebu_directory.csv \
         lib/cmake/OrvNebu/OrvNebuConfig.cmake lib/pkgconfig/orvnebu.pc \
         lib/pkgconfig/orvnebu-host.pc; do
  [ -e "$work/prefix/$f" ] || fail "missing $f"
done

# The plug-in exports the OrvNebu_ functions and nothing else.
exports=$(nm -D --defined-only "$work/prefix/lib/liborvnebu.so" | awk '{print $3}' | sort)
expect "exported functions" 27 "$(grep -c '^OrvNebu_' <<<"$exports")"
expect "other exports" "" "$(grep -v '^OrvNebu_' <<<"$exports" || true)"

check_prefix() {  # check_prefix PREFIX: the console and both host builds on the demo board
  local prefix=$1 out
  out=$("$prefix/bin/nebu" -e "getSlaveCount 0 1")
  expect "installed nebu in $prefix" $'> getSlaveCount 0 1\nrc=0x00000000\ncount=8' "$out"
  # The console finds the demo data beside itself: a slave of the demo board reads its registers.
  out=$("$prefix/bin/nebu" -e "initialize 0 1 0" | tail -1)
  expect "installed nebu initialize" "rc=0x00000000" "$out"

  rm -rf "$work/cmake-host"
  cmake -S "$root/examples/host" -B "$work/cmake-host" -DCMAKE_PREFIX_PATH="$prefix" \
        -DCMAKE_CXX_FLAGS="$cxxflags" >/dev/null
  cmake --build "$work/cmake-host" >/dev/null
  out=$("$work/cmake-host/orvnebu_host" "$prefix/share/orvnebu/boards/demo.json" \
        "$prefix/share/orvnebu/data")
  expect "find_package host" "getSlaveCount rc=0x00000000 count=8" "$out"

  local flags
  flags=$(PKG_CONFIG_PATH="$prefix/lib/pkgconfig" pkg-config --cflags --libs orvnebu orvnebu-host)
  # shellcheck disable=SC2086
  g++ $cxxflags -std=c++17 -o "$work/pc-host" "$root/examples/host/host.cpp" $flags -Wl,-rpath,"$prefix/lib"
  out=$("$work/pc-host" "$prefix/share/orvnebu/boards/demo.json" "$prefix/share/orvnebu/data" 0 2)
  expect "pkg-config host, transceiver bus" "getSlaveCount rc=0x00000000 count=8" "$out"
  # The demo board's second device has no bus on chain 1.
  out=$("$work/pc-host" "$prefix/share/orvnebu/boards/demo.json" "$prefix/share/orvnebu/data" 1 1)
  expect "pkg-config host, no bus" "getSlaveCount rc=0x00000000 count=0" "$out"
}

check_prefix "$work/prefix"
# The example host refuses what it cannot use, with a message and status 2.
set +e
out=$("$work/pc-host" "$work/absent.json" 2>&1); status=$?
set -e
expect "example host, missing board: status" 2 "$status"
grep -q 'absent.json' <<<"$out" || fail "example host, missing board: $out"
set +e
out=$("$work/pc-host" "$work/prefix/share/orvnebu/boards/demo.json" "$work/prefix/share/orvnebu/data" 0 x 2>&1); status=$?
set -e
expect "example host, bad chain: status" 2 "$status"
# Nothing refers to the prefix it was installed to.
mv "$work/prefix" "$work/moved"
check_prefix "$work/moved"
echo "40-install: installed tree, find_package and pkg-config hosts, installed nebu: ok"
