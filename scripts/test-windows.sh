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

# Locales whose code pages Wine takes: 932, where the second byte of a character can be that of a
# separator, and 1251.
export LOCPATH="$PWD/build/locale"
mkdir -p "$LOCPATH"
for language in ja_JP ru_RU; do
  localedef -f UTF-8 -i "$language" "$LOCPATH/$language.UTF-8"
done

export WINEPREFIX="$PWD/build/wine"
rm -rf "$WINEPREFIX"
scripts/wine.sh wineboot --init
trap 'wineserver --kill || true' EXIT  # it may have ended by itself

# Unit tests once more, without the runs of the program, which ctest does.
run_unit_tests() {
  scripts/wine.sh "build/windows/tests/$1.exe" --gtest_brief=1 --gtest_filter=-Run.*
}
for language in ja_JP ru_RU; do
  echo "Unit tests: $language"
  for tests in orx_tests orx_reader_tests orx_platform_tests; do
    ORX_LOCALE="$language.UTF-8" run_unit_tests "$tests"
  done
done
# Only the platform layer calls what differs between versions.
for version in vista win7 win8 win81 win10; do
  echo "Unit tests: $version"
  scripts/wine.sh reg add 'HKCU\Software\Wine' /v Version /d "$version" /f > /dev/null
  run_unit_tests orx_platform_tests
done

ctest --preset windows
