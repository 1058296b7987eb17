#!/bin/sh
# Installs what a fresh Debian machine lacks, builds, and records, packs and reads a complete event
# in a temporary folder.
set -eu
cd "$(dirname "$0")/.."

scripts/build.sh release
PATH="$PWD/build/release:$PATH" scripts/sample-machine/whole-event.sh
