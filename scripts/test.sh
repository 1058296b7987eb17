#!/bin/sh
# Builds and runs every test: under the address and undefined-behaviour sanitizers, and as
# released; in between, other programs read the archives.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh libnss-wrapper unzip zip python3
scripts/build.sh debug
ctest --preset debug
scripts/build.sh release
scripts/check-archive.sh build/release/ORXInstallEventLog
ctest --preset release
