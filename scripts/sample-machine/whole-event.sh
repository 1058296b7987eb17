#!/bin/sh
# Records an event of a sample machine in a scratch folder, packs the history and reads it back.
# Needs ORXInstallEventLog, orxhistory, and the registry exports beside this script.
# The commands that are shown are expanded when they run.
# shellcheck disable=SC2016
set -eu
sample=$(cd "$(dirname "$0")" && pwd)
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
cd "$scratch"

# say TEXT: a heading in the output.
say() {
  printf '\n\n# %s\n' "$1"
}

# run COMMAND: shows the command and then runs it.
run() {
  printf '\n$ %s\n' "$1"
  eval "$1"
}

mkdir ZEK
cp "$sample/Registry.reg" "$sample/installed.reg" .
for kind in log trc rsp; do
  echo "the installer's own .$kind file" > "setup.$kind"
done

say "A scratch folder replaces /var/lib, so that this machine's history does not change."
run 'export ORX_COMMON_APPDATA=$PWD'
run 'cp Registry.reg ZEK/  # the registry of the sample machine'

say "A setup program records its start, a message and its end."
run 'ORXInstallEventLog -start 42 -Product "ORX Server Build 1907" -Version 9.5 \
    -ServiceLevel "Service Level 3" -Type GUI -Action Install -Path "C:\ZEK\ORX95" \
    -Command "setup.exe /gui" -l $PWD/setup.log -t $PWD/setup.trc -u $PWD/setup.rsp'
run 'ORXInstallEventLog -logmessage 42 -message "Creating instance ORX95"'
run 'cat installed.reg >> ZEK/Registry.reg  # what the setup program changes: a new instance'
run 'ORXInstallEventLog -end 42 -CopyName Main -Result Successful'

say "Another one never ends. Then support asks for the history."
run 'ORXInstallEventLog -start 43 -Product "ORX Client Build 1907" -Action Install'
run 'ORXInstallEventLog -report history.zip'

say "The files: the history, the summaries, and a report for each event."
run 'find ZEK/ORXHistory | sort'
run 'cat ZEK/ORXHistory/History.ini'
run 'head -n 24 ZEK/ORXHistory/Summary.txt'
run 'sed -n "1,20p" ZEK/ORXHistory/Main/42/ORXInstallEvent.Log  # up to the first snapshot'
run 'tail -n 18 ZEK/ORXHistory/Main/42/ORXInstallEvent.Log  # after the second snapshot'

say "What support reads in the archive."
run 'orxhistory --from history.zip list'
run 'orxhistory --from history.zip changes 42'
