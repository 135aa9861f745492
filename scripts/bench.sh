#!/usr/bin/env bash
# Builds the benchmark programs in Release and runs them all. Each program ends with a
# table of kelcore against its peers from the same run. Arguments go to every program
# (for example --benchmark_filter=utf or --benchmark_repetitions=5).
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh --bench
source scripts/common.sh
kel_build build/bench -DCMAKE_BUILD_TYPE=Release -DKELCORE_BUILD_TESTS=OFF \
  -DKELCORE_BUILD_BENCH=ON >&2
for program in build/bench/bench/*/bench_*; do
  [[ -x "$program" ]] || continue
  echo "== $(basename "$program")"
  "$program" "$@"
done
