#!/usr/bin/env bash
# 32-bit pass: the real host is a 32-bit process, so the library, the stand-in host, the board,
# the console and every test are built with -m32 (GoogleTest from its sources) and run. Skipped
# where the kernel cannot run 32-bit programs.
source "$(dirname "$0")/common.bash"
need g++-multilib googletest file
dir="$root/build-m32"
probe_m32 "$dir"
configure "$dir" -DNEBU_BUILD_BENCH=OFF -DNEBU_GTEST_FROM_SOURCE=ON -DCMAKE_CXX_FLAGS=-m32
cmake --build "$dir" -j "$jobs"
file -L "$dir/lib/liborvnebu.so" | grep -q 'ELF 32-bit' || fail "liborvnebu.so is not a 32-bit library"
run_ctest "$dir"
