#!/usr/bin/env bash
# Builds the libFuzzer targets with clang (AddressSanitizer and UndefinedBehaviorSanitizer),
# replays every seed and regression input, then fuzzes each target for a bounded time,
# as many at once as there are cores. A crash, leak, timeout or sanitizer report fails
# the run; the input that caused it is left in build/fuzz/artifacts/.
#   scripts/fuzz.sh [SECONDS_PER_TARGET [TARGET...]]     (default: 30 seconds, every target)
# New inputs found while fuzzing collect in build/fuzz/corpus/<target>/, not in the tree.
# KELCORE_FUZZ_BUILD names another build directory instead of build/fuzz.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh --fuzz
source scripts/common.sh

seconds=${1:-30}
shift || true
dir=${KELCORE_FUZZ_BUILD:-build/fuzz}

kel_build "$dir" -DCMAKE_C_COMPILER=clang-14 -DCMAKE_CXX_COMPILER=clang++-14 \
  -DCMAKE_BUILD_TYPE=RelWithDebInfo -DKELCORE_FUZZ=ON \
  -DKELCORE_BUILD_TESTS=OFF -DKELCORE_BUILD_APPS=OFF

export ASAN_OPTIONS=detect_leaks=1:abort_on_error=1:strict_string_checks=1
export UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1
ctest --test-dir "$dir" --output-on-failure --parallel "$(nproc)"

targets=("$@")
if [[ ${#targets[@]} -eq 0 ]]; then
  mapfile -t targets < <(sed -n 's/^kelcore_add_fuzzer(\(.*\))$/\1/p' fuzz/CMakeLists.txt)
fi
mkdir -p "$dir/artifacts" "$dir/logs"

fuzz_one() {
  local name=$1 seconds=$2 dir=$3
  local work="$dir/corpus/$name" dict=()
  mkdir -p "$work"
  [[ -f fuzz/dict/$name.dict ]] && dict=(-dict="fuzz/dict/$name.dict")
  if "$dir/fuzz/fuzz_$name" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 \
      -print_final_stats=1 -artifact_prefix="$dir/artifacts/$name-" "${dict[@]}" \
      "$work" "fuzz/corpus/$name" >"$dir/logs/$name.log" 2>&1; then
    local runs rate
    runs=$(sed -n 's/^stat::number_of_executed_units: *//p' "$dir/logs/$name.log")
    rate=$((runs / (seconds > 0 ? seconds : 1)))
    echo "fuzz $name: $runs inputs in ${seconds}s ($rate/s), no finding"
  else
    echo "fuzz $name: FAILED; log $dir/logs/$name.log:"
    tail -n 60 "$dir/logs/$name.log"
    return 1
  fi
}
export -f fuzz_one

printf '%s\n' "${targets[@]}" | xargs -P "$(nproc)" -I{} bash -c 'fuzz_one "$@"' _ {} "$seconds" "$dir"
