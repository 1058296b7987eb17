#!/bin/sh
# Runs a Windows program under Wine, in a Windows of its own in the build folder, without a display
# and without the questions of a first start.
set -eu
export WINEPREFIX="${WINEPREFIX:-$(cd "$(dirname "$0")/.." && pwd)/build/wine}"
export WINEARCH=win64 LC_ALL=C.UTF-8 WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml,winemenubuilder.exe="
unset DISPLAY
exec wine "$@"
