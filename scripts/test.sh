#!/bin/sh
# Builds and runs every test: as released, and under the address and undefined-behaviour sanitizers.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh tests
for preset in release debug; do
  scripts/build.sh "$preset"
  ctest --preset "$preset"
done
