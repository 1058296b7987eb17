"""What every attack works with: the machine that is attacked, and the table of attacks. run.py says
how to add an attack."""

import concurrent.futures
import hashlib
import os
import random
import re
import stat
import subprocess
import time
import typing

import history
from history import check
from machine import Machine, Skipped, check_equal, shown

MARKER = b"what is outside stays outside"
OLDER = b"an older archive"
NOBODY = 65534
AS_NOBODY = {"user": NOBODY, "group": NOBODY, "extra_groups": []}  # options of a run

# The runs of an event's life.
RUNS = (("-start", "7"), ("-logmessage", "7", "-message", "text"), ("-end", "7"),
        ("-end", "7", "-CopyName", "C1"), ("-report",))


def digest(path):
    """What must stay as it is: kind, owner, permissions, time of change, contents."""
    status = path.lstat()
    content = ""
    if path.is_symlink():
        content = os.readlink(path)
    elif path.is_file():
        content = hashlib.sha256(path.read_bytes()).hexdigest()
    # The history folder comes and goes in its parent.
    changed = 0 if stat.S_ISDIR(status.st_mode) and path.name == "ZEK" else status.st_mtime_ns
    return str((status.st_mode, status.st_uid, status.st_gid, changed, content))


def expected_entry(path):
    """An entry's attributes, local time and contents."""
    status = path.stat()
    written = time.localtime(status.st_mtime)[:6]
    date = written[:5] + (written[5] // 2 * 2,)
    if path.is_dir():
        return str((0x10, date, b""))
    return str((0x80 if status.st_mode & 0o222 else 0, date, path.read_bytes()))


def injecting(call, fault, *options):
    """The command before a run in which that system call fails so, as strace spells it. Without
    --seccomp-bpf, with which strace injects no signal."""
    return ("strace", "-f", "-qq", "-o", "/dev/null", "-e", f"trace={call}", "-e",
            f"inject={call}:{fault}", *options)


def require_root():
    if os.geteuid() != 0:
        raise Skipped("only root can try it")


def wait_for(holds, message):
    until = time.monotonic() + 10
    while not holds():
        check(time.monotonic() < until, message)
        time.sleep(0.001)


class Target(Machine):
    """A machine with a history folder, files outside it that must stay as they are, an installer's
    log, and a folder for archives."""

    def __init__(self, program):
        super().__init__()
        self.built = program
        # A copy, as another user may not be able to reach the build's folder. By another process,
        # so that no run that starts at this moment has it open for writing.
        self.program = (self.scratch / "program",)
        subprocess.run(["cp", program, *self.program], check=True)
        self.outside = self.scratch / "outside"
        self.archives = self.scratch / "archives"
        self.archive = self.archives / "history.zip"
        self.source = self.scratch / "setup.log"
        self.source.write_text("the installer's own words\n")
        self.archives.mkdir()
        self.history.mkdir(parents=True)
        (self.outside / "folder").mkdir(parents=True)
        for name in ("file", "folder/file"):
            (self.outside / name).write_bytes(MARKER + b"\n")
        self.watch()

    # Runs of the program.

    def with_functions(self, source):
        """The variables of a run in which these functions, in C, replace those of the system's
        library."""
        library = self.scratch / "functions.so"
        subprocess.run(["gcc", "-shared", "-fPIC", "-xc", "-", "-o", library], check=True,
                       input=source.encode())
        return {"LD_PRELOAD": str(library)}

    def record(self, event):
        """A complete event of the copy C1, with the installer's log."""
        self.must("-start", event, "-Product", "P", "-l", str(self.source))
        self.must("-end", event, "-CopyName", "C1", "-Result", "good")

    def report(self, **options):
        return self.must("-report", str(self.archive), **options)

    def report_for_owner(self, *files, **options):
        """Another user owns the history and records an event with these files. Root reports."""
        require_root()
        os.chown(self.history, NOBODY, NOBODY)
        self.watch()
        self.must("-start", "7", *files, **AS_NOBODY)
        self.must("-end", "7", **AS_NOBODY)
        self.report(**options)

    def run_checked(self, *arguments, has_own_marker=False, **options):
        """A run of any kind, and what must hold in every state of the history."""
        more = {"-report": (str(self.archive),), "-start": ("-l", str(self.source))}
        code, _ = self.run(*arguments, *more.get(arguments[0], ()), **options)
        check(code == 0 or code == 3 and arguments == ("-report",),
              f"exit code {code}: {shown(arguments)}")
        self.check_outside()
        if self.archive.exists() and not has_own_marker:
            for name, data in history.read_archive(self.archive, has_blank_names=True).items():
                check(MARKER not in data, f"packed from outside: {name}")

    # What a run leaves.

    def packed(self):
        return history.read_archive(self.archive)

    def count(self):
        return int(self.sections()["History"]["Count"])

    def log_of(self, identity, copy):
        """The only log of an event, which is beside the copy's folder or, after its end, in it."""
        logs = [log for log in (self.history / identity / history.LOG,
                                self.history / copy / identity / history.LOG) if log.exists()]
        check(len(logs) == 1, f"{len(logs)} logs of {identity}")
        return logs[0]

    def check_report(self, **options):
        """A report packs exactly the files and folders that exist, in the order of their names,
        without what begins with a dot."""
        self.report(**options)
        expected = {}
        for path in sorted(self.history.rglob("*")):
            name = str(path.relative_to(self.history))
            is_packed = stat.S_IFMT(path.lstat().st_mode) in (stat.S_IFREG, stat.S_IFDIR)
            if is_packed and not re.search(r"(^|/)\.", name):
                expected[name] = expected_entry(path)
        found = history.archive_entries(self.archive)
        check_equal("\n".join(name for name, _, _ in found), "\n".join(expected), "names")
        for name, info, data in found:
            check_equal(str((info.external_attr, info.date_time, data)), expected[name], name)

    # What is outside.

    def outside_state(self):
        mine = (self.history, self.archives)
        return {str(path): digest(path) for top in (self.root, self.outside, self.source)
                for path in [top, *sorted(top.rglob("*"))]
                if not any(path == own or own in path.parents for own in mine)}

    def watch(self):
        """From now on, what is outside the history must stay as it is."""
        self.outside_before = self.outside_state()

    def check_outside(self):
        check_equal(self.outside_state(), self.outside_before, "changed outside")

    def mount(self, folder, size):
        """Puts a small empty file system over a folder."""
        require_root()
        done = subprocess.run(["mount", "-t", "tmpfs", "-o", f"size={size}", "orx-test", folder],
                              check=False, stderr=subprocess.DEVNULL)
        if done.returncode != 0:
            raise Skipped("nothing can be mounted here")
        self.callback(subprocess.run, ["umount", "--lazy", folder], check=True)


ATTACKS = {}


def attack(*rows):
    """Adds the function below it to the table, under its own name with blanks. With rows it is one
    attack for each. A row is a name, or a tuple of a name and arguments; the function is called
    with the machine and the arguments, or with the machine and the name."""
    def add(function):
        name = function.__name__.replace("_", " ")
        if not rows:
            ATTACKS[name] = function
        for row in rows:
            label, *arguments = row if isinstance(row, tuple) else (row, row)
            ATTACKS[f"{name}: {label}"] = (
                lambda machine, arguments=arguments: function(machine, *arguments))
        return function
    return add


def run_attack(program, action):
    """One attack on a machine of its own. What is outside must be unchanged after it."""
    with Target(program) as machine:
        action(machine)
        machine.check_outside()


def in_threads(calls):
    """Makes all calls (function, arguments...) at once and waits for their end."""
    with concurrent.futures.ThreadPoolExecutor(len(calls)) as pool:
        for future in [pool.submit(*call) for call in calls]:
            future.result()


class Case(typing.NamedTuple):
    name: str
    kind: tuple
    action: typing.Callable  # called with a worker


def sample(outcome, cases, seconds, only, workers):
    """Runs the cases whose names contain `only`, with all workers at once, for about so many
    seconds (0: all of them), one case of each kind first. Returns how many there were."""
    cases = [case for case in cases if only in case.name]
    random.Random(1).shuffle(cases)
    firsts = {case.kind: case for case in cases}
    cases.sort(key=lambda case: case is not firsts[case.kind])
    remaining = iter(cases)  # of a list, which threads may share
    until = time.monotonic() + (seconds or float("inf"))
    done = []

    def work(worker):
        for case in remaining:
            outcome.attempt(case.name, lambda: case.action(worker))
            done.append(case)
            if time.monotonic() > until:
                return
    in_threads([(work, worker) for worker in workers])
    return (f"{len(done)} of {len(cases)} cases, {len({case.kind for case in done})} of "
            f"{len(firsts)} kinds")
