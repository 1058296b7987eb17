"""What every attack works with: a scratch machine, runs of the program, tables of attacks, and the
one way to report what did not hold. run.py says how to add an attack."""

import contextlib
import hashlib
import itertools
import os
import queue
import shutil
import signal
import stat
import subprocess
import tempfile
import threading
import time
from pathlib import Path

import history
from history import Fault, check

MARKER = b"what is outside stays outside"
NOBODY = 65534


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
    return status.st_mode, status.st_uid, status.st_gid, changed, content


def contents(folder, pattern="*"):
    """What is below a folder: the bytes of each file by its path there; none for a folder."""
    return {str(path.relative_to(folder)): path.read_bytes() if path.is_file() else b""
            for path in sorted(folder.rglob(pattern))}


def injecting(call, fault, *options):
    """Words before a run in which that system call has the fault, in strace's words. Without
    --seccomp-bpf, with which strace injects no signal."""
    return ("strace", "-f", "-qq", "-o", "/dev/null", "-e", f"trace={call}", "-e",
            f"inject={call}:{fault}", *options)


def as_nobody():
    """For preexec_fn: the run is another user's."""
    os.setgroups([])
    os.setgid(NOBODY)
    os.setuid(NOBODY)


class Machine(contextlib.ExitStack):
    """A scratch folder with room for a history, files outside it that must stay as they are, and an
    installer's log. In memory where possible: the order of the calls is tested and not the disk.
    Leaving the context undoes everything, what `callback` was given first."""

    def __init__(self, program):
        super().__init__()
        parent = "/dev/shm" if os.access("/dev/shm", os.W_OK) else None
        self.scratch = Path(tempfile.mkdtemp(prefix="orx-", dir=parent))
        self.callback(shutil.rmtree, self.scratch)
        self.scratch.chmod(0o755)
        self.built = Path(program)
        # A copy, as another user may not be able to reach the build's folder. By another process,
        # so that no run that starts at this moment has it open for writing.
        self.program = self.scratch / "program"
        subprocess.run(["cp", program, self.program], check=True)
        self.root = self.scratch / "root"
        self.history = self.root / history.HISTORY
        self.ini = self.history / "History.ini"
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

    def command(self, words, before=()):
        return [os.fsencode(word) for word in (*before, str(self.program), *words)]

    def environment(self, **variables):
        return {**os.environ, "ORX_COMMON_APPDATA": str(self.root), **variables}

    def with_functions(self, source):
        """The variables of a run in which these functions, in C, replace those of the system's
        library."""
        library = self.scratch / "functions.so"
        subprocess.run(["gcc", "-shared", "-fPIC", "-xc", "-", "-o", library], check=True,
                       input=source.encode())
        return {"LD_PRELOAD": str(library)}

    def start(self, *words, before=(), **options):
        """A run in the background, killed at the end of the attack."""
        process = subprocess.Popen(self.command(words, before), env=self.environment(), cwd="/",
                                   stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                                   stderr=subprocess.DEVNULL, **options)
        self.callback(process.wait)
        self.callback(process.kill)
        return process

    def run(self, *words, before=(), timeout=20, variables=None, **options):
        """Runs the program after the words in `before`; returns result and standard output. A run
        that needs longer is a Fault."""
        options = {"stdin": subprocess.DEVNULL, "stdout": subprocess.PIPE,
                   "stderr": subprocess.DEVNULL, "cwd": "/", **options}
        with subprocess.Popen(self.command(words, before), start_new_session=True,
                              env=self.environment(**variables or {}), **options) as process:
            try:
                output, _ = process.communicate(timeout=timeout)
            except subprocess.TimeoutExpired as error:
                os.killpg(process.pid, signal.SIGKILL)
                raise Fault(f"hangs: {shown(words)}") from error
        return process.returncode, output

    def must(self, *words, result=0, **options):
        found, output = self.run(*words, **options)
        check(found == result, f"result {found} instead of {result}: {shown(words)}")
        return output

    def sections(self):
        return history.parse_history(self.ini.read_bytes())

    def log_of(self, identity, copy):
        """The only log of an event, which is beside the copy's folder or, after its end, in it."""
        logs = [log for log in (self.history / identity / history.LOG,
                                self.history / copy / identity / history.LOG) if log.exists()]
        check(len(logs) == 1, f"{len(logs)} logs of {identity}")
        return logs[0]

    def check_report(self, **options):
        """A report packs exactly what exists, without what begins with a dot."""
        self.must("-report", str(self.archive), **options)
        found, packed = contents(self.history, "[!.]*"), history.read_archive(self.archive)
        check(found == packed, f"archive {difference(found, packed)}")

    def record(self, *names, copy="C1"):
        """Whole events, with the installer's log and a copy."""
        for name in names:
            self.must("-start", name, "-Product", f"P{name}", "-l", str(self.source))
            self.must("-end", name, "-CopyName", copy, "-Result", "good")

    # What lies outside.

    def beside(self):
        mine = (self.history, self.archives)
        return {str(path): digest(path) for top in (self.root, self.outside, self.source)
                for path in [top, *sorted(top.rglob("*"))]
                if not any(path == own or own in path.parents for own in mine)}

    def watch(self):
        """From now on, what lies outside the history must stay as it is."""
        self.before = self.beside()

    def check_outside(self):
        after = self.beside()
        changed = [name for name in {*self.before, *after}
                   if self.before.get(name) != after.get(name)]
        check(not changed, f"changed outside: {changed}")

    # Snapshots of the whole root.

    def save(self, name):
        shutil.copytree(self.root, self.scratch / name, symlinks=True)

    def restore(self, name):
        shutil.rmtree(self.root)
        shutil.copytree(self.scratch / name, self.root, symlinks=True)

    def mount(self, folder, size):
        """Puts a small empty file system over a folder."""
        done = subprocess.run(["mount", "-t", "tmpfs", "-o", f"size={size}", "orx-test", folder],
                              check=False, stderr=subprocess.DEVNULL)
        if done.returncode != 0:
            raise Skipped("nothing can be mounted here")
        self.callback(subprocess.run, ["umount", "--lazy", folder], check=True)


