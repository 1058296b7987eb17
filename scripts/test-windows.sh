#!/bin/sh
# Builds the program and its tests for Windows, runs the tests under Wine, and compares what the
# program does there with what it does here.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh windows
scripts/build.sh release  # one side of the comparison
cmake --preset windows
cmake --build --preset windows

# The program must start on a Windows where nothing was installed for it, and where the libraries
# that it looks up at run time may be missing.
imports=$(x86_64-w64-mingw32-objdump -p build/windows/ORXInstallEventLog.exe |
  sed -n 's/.*DLL Name: //p' | tr '[:upper:]' '[:lower:]')
for import in $imports; do
  case $import in
    advapi32.dll | kernel32.dll | msvcrt.dll) ;;
    *) echo "The program needs $import." >&2; exit 1 ;;
  esac
done

export WINEPREFIX="$PWD/build/wine"
rm -rf "$WINEPREFIX"
scripts/wine.sh wineboot --init
trap 'wineserver --kill || true' EXIT  # it may have ended by itself
ctest --preset windows
