#!/bin/sh
# Records a whole event in a scratch folder: a sample machine's registry, this machine's processes,
# users and services. Then shows what support would get.
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh unzip
scripts/build.sh release
program=$PWD/build/release/ORXInstallEventLog
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
export ORX_COMMON_APPDATA="$scratch"
history=$scratch/ZEK/ORXHistory

title() { printf '\n===== %s =====\n\n' "$1"; }

mkdir "$scratch/ZEK"
cp scripts/sample-machine/Registry.reg "$scratch/ZEK/"
for kind in log trc rsp; do
  echo "the installer's own .$kind file" > "$scratch/setup.$kind"
done

"$program" -start 42 -Product "ORX Server Build 1907" -Version 9.5 -ServiceLevel "Service Level 3" \
  -Type GUI -Action Install -Path "C:\\ZEK\\ORX95" -Command "setup.exe /gui" \
  -l "$scratch/setup.log" -t "$scratch/setup.trc" -u "$scratch/setup.rsp"
"$program" -logmessage 42 -message "Copying files"
"$program" -logmessage 42 -message "Creating instance ORX1"
"$program" -end 42 -CopyName Main -Result "Successful"
"$program" -start 43 -Product "ORX Client Build 1907" -Action Install
title "Packing the history"
"$program" -report "$scratch/history.zip"

title "The tree"
(cd "$scratch" && find ZEK | sort)
title "History.ini"
cat "$history/History.ini"
title "The report of event 42"
cat "$history/Main/42/ORXInstallEvent.Log"
title "The overall summary"
cat "$history/Summary.txt"
title "The archive"
unzip -l "$scratch/history.zip"
unzip -tq "$scratch/history.zip"
