#!/usr/bin/env bash
# Fuzz pass: every libFuzzer target for about a minute (build-fuzz/); any finding fails.
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
exec "$root/scripts/fuzz" "${NEBU_FUZZ_SECONDS:-60}"
