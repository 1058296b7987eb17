#!/bin/sh
# Times what a snapshot asks of a large registry export beside reading that file once.
set -eu
cd "$(dirname "$0")/.."
megabytes=${1:-100}

scripts/install-packages.sh python3 g++ cmake ninja-build zlib1g-dev libminizip-dev libsystemd-dev
cmake --preset release -DORX_BENCH=ON
cmake --build --preset release --target registry_questions
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
mkdir "$scratch/ZEK"
export ORX_COMMON_APPDATA="$scratch"

for encoding in utf-8 utf-16; do
  scripts/make-registry-export.py "$megabytes" "$encoding" "$scratch/ZEK/Registry.reg"
  echo "$megabytes MB, $encoding:"
  bench/compare.py 21 build/release/bench/registry_questions "cat $scratch/ZEK/Registry.reg"
done
