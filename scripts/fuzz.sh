#!/bin/sh
# Runs every fuzz target for so many seconds (30 unless told) over its seeds. What it finds lies in
# build/fuzz; a finding ends the script with a failure. docs/fuzzing.md tells what each looks at.
set -eu
cd "$(dirname "$0")/.."
seconds=${1:-30}

scripts/install-packages.sh clang libclang-rt-dev cmake ninja-build zlib1g-dev libminizip-dev libsystemd-dev
cmake --preset fuzz
cmake --build --preset fuzz

# Histories come and go by the thousand: in memory, where there is such a place.
[ -d /dev/shm ] && TMPDIR=/dev/shm
TMPDIR=$(mktemp -d "${TMPDIR:-/tmp}/orx-fuzz.XXXXXX")
export TMPDIR
trap 'rm -rf "$TMPDIR"' EXIT

cd build/fuzz
for seeds in ../../fuzz/corpus/*; do
  target=$(basename "$seeds")
  mkdir -p "grown/$target"
  "fuzz/${target}_fuzz" -max_total_time="$seconds" -timeout=10 -max_len=4096 -print_final_stats=1 \
    "grown/$target" "$seeds"
done
