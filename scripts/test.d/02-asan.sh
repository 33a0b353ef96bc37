#!/usr/bin/env bash
# Everything built with AddressSanitizer + UndefinedBehaviorSanitizer (build-asan/), every test
# run.
source "$(dirname "$0")/common.bash"
configure "$root/build-asan" -DNEBU_SANITIZE=ON -DNEBU_BUILD_BENCH=OFF -DCMAKE_BUILD_TYPE=Debug
cmake --build "$root/build-asan" -j "$jobs"
ASAN_OPTIONS=detect_leaks=1 UBSAN_OPTIONS=print_stacktrace=1 run_ctest "$root/build-asan"
