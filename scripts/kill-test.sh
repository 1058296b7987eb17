#!/bin/sh
# Kills the program at each of its writing system calls, and has each call fail, one at a time;
# checks the history after each. "--seconds N" takes a sample of about that many seconds.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh python3 strace
scripts/build.sh release
exec python3 scripts/reliability/kill_test.py "$@"
