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

import history
from harness import Machine, difference, sample
from history import check

# By their names on all processors. A call that only reads is of interest where it fails.
WRITING = {"open", "openat", "creat", "write", "writev", "pwrite64", "pwritev", "rename",
           "renameat", "renameat2", "mkdir", "mkdirat", "rmdir", "unlink", "unlinkat", "link",
           "linkat", "symlink", "symlinkat", "fsync", "fdatasync", "fchmod", "chmod", "fchmodat",
           "fchown", "chown", "fchownat", "truncate", "ftruncate", "fallocate", "sendfile",
           "copy_file_range", "utimensat", "flock", "exit_group"}
READING = {"open", "openat", "read", "pread64", "lseek", "stat", "lstat", "fstat", "newfstatat",
           "statx", "access", "faccessat", "faccessat2", "getdents64"}
OPENING = {"open", "openat"}

# A library opens and writes the archive and does not repeat these calls when they are interrupted.
NOT_REPEATED = {"openat", "write"}
OLDER_ARCHIVE = b"an older archive"

Call = collections.namedtuple("Call", "name number text")  # the number counts calls of that name
Point = collections.namedtuple("Point", "scenario call fault")  # or a size instead of a call


class Scenario:
    """One kind of run: the history that it starts from, and the changes that it makes to the
    history file, each whole or not at all. A change is a list of parts, of which some may be
    missing after an error."""

    def __init__(self, name, base, words, event, changes):
        self.name, self.base, self.words = name, base, words
        self.event, self.changes = event, changes
        self.calls = []
        self.reference = None

    def killed_states(self, old):
        """After a run that was killed: the first changes are made, whole."""
        return [apply(old, sum(self.changes[:count], []))
                for count in range(len(self.changes) + 1)]

    def failed_states(self, old):
        """After a run that met an error: any part may be missing."""
        parts = sum(self.changes, [])
        return [apply(old, way) for count in range(len(parts) + 1)
                for way in itertools.combinations(parts, count)]


def apply(sections, changes):
    result = {name: dict(keys) for name, keys in sections.items()}
    for change in changes:
        change(result)
    return result


