"""Kills the program at every writing system call, and makes every call on its files fail.

Each kind of run is traced once. Then it is run again for each of its calls, from the same history,
and that call either kills it or returns an error. A limit on the size of files does the same in
the middle of a write. After each such run the history must be one of those that the interface
allows, nothing of other events may have changed, and the next runs must work.
"""

import collections
import contextlib
import itertools
import os
import random
import re
import resource
import shutil
import signal
import typing

import history
from harness import Machine, contents, difference, injecting, sample
from history import check

# By their names on all processors. A call that only reads is of interest where it fails.
WRITING = {"open", "openat", "creat", "write", "writev", "pwrite64", "pwritev", "rename",
           "renameat", "renameat2", "mkdir", "mkdirat", "rmdir", "unlink", "unlinkat", "link",
           "linkat", "symlink", "symlinkat", "fsync", "fdatasync", "fchmod", "chmod", "fchmodat",
           "fchown", "chown", "fchownat", "truncate", "ftruncate", "fallocate", "sendfile",
           "copy_file_range", "utimensat", "flock", "exit_group"}
READING = {"open", "openat", "read", "pread64", "lseek", "stat", "lstat", "fstat", "newfstatat",
           "statx", "access", "faccessat", "faccessat2", "getdents64"}

OLDER_ARCHIVE = b"an older archive"


class Point(typing.NamedTuple):
    """A fault of one kind of run, at a call with a number among those of its name. For the call
    "size" the number is the size that no file may exceed."""
    run: str
    call: str
    number: int
    fault: str
    text: str = ""  # the call with its arguments

    def name(self):
        return f"kill: {self.run}, {self.call} {self.number}, {self.fault}"

    def kind(self):
        return self.run, self.call, self.fault

    def is_repeated(self):
        """Whether the program repeats the call when it is interrupted. A library opens and writes
        the archive, and does not."""
        return self.call not in ("openat", "write") or "/archives/" not in self.text


class Scenario(typing.NamedTuple):
    """One kind of run: the history that it starts from, its words, the event that is its own, and
    its changes of the history file, each whole or not at all. A change is a list of parts, of which
    some may be missing after an error."""
    base: str
    words: tuple
    event: str | None
    changes: list

    def killed_states(self, old):
        """After a run that was killed: the first changes are made, whole."""
        return [apply(old, sum(self.changes[:count], []))
                for count in range(len(self.changes) + 1)]

    def failed_states(self, old):
        """After a run that met an error: any part may be missing."""
        parts = sum(self.changes, [])
        return [apply(old, way) for count in range(len(parts) + 1)
                for way in itertools.combinations(parts, count)]


def apply(sections, parts):
    result = {name: dict(keys) for name, keys in sections.items()}
    for part in parts:
        part(result)
    return result


