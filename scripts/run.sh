#!/usr/bin/env bash
# Builds kelcore and starts its console program, kelcon. Arguments go to kelcon.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
source scripts/common.sh
kel_build build/release -DCMAKE_BUILD_TYPE=Release -DKELCORE_BUILD_TESTS=OFF >&2
exec build/release/apps/kelcon/kelcon "$@"