class Bench:
    """A machine with the histories that the runs start from."""

    def __init__(self, machine):
        self.machine = machine
        self.files = machine.scratch / "files"
        self.archive = machine.archive
        self.trace = machine.scratch / "trace"
        self.files.mkdir()
        for kind in ("log", "trc", "rsp"):
            (self.files / f"setup.{kind}").write_text(f"{kind} line\n" * 500)
        self.make_histories()
        self.scenarios = {scenario.name: scenario for scenario in self.make_scenarios()}
        for scenario in self.scenarios.values():
            self.trace_calls(scenario)

    def make_histories(self):
        machine = self.machine
        machine.history.rmdir()
        shutil.copy(history.REPOSITORY / "scripts/sample-machine/Registry.reg",
                    machine.root / "ZEK")
        machine.save("empty")
        own = [word for option, kind in (("-l", "log"), ("-t", "trc"), ("-u", "rsp"))
               for word in (option, str(self.files / f"setup.{kind}"))]
        machine.must("-start", "done1", "-Product", "P1", *own)
        machine.must("-end", "done1", "-CopyName", "C1", "-Result", "good")
        machine.must("-start", "done2", "-Product", "P2", *own[:2])
        machine.must("-end", "done2", "-Result", "bad")
        machine.must("-start", "open", "-Product", "P3", *own)
        machine.must("-logmessage", "open", "-message", "first")
        machine.save("full")

    def make_scenarios(self):
        def start(identity):
            keys = dict.fromkeys(("End_Time", "Action", "Type", "Version", "Service_Level", "Path",
                                  "Log_File_Name", "Trace_File", "Response_File"), "")
            keys.update(Start_Time="TIME", Product="P4", Command_Line="run",
                        Copy_Name="(Unknown)", Complete_Flag="FALSE")
            return [lambda s: [self.count(s, identity), s[identity].update(keys)]]
        words = ("-Product", "P4", "-Command", "run")
        target = self.machine.history / "C2/open" / history.LOG
        return [
            Scenario("first start", "empty", ("-start", "new", *words), "new",
                     [start("new")]),
            Scenario("start", "full", ("-start", "new", *words), "new", [start("new")]),
            Scenario("restart", "full", ("-start", "open", *words), "open", [start("open")]),
            Scenario("logmessage", "full", ("-logmessage", "open", "-message", "second"), "open",
                     []),
            Scenario("end", "full", ("-end", "open", "-CopyName", "C2", "-Result", "fine"), "open",
                     [[lambda s: s["open"].update(End_Time="TIME", Copy_Name="C2", Result="fine",
                                                  Complete_Flag="TRUE")],
                      [lambda s: s["open"].update(Event_Log_File=str(target))]]),
            Scenario("report", "full", ("-report", str(self.archive)), None,
                     [[lambda s, key=key: self.collect(s["done1"], key, "C1/done1")
                       for key in ("Log_File_Name", "Trace_File", "Response_File")],
                      [lambda s: self.collect(s["done2"], "Log_File_Name", "done2")]]),
        ]

    def count(self, sections, identity):
        counts = sections.setdefault("History", {"Count": "0"})
        counts["Count"] = str(int(counts["Count"]) + 1)
        sections[identity] = history.event(
            identity, str(self.machine.history / identity / history.LOG),
            Log_File_Name="(none)", Trace_File="(none)", Response_File="(none)")

    def collect(self, section, key, folder):
        name = section[key].rpartition("/")[2]
        section[key] = str(self.machine.history / folder / name)

    def state(self):
        if not self.machine.ini.exists():
            return {}
        return history.without_times(self.machine.sections())

    def begin(self, scenario):
        self.machine.restore(scenario.base)
        self.archive.write_bytes(OLDER_ARCHIVE)
        for file in self.archive.parent.glob(".*"):  # of a run that was killed
            file.unlink()

    def is_older_archive(self):
        return self.archive.read_bytes() == OLDER_ARCHIVE

    def traced(self, scenario, *options):
        return self.machine.run(*scenario.words, before=("strace", "-f", "-y", "-s", "0", "-o",
                                                         str(self.trace), *options))

    def trace_calls(self, scenario):
        """Keeps the calls of an undisturbed run, from its first access to the history on."""
        self.begin(scenario)
        check(self.traced(scenario)[0] == 0, "the undisturbed run failed")
        scenario.reference = self.picture()
        numbers = collections.Counter()
        has_begun = False
        main = None
        for line in self.trace.read_text(errors="replace").splitlines():
            match = re.match(r"(\d+)\s+(\w+)\(", line)
            if not match or match[2] == "execve":
                continue
            process, name = match.groups()
            main = main or process
            if process != main:  # strace counts the calls of each process on their own
                continue
            numbers[name] += 1
            has_begun = has_begun or str(self.machine.root) in line
            if has_begun:
                scenario.calls.append(Call(name, numbers[name], line))

    def points(self, scenario):
        for call in scenario.calls:
            creates = "O_CREAT" in call.text or "O_TRUNC" in call.text
            writes = call.name in WRITING and (call.name not in OPENING or creates)
            is_ours = str(self.machine.scratch) in call.text
            if call.name == "lseek" and "/archives/" in call.text:
                continue  # minizip does not check it, as it cannot fail on a regular file
            if writes:
                yield Point(scenario, call, "kill")
            if is_ours and call.name != "exit_group" and (writes or call.name in READING):
                for error in ("EIO", "EINTR", *(["ENOSPC"] if writes else [])):
                    yield Point(scenario, call, error)
        file = self.machine.scratch / scenario.base / history.HISTORY / "History.ini"
        length = file.stat().st_size if file.exists() else 0
        for size in sorted({0, 1, 17, *range(100, length + 1500, 150)}):
            yield Point(scenario, size, "EFBIG")

    def disturb(self, point):
        """Runs the scenario with the point's fault; gives the result, or None if killed."""
        if isinstance(point.call, int):
            return self.limit_size(point)
        name, number, _ = point.call
        fault = "signal=SIGKILL" if point.fault == "kill" else f"error={point.fault}"
        result, output = self.traced(point.scenario, "--seccomp-bpf", "-e", f"trace={name}", "-e",
                                     f"inject={name}:{fault}:when={number}")
        return (None if result == -signal.SIGKILL else result), output

    def limit_size(self, point):
        """No file grows beyond the size: the write up to it is done, and the next one fails. The
        signal that the system sends then ends every program that does not expect it."""
        def set_limit():
            resource.setrlimit(resource.RLIMIT_CORE, (0, 0))
            resource.setrlimit(resource.RLIMIT_FSIZE, (point.call, point.call))
            signal.signal(signal.SIGXFSZ, signal.SIG_DFL)
        # Python ignores this signal; restore_signals would overrule set_limit.
        return self.machine.run(*point.scenario.words, preexec_fn=set_limit, restore_signals=False)

    def check_point(self, point):
        scenario = point.scenario
        self.begin(scenario)
        old = self.state()
        result, output = self.disturb(point)
        self.check_result(point, result, output)
        new = self.state()
        allowed = scenario.killed_states if point.fault == "kill" else scenario.failed_states
        check(new in allowed(old), f"history {difference(old, new)}")
        self.check_others(scenario)
        self.check_own_log(scenario)
        if not self.is_older_archive():
            history.read_archive(self.archive)
        if point.fault == "EINTR" and not (point.call.name in NOT_REPEATED
                                           and "/archives/" in point.call.text):
            check(self.picture() == scenario.reference,
                  f"lost: {difference(scenario.reference, self.picture())}")
        self.check_next_runs(scenario, new)

    def check_result(self, point, result, output):
        if result is None:
            check(point.fault == "kill", "died")
        elif point.scenario.name == "report":
            check(result in (0, 3), f"result {result}")
            check(result == 3 or b"is created successfully" in output, f"said {output}")
            check((result == 3) == self.is_older_archive(), f"result {result}, other archive")
            check(os.listdir(self.archive.parent) == [self.archive.name], "litter")
        else:
            is_set_up = b"Initialiation Failed:" not in output
            check(result == (0 if is_set_up else 1), f"result {result}, said {output}")
            check(is_set_up or point.scenario.base == "empty", "set-up failed")

    def check_others(self, scenario):
        """All that is not of the run's event, or a report's to write, is as it was."""
        base = self.machine.scratch / scenario.base
        for file in base.rglob("*"):
            name = file.relative_to(base)
            if file.is_dir() or name.name == "History.ini" or scenario.event in name.parts:
                continue
            check((self.machine.root / name).is_file(), f"lost: {name}")
            check((self.machine.root / name).read_bytes() == file.read_bytes(), f"changed: {name}")
        for file in self.machine.history.rglob("setup.*"):
            check(file.read_bytes() == (self.files / file.name).read_bytes(), f"part of {file}")

    def check_own_log(self, scenario):
        if scenario.name not in ("logmessage", "end"):
            return
        places = [folder / "open" / history.LOG
                  for folder in (self.machine.history, self.machine.history / "C2")]
        logs = [place.read_bytes() for place in places if place.exists()]
        check(len(logs) == 1, f"{len(logs)} logs")
        before = self.machine.scratch / "full" / history.HISTORY / "open" / history.LOG
        check(logs[0].startswith(before.read_bytes()), "log lost its beginning")

    def check_next_runs(self, scenario, old):
        self.machine.must(*scenario.words)
        new = self.state()
        if scenario.name == "report":
            # What was copied before the keys could be written is not copied again.
            allowed = scenario.failed_states(old)
        elif scenario.name == "end":
            # What was moved before the key could be written is not moved again.
            allowed = scenario.killed_states(old)[1:]
        else:
            allowed = scenario.killed_states(old)[-1:]
        check(new in allowed, f"next run {difference(old, new)}")
        if "start" in scenario.name:
            log = self.machine.history / scenario.event / history.LOG
            check(log.read_bytes().endswith(b" Starts  \n" + 94 * b"*" + b"\n"), "next log broken")
        check(not (self.machine.history / ".History.tmp").exists() or not scenario.changes
              or scenario.name == "report", "litter")
        self.machine.must("-report", str(self.archive))
        entries = history.read_archive(self.archive)
        found = {str(path.relative_to(self.machine.history)): path
                 for path in self.machine.history.rglob("[!.]*")}
        check(set(entries) == set(found), f"archive holds {set(entries) ^ set(found)}")
        for name, path in found.items():
            check(path.is_dir() or entries[name] == path.read_bytes(), f"entry {name}")

    def picture(self):
        """The whole history and the archive, without what differs from run to run."""
        names = {}
        for path in sorted(self.machine.history.rglob("*")):
            names[str(path.relative_to(self.machine.history))] = (
                settled(path.read_bytes()) if path.is_file() else b"")
        if not self.is_older_archive():
            entries = history.read_archive(self.archive)
            names.update((f"archive {name}", settled(data)) for name, data in entries.items())
        return names


