#!/bin/sh
# Formatting and static analysis of all our sources; says what is wrong and changes nothing.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh git clang-format clang-tidy python3
git ls-files '*.cpp' '*.h' | xargs clang-format --dry-run -Werror
scripts/build.sh release
git ls-files 'app/*.cpp' 'history/*.cpp' 'eventlog/*.cpp' 'inventory/*.cpp' 'products/*.cpp' \
  'report/*.cpp' 'platform/posix/*.cpp' |
  xargs -P "$(nproc)" -n 8 clang-tidy -p build/release --quiet --extra-arg=-Wno-unknown-warning-option
