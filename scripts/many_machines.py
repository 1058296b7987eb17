#!/usr/bin/env python3
"""Runs the commands of docs/reader.md, "Many machines", over the archives of many machines.

    many_machines.py MACHINES

The recorder records two histories: an install that goes well and an upgrade, which goes well too or
fails after it has changed a value. Each machine has a copy of one of them in its archive, with a
name of its own. The answers must be these machines. Needs sqlite3.
"""

import os
import re
import subprocess
import sys
import time
import zipfile

import history
from machine import Machine, check_equal, contents

COPY = "HKEY_LOCAL_MACHINE\\SOFTWARE\\ZEK\\ORX\\InstalledCopies\\Prod"


def write_registry(machine, port):
    machine.history.parent.mkdir(parents=True, exist_ok=True)
    (machine.history.parent / "Registry.reg").write_text(
        f'Windows Registry Editor Version 5.00\n\n[{COPY}\\GLOBAL_PROFILE]\n"Port"="{port}"\n')


def record(fails):
    """The files of a history by their paths in an archive, and the time of the upgrade."""
    with Machine(history.PROGRAM) as machine:
        write_registry(machine, 50000)
        machine.must("-start", "install", "-Action", "Install", "-Version", "9.3")
        machine.must("-end", "install", "-CopyName", "Prod", "-Result", "0")
        time.sleep(1)  # the upgrade is later, in the seconds of the history
        machine.must("-start", "upgrade", "-Action", "Upgrade", "-Version", "9.4")
        if fails:
            write_registry(machine, 50010)
        machine.must("-end", "upgrade", "-CopyName", "Prod", "-Result", "1603" if fails else "0")
        files = {name: data.decode() for name, data in contents(machine.history).items() if data}
        started = time.strptime(machine.sections()["upgrade"]["Start_Time"], "%Y%m%d %H:%M:%S")
    return files, time.strftime("%Y-%m-%dT%H:%M:%S", started)


def write_archive(path, files, computer):
    with zipfile.ZipFile(path, "w", zipfile.ZIP_DEFLATED) as archive:
        for name, text in files.items():
            archive.writestr(name, re.sub(r"(?m)^(Computer Name       :).*",
                                          rf"\g<1>{computer}", text))


def documented_commands():
    text = (history.REPOSITORY / "docs" / "reader.md").read_text()
    return re.findall(r"```sh\n(.*?)```", text.split("## Many machines")[1], re.S)


def outputs_of(commands, folder):
    """Their outputs in the folder, with the time that they take."""
    environment = dict(os.environ, PATH=f"{history.PROGRAM.parent}:{os.environ['PATH']}")
    for command in commands:
        began = time.monotonic()
        yield subprocess.run(["bash", "-euc", command], cwd=folder, env=environment, check=True,
                             capture_output=True, text=True).stdout
        print(f"{time.monotonic() - began:6.2f} s  {command.strip().splitlines()[-1]}")


def main():
    names = [f"machine{number:04}" for number in range(int(sys.argv[1]))]
    failed, well = names[::3], [name for number, name in enumerate(names) if number % 3]
    files_of_failed, failed_since = record(fails=True)
    files_of_well, _ = record(fails=False)
    with Machine() as machine:
        archives = machine.scratch / "archives"
        archives.mkdir()
        for name in names:
            write_archive(archives / f"{name}.zip",
                          files_of_failed if name in failed else files_of_well, name)
        _, _, failures, versions, changes = outputs_of(documented_commands(), machine.scratch)
    check_equal(failures, "".join(f"{name}|{failed_since}\n" for name in failed),
                "failed machines")
    check_equal(versions, "".join(f"{name}|Prod\n" for name in well), "machines with the version")
    history.check(f'profile|["Prod"]|Port|changed|{len(failed)}\n' in changes,
                  f"changes: {changes}")
    print(f"{len(names)} machines: the answers are right")


if __name__ == "__main__":
    main()
