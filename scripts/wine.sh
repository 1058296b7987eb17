#!/bin/sh
# Runs a Windows program under Wine, in a Windows of its own in the build folder, without a display
# and without the questions of a first start.
set -eu
export WINEPREFIX="${WINEPREFIX:-$(cd "$(dirname "$0")/.." && pwd)/build/wine}"
export WINEARCH=win64 WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml,winemenubuilder.exe="
export LC_ALL=C.UTF-8  # for the code page of Western Europe
unset DISPLAY
exec wine "$@"
