#!/bin/sh
# Runs every fuzz target for N seconds (default 30) over its seeds. A finding ends the script with a
# failure; its input is in build/fuzz. docs/fuzzing.md describes the targets.
set -eu
cd "$(dirname "$0")/.."
seconds=${1:-30}

scripts/install-packages.sh fuzz
cmake --preset fuzz
cmake --build --preset fuzz

# Thousands of histories are made and removed: in memory, if possible.
[ -d /dev/shm ] && TMPDIR=/dev/shm
TMPDIR=$(mktemp -d "${TMPDIR:-/tmp}/orx-fuzz.XXXXXX")
export TMPDIR
trap 'rm -rf "$TMPDIR"' EXIT

cd build/fuzz
find ../../fuzz/corpus -mindepth 1 -maxdepth 1 -printf "%f\n" | xargs -P "$(nproc)" -I{} sh -ec '
  mkdir -p grown/{}
  fuzz/{}_fuzz -max_total_time='"$seconds"' -timeout=10 -max_len=4096 -print_final_stats=1 \
    grown/{} ../../fuzz/corpus/{}'
