#!/bin/sh
# Installs what a fresh Debian machine lacks, builds, and records, packs and reads a whole event in a
# scratch folder.
set -eu
cd "$(dirname "$0")/.."

scripts/build.sh release
PATH="$PWD/build/release:$PATH" scripts/sample-machine/whole-event.sh
