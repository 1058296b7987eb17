#!/usr/bin/env python3
"""Runs the examples of README.md and docs/integrating.md as they are written there, and follows the
links of all documents.

usage: documented_examples.py PROGRAMS          the sessions of both and the shell script
       documented_examples.py PROGRAMS --wine   the batch file, with the programs for Windows
"""
import os
import re
import shutil
import subprocess
import sys
import tempfile
from pathlib import Path

sys.path.insert(0, str(Path(__file__).resolve().parents[1] / "scripts"))

from history import REPOSITORY, check  # noqa: E402
from machine import Machine, check_equal  # noqa: E402

GUIDE = "docs/integrating.md"


def blocks(page, language):
    text = (REPOSITORY / page).read_text(encoding="utf-8")
    found = re.findall(rf"^```{language}\n(.*?)^```$", text, re.M | re.S)
    check(found, f"{page} has no {language} example")
    return found


def check_links(_machine):
    for page in [*REPOSITORY.glob("*.md"), *REPOSITORY.glob("docs/*.md")]:
        for link in re.findall(r"\]\(([^)#:]+)", page.read_text(encoding="utf-8")):
            check((page.parent / link).exists(), f"{page} has a link to {link}")


def output_of(machine, *command, code=0, **variables):
    found, output = machine.run(*command, variables=variables, timeout=600)
    check(found == code, f"{command} returned {found}, not {code}\n{output.decode()}")
    return output.decode()


def check_recorded(scratch, history, result):
    """The one event of which setup left a log: ended, with the result, its log collected."""
    [log] = scratch.glob("setup-*.log")
    identity = log.stem.removeprefix("setup-")
    keys = (history / "History.ini").read_text().split(f"[{identity}]\n")[1].split("\n[")[0]
    for line in ("Complete_Flag=TRUE", "Copy_Name=Main", f"Result={result}"):
        check(line in keys.splitlines(), f"Not in the history: {line}\n{keys}")
    check_equal((history / "Main" / identity / log.name).read_text(), log.read_text(),
                "the collected log")


def check_shell_script(machine, status, has_recorder=True):
    (machine.root / "install.sh").write_text(blocks(GUIDE, "sh")[0])
    setup = machine.root / "setup"
    setup.write_text(f"#!/bin/sh\necho output of setup\nexit {status}\n")
    setup.chmod(0o755)
    if not has_recorder:
        machine.variables["PATH"] = "/usr/bin:/bin"
    output_of(machine, "sh", "install.sh", code=status)
    if has_recorder:
        output_of(machine, "ORXInstallEventLog", "-report", "history.zip")
        check_recorded(machine.root, machine.history, status)


def check_batch_file(machine, programs, status):
    wine = REPOSITORY / "scripts/wine.sh"
    shutil.copy(programs / "ORXInstallEventLog.exe", machine.root)
    (machine.root / "install.bat").write_text(blocks(GUIDE, "bat")[0], newline="\r\n")
    (machine.root / "setup.c").write_text(
        f'#include <stdio.h>\nint main() {{ puts("output of setup"); return {status}; }}')
    output_of(machine, "x86_64-w64-mingw32-gcc-posix", "setup.c", "-o", "setup.exe")
    output_of(machine, wine, "cmd", "/c", "install.bat", code=status)
    output_of(machine, wine, "ORXInstallEventLog.exe", "-report", "history.zip")
    prefix = Path(os.environ.get("WINEPREFIX") or REPOSITORY / "build/wine")
    check_recorded(machine.root, prefix / "drive_c/ProgramData/ZEK/ORXHistory", status)


def without_variables(line):
    """A line without what differs between two runs: times, and processes that came and went."""
    line = re.sub(r"\d{4}-\d\d-\d\d \d\d:\d\d:\d\d( to \d\d:\d\d:\d\d)?", "TIME", line)
    line = re.sub(r"\b\d+ s\b", "DURATION", line)
    line = re.sub(r"([+~-]\d+ )+", "CHANGES ", line)
    line = line.replace(" processes,", "") if line.startswith("unchanged: ") else line
    return " ".join(line.split())


def check_sessions(machine, page, before):
    """The sessions of a page, as one: the lines that it shows come in their order."""
    session = f"$ {before}\n" + "".join(blocks(page, "console"))
    steps = re.findall(r"^\$ (.*)\n((?:(?!\$ ).*\n)*)", session, re.M)
    (machine.root / "scripts").symlink_to(REPOSITORY / "scripts")
    (machine.root / "session.sh").write_text("".join(f"{command}\n" for command, _ in steps))
    output = output_of(machine, "sh", "-ev", "session.sh", TMPDIR=machine.root)
    printed = iter([without_variables(line) for line in output.splitlines()])
    for command, shown in steps:
        for line in [command, *shown.splitlines()]:
            check(without_variables(line) in printed, f"{command}\nlacks: {line}\n{output}")


def main():
    programs = Path(sys.argv[1]).resolve()
    if "--wine" in sys.argv:
        cases = [(check_batch_file, programs, status) for status in (0, 3)]
    else:
        start = 'ORXInstallEventLog -start 43 -Product "ORX Client 9.5" -Action Install'
        cases = [(check_links,), (check_shell_script, 0), (check_shell_script, 3),
                 (check_shell_script, 0, False), (check_sessions, "README.md", ":"),
                 (check_sessions, GUIDE, start)]
    for function, *arguments in cases:
        with tempfile.TemporaryDirectory() as scratch, Machine(root=Path(scratch)) as machine:
            machine.variables["PATH"] = f"{programs}:{os.environ['PATH']}"
            machine.options |= {"cwd": scratch, "stderr": subprocess.STDOUT}
            function(machine, *arguments)
        print("ok:", function.__name__, *arguments)


main()
