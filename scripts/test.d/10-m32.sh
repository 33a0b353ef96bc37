#!/usr/bin/env bash
# 32-bit pass: the real host is a 32-bit process, so the library, the stand-in host, the board,
# the console and every test are built with -m32 (GoogleTest from its sources) and run.
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
"$root/scripts/bootstrap" g++-multilib googletest file
dir="$root/build-m32"
jobs=$(nproc)
cmake -S "$root" -B "$dir" -DNEBU_WERROR=ON -DNEBU_BUILD_BENCH=OFF -DNEBU_GTEST_FROM_SOURCE=ON \
      -DCMAKE_CXX_FLAGS=-m32 >/dev/null
cmake --build "$dir" -j "$jobs"
file -L "$dir/lib/liborvnebu.so" | grep -q 'ELF 32-bit' \
  || { echo "10-m32: liborvnebu.so is not a 32-bit library" >&2; exit 1; }
(cd "$dir" && ctest --output-on-failure -j "$jobs")
