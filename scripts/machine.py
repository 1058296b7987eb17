"""A machine on which a program keeps its history, and the report of the promises that it breaks."""

import contextlib
import difflib
import itertools
import os
import signal
import subprocess
import tempfile
import time
import traceback
from pathlib import Path

import history
from history import Failure, check


class Skipped(Exception):
    """The case is not possible on this machine."""


class Machine(contextlib.ExitStack):
    """A program, and a folder that is its common application data folder. Without a folder it is a
    temporary one, in memory where possible: the order of the system calls is tested, not the disk.
    At its end it kills what was started and undoes what `callback` was given, the last first."""

    def __init__(self, *program, root=None):
        super().__init__()
        self.program = program
        if not root:
            parent = "/dev/shm" if os.access("/dev/shm", os.W_OK) else None
            self.scratch = Path(self.enter_context(
                tempfile.TemporaryDirectory(prefix="orx-", dir=parent)))
            self.scratch.chmod(0o755)
        self.root = root or self.scratch / "root"
        self.history = self.root / history.HISTORY
        self.ini = self.history / "History.ini"
        self.variables = {"ORX_COMMON_APPDATA": str(self.root)}
        self.options = {"stdin": subprocess.DEVNULL, "stdout": subprocess.DEVNULL,
                        "stderr": subprocess.DEVNULL, "cwd": "/"}

    def popen(self, arguments, before=(), variables=None, **options):
        """A process of the program, after the command in `before`."""
        return subprocess.Popen(
            [os.fsencode(word) for word in (*before, *self.program, *arguments)],
            env={**os.environ, **self.variables, **(variables or {})}, **self.options | options)

    def start(self, *arguments, **options):
        """A run in the background, killed at the machine's end."""
        return self.kill_at_end(self.popen(arguments, **options))

    def kill_at_end(self, process):
        self.callback(process.wait)
        self.callback(process.kill)
        return process

    def run(self, *arguments, timeout=20, **options):
        """The exit code and the standard output of a run. One that needs longer is a Failure."""
        options = {"stdout": subprocess.PIPE, **options}
        with self.popen(arguments, start_new_session=True, **options) as process:
            try:
                output, _ = process.communicate(timeout=timeout)
            except subprocess.TimeoutExpired as error:
                os.killpg(process.pid, signal.SIGKILL)
                raise Failure(f"hangs: {shown(arguments)}") from error
        return process.returncode, output

    def must(self, *arguments, code=0, **options):
        """The standard output of a run that must have that exit code."""
        found, output = self.run(*arguments, **options)
        check(found == code, f"exit code {found} instead of {code}: {shown(arguments)}")
        return output

    def sections(self):
        return history.parse_history(self.ini.read_bytes())


def shown(arguments):
    return " ".join(repr(word) if len(word) < 80 else repr(word[:77]) + "..." for word in arguments)


def contents(folder):
    """The bytes of all files below a folder by their paths there; none for a folder."""
    return {str(path.relative_to(folder)): path.read_bytes() if path.is_file() else b""
            for path in sorted(folder.rglob("*"))}


def check_equal(found, expected, message):
    """Compares texts or dictionaries of texts. The Failure has the lines that differ: those found
    with a "-", those expected with a "+"."""
    if found != expected:
        raise Failure(f"{message}: {difference(found, expected)}")


def difference(found, expected):
    if isinstance(found or expected, dict):
        found, expected = found or {}, expected or {}
        return "; ".join(f"{name}: {difference(found.get(name), expected.get(name))}"
                         for name in sorted({*found, *expected})
                         if found.get(name) != expected.get(name))
    lines = [(text.decode(errors="replace") if isinstance(text, bytes) else text or "").split("\n")
             for text in (found, expected)]
    changed = difflib.unified_diff(*lines, lineterm="", n=1)
    return "\n".join(line[:300] for line in itertools.islice(changed, 2, 60))  # without file names


class Outcome:
    """Runs cases, prints what does not hold under the name of its case, and counts."""

    def __init__(self):
        self.attempts = 0
        self.skipped = 0
        self.failures = 0
        self.began = time.monotonic()

    def attempt(self, name, action):
        """Runs one case. Whatever it raises is reported under its name."""
        self.attempts += 1
        try:
            return action()
        except Skipped as reason:
            self.skipped += 1
            print(f"skipped {name}: {reason}", flush=True)
        except Exception as error:  # a case that ends otherwise is no reason to end the others
            self.failures += 1
            text = error if isinstance(error, Failure) else traceback.format_exc(limit=-1)
            if self.failures <= 50:
                print(f"FAILED {name}: {str(text)[:2000]}", flush=True)
        return None

    def summary(self):
        return (f"{self.attempts - self.skipped - self.failures} held, {self.skipped} skipped, "
                f"{self.failures} broken, {time.monotonic() - self.began:.0f} s")
