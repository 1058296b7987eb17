#!/bin/sh
# Builds a preset ("release" or "debug"), after installing what a fresh Debian machine lacks for it.
set -eu
cd "$(dirname "$0")/.."
preset=$1

scripts/install-packages.sh build
cmake --preset "$preset"
cmake --build --preset "$preset"
