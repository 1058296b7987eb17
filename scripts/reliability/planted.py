"""Links, pipes, folders and the like at each path that a run touches, before each run of an event's
life. Nothing outside the history may change, and a marker in the files outside may get into no
archive."""

import itertools
import os
import shutil
import socket

from harness import RUNS, Case, Target, sample

# Below the history folder.
PATHS = ("History.ini", ".History.tmp", "Summary.txt", "7", "7/ORXInstallEvent.Log",
         "7/setup.log", "7/Summary.txt", "C1", "C1/Summary.txt", "C1/7",
         "C1/7/ORXInstallEvent.Log", "C1/7/setup.log", "stray")


def listen(path):
    with socket.socket(socket.AF_UNIX) as listener:
        listener.bind(str(path))


# What is made at a path, with the folder outside.
KINDS = {
    "link to a file": lambda path, outside: path.symlink_to(outside / "file"),
    "link to a folder": lambda path, outside: path.symlink_to(outside / "folder"),
    "link to nothing": lambda path, outside: path.symlink_to(outside / "new"),
    "relative link": lambda path, outside: path.symlink_to(
        os.path.relpath(outside / "file", path.parent)),
    "link to itself": lambda path, _: path.symlink_to(path),
    "pipe": lambda path, _: os.mkfifo(path),
    "socket": lambda path, _: listen(path),
    "folder": lambda path, _: (path / "inside").mkdir(parents=True),
    "hard link": lambda path, outside: os.link(outside / "file", path),
}
# Only these are replaced. Another file with a second name outside is one file: the program appends
# to it or empties it.
REPLACED = ("History.ini", ".History.tmp")


def check_planted(program, path, kind, stage):
    with Target(program) as machine:
        for number, arguments in enumerate(RUNS):
            if number == stage:
                plant(machine, machine.history / path, kind)
            # Until it is replaced, a hard link's text, the marker, is the history's own.
            machine.run_checked(*arguments, has_own_marker=kind == "hard link")


def plant(machine, path, kind):
    """Replaces what is there."""
    path.parent.mkdir(parents=True, exist_ok=True)
    if path.is_dir() and not path.is_symlink():
        shutil.rmtree(path)
    path.unlink(missing_ok=True)
    KINDS[kind](path, machine.outside)
    machine.watch()


def attack_paths(program, outcome, seconds, only):
    cases = [Case(f"planted: {path}, {kind}, before {' '.join(RUNS[stage])}", (path, kind),
                  lambda _, case=(path, kind, stage): check_planted(program, *case))
             for path, kind, stage in itertools.product(PATHS, KINDS, range(len(RUNS)))
             if kind != "hard link" or path in REPLACED]
    return sample(outcome, cases, seconds, only, range(os.cpu_count() or 1))
