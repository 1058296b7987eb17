#!/bin/bash
# Makes reports over histories of several kinds and has other programs read the archives.
#
#   check-archive.sh PROGRAM
#
# Ends with 1 at the first archive that is not accepted.
set -euo pipefail

program=$(realpath "$1")
scripts=$(dirname "$(realpath "$0")")
"$scripts/install-packages.sh" unzip python3
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
export ORX_COMMON_APPDATA=$scratch/data
history=$ORX_COMMON_APPDATA/ZEK/ORXHistory

begin() {
  echo "== $1"
  rm -rf "$scratch"/*
}

# check ARCHIVE RESULT: the result, 1 at most, that the readers may give; that of an empty archive
# is a warning.
check() {
  local accepted=$2
  "$program" -report "$1"
  unzip -tq "$1" || [ $? -le "$accepted" ]
  zipinfo "$1" >"$scratch/listing" || [ $? -le "$accepted" ]
  python3 "$scripts/compare-archive.py" "$1" "$history"
}

begin "an empty history folder"
mkdir -p "$history"
check "$scratch/empty.zip" 1

begin "200 events with their files, packed twice"
"$scripts/make-history.py" "$ORX_COMMON_APPDATA" 200 --collect
check "$scratch/first.zip" 0
check "$scratch/second.zip" 0

begin "files of all sizes and names, times and permissions"
"$scripts/make-history.py" "$ORX_COMMON_APPDATA" 3
: >"$history/none.txt"
head -c 5000000 /dev/urandom >"$history/large.bin"
echo text >"$history/"$'bytes \xff \xc3\xbc.txt'
echo text >"$history/read-only.txt"
chmod 444 "$history/read-only.txt"
touch -d '1999-12-31 23:59:59' "$history/old.txt"
touch -d '2024-07-01 12:00:01' "$history/summer.txt"
mkdir "$history/.hidden" "$history/empty folder"
echo text >"$history/.hidden/inner.txt"
mkfifo "$history/pipe"
ln -s /etc "$history/link"
check "$scratch/all.zip" 0

begin "an archive in the folder that it packs"
"$scripts/make-history.py" "$ORX_COMMON_APPDATA" 3
"$program" -report "$history/Copy1/self.zip"
mv "$history/Copy1/self.zip" "$scratch/self.zip"
unzip -tq "$scratch/self.zip"
if zipinfo -1 "$scratch/self.zip" | grep self.zip; then exit 1; fi

begin "names that another program lists"
"$scripts/make-history.py" "$ORX_COMMON_APPDATA" 1
"$program" -report "$scratch/one.zip"
diff - <(zipinfo -1 "$scratch/one.zip") <<'END'
Copy0
Copy0/0000
Copy0/0000/ORXInstallEvent.Log
Copy0/Summary.txt
History.ini
Summary.txt
END
echo "All archives are accepted."
