#!/usr/bin/env bash
# Everything built with warnings as errors (build/), every test run.
source "$(dirname "$0")/common.bash"
configure "$root/build"
cmake --build "$root/build" -j "$jobs"
run_ctest "$root/build"
