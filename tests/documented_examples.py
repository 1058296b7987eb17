#!/usr/bin/env python3
"""Runs the examples of README.md and docs/integrating.md as they are written there, and follows the
links of all documents.

usage: documented_examples.py PROGRAMS          the sessions of both and the shell script
       documented_examples.py PROGRAMS --wine   the batch file, with the programs for Windows
"""
import os
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile

REPOSITORY = pathlib.Path(__file__).resolve().parent.parent
GUIDE = "docs/integrating.md"


def blocks(page, language):
    text = (REPOSITORY / page).read_text(encoding="utf-8")
    found = re.findall(rf"^```{language}\n(.*?)^```$", text, re.M | re.S)
    assert found, f"{page} has no {language} example"
    return found


def check(condition, what, evidence=""):
    if not condition:
        sys.exit(f"{what}\n{evidence}")


def check_links(_programs, _scratch):
    for page in [*REPOSITORY.glob("*.md"), *REPOSITORY.glob("docs/*.md")]:
        for link in re.findall(r"\]\(([^)#:]+)", page.read_text(encoding="utf-8")):
            check((page.parent / link).exists(), f"{page} has a link to {link}")


def check_recorded(scratch, history, result):
    """The one event of which setup left a log: ended, with the result, its log collected."""
    [log] = scratch.glob("setup-*.log")
    identity = log.stem.removeprefix("setup-")
    keys = (history / "History.ini").read_text().split(f"[{identity}]\n")[1].split("\n[")[0]
    for line in ("Complete_Flag=TRUE", "Copy_Name=Main", f"Result={result}"):
        check(line in keys.splitlines(), f"Not in the history: {line}", keys)
    collected = history / "Main" / identity / log.name
    check(collected.read_text() == log.read_text(), f"Not collected: {collected}")


def check_shell_script(programs, scratch, status):
    environment = dict(os.environ, ORX_COMMON_APPDATA=str(scratch))
    if programs:
        environment["PATH"] = f"{programs}:{environment['PATH']}"
    (scratch / "install.sh").write_text(blocks(GUIDE, "sh")[0])
    setup = scratch / "setup"
    setup.write_text(f"#!/bin/sh\necho output of setup\nexit {status}\n")
    setup.chmod(0o755)
    run = subprocess.run(["sh", "install.sh"], cwd=scratch, env=environment, stderr=subprocess.PIPE)
    check(run.returncode == status, f"install.sh returned {run.returncode}, not {status}",
          run.stderr)
    if programs:
        subprocess.run([programs / "ORXInstallEventLog", "-report", "history.zip"], cwd=scratch,
                       env=environment, check=True)
        check_recorded(scratch, scratch / "ZEK/ORXHistory", status)


def check_batch_file(programs, scratch, status):
    wine = str(REPOSITORY / "scripts/wine.sh")
    shutil.copy(programs / "ORXInstallEventLog.exe", scratch)
    (scratch / "install.bat").write_text(blocks(GUIDE, "bat")[0], newline="\r\n")
    setup = f'#include <stdio.h>\nint main() {{ puts("output of setup"); return {status}; }}\n'
    subprocess.run(["x86_64-w64-mingw32-gcc-posix", "-x", "c", "-", "-o", "setup.exe"], cwd=scratch,
                   input=setup.encode(), check=True)
    run = subprocess.run([wine, "cmd", "/c", "install.bat"], cwd=scratch)
    check(run.returncode == status, f"install.bat returned {run.returncode}, not {status}")
    subprocess.run([wine, "ORXInstallEventLog.exe", "-report", "history.zip"], cwd=scratch,
                   check=True)
    prefix = os.environ.get("WINEPREFIX") or REPOSITORY / "build/wine"
    check_recorded(scratch, pathlib.Path(prefix) / "drive_c/ProgramData/ZEK/ORXHistory", status)


def without_variables(line):
    """A line without what differs between two runs: times, and processes that came and went."""
    line = re.sub(r"\d{4}-\d\d-\d\d \d\d:\d\d:\d\d( to \d\d:\d\d:\d\d)?", "TIME", line)
    line = re.sub(r"\b\d+ s\b", "DURATION", line)
    line = re.sub(r"([+~-]\d+ )+", "CHANGES ", line)
    line = line.replace(" processes,", "") if line.startswith("unchanged: ") else line
    return " ".join(line.split())


def check_sessions(programs, scratch, page, before):
    """The sessions of a page, as one: the lines that it shows come in their order."""
    session = f"$ {before}\n" + "".join(blocks(page, "console"))
    steps = re.findall(r"^\$ (.*)\n((?:(?!\$ ).*\n)*)", session, re.M)
    (scratch / "scripts").symlink_to(REPOSITORY / "scripts")
    environment = dict(os.environ, PATH=f"{programs}:{os.environ['PATH']}", TMPDIR=str(scratch),
                       ORX_COMMON_APPDATA=str(scratch))
    run = subprocess.run(["sh", "-ev"], input="".join(f"{command}\n" for command, _ in steps),
                         cwd=scratch, env=environment, text=True,
                         stdout=subprocess.PIPE, stderr=subprocess.STDOUT)
    check(run.returncode == 0, f"The session of {page} failed", run.stdout)
    printed = iter([without_variables(line) for line in run.stdout.splitlines()])
    for command, output in steps:
        for line in [command, *output.splitlines()]:
            check(without_variables(line) in printed, f"{command}\nlacks: {line}", run.stdout)


def main():
    programs = pathlib.Path(sys.argv[1]).resolve()
    if "--wine" in sys.argv:
        cases = [(check_batch_file, programs, status) for status in (0, 3)]
    else:
        cases = [(check_links, None)]
        cases += [(check_shell_script, programs, status) for status in (0, 3)]
        cases += [(check_shell_script, None, 0)]
        start = 'ORXInstallEventLog -start 43 -Product "ORX Client 9.5" -Action Install'
        cases += [(check_sessions, programs, "README.md", ":"),
                  (check_sessions, programs, GUIDE, start)]
    for function, *arguments in cases:
        with tempfile.TemporaryDirectory() as scratch:
            function(arguments[0], pathlib.Path(scratch), *arguments[1:])
        print("ok:", function.__name__, *arguments[1:])


main()
