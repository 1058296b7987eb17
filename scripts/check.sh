#!/bin/bash
# The checks, each step with its name and its time:
#
#   check.sh            what to run before a commit: style, build, tests (the same as "quick")
#   check.sh all        everything that a change must pass, from a clean clone on a bare Debian 12
#   check.sh reliability | windows | fuzz | packages       one part of it
#
# The first step that fails ends the run with a failure and shows what it printed; the output of all
# steps is in build/check/.
set -euo pipefail
cd "$(dirname "$0")/.."
mkdir -p build/check

# step NAME COMMAND...
step() {
  local name=$1 began=$SECONDS log=build/check/$1.log
  shift
  printf '%-12s ' "$name"
  if "$@" >"$log" 2>&1 </dev/null; then
    printf '%4d s\n' $((SECONDS - began))
  else
    printf '%4d s  FAILED\n' $((SECONDS - began))
    cat "$log"
    exit 1
  fi
}

quick() {
  step format scripts/check-style.sh format
  step build scripts/build.sh release
  scripts/install-packages.sh tests >/dev/null
  step tests ctest --preset release
}

reliability() {
  step build scripts/build.sh release
  scripts/install-packages.sh reliability >/dev/null
  step reliability python3 scripts/reliability/run.py "$@"
}

page() {
  step build scripts/build.sh release
  scripts/install-packages.sh page >/dev/null
  step page python3 scripts/check_page.py
}

packages() {
  step packages scripts/package.sh
}

all() {
  quick
  step demo scripts/demo.sh
  step analysis scripts/check-style.sh analysis
  page
  reliability --seconds 60
  step fuzz scripts/fuzz.sh 8
  step windows scripts/test-windows.sh
  packages
  step all-tests scripts/test.sh
}

case ${1:-quick} in
  quick) quick; summary=tests ;;
  all) all; summary=all-tests ;;
  reliability) shift; reliability "$@"; summary=reliability ;;
  windows) step windows scripts/test-windows.sh; summary=windows ;;
  fuzz) step fuzz scripts/fuzz.sh "${2:-30}"; summary=fuzz ;;
  packages) packages; summary=packages ;;
  *) sed -n '2,/^$/s/^# \{0,1\}//p' "$0" >&2; exit 2 ;;
esac
echo
tail -n 4 "build/check/$summary.log"
