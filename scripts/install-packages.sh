#!/bin/sh
# Installs those of the named Debian packages that are missing.
set -eu

missing=""
for package in "$@"; do
  if ! dpkg-query --show --showformat='${db:Status-Status}\n' "$package" 2>/dev/null |
      grep -q '^installed$'; then
    missing="$missing $package"
  fi
done
[ -n "$missing" ] || exit 0

as_root=""
[ "$(id -u)" -eq 0 ] || as_root=sudo
$as_root apt-get -q update
# The words of the list are to be split.
# shellcheck disable=SC2086
DEBIAN_FRONTEND=noninteractive $as_root apt-get -q install -y --no-install-recommends $missing
