#!/usr/bin/env bash
# Builds kelcore and runs every test: first a warnings-as-errors build (which also
# installs the library and builds a program against it), then the same suite built
# with AddressSanitizer and UndefinedBehaviorSanitizer, and again with ThreadSanitizer;
# last, every fuzz target replays its corpus and is fuzzed for KELCORE_FUZZ_SECONDS
# (30 by default) under clang's sanitizers.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
source scripts/common.sh

export ASAN_OPTIONS=detect_leaks=1:abort_on_error=1:strict_string_checks=1
export UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1
export TSAN_OPTIONS=halt_on_error=1:second_deadlock_stack=1

run_suite() {
  local dir=$1
  shift
  echo "== $dir"
  kel_build "$dir" -DKELCORE_WERROR=ON "$@"
  ctest --test-dir "$dir" --output-on-failure --parallel "$(nproc)"
}

run_suite build/test -DCMAKE_BUILD_TYPE=RelWithDebInfo
run_suite build/test-asan -DCMAKE_BUILD_TYPE=Debug -DCMAKE_CXX_FLAGS_DEBUG="-g -O1" -DKELCORE_SANITIZE=address,undefined
run_suite build/test-tsan -DCMAKE_BUILD_TYPE=Debug -DCMAKE_CXX_FLAGS_DEBUG="-g -O1" -DKELCORE_SANITIZE=thread \
  -DKELCORE_BUILD_APPS=OFF

scripts/fuzz.sh "${KELCORE_FUZZ_SECONDS:-30}"
