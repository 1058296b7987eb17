#!/bin/sh
# Hostile names, links in every place that a run touches, foreign and full folders; checks that
# nothing outside the history is changed or packed. As root, to be other users too. Looks at the
# program's hardening as well.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh python3 util-linux binutils
scripts/build.sh release
exec python3 scripts/reliability/trust_test.py "$@"
