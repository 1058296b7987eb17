#!/bin/sh
# Measures whole runs of the program beside what one would otherwise use; see docs/performance.md.
# usage: bench.sh [--short] [WORK...]
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh g++ cmake ninja-build pkg-config zlib1g-dev libminizip-dev \
  libsystemd-dev libbenchmark-dev libglib2.0-dev crudini git zip minizip libnss-wrapper procps python3
cmake --preset bench > /dev/null
cmake --build --preset bench > /dev/null
exec python3 scripts/bench.py "$@"
