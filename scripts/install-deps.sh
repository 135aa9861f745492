#!/usr/bin/env bash
# Installs the Debian packages kelcore needs that are not installed yet.
#   scripts/install-deps.sh           what building, running and testing need
#   scripts/install-deps.sh --bench   also the peer libraries the benchmarks compare with
#   scripts/install-deps.sh --fuzz    also clang and its fuzzing runtime
set -euo pipefail

packages=(
  g++ cmake ninja-build ccache pkg-config
  libboost-dev libicu-dev libexpat1-dev zlib1g-dev libedit-dev
  libgtest-dev libgmock-dev
)
if [[ "${1:-}" == "--bench" ]]; then
  packages+=(libbenchmark-dev libmimalloc-dev libjemalloc-dev libtbb-dev nlohmann-json3-dev rapidjson-dev)
elif [[ "${1:-}" == "--fuzz" ]]; then
  packages+=(clang-14 libclang-rt-14-dev)
fi

missing=()
for pkg in "${packages[@]}"; do
  if ! dpkg-query -W -f='${Status}' "$pkg" 2>/dev/null | grep -q "install ok installed"; then
    missing+=("$pkg")
  fi
done
[[ ${#missing[@]} -eq 0 ]] && exit 0

echo "install-deps: installing ${missing[*]}"
sudo=()
[[ $(id -u) -ne 0 ]] && sudo=(sudo)
export DEBIAN_FRONTEND=noninteractive
"${sudo[@]}" apt-get update -qq
"${sudo[@]}" apt-get install -y -qq --no-install-recommends "${missing[@]}"
