"""Links, pipes, folders and the like at each path that a run touches, before each run of an event's
life. Nothing outside the history may change, and a marker in the files outside may get into no
archive."""

import itertools
import os
import random
import shutil
import socket

import history
from harness import MARKER, Machine, sample
from history import check

# Below the history folder. The event is called 7 and the copy C1.
PLACES = ("History.ini", ".History.tmp", "Summary.txt", "7", "7/ORXInstallEvent.Log",
          "7/setup.log", "7/Summary.txt", "C1", "C1/Summary.txt", "C1/7",
          "C1/7/ORXInstallEvent.Log", "C1/7/setup.log", "stray")
RUNS = (("-start", "7"), ("-logmessage", "7", "-message", "text"), ("-end", "7"),
        ("-end", "7", "-CopyName", "C1"), ("-report",))


def listen(path):
    with socket.socket(socket.AF_UNIX) as listener:
        listener.bind(str(path))


# What is made at a path of the history.
KINDS = {
    "link to a file": lambda machine, path: path.symlink_to(machine.outside / "file"),
    "link to a folder": lambda machine, path: path.symlink_to(machine.outside / "folder"),
    "link to nothing": lambda machine, path: path.symlink_to(machine.outside / "new"),
    "relative link": lambda machine, path: path.symlink_to(
        os.path.relpath(machine.outside / "file", path.parent)),
    "link to itself": lambda machine, path: path.symlink_to(path),
    "pipe": lambda machine, path: os.mkfifo(path),
    "socket": lambda machine, path: listen(path),
    "folder": lambda machine, path: (path / "inside").mkdir(parents=True),
    "hard link": lambda machine, path: os.link(machine.outside / "file", path),
}
# Only these are replaced. Another file with a second name outside is one file: the program appends
# to it or empties it.
REPLACED = ("History.ini", ".History.tmp")


def run_any(machine, words, is_packed_checked=True, **options):
    """One run of any kind, and what must hold whatever it meets."""
    if words == ("-report",):
        words = ("-report", str(machine.archive))
    elif words[0] == "-start":
        words = (*words, "-l", str(machine.source))
    result, _ = machine.run(*words, timeout=20, **options)
    check(result in ((0, 3) if words[0] == "-report" else (0,)), f"result {result}: {words}")
    machine.check_outside()
    if machine.archive.exists() and is_packed_checked:
        for name, data in history.read_archive(machine.archive, has_blank_names=True).items():
            check(MARKER not in data, f"packed from outside: {name}")


def plant(machine, place, kind):
    """Replaces what is there."""
    path = machine.history / place
    path.parent.mkdir(parents=True, exist_ok=True)
    if path.is_dir() and not path.is_symlink():
        shutil.rmtree(path)
    path.unlink(missing_ok=True)
    KINDS[kind](machine, path)
    machine.watch()


def check_planted(program, place, kind, stage):
    with Machine(program) as machine:
        for number, words in enumerate(RUNS):
            if number == stage:
                plant(machine, place, kind)
            # Until it is replaced, a hard link's text, the marker, is the history's own.
            run_any(machine, words, is_packed_checked=kind != "hard link")


def attack_paths(program, outcome, seconds, only):
    cases = [(f"planted: {place}, {kind}, before {' '.join(RUNS[stage])}",
              lambda _, p=place, k=kind, s=stage: check_planted(program, p, k, s))
             for place, kind, stage in itertools.product(PLACES, KINDS, range(len(RUNS)))
             if kind != "hard link" or place in REPLACED]
    cases = [case for case in cases if only in case[0]]
    random.Random(1).shuffle(cases)
    done = sample(outcome, cases, seconds)
    print(f"planted: {len(done)} of {len(cases)}")
