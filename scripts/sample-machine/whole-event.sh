#!/bin/sh
# Records a whole event of a sample machine in a scratch folder, packs the history and reads it back.
# Needs ORXInstallEventLog, orxhistory, and the registry exports beside this script.
# The commands that are shown are expanded when they run.
# shellcheck disable=SC2016
set -eu
sample=$(cd "$(dirname "$0")" && pwd)
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
cd "$scratch"

run() {
  printf '\n$ %s\n' "$1"
  eval "$1"
}

# The caller of a setup program would not set this: it is so that no history of this machine changes.
run 'export ORX_COMMON_APPDATA=$PWD'
mkdir ZEK
cp "$sample/Registry.reg" ZEK/
for kind in log trc rsp; do
  echo "the installer's own .$kind file" > "setup.$kind"
done

run 'ORXInstallEventLog -start 42 -Product "ORX Server Build 1907" -Version 9.5 \
    -ServiceLevel "Service Level 3" -Type GUI -Action Install -Path "C:\ZEK\ORX95" \
    -Command "setup.exe /gui" -l $PWD/setup.log -t $PWD/setup.trc -u $PWD/setup.rsp'
run 'ORXInstallEventLog -logmessage 42 -message "Creating instance ORX95"'

# What the setup program would do: an instance more in the registry.
cat "$sample/installed.reg" >> ZEK/Registry.reg
run 'ORXInstallEventLog -end 42 -CopyName Main -Result Successful'
run 'ORXInstallEventLog -start 43 -Product "ORX Client Build 1907" -Action Install'
run 'ORXInstallEventLog -report history.zip'

run 'find ZEK/ORXHistory | sort'
run 'cat ZEK/ORXHistory/History.ini'
# The report has a snapshot before and one after. Its frame, and where the two differ:
run 'sed -n "1,20p" ZEK/ORXHistory/Main/42/ORXInstallEvent.Log'
run 'tail -n 22 ZEK/ORXHistory/Main/42/ORXInstallEvent.Log'
run 'csplit -s ZEK/ORXHistory/Main/42/ORXInstallEvent.Log "/^1) /" "/^\* End of Snap/" "/^1) /" "/^\*End of Snap/"'
run 'diff xx01 xx03 || true'
run 'head -n 22 ZEK/ORXHistory/Summary.txt'

run 'orxhistory --from history.zip list'
run 'orxhistory --from history.zip changes 42'
