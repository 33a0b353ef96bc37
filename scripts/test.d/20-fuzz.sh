#!/usr/bin/env bash
# Fuzz pass: every libFuzzer target for about a minute (build-fuzz/); any finding fails.
# Skipped where clang cannot build and run a libFuzzer probe.
source "$(dirname "$0")/common.bash"
need clang libclang-rt-14-dev
probe="$root/build-fuzz/probe"
mkdir -p "$probe"
printf '%s\n' '#include <cstddef>' '#include <cstdint>' \
  'extern "C" int LLVMFuzzerTestOneInput(const uint8_t*, size_t) { return 0; }' >"$probe/probe.cpp"
clang++ -fsanitize=fuzzer,address,undefined -o "$probe/probe" "$probe/probe.cpp" 2>/dev/null ||
  skip "clang cannot build a libFuzzer probe (-fsanitize=fuzzer,address,undefined)"
"$probe/probe" -runs=1 >/dev/null 2>&1 || skip "a libFuzzer probe does not run"
exec "$root/scripts/fuzz" "${NEBU_FUZZ_SECONDS:-60}"
