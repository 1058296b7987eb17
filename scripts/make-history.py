#!/usr/bin/env python3
"""Makes a history of many ended events, to try and to measure reports on.

    make-history.py ROOT EVENTS [--copies N] [--log-bytes N] [--collect] [--name-length N]

ROOT becomes the common application data folder; it must not hold a history yet. With --collect each
event also names three files of the installer, below ROOT/installer, that the first report collects.
The same arguments give the same files.
"""
import argparse
import pathlib
import random


def event_log(generator, size):
    """Text that packs about as well as a real report."""
    lines = []
    length = 0
    while length < size:
        line = "%-19d%s%s" % (
            generator.randrange(100000),
            generator.choice(["orxserver.exe", "msiexec.exe", "Name Server", "Net Driver 9.1"]),
            " " * generator.randrange(30),
        )
        lines.append(line)
        length += len(line) + 1
    return "\n".join(lines) + "\n"


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("root", type=pathlib.Path)
    parser.add_argument("events", type=int)
    parser.add_argument("--copies", type=int, default=20)
    parser.add_argument("--log-bytes", type=int, default=8000)
    parser.add_argument("--name-length", type=int, default=4)
    parser.add_argument("--collect", action="store_true")
    options = parser.parse_args()

    history = options.root / "ZEK" / "ORXHistory"
    history.mkdir(parents=True)
    installer = (options.root / "installer").resolve()
    generator = random.Random(1)
    with open(history / "History.ini", "w", newline="\n") as ini:
        ini.write("[History]\nCount=%d\n" % options.events)
        for number in range(options.events):
            identity = str(number).zfill(options.name_length)
            copy = "Copy%d" % (number % options.copies)
            folder = history / copy / identity
            folder.mkdir(parents=True)
            (folder / "ORXInstallEvent.Log").write_text(event_log(generator, options.log_bytes))
            files = dict.fromkeys(["log", "trc", "rsp"], "")
            if options.collect:
                source = installer / identity
                source.mkdir(parents=True)
                for kind in files:
                    files[kind] = source / ("setup." + kind)
                    files[kind].write_text(event_log(generator, 1000))
            ini.write(
                f"[{identity}]\nEvent_ID={identity}\nCommand_Line=setup.exe -silent\n"
                f"Start_Time=20261124 21:05:07\nEnd_Time=20261124 21:09:41\nAction=Install\n"
                f"Type=GUI\nProduct=Server 9.1 build {number}\nVersion=9.1\nService_Level=SP2\n"
                f"Path=/opt/orx/{copy}\nCopy_Name={copy}\nComplete_Flag=TRUE\n"
                f"Log_File_Name={files['log']}\nTrace_File={files['trc']}\n"
                f"Response_File={files['rsp']}\n"
                f"Event_Log_File={folder / 'ORXInstallEvent.Log'}\nResult=Success\n"
            )


if __name__ == "__main__":
    main()
