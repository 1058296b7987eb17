#!/bin/sh
# Builds the packages in build/packages and tries them: the one for Debian in a new minimal system,
# the one for Windows under Wine. In each a complete event is recorded, packed and read.
set -eu
cd "$(dirname "$0")/.."
packages=$PWD/build/packages
version=$(sed -n 's/^project(.* VERSION \([0-9.]*\) .*/\1/p' CMakeLists.txt)

scripts/install-packages.sh packages
scripts/build.sh release
cmake --preset windows
cmake --build --preset windows --target ORXInstallEventLog orxhistory
rm -rf "$packages"
cpack --preset release
cpack --preset windows
rm -rf "$packages/_CPack_Packages"

scratch=$(mktemp -d)
as_root=""
[ "$(id -u)" -eq 0 ] || as_root=sudo
clean_up() {
  WINEPREFIX=$scratch/wine wineserver --kill || true  # it may have ended by itself
  $as_root rm -rf --one-file-system "$scratch"
}
trap clean_up EXIT

# has FILE TEXT: shows the file and ends with 1 if it lacks the text.
has() {
  grep -qF -e "$2" "$1" || { cat "$1"; echo "Missing: $2" >&2; exit 1; }
}

echo "== The package for Debian"
deb=$packages/orxinstalleventlog_${version}_$(dpkg --print-architecture).deb
lintian --fail-on error "$deb"
root=$scratch/root
# shellcheck disable=SC2016
mirror=$(apt-get indextargets --format '$(SITE)' 'Created-By: Packages' | head -n 1)
suite=$(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)
$as_root debootstrap --variant=minbase "$suite" "$root" ${mirror:+"$mirror"} > "$scratch/log" ||
  { cat "$scratch/log"; exit 1; }
in_root() { $as_root chroot "$root" "$@"; }
$as_root cp "$deb" "$root/package.deb"
in_root dpkg --install /package.deb
for program in ORXInstallEventLog orxhistory; do
  in_root $program --version > "$scratch/version"
  has "$scratch/version" "$program $version"
  in_root zcat "/usr/share/man/man1/$program.1.gz" > "$scratch/manual"
  has "$scratch/manual" "\"ORXInstallEventLog $version\""
done
in_root /usr/share/doc/orxinstalleventlog/examples/whole-event.sh > "$scratch/event"
sed -n '/^\$ orxhistory/,$p' "$scratch/event" > "$scratch/read"
cat "$scratch/read"
has "$scratch/read" "ORX Server Build 1907"
has "$scratch/read" "+ ORX95"  # an instance that the event adds
in_root dpkg --purge orxinstalleventlog

echo "== The package for Windows"
export WINEPREFIX="$scratch/wine"
wine=$PWD/scripts/wine.sh
"$wine" wineboot --init
cd "$scratch"
cmake -E tar xf "$packages/ORXInstallEventLog-$version-windows.zip"
cd "ORXInstallEventLog-$version-windows"
for program in ORXInstallEventLog orxhistory; do
  "$wine" $program.exe --version > "$scratch/version"
  has "$scratch/version" "$program $version"
  strings -n 2 -el $program.exe > "$scratch/resources"
  has "$scratch/resources" "$version"
done
"$wine" ORXInstallEventLog.exe -start 42 -Product "ORX Server Build 1907" -Action Install
"$wine" ORXInstallEventLog.exe -logmessage 42 -message "Creating instance ORX95"
"$wine" reg add 'HKLM\Software\ZEK\ORX\InstalledCopies\Main\PROFILES\ORX95' /v Folder /d 'C:\ZEK'
"$wine" ORXInstallEventLog.exe -end 42 -CopyName Main -Result Successful
"$wine" ORXInstallEventLog.exe -report history.zip
"$wine" orxhistory.exe --from history.zip list > "$scratch/read"
"$wine" orxhistory.exe --from history.zip changes 42 >> "$scratch/read"
cat "$scratch/read"
has "$scratch/read" "ORX Server Build 1907"
has "$scratch/read" "+ Main"  # the copy that the event adds
echo "Both packages work: $packages"
