#!/bin/sh
# Installs those of the named Debian packages that are missing. A name may be that of a group below:
# this is the one list of what the scripts need. A script that needs one more package by itself may
# name it.
set -eu

packages_of() {
  case $1 in
    build) echo "g++ cmake ninja-build pkg-config zlib1g-dev libminizip-dev libsystemd-dev \
      libcli11-dev nlohmann-json3-dev libgtest-dev" ;;
    tests) echo "libnss-wrapper python3 sqlite3" ;;
    style) echo "git clang-format clang-tidy python3 pycodestyle pyflakes3 shellcheck" ;;
    reliability) echo "acl attr binutils libnss-wrapper python3 strace unzip" ;;
    page) echo "chromium python3" ;;
    fuzz) echo "clang libclang-rt-dev cmake ninja-build zlib1g-dev libminizip-dev libsystemd-dev \
      libcli11-dev nlohmann-json3-dev" ;;
    windows) echo "cmake dpkg-dev googletest g++-mingw-w64-x86-64-posix libcli11-dev \
      libz-mingw-w64-dev ninja-build nlohmann-json3-dev python3 wine wine64" ;;
    packages) echo "$(packages_of windows) binutils debootstrap lintian" ;;
    bench) echo "libbenchmark-dev libglib2.0-dev pkg-config crudini git zip unzip minizip \
      libnss-wrapper procps python3" ;;
    *) echo "$1" ;;
  esac
}

missing=""
for name in "$@"; do
  for package in $(packages_of "$name"); do
    if ! dpkg-query --show --showformat='${db:Status-Status}\n' "$package" 2>/dev/null |
        grep -q '^installed$'; then
      missing="$missing $package"
    fi
  done
done
[ -n "$missing" ] || exit 0

as_root=""
[ "$(id -u)" -eq 0 ] || as_root=sudo
$as_root apt-get -q update
# The words of the list are to be split.
# shellcheck disable=SC2086
DEBIAN_FRONTEND=noninteractive $as_root apt-get -q install -y --no-install-recommends $missing
