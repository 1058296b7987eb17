#!/usr/bin/env python3
"""Runs the commands of docs/reader.md, "Many machines", over the archives of many machines.

    many_machines.py [MACHINES]

The recorder records two histories: an install that goes well and an upgrade, which goes well too or
fails after it has changed a value. Each machine has a copy of one of them in its archive, with a
name of its own. The answers must be these machines. Needs sqlite3.
"""

import os
import re
import subprocess
import sys
import tempfile
import time
import zipfile
from pathlib import Path

import history

READER = history.PROGRAM.with_name("orxhistory")
COPY = "HKEY_LOCAL_MACHINE\\SOFTWARE\\ZEK\\ORX\\InstalledCopies\\Prod"


def registry(port):
    return (f'Windows Registry Editor Version 5.00\n\n[{COPY}\\GLOBAL_PROFILE]\n'
            f'"Port"="{port}"\n')


def record(root, fails):
    """The files of a history, by their paths in an archive."""
    environment = dict(os.environ, ORX_COMMON_APPDATA=str(root))
    export = root / "ZEK" / "Registry.reg"
    export.parent.mkdir(parents=True)

    def run(*arguments):
        subprocess.run([history.PROGRAM, *arguments], env=environment, check=True)

    export.write_text(registry(50000))
    run("-start", "install", "-Action", "Install", "-Version", "9.3")
    run("-end", "install", "-CopyName", "Prod", "-Result", "0")
    run("-start", "upgrade", "-Action", "Upgrade", "-Version", "9.4")
    if fails:
        export.write_text(registry(50010))
    run("-end", "upgrade", "-CopyName", "Prod", "-Result", "1603" if fails else "0")
    folder = root / history.HISTORY
    files = {str(path.relative_to(folder)): path.read_text()
             for path in folder.rglob("*") if path.is_file()}
    # The upgrade is an hour after the install.
    install, upgrade = files["History.ini"].split("[upgrade]")
    files["History.ini"] = at_hour(10, install) + "[upgrade]" + at_hour(11, upgrade)
    for event, hour in (("install", 10), ("upgrade", 11)):
        log = f"Prod/{event}/{history.LOG}"
        files[log] = at_hour(hour, files[log])
    return files


def at_hour(hour, text):
    return history.TIME.sub(f"20261114 {hour}:00:00", text)


def write_archive(path, files, computer):
    with zipfile.ZipFile(path, "w", zipfile.ZIP_DEFLATED) as archive:
        for name, text in files.items():
            archive.writestr(name, re.sub(r"(?m)^(Computer Name       :).*",
                                          rf"\g<1>{computer}", text))


def shell_blocks():
    text = (history.REPOSITORY / "docs" / "reader.md").read_text()
    return re.findall(r"```sh\n(.*?)```", text.split("## Many machines")[1], re.S)


def main():
    machines = int(sys.argv[1]) if len(sys.argv) > 1 else 100
    with tempfile.TemporaryDirectory() as scratch:
        folder = Path(scratch)
        (folder / "archives").mkdir()
        histories = [record(folder / name, fails=name == "failed") for name in ("well", "failed")]
        failed = []
        well = []
        for number in range(machines):
            computer = f"machine{number:04}"
            fails = number % 3 == 0
            (failed if fails else well).append(computer)
            write_archive(folder / "archives" / f"{number}.zip", histories[fails], computer)
        environment = dict(os.environ, PATH=f"{READER.parent}:{os.environ['PATH']}")
        outputs = []
        for block in shell_blocks():
            began = time.monotonic()
            outputs.append(subprocess.run(["bash", "-euc", block], cwd=folder, env=environment,
                                          check=True, capture_output=True, text=True).stdout)
            print(f"{time.monotonic() - began:6.2f} s  {block.strip().splitlines()[-1]}")
        check = history.check
        check(len(outputs) == 5, f"{len(outputs)} blocks of commands")
        check(outputs[2] == "".join(f"{name}|2026-11-14T11:00:00\n" for name in failed),
              f"failed machines: {outputs[2]}")
        check(outputs[3] == "".join(f"{name}|Prod\n" for name in well),
              f"machines with the version: {outputs[3]}")
        check(f'profile|["Prod"]|Port|changed|{len(failed)}\n' in outputs[4],
              f"changes: {outputs[4]}")
    print(f"{machines} machines: the answers are right")


if __name__ == "__main__":
    main()
