#!/bin/sh
# Unpacks the system's minizip source package, with its distributor's corrections, as the folder
# "minizip" below the named one. The package lists of sources are fetched into that folder too: the
# machine's own package sources are read, and nothing of its set-up is changed.
set -eu
mkdir -p "$1"
cd "$1"
folder=$PWD

mkdir -p sources lists/partial cache/archives/partial
lists=/etc/apt/sources.list
for list in "$lists" "$lists".d/*.list "$lists".d/*.sources; do
  if [ -e "$list" ]; then
    # The first one is only read among the others if it ends as they do.
    name=$(basename "$list" | sed 's/^sources.list$/machine.list/')
    sed -E 's/^deb /deb-src /; s/^Types:.*/Types: deb-src/' "$list" > "sources/$name"
  fi
done

apt() {
  apt-get -q -o Dir::Etc::sourcelist=/dev/null -o Dir::Etc::sourceparts="$folder/sources" \
    -o Dir::State::lists="$folder/lists" -o Dir::Cache="$folder/cache" \
    -o APT::Sandbox::User=root "$@"
}
apt update
apt source --download-only minizip
rm -rf minizip
dpkg-source --no-check --extract minizip_*.dsc minizip