def shown(words):
    return " ".join(repr(word) if len(word) < 80 else repr(word[:77]) + "..." for word in words)


class Skipped(Exception):
    """The attack is not possible on this machine."""


class Attack:
    def __init__(self, name, action, needs_root):
        self.name, self.action, self.needs_root = name, action, needs_root


ATTACKS = []


def attack(*rows, needs_root=False):
    """Adds the function below it to the table, under its own name with blanks. With rows (tuples
    whose first element is a name) it is one attack for each row, called with the row's other
    elements after the machine."""
    def add(function):
        name = function.__name__.replace("_", " ")
        for row in rows or [("",)]:
            ATTACKS.append(Attack(
                f"{name}: {row[0]}" if row[0] else name,
                lambda machine, row=row: function(machine, *row[1:]), needs_root))
        return function
    return add


def run_attack(program, action):
    """One attack on a machine of its own. What lies outside must be unchanged after it."""
    with Machine(program) as machine:
        action(machine)
        machine.check_outside()


class Outcome:
    """Runs the attacks, prints what does not hold under the attack's name, and counts."""

    def __init__(self):
        self.attempts = 0
        self.skipped = 0
        self.faults = []
        self.began = time.monotonic()

    def seconds(self):
        return time.monotonic() - self.began

    def attempt(self, name, action):
        """Runs one attack. Whatever it raises is reported under its name."""
        self.attempts += 1
        try:
            return action()
        except Fault as fault:
            self.note(name, fault)
        except Skipped as reason:
            self.skipped += 1
            print(f"skipped {name}: {reason}", flush=True)
        except Exception as error:  # an attack that ends otherwise is no reason to end the others
            last = error.__traceback__
            while last.tb_next:
                last = last.tb_next
            code = last.tb_frame.f_code
            self.note(name, f"{type(error).__name__}: {error} "
                      f"({Path(code.co_filename).name}, line {last.tb_lineno})")
        return None

    def note(self, name, fault):
        self.faults.append(name)
        if len(self.faults) <= 50:
            print(f"FAULT {name}: {str(fault)[:2000]}", flush=True)

    def summary(self):
        return (f"{self.attempts - self.skipped - len(self.faults)} held, {self.skipped} skipped, "
                f"{len(self.faults)} broken, {self.seconds():.0f} s")


def sample(outcome, cases, seconds, workers=None):
    """Runs cases, pairs of a name and an action on a worker, on all processors, for about so many
    seconds (0: all of them). Returns the names of those that ran."""
    workers = workers or [None] * (os.cpu_count() or 1)
    waiting = queue.Queue()
    for case in cases:
        waiting.put(case)
    until = time.monotonic() + seconds
    done = []

    def work(worker):
        while not seconds or time.monotonic() < until:
            try:
                name, action = waiting.get_nowait()
            except queue.Empty:
                return
            outcome.attempt(name, lambda: action(worker))
            done.append(name)
    in_threads([(work, worker) for worker in workers])
    return done


def in_threads(calls):
    """Makes all calls (function, arguments...) at once and waits for their end."""
    threads = [threading.Thread(target=function, args=words) for function, *words in calls]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()


def difference(old, new):
    """The names that differ, each with the first lines that do."""
    def lines(value):
        text = value.decode(errors="replace") if isinstance(value, bytes) else str(value)
        return text.splitlines() or [""]
    parts = []
    for name in sorted({*old, *new}):
        if old.get(name) != new.get(name):
            pairs = itertools.zip_longest(lines(old.get(name)), lines(new.get(name)))
            pair = next((pair for pair in pairs if pair[0] != pair[1]), ("", ""))
            parts.append(f"{name}: {pair[0]!s:.300} | {pair[1]!s:.300}")
    return "; ".join(parts)
