#!/usr/bin/env bash
# Mutation pass: a fixed sample of faults planted in the plug-in (scripts/mutate, build-mutate/),
# those the schema holds (the few built one by one cost seconds each and are left to full runs);
# fails when the suite kills a smaller share of them than scripts/mutate.floor holds.
set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
"$root/scripts/bootstrap" python3 ninja-build git ccache lld
exec python3 "$root/scripts/mutate" --sample "${NEBU_MUTATE_SAMPLE:-150}" --seed 1 --schema-only \
  --floor "$root/scripts/mutate.floor" --report "$root/build-mutate/sample-report.txt"
