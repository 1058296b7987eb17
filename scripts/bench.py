#!/usr/bin/env python3
"""Measures complete processes side by side, and compares the ratios with their limits.

The commands of one comparison take turns (A B A B ...), so that a change of the machine's speed
affects all of them. CPU time, of program and system together, decides; elapsed time is printed too.
A ratio is that of the medians; the span after it is the lowest and highest ratio of one round.
The exit code is not 0 only if something could not be measured.
"""
import argparse
import contextlib
import itertools
import os
import pathlib
import shutil
import statistics
import subprocess
import sys
import tempfile
import time

from history import HISTORY, REPOSITORY
from make_history import make_history
from make_registry_export import make_registry_export

PROGRAMS = REPOSITORY / "build" / "bench" / "programs"
TOOL = PROGRAMS / "ORXInstallEventLog"


class Side:
    """A command that takes its turns. What `prepare` does before each turn is not measured."""

    def __init__(self, name, *command, prepare=lambda: None, cwd=".", share=1, **variables):
        self.name = name
        self.command = [str(word) for word in command]
        self.prepare = prepare
        self.cwd = cwd
        self.share = share  # the ratio is for one of so many
        self.environment = dict(os.environ, LC_ALL="C", **variables)
        self.cpu = []
        self.wall = []

    def take_turn(self, counts):
        self.prepare()
        home = os.getcwd()
        os.chdir(self.cwd)
        quiet = [(os.POSIX_SPAWN_OPEN, 1, os.devnull, os.O_WRONLY, 0)]
        begin = time.perf_counter()
        child = os.posix_spawnp(self.command[0], self.command, self.environment, file_actions=quiet)
        _, status, usage = os.wait4(child, 0)
        wall = time.perf_counter() - begin
        os.chdir(home)
        if status != 0:
            sys.exit(f"cannot measure: {' '.join(self.command[:4])} failed")
        if counts:
            self.cpu.append((usage.ru_utime + usage.ru_stime) / self.share)
            self.wall.append(wall / self.share)


def tool(name, root, *arguments, **options):
    return Side(name, TOOL, *arguments, ORX_COMMON_APPDATA=str(root), **options)


def take_turns(sides, rounds):
    """One round that does not count, to have all files in memory, and those that do.

    Every other round goes backwards: what ran before leaves the processor's caches to the next.
    """
    for turn in range(rounds + 1):
        for side in sides if turn % 2 == 0 else reversed(sides):
            side.take_turn(turn > 0)


def together(name, sides):
    """What the commands cost one after the other."""
    total = Side(name, "true")
    total.cpu = [sum(turns) for turns in zip(*(side.cpu for side in sides))]
    total.wall = [sum(turns) for turns in zip(*(side.wall for side in sides))]
    return total


def heading():
    print("| work | ours | beside | CPU ratio (span) | to reach | | elapsed ratio |")
    print("|---|---|---|---|---|---|---|")


def ratio(ours, beside):
    return statistics.median(ours) / statistics.median(beside)


def show(work, ours, beside, limit):
    def figure(side):
        return f"{side.name} {1000 * statistics.median(side.cpu):.3g} ms"

    cpu = ratio(ours.cpu, beside.cpu)
    turns = [a / b for a, b in zip(ours.cpu, beside.cpu)]
    verdict = "met" if cpu <= limit else "missed"
    print(f"| {work} | {figure(ours)} | {figure(beside)} | {cpu:.3g} "
          f"({min(turns):.3g}-{max(turns):.3g}) | {limit:.3g} | {verdict} | "
          f"{ratio(ours.wall, beside.wall):.3g} |", flush=True)


def copy_to_disk(source, target):
    """Leaves nothing to be written for the run that is measured."""
    shutil.copyfile(source, target)
    with open(target, "rb") as copy:
        os.fsync(copy.fileno())


