"""What the reliability scripts share: scratch histories, runs of the program, and strict readers
of what the program leaves."""

import argparse
import os
import re
import shutil
import subprocess
import sys
import tempfile
import time
import zipfile
import zlib
from pathlib import Path

REPOSITORY = Path(__file__).resolve().parents[2]
PROGRAM = REPOSITORY / "build/release/ORXInstallEventLog"

# The keys of an event that has had a start, in the order of the file.
EVENT_KEYS = ("Event_ID", "Command_Line", "Start_Time", "End_Time", "Action", "Type", "Product",
              "Version", "Service_Level", "Path", "Copy_Name", "Complete_Flag", "Log_File_Name",
              "Trace_File", "Response_File", "Event_Log_File", "Result")
TIME = re.compile(r"\d{8} \d\d:\d\d:\d\d")


class Fault(Exception):
    """A promise that did not hold."""


def check(holds, message):
    if not holds:
        raise Fault(message)


def parse_history(data):
    """The sections of a history file as the program writes it, in file order, or a Fault: every
    line is a section or a key, no name comes twice, and the last line is whole."""
    check(data.endswith(b"\n"), "history does not end with a line end")
    sections = {}
    keys = None
    for line in data.decode("utf-8", "surrogateescape")[:-1].split("\n"):
        if line.startswith("[") and line.endswith("]"):
            check(line[1:-1] not in sections, f"section twice: {line!r}")
            keys = sections[line[1:-1]] = {}
            continue
        key, sign, value = line.partition("=")
        check(sign and keys is not None, f"neither section nor key: {line!r}")
        check(key in EVENT_KEYS or key == "Count", f"strange key: {line!r}")
        check(key not in keys, f"key twice: {line!r}")
        keys[key] = value
    check(re.fullmatch(r"\d+", sections.get("History", {}).get("Count", "")), "no Count")
    return sections


def without_times(sections):
    """The sections with each time stamp replaced by one word, to be compared."""
    return {name: {key: TIME.sub("TIME", value) if key.endswith("_Time") else value
                   for key, value in keys.items()} for name, keys in sections.items()}


def check_archive(path, has_blank_names=False):
    """The entries of a valid archive of a history; no name in it begins with a dot. White space
    around a name is cut off, so that two files with names of nothing else may become one."""
    try:
        with zipfile.ZipFile(path) as archive:
            check(archive.testzip() is None, f"damaged entry: {archive.testzip()}")
            names = archive.namelist()
            entries = {name: archive.read(name) for name in names}
    except (zipfile.BadZipFile, OSError, ValueError, EOFError, zlib.error) as error:
        raise Fault(f"no valid archive: {error}") from error
    check(has_blank_names or len(entries) == len(names), "an entry twice")
    for name in names:
        check(not any(part.startswith(".") for part in name.split("/")), f"litter: {name}")
    return entries


class Machine:
    """A scratch folder with a history in it. In memory, where it can be: what is tested is the
    order of the calls and not the disk."""

    def __init__(self, program):
        place = "/dev/shm" if os.access("/dev/shm", os.W_OK) else None
        self.scratch = Path(tempfile.mkdtemp(prefix="orx-", dir=place))
        self.scratch.chmod(0o755)
        # A copy, as another user may not be able to reach the build's folder.
        self.program = self.scratch / "program"
        shutil.copy(program, self.program)
        self.root = self.scratch / "root"
        self.history = self.root / "ZEK" / "ORXHistory"
        self.ini = self.history / "History.ini"
        self.root.mkdir()

    def remove(self):
        shutil.rmtree(self.scratch)

    def save(self, name):
        shutil.copytree(self.root, self.scratch / name, symlinks=True)

    def restore(self, name):
        shutil.rmtree(self.root)
        shutil.copytree(self.scratch / name, self.root, symlinks=True)

    def run(self, *words, before=(), timeout=20, **options):
        """Runs the program, behind the words in `before`; gives result and standard output."""
        environment = {**os.environ, "ORX_COMMON_APPDATA": str(self.root)}
        command = [*before, str(self.program), *words]
        try:
            done = subprocess.run([os.fsencode(word) for word in command], env=environment,
                                  stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                                  stderr=subprocess.DEVNULL, cwd="/", timeout=timeout,
                                  check=False, **options)
        except subprocess.TimeoutExpired as error:
            raise Fault(f"hangs: {words}") from error
        return done.returncode, done.stdout

    def must(self, *words, result=0, **options):
        found = self.run(*words, **options)[0]
        check(found == result, f"result {found} instead of {result}: {words}")

    def sections(self):
        return parse_history(self.ini.read_bytes())


class Outcome:
    """Collects the faults of a script and ends it."""

    def __init__(self):
        self.checks = 0
        self.faults = []
        self.began = time.monotonic()

    def seconds(self):
        return time.monotonic() - self.began

    def attempt(self, name, action):
        """Runs one check; a Fault in it is noted under the name."""
        self.checks += 1
        try:
            return action()
        except Fault as fault:
            self.faults.append((name, fault))
            if len(self.faults) <= 20:
                print(f"FAULT {name}: {fault}", flush=True)
            return None

    def end(self):
        print(f"{self.checks - len(self.faults)} passed, {len(self.faults)} failed")
        sys.exit(1 if self.faults else 0)


def arguments(description, seconds_help):
    parser = argparse.ArgumentParser(description=description)
    parser.add_argument("--program", type=Path, default=PROGRAM)
    parser.add_argument("--seconds", type=float, default=0, help=seconds_help)
    return parser
