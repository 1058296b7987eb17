#!/bin/sh
# Measures complete runs of the program and of other tools; see docs/performance.md.
# usage: bench.sh [--short] [WORK...]
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh build bench
cmake --preset bench > /dev/null
cmake --build --preset bench > /dev/null
# Copies, as an installed program is one: the linker leaves a file in small pieces of memory, whose
# pages cost more to map.
programs=build/bench/programs
rm -rf "$programs"
mkdir "$programs"
for name in ORXInstallEventLog bench/set_key bench/set_key_glib bench/registry_questions \
  bench/empty bench/empty_iostream; do
  cp "build/bench/$name" "$programs"
done
exec python3 scripts/bench.py "$@"