def bench_message(folder, short):
    subprocess.run([TOOL, "-start", "1"], check=True, stdout=subprocess.DEVNULL,
                   env=dict(os.environ, ORX_COMMON_APPDATA=str(folder)))
    ours = tool("-logmessage", folder, "-logmessage", "1", "-message", "Copying files")
    empty = Side("empty program", PROGRAMS / "empty")
    streams = Side("empty program with iostream", PROGRAMS / "empty_iostream")
    take_turns([ours, empty, streams], 40 if short else 400)
    show("process start", ours, empty, 1.5)
    show("process start", ours, streams, 1.5)


def bench_key(folder, short):
    for events in (10, 1000) if short else (10, 1000, 10000):
        root = make_history(folder / str(events), events, log_bytes=0)
        source = root / HISTORY / "History.ini"
        # git takes no "_" in the name of a key.
        source.write_text(source.read_text().replace("_", "-"))
        section = str(events // 2).zfill(4)

        def side(name, *command, end=(section, "Result", "Failed")):
            own = folder / f"{name.split()[0]}-{events}.ini"
            words = [own if word == "FILE" else word for word in command]
            return Side(name, *words, *end, prepare=lambda: copy_to_disk(source, own))

        ours = side("set_key", PROGRAMS / "set_key", "FILE")
        others = [side("git config -f", "git", "config", "-f", "FILE",
                       end=(section + ".Result", "Failed")),
                  side("GKeyFile", PROGRAMS / "set_key_glib", "FILE")]
        take_turns([ours, *others], 10 if short else 60)
        for other in others:
            show(f"one key of {events} events", ours, other, 1)
        # Takes seconds at its largest, so that it gets fewer turns.
        slow = side("crudini --set", "crudini", "--set", "FILE")
        ours = side("set_key", PROGRAMS / "set_key", "FILE")
        take_turns([ours, slow], 3 if short or events > 1000 else 20)
        show(f"one key of {events} events", ours, slow, 1)


def bench_start(folder, short):
    sides = []
    for events in (10, 1000, 10000):
        root = make_history(folder / str(events), events, log_bytes=0)
        ini = root / HISTORY / "History.ini"
        kept = root / "kept.ini"
        shutil.copyfile(ini, kept)
        sides.append(tool(f"{events} events", root, "-start", "bench", "-Product", "Server",
                          prepare=lambda kept=kept, ini=ini: copy_to_disk(kept, ini)))
    take_turns(sides, 10 if short else 100)
    for side in sides[1:]:
        show("a whole -start", side, sides[0], 3)


def first_report(folder, events):
    """A report over a new copy of a history each time, whose files have not been collected.

    The copies stay until the end: a file system that has just removed thousands of files is slow to
    make new ones.
    """
    source = make_history(folder / f"source-{events}", events, collect=True)
    roots = (folder / f"{events}-{turn}" for turn in itertools.count())

    def prepare():
        root = next(roots)
        shutil.copytree(source, root)
        os.sync()
        side.environment["ORX_COMMON_APPDATA"] = str(root)

    side = tool(f"{events} events, each", "", "-report", folder / "history.zip", share=events,
                prepare=prepare)
    return side


def repeated_report(folder, events):
    """A report over a history of which there was one."""
    return tool(f"{events} events, each", folder / f"{events}-0", "-report",
                folder / "history.zip", share=events)


def bench_report(folder, short):
    sizes = (100, 500) if short else (100, 1000, 2000)
    for work, make, rounds in (("a first report, collecting", first_report, 2 if short else 3),
                               ("a repeated report", repeated_report, 3 if short else 7)):
        sides = [make(folder, events) for events in sizes]
        take_turns(sides, rounds)
        for side in sides[1:]:
            show(work, side, sides[0], 1.25)


def bench_archive(folder, short):
    events = 100 if short else 1000
    size = 200000
    make_history(folder, events, log_bytes=size)
    tree = folder / HISTORY
    (tree / "History.ini").unlink()  # a report without it makes the archive and no summaries
    files = sorted(path.relative_to(tree) for path in tree.rglob("*") if path.is_file())
    ours = tool("-report", folder, "-report", folder / "ours.zip")
    others = [Side("zip -r -6", "zip", "-q", "-r", "-6", folder / "zip.zip", ".", cwd=tree,
                   prepare=lambda: (folder / "zip.zip").unlink(missing_ok=True)),
              Side("minizip -6", "minizip", "-o", "-6", folder / "minizip.zip", *files, cwd=tree)]
    take_turns([ours, *others], 2 if short else 5)
    for other in others:
        show(f"archive of {events * size // 1000000} MB", ours, other, 1.05)


def bench_registry(folder, short):
    megabytes = 20 if short else 100
    for code in "utf-8", "utf-16":
        root = folder / code
        (root / "ZEK").mkdir(parents=True)
        export = root / "ZEK" / "Registry.reg"
        make_registry_export(megabytes, code, export)
        os.sync()
        whole = tool("a whole -start", root, "-start", "bench")
        alone = Side("its questions alone", PROGRAMS / "registry_questions",
                     ORX_COMMON_APPDATA=str(root))
        cat = Side("cat", "cat", export)
        take_turns([whole, alone, cat], 5 if short else 20)
        for ours in whole, alone:
            show(f"registry export of {megabytes} MB, {code}", ours, cat, 10)


@contextlib.contextmanager
def sleepers(count):
    """Processes that do nothing; should this script be killed, they end by themselves."""
    with contextlib.ExitStack() as stack:
        for _ in range(count):
            child = subprocess.Popen(["sleep", "300"])
            stack.callback(child.wait)
            stack.callback(child.kill)
        yield


def bench_snapshot(folder, short):
    processes, members = (200, 500) if short else (2000, 5000)
    users = [(f"user{i:05}", 1000 + i // 10) for i in range(members)]
    passwd = folder / "passwd"
    passwd.write_text("root:x:0:0:root:/root:/bin/sh\n" + "".join(
        f"{name}:x:{10000 + i}:{group}::/home/{name}:/bin/sh\n"
        for i, (name, group) in enumerate(users)))
    groups = folder / "group"
    groups.write_text("root:x:0:\n" + "".join(
        f"group{i:04}:x:{1000 + i}:{','.join(n for n, _ in users[i * 10:i * 10 + 10])}\n"
        for i in range(members // 10)))
    names = {"LD_PRELOAD": "libnss_wrapper.so", "NSS_WRAPPER_PASSWD": str(passwd),
             "NSS_WRAPPER_GROUP": str(groups)}
    ours = tool("a whole -start", folder, "-start", "bench", **names)
    others = [Side("ps -e", "ps", "-e"), Side("getent group", "getent", "group", **names)]
    with sleepers(processes):
        take_turns([ours, *others], 5 if short else 40)
    both = together("ps -e and getent group", others)
    show(f"snapshot of {processes} processes, {members} members", ours, both, 1)


WORKS = {"message": bench_message, "key": bench_key, "start": bench_start, "report": bench_report,
         "archive": bench_archive, "registry": bench_registry, "snapshot": bench_snapshot}


def main():
    parser = argparse.ArgumentParser(description=__doc__,
                                     formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--short", action="store_true", help="smaller sizes and fewer turns")
    parser.add_argument("works", nargs="*", metavar="WORK",
                        help=f"{', '.join(WORKS)}; all of them without any")
    options = parser.parse_args()
    if not set(options.works) <= set(WORKS):
        parser.error(f"a work is one of {', '.join(WORKS)}")
    heading()
    for name in options.works or WORKS:
        with tempfile.TemporaryDirectory(prefix="orx-bench-") as folder:
            WORKS[name](pathlib.Path(folder), options.short)


if __name__ == "__main__":
    main()