class Bench(Machine):
    """A machine with the histories that the runs start from."""

    def __init__(self, program):
        super().__init__(program)
        self.files = self.scratch / "files"
        self.files.mkdir()
        for kind in ("log", "trc", "rsp"):
            (self.files / f"setup.{kind}").write_text(f"{kind} line\n" * 500)
        self.make_histories()
        self.scenarios = self.make_scenarios()
        self.undisturbed = {}
        for run, scenario in self.scenarios.items():
            self.begin(scenario)
            self.must(*scenario.words)
            self.undisturbed[run] = self.picture()

    def make_histories(self):
        self.history.rmdir()
        shutil.copy(history.REPOSITORY / "scripts/sample-machine/Registry.reg", self.root / "ZEK")
        self.save("empty")
        own = [word for option, kind in (("-l", "log"), ("-t", "trc"), ("-u", "rsp"))
               for word in (option, str(self.files / f"setup.{kind}"))]
        self.must("-start", "done1", "-Product", "P1", *own)
        self.must("-end", "done1", "-CopyName", "C1", "-Result", "good")
        self.must("-start", "done2", "-Product", "P2", *own[:2])
        self.must("-end", "done2", "-Result", "bad")
        self.must("-start", "open", "-Product", "P3", *own)
        self.must("-logmessage", "open", "-message", "first")
        self.save("full")

    def make_scenarios(self):
        def start(base, identity):
            return Scenario(base, ("-start", identity, "-Product", "P4", "-Command", "run"),
                            identity, [[lambda sections: self.add_event(sections, identity)]])
        target = self.history / "C2/open" / history.LOG
        end = [[lambda s: s["open"].update(End_Time="TIME", Copy_Name="C2", Result="fine",
                                           Complete_Flag="TRUE")],
               [lambda s: s["open"].update(Event_Log_File=str(target))]]
        collected = [[lambda s, key=key: self.collect(s["done1"], key, "C1/done1")
                      for key in ("Log_File_Name", "Trace_File", "Response_File")],
                     [lambda s: self.collect(s["done2"], "Log_File_Name", "done2")]]
        return {
            "first start": start("empty", "new"),
            "start": start("full", "new"),
            "restart": start("full", "open"),
            "logmessage": Scenario("full", ("-logmessage", "open", "-message", "second"), "open",
                                   []),
            "end": Scenario("full", ("-end", "open", "-CopyName", "C2", "-Result", "fine"), "open",
                            end),
            "report": Scenario("full", ("-report", str(self.archive)), None, collected),
        }

    def add_event(self, sections, identity):
        counts = sections.setdefault("History", {"Count": "0"})
        counts["Count"] = str(int(counts["Count"]) + 1)
        sections[identity] = history.event(
            identity, str(self.history / identity / history.LOG), Start_Time="TIME", Product="P4",
            Command_Line="run")

    def collect(self, section, key, folder):
        section[key] = str(self.history / folder / section[key].rpartition("/")[2])

    def state(self):
        return history.without_times(self.sections()) if self.ini.exists() else {}

    def begin(self, scenario):
        self.restore(scenario.base)
        self.archive.write_bytes(OLDER_ARCHIVE)
        for file in self.archives.glob(".*"):  # of a run that was killed
            file.unlink()

    def is_older_archive(self):
        return self.archive.read_bytes() == OLDER_ARCHIVE

    def trace_calls(self, run):
        """The calls of an undisturbed run with their numbers, from its first access to the history
        on. strace counts the calls of each process on their own."""
        trace = self.scratch / "trace"
        self.begin(self.scenarios[run])
        self.must(*self.scenarios[run].words,
                  before=("strace", "-f", "-y", "-s", "0", "-o", str(trace)))
        calls = re.findall(r"(?m)^(\d+)\s+((\w+)\(.*)", trace.read_text(errors="replace"))
        numbers = collections.Counter()
        has_begun = False
        for process, text, name in calls:
            if process == calls[0][0] and name != "execve":
                numbers[name] += 1
                has_begun = has_begun or str(self.root) in text
                if has_begun:
                    yield name, numbers[name], text

    def points(self, run):
        for call, number, text in self.trace_calls(run):
            creates = "O_CREAT" in text or "O_TRUNC" in text
            writes = call in WRITING and (creates or call not in READING)
            is_ours = str(self.scratch) in text and call != "exit_group"
            if call == "lseek" and "/archives/" in text:
                continue  # minizip does not check it, as it cannot fail on a regular file
            faults = [*(["kill"] if writes else []),
                      *(["EIO", "EINTR"] if is_ours and (writes or call in READING) else []),
                      *(["ENOSPC"] if is_ours and writes else [])]
            for fault in faults:
                yield Point(run, call, number, fault, text)
        file = self.scratch / self.scenarios[run].base / history.HISTORY / "History.ini"
        length = file.stat().st_size if file.exists() else 0
        for size in sorted({0, 1, 17, *range(100, length + 1500, 150)}):
            yield Point(run, "size", size, "EFBIG")

    def disturb(self, point, words):
        """Makes the run with the point's fault; returns its result and output."""
        if point.call == "size":
            return self.limit_size(point.number, words)
        fault = "signal=SIGKILL" if point.fault == "kill" else f"error={point.fault}"
        return self.run(*words, before=injecting(point.call, f"{fault}:when={point.number}"))

    def limit_size(self, size, words):
        """No file grows beyond the size: the write up to it is done, and the next one fails. The
        signal that the system sends then ends every program that does not expect it."""
        def set_limit():
            resource.setrlimit(resource.RLIMIT_CORE, (0, 0))
            resource.setrlimit(resource.RLIMIT_FSIZE, (size, size))
            signal.signal(signal.SIGXFSZ, signal.SIG_DFL)
        # Python ignores this signal; restore_signals would overrule set_limit.
        return self.run(*words, preexec_fn=set_limit, restore_signals=False)

    def check_point(self, point):
        scenario = self.scenarios[point.run]
        self.begin(scenario)
        old = self.state()
        self.check_result(point, *self.disturb(point, scenario.words))
        new = self.state()
        allowed = scenario.killed_states if point.fault == "kill" else scenario.failed_states
        check(new in allowed(old), f"history {difference(old, new)}")
        self.check_others(scenario)
        if point.run in ("logmessage", "end"):
            before = self.scratch / "full" / history.HISTORY / "open" / history.LOG
            check(self.log_of("open", "C2").read_bytes().startswith(before.read_bytes()),
                  "log lost its beginning")
        if not self.is_older_archive():
            history.read_archive(self.archive)
        if point.fault == "EINTR" and point.is_repeated():
            wanted, found = self.undisturbed[point.run], self.picture()
            check(found == wanted, f"lost: {difference(wanted, found)}")
        self.check_next_runs(point.run, scenario, new)

    def check_result(self, point, result, output):
        if point.fault == "kill":
            check(result == -signal.SIGKILL, f"not killed, result {result}")
        elif point.run == "report":
            check(result in (0, 3), f"result {result}")
            check(result == 3 or b"is created successfully" in output, f"said {output}")
            check((result == 3) == self.is_older_archive(), f"result {result}, other archive")
            check(os.listdir(self.archives) == [self.archive.name], "litter")
        else:
            is_set_up = b"Initialiation Failed:" not in output
            check(result == (0 if is_set_up else 1), f"result {result}, said {output}")
            check(is_set_up or point.run == "first start", "set-up failed")

    def check_others(self, scenario):
        """All that is not of the run's event, or a report's to write, is as it was."""
        def others(folder):
            return {name: data for name, data in contents(folder).items()
                    if not {"History.ini", scenario.event} & {*name.split("/")}}
        old, new = others(self.scratch / scenario.base), others(self.root)
        kept = {name: new.get(name) for name in old}
        check(kept == old, f"lost or changed: {difference(old, kept)}")
        for file in self.history.rglob("setup.*"):
            check(file.read_bytes() == (self.files / file.name).read_bytes(), f"part of {file}")

    def check_next_runs(self, run, scenario, old):
        self.must(*scenario.words)
        new = self.state()
        allowed = {
            # What was copied or moved before the keys could be written is not copied or moved
            # again.
            "report": scenario.failed_states,
            "end": lambda old: scenario.killed_states(old)[1:],
        }.get(run, lambda old: scenario.killed_states(old)[-1:])
        check(new in allowed(old), f"next run {difference(old, new)}")
        if "start" in run:
            log = self.history / scenario.event / history.LOG
            check(log.read_bytes().endswith(b" Starts  \n" + 94 * b"*" + b"\n"), "next log broken")
        check(not (self.history / ".History.tmp").exists() or run in ("logmessage", "report"),
              "litter")
        self.check_report()

    def picture(self):
        """The history and the archive, without what differs from run to run."""
        files = contents(self.history)
        if not self.is_older_archive():
            files |= {f"archive: {name}": data
                      for name, data in history.read_archive(self.archive).items()}
        return {name: settled(data) for name, data in files.items()}