def settled(text):
    """The text without time stamps and without users and processes: these come from libraries and
    from the whole machine."""
    text = re.sub(rb"\d{8} \d\d:\d\d:\d\d", b"TIME", text)
    text = re.sub(rb"\n1\) User.*?\n2\) ", b"\n", text, flags=re.DOTALL)
    return re.sub(rb"\n3\) Current.*?\n4\) ", b"\n", text, flags=re.DOTALL)


def in_order(points, is_sample):
    """All points; for a sample the rarer ones first: one for each fault of each call of each kind
    of run, then the others in random order."""
    if not is_sample:
        return points
    random.Random(1).shuffle(points)
    seen = collections.Counter()
    ranked = []
    for point in points:
        seen[kind_of(point)] += 1
        ranked.append((min(seen[kind_of(point)], 2), len(ranked), point))
    return [point for _, _, point in sorted(ranked, key=lambda item: item[:2])]


def kind_of(point):
    call = "size" if isinstance(point.call, int) else point.call.name
    return point.scenario.name, call, point.fault


def name_of(point):
    run, call, fault = kind_of(point)
    number = point.call if isinstance(point.call, int) else point.call.number
    return f"kill: {run}, {call} {number}, {fault}"


def print_table(done, total):
    faults = ("kill", "ENOSPC", "EIO", "EINTR", "EFBIG")
    print(f"{'run':12}{'call':14}" + "".join(f"{fault:>8}" for fault in faults))
    for run, call in sorted({key[:2] for key in total}):
        cells = (f"{done[run, call, fault]}/{total[run, call, fault]}"
                 if total[run, call, fault] else "" for fault in faults)
        print(f"{run:12}{call:14}" + "".join(f"{cell:>8}" for cell in cells))


def attack_calls(program, outcome, seconds, only):
    with contextlib.ExitStack() as machines:
        benches = [Bench(machines.enter_context(Machine(program)))
                   for _ in range(os.cpu_count() or 1)]
        points = [point for scenario in benches[0].scenarios.values()
                  for point in benches[0].points(scenario)]
        points = {name_of(point): point for point in in_order(points, seconds > 0)
                  if only in name_of(point)}
        # A bench has scenarios of its own, by the same names; the calls are the same.
        done = sample(outcome, [
            (name, lambda bench, p=point: bench.check_point(
                p._replace(scenario=bench.scenarios[p.scenario.name])))
            for name, point in points.items()], seconds, benches)
    print_table(collections.Counter(kind_of(points[name]) for name in done),
                collections.Counter(kind_of(point) for point in points.values()))
