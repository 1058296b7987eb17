"""Kills the program at every writing system call, and makes every call on its files fail.

Each kind of run is traced once. Then it is run again for each of its calls, from the same history,
and that call either kills it or returns an error. A limit on the size of files does the same in
the middle of a write. After each such run the history must be one of those that the run may leave,
nothing of other events may have changed, and the next runs must work.
"""

import collections
import contextlib
import itertools
import os
import re
import shutil
import signal
import typing

import history
from harness import OLDER, Case, Target, injecting, sample
from history import check
from machine import Skipped, check_equal, contents, difference

# By their names on all processors. A call that only reads is of interest where it fails.
WRITING = {"creat", "write", "writev", "pwrite64", "pwritev", "rename", "renameat", "renameat2",
           "mkdir", "mkdirat", "rmdir", "unlink", "unlinkat", "link", "linkat", "symlink",
           "symlinkat", "fsync", "fdatasync", "fchmod", "chmod", "fchmodat", "fchown", "chown",
           "fchownat", "truncate", "ftruncate", "fallocate", "sendfile", "copy_file_range",
           "utimensat", "flock", "exit_group"}
OPENING = {"open", "openat"}
READING = {"read", "pread64", "lseek", "stat", "lstat", "fstat", "newfstatat", "statx", "access",
           "faccessat", "faccessat2", "getdents64"}


class Point(typing.NamedTuple):
    """A fault of one kind of run, at a call with a number among those of its name. For the call
    "size" the number is the size that no file may exceed."""
    run: str
    call: str
    number: int
    fault: str
    before: tuple  # the command before a run that makes it happen
    text: str = ""  # the call with its arguments


class Scenario(typing.NamedTuple):
    """One kind of run: the history that it starts from, its arguments, the event that is its own,
    and its replacements of the history file in their order. A replacement is a list of pairs: a
    section and the keys that are set in it, all or none."""
    base: str
    arguments: tuple
    event: str | None
    replacements: list

    def killed_states(self, old):
        """After a run that was killed: the first replacements are made."""
        return [history.changed(old, *sum(self.replacements[:count], []))
                for count in range(len(self.replacements) + 1)]

    def failed_states(self, old):
        """After a run that met an error: any pair may be missing."""
        pairs = sum(self.replacements, [])
        return [history.changed(old, *chosen) for count in range(len(pairs) + 1)
                for chosen in itertools.combinations(pairs, count)]


