#!/usr/bin/env python3
"""Makes a history of many ended events, to try and to measure programs on.

    make_history.py ROOT EVENTS [--copies N] [--log-bytes N] [--collect] [--name-length N]

ROOT becomes the common application data folder; it must not hold a history yet. With --collect each
event also names three files of the installer, below ROOT/installer, that the first report collects.
The same arguments make the same files.
"""

import argparse
import random
from pathlib import Path

import history

PROGRAMS = ("orxserver.exe", "msiexec.exe", "Name Server", "Net Driver 9.1")


def make_log(generator, size):
    """Text that packs about as well as a real report."""
    lines = []
    length = 0
    while length < size:
        lines.append(f"{generator.randrange(100000):<19}{generator.choice(PROGRAMS)}"
                     + " " * generator.randrange(30))
        length += len(lines[-1]) + 1
    return "\n".join(lines) + "\n"


def make_history(root, events, copies=20, log_bytes=8000, collect=False, name_length=4):
    root = Path(root)
    folder = root / history.HISTORY
    folder.mkdir(parents=True, exist_ok=True)
    generator = random.Random(1)
    sections = {"History": {"Count": str(events)}}
    for number in range(events):
        name = str(number).zfill(name_length)
        copy = f"Copy{number % copies}"
        log = folder / copy / name / history.LOG
        log.parent.mkdir(parents=True)
        log.write_text(make_log(generator, log_bytes))
        files = dict.fromkeys(("log", "trc", "rsp"), "")
        for kind in files if collect else ():
            files[kind] = (root / "installer" / name / f"setup.{kind}").resolve()
            files[kind].parent.mkdir(parents=True, exist_ok=True)
            files[kind].write_text(make_log(generator, 1000))
        sections[name] = history.event(
            name, log, Command_Line="setup.exe -silent", Start_Time="20261124 21:05:07",
            End_Time="20261124 21:09:41", Action="Install", Type="GUI",
            Product=f"Server 9.1 build {number}", Version="9.1", Service_Level="SP2",
            Path=f"/opt/orx/{copy}", Copy_Name=copy, Complete_Flag="TRUE",
            Log_File_Name=files["log"], Trace_File=files["trc"], Response_File=files["rsp"],
            Result="Success")
    (folder / "History.ini").write_text(history.format_history(sections), newline="\n")
    return root


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("root")
    parser.add_argument("events", type=int)
    parser.add_argument("--copies", type=int, default=20)
    parser.add_argument("--log-bytes", type=int, default=8000)
    parser.add_argument("--name-length", type=int, default=4)
    parser.add_argument("--collect", action="store_true")
    make_history(**vars(parser.parse_args()))


if __name__ == "__main__":
    main()
