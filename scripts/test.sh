#!/bin/sh
# Builds and runs every test: once as released, once under the address and undefined-behaviour
# sanitizers.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh libnss-wrapper unzip zip
for preset in debug release; do
  scripts/build.sh "$preset"
  ctest --preset "$preset"
done
scripts/check-archive.sh build/release/ORXInstallEventLog