class ScenarioMachine(Target):
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
            self.must(*scenario.arguments)
            self.undisturbed[run] = self.snapshot()

    def make_histories(self):
        self.history.rmdir()
        shutil.copy(history.REPOSITORY / "scripts/sample-machine/Registry.reg", self.root / "ZEK")
        shutil.copytree(self.root, self.scratch / "empty")
        own = [word for option, kind in (("-l", "log"), ("-t", "trc"), ("-u", "rsp"))
               for word in (option, str(self.files / f"setup.{kind}"))]
        self.must("-start", "done1", "-Product", "P1", *own)
        self.must("-end", "done1", "-CopyName", "C1", "-Result", "good")
        self.must("-start", "done2", "-Product", "P2", *own[:2])
        self.must("-end", "done2", "-Result", "bad")
        self.must("-start", "open", "-Product", "P3", *own)
        self.must("-logmessage", "open", "-message", "first")
        shutil.copytree(self.root, self.scratch / "full")

    def make_scenarios(self):
        def start(base, event):
            keys = history.event(event, str(self.history / event / history.LOG),
                                 Start_Time="TIME", Product="P4", Command_Line="run")
            return Scenario(base, ("-start", event, "-Product", "P4", "-Command", "run"), event,
                            [[(event, keys)]])

        def collected(event, folder, **files):
            return [(event, {key: str(self.history / folder / name)})
                    for key, name in files.items()]
        end = {"End_Time": "TIME", "Copy_Name": "C2", "Result": "fine", "Complete_Flag": "TRUE"}
        target = {"Event_Log_File": str(self.history / "C2/open" / history.LOG)}
        return {
            "first start": start("empty", "new"),
            "start": start("full", "new"),
            "restart": start("full", "open"),
            "logmessage": Scenario("full", ("-logmessage", "open", "-message", "second"), "open",
                                   []),
            "end": Scenario("full", ("-end", "open", "-CopyName", "C2", "-Result", "fine"), "open",
                            [[("open", end)], [("open", target)]]),
            "report": Scenario("full", ("-report", str(self.archive)), None, [
                collected("done1", "C1/done1", Log_File_Name="setup.log", Trace_File="setup.trc",
                          Response_File="setup.rsp"),
                collected("done2", "done2", Log_File_Name="setup.log")]),
        }

    def state(self):
        if not self.ini.exists():
            return {}
        return history.parse_history(comparable(self.ini.read_bytes()).encode())

    def begin(self, scenario):
        shutil.rmtree(self.root)
        shutil.copytree(self.scratch / scenario.base, self.root)
        self.archive.write_bytes(OLDER)
        for file in self.archives.glob(".*"):  # of a run that was killed
            file.unlink()

    def is_older_archive(self):
        return self.archive.read_bytes() == OLDER

    def trace_calls(self, run):
        """The calls of an undisturbed run with their numbers, from its first access to the history
        on. strace counts the calls of each process on their own."""
        trace = self.scratch / "trace"
        self.begin(self.scenarios[run])
        self.must(*self.scenarios[run].arguments,
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
            if call == "lseek" and "/archives/" in text:
                continue  # minizip does not check it, as it cannot fail on a regular file
            writes = call in WRITING or call in OPENING and ("O_CREAT" in text or "O_TRUNC" in text)
            faults = ["kill"] if writes else []
            if str(self.scratch) in text and call != "exit_group":
                faults += ["EIO", "EINTR"] if writes or call in OPENING | READING else []
                faults += ["ENOSPC"] if writes else []
            for fault in faults:
                effect = "signal=SIGKILL" if fault == "kill" else f"error={fault}"
                yield Point(run, call, number, fault,
                            injecting(call, f"{effect}:when={number}"), text)
        file = self.scratch / self.scenarios[run].base / history.HISTORY / "History.ini"
        length = file.stat().st_size if file.exists() else 0
        for size in sorted({0, 1, 17, *range(100, length + 1500, 150)}):
            # The write up to the size is done, and the next one fails. The signal that the system
            # sends then ends every program that does not expect it.
            yield Point(run, "size", size, "EFBIG", ("prlimit", "--core=0", f"--fsize={size}"))

    def check_point(self, point):
        scenario = self.scenarios[point.run]
        self.begin(scenario)
        old = self.state()
        self.check_code(point, *self.run(*scenario.arguments, before=point.before))
        new = self.state()
        allowed = scenario.killed_states if point.fault == "kill" else scenario.failed_states
        check(new in allowed(old), f"history {difference(new, old)}")
        self.check_others(scenario)
        if point.run in ("logmessage", "end"):
            before = self.scratch / "full" / history.HISTORY / "open" / history.LOG
            check(self.log_of("open", "C2").read_bytes().startswith(before.read_bytes()),
                  "log lost its beginning")
        if not self.is_older_archive():
            self.packed()
        # A library opens and writes the archive, and does not repeat that.
        is_library = point.call in ("openat", "write") and "/archives/" in point.text
        if point.fault == "EINTR" and not is_library:
            check_equal(self.snapshot(), self.undisturbed[point.run], "lost")
        self.check_next_runs(point.run, scenario, new)

    def check_code(self, point, code, output):
        if point.fault == "kill":
            if code == 0:  # processes, and so rows of the report, may be gone since the trace
                now = [number for call, number, _ in self.trace_calls(point.run)
                       if call == point.call]
                if point.number > max(now, default=0):
                    raise Skipped("the report has become shorter")
            check(code == -signal.SIGKILL, f"not killed, exit code {code}")
        elif point.run == "report":
            check(code in (0, 3), f"exit code {code}")
            check(code == 3 or b"is created successfully" in output, f"printed {output}")
            check((code == 3) == self.is_older_archive(), f"exit code {code}, other archive")
            check(os.listdir(self.archives) == [self.archive.name], "leftover files")
        else:
            is_set_up = b"Initialiation Failed:" not in output
            check(code == (0 if is_set_up else 1), f"exit code {code}, printed {output}")
            check(is_set_up or point.run == "first start", "set-up failed")

    def check_others(self, scenario):
        """All that is not of the run's event, or a report's to write, is as it was."""
        def others(folder):
            return {name: data for name, data in contents(folder).items()
                    if not {"History.ini", scenario.event} & {*name.split("/")}}
        old, new = others(self.scratch / scenario.base), others(self.root)
        check_equal({name: new.get(name) for name in old}, old, "lost or changed")
        for file in self.history.rglob("setup.*"):
            check(file.read_bytes() == (self.files / file.name).read_bytes(), f"part of {file}")

    def check_next_runs(self, run, scenario, old):
        self.must(*scenario.arguments)
        new = self.state()
        allowed = scenario.killed_states(old)[-1:]
        if run == "end":  # a folder that was moved before the key was set is not moved again
            allowed = scenario.killed_states(old)[1:]
        elif run == "report":  # nor are files copied again
            allowed = scenario.failed_states(old)
        check(new in allowed, f"next run {difference(new, old)}")
        if "start" in run:
            log = self.history / scenario.event / history.LOG
            check(log.read_bytes().endswith(b" Starts  \n" + 94 * b"*" + b"\n"), "next log broken")
        check(not (self.history / ".History.tmp").exists() or run in ("logmessage", "report"),
              "leftover files")
        self.check_report()

    def snapshot(self):
        """The history and the archive, without what differs from run to run."""
        files = contents(self.history)
        if not self.is_older_archive():
            files |= {f"archive: {name}": data for name, data in self.packed().items()}
        return {name: comparable(data) for name, data in files.items()}


def comparable(data):
    """The text without time stamps and without users and processes: these come from libraries and
    from the entire machine."""
    text = history.TIME.sub("TIME", data.decode(errors="surrogateescape"))
    return re.sub(r"\n(1\) User|3\) Current).*?\n(?=[24]\) )", "\n", text, flags=re.DOTALL)


def attack_calls(program, outcome, seconds, only):
    with contextlib.ExitStack() as machines:
        workers = [machines.enter_context(ScenarioMachine(program))
                   for _ in range(os.cpu_count() or 1)]
        cases = [Case(f"kill: {run}, {point.call} {point.number}, {point.fault}",
                      (run, point.call, point.fault),
                      lambda worker, p=point: worker.check_point(p))
                 for run in workers[0].scenarios for point in workers[0].points(run)]
        return sample(outcome, cases, seconds, only, workers)