def settled(text):
    """The text without time stamps and without users and processes: these come from libraries and
    from the whole machine."""
    text = re.sub(rb"\d{8} \d\d:\d\d:\d\d", b"TIME", text)
    text = re.sub(rb"\n1\) User.*?\n2\) ", b"\n", text, flags=re.DOTALL)
    return re.sub(rb"\n3\) Current.*?\n4\) ", b"\n", text, flags=re.DOTALL)


def in_order(points):
    """One point of each kind first, then the others, for a sample."""
    random.Random(1).shuffle(points)
    firsts = {}
    for point in points:
        firsts.setdefault(point.kind(), point)
    return [*firsts.values(), *(point for point in points if firsts[point.kind()] is not point)]


def attack_calls(program, outcome, seconds, only):
    with contextlib.ExitStack() as machines:
        benches = [machines.enter_context(Bench(program)) for _ in range(os.cpu_count() or 1)]
        points = [point for run in benches[0].scenarios for point in benches[0].points(run)
                  if only in point.name()]
        done = sample(outcome, [(point.name(), lambda bench, p=point: bench.check_point(p))
                                for point in in_order(points)], seconds, benches)
    faults = collections.Counter(name.rpartition(", ")[2] for name in done)
    print(f"kill: {len(done)} of {len(points)} faults",
          *(f"{fault} {count}" for fault, count in faults.items()), sep=", ")
