#!/bin/sh
# Runs a Windows program under Wine, in a Windows of its own in the build folder, without a display
# and without the questions of a first start.
set -eu
export WINEPREFIX="${WINEPREFIX:-$(cd "$(dirname "$0")/.." && pwd)/build/wine}"
export WINEARCH=win64 WINEDEBUG=-all
export WINEDLLOVERRIDES="${WINEDLLOVERRIDES:+$WINEDLLOVERRIDES;}mscoree,mshtml,winemenubuilder.exe="
export LC_ALL="${ORX_LOCALE:-C.UTF-8}"  # decides the code page: without it that of Western Europe
unset DISPLAY
exec wine "$@"
