#!/usr/bin/env bash
# Windows x86-64 under Wine (build-wine64/): the plug-in, stand-in host, board, console and
# nebu_tests cross-built with mingw-w64, every test run under wine64, and nebu.exe's output of
# the demo tour compared with the Linux console's.
source "$(dirname "$0")/common.bash"
source "$(dirname "$0")/wine.bash"
need g++-mingw-w64-x86-64-posix wine64 googletest
wine_pass x86_64 "$root/build-wine64" wine64
