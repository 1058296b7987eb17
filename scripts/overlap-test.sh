#!/bin/sh
# Sixteen runs at once, of all kinds, by the thousand; checks that nothing of any is lost.
# "--seconds N" makes each of its rounds about that long.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh python3 strace
scripts/build.sh release
exec python3 scripts/reliability/overlap_test.py "$@"
