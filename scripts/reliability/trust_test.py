"""Tries to make the program change, follow or pack what lies outside the history folder.

All that is in the scratch folder beside the history is compared before and after, contents,
owners, permissions and times, and a marker in a file outside must get into no archive.
"""

import hashlib
import itertools
import json
import os
import random
import shutil
import socket
import stat
import subprocess

import common
from common import check

MARKER = b"what is outside stays outside"
NOBODY = 65534

# Below the history folder. The events are called 7 and the copy C1.
PLACES = ("History.ini", ".History.tmp", "Summary.txt", "7", "7/ORXInstallEvent.Log",
          "7/setup.log", "7/Summary.txt", "C1", "C1/Summary.txt", "C1/7",
          "C1/7/ORXInstallEvent.Log", "C1/7/setup.log", "stray")
RUNS = (("-start", "7"), ("-logmessage", "7", "-message", "text"), ("-end", "7"),
        ("-end", "7", "-CopyName", "C1"), ("-report",))

HOSTILE = ("..", "../outside", "../../../outside", "a/../../../../outside", ".", "./7", "7/.",
           "7/..", "...", ".. ", " ..", "..\\..", "C:\\outside", "\\\\host\\share", "History",
           "History.ini", "Summary.txt", ".History.tmp", ".copy-1.tmp", "-start", "[x]", "]", "=",
           "a=b", ";c", "#", "a\nb", "a\r\n[History]\r\nCount=99", "\t", "\x01\x7f", "a/b/c",
           "/", "//", "n" * 256, "n/" * 3000, "\udcc3(\udcff", "C1", "%s%n", "~", "$(id)", "*")


def digest(path):
    """What is to stay as it is: kind, owner, permissions, time of change, contents."""
    status = path.lstat()
    if path.is_symlink():
        content = os.readlink(path)
    else:
        content = hashlib.sha256(path.read_bytes()).hexdigest() if path.is_file() else ""
    time = 0 if stat.S_ISDIR(status.st_mode) and path.name == "ZEK" else status.st_mtime_ns
    return status.st_mode, status.st_uid, status.st_gid, time, content


class Trap:
    """A machine with things outside the history, and the check that they stay as they were."""

    def __init__(self, program):
        self.machine = common.Machine(program)
        self.outside = self.machine.scratch / "outside"
        self.archives = self.machine.scratch / "archives"
        self.archive = self.archives / "history.zip"
        self.source = self.machine.scratch / "setup.log"
        self.source.write_text("the installer's own words\n")
        self.archives.mkdir()
        (self.outside / "folder").mkdir(parents=True)
        for name in ("file", "folder/file"):
            (self.outside / name).write_bytes(MARKER + b"\n")
        self.machine.history.mkdir(parents=True)
        self.before = self.beside()

    def beside(self):
        mine = (self.machine.history, self.archives)
        return {str(path): digest(path)
                for top in (self.machine.root, self.outside, self.source)
                for path in [top, *sorted(top.rglob("*"))]
                if not any(path == own or own in path.parents for own in mine)}

    def check_outside(self):
        after = self.beside()
        changed = [name for name in {*self.before, *after}
                   if self.before.get(name) != after.get(name)]
        check(not changed, f"changed outside: {changed}")

    def check_archive(self):
        for name, data in common.check_archive(self.archive, True).items():
            check(MARKER not in data, f"packed from outside: {name}")

    def run(self, words, **options):
        """One run of any kind, and what holds whatever it met."""
        if words == ("-report",):
            words = ("-report", str(self.archive))
        elif words[0] == "-start":
            words = (*words, "-l", str(self.source))
        result, _ = self.machine.run(*words, timeout=10, **options)
        check(result in ((0, 3) if words[0] == "-report" else (0,)), f"result {result}: {words}")
        self.check_outside()
        if self.archive.exists():
            self.check_archive()

    def plant(self, place, kind):
        """Puts something in the place of what is there."""
        path = self.machine.history / place
        path.parent.mkdir(parents=True, exist_ok=True)
        if path.is_dir() and not path.is_symlink():
            shutil.rmtree(path)
        path.unlink(missing_ok=True)
        KINDS[kind](self, path)
        self.before = self.beside()

    def remove(self):
        self.machine.remove()


def listen(path):
    with socket.socket(socket.AF_UNIX) as listener:
        listener.bind(str(path))


KINDS = {
    "link to a file": lambda trap, path: path.symlink_to(trap.outside / "file"),
    "link to a folder": lambda trap, path: path.symlink_to(trap.outside / "folder"),
    "link to nothing": lambda trap, path: path.symlink_to(trap.outside / "new"),
    "relative link": lambda trap, path: path.symlink_to(
        os.path.relpath(trap.outside / "file", path.parent)),
    "link to itself": lambda trap, path: path.symlink_to(path),
    "pipe": lambda trap, path: os.mkfifo(path),
    "socket": lambda trap, path: listen(path),
    "folder": lambda trap, path: (path / "inside").mkdir(parents=True),
    "hard link": lambda trap, path: os.link(trap.outside / "file", path),
}
# A file with a second name outside that the program adds to, or empties, stays one file; and a
# second name of a file looks like its first to an archive.
REPLACED = ("History.ini", ".History.tmp")


def planted_cases():
    for place, kind, stage in itertools.product(PLACES, KINDS, range(len(RUNS))):
        if kind != "hard link" or place in REPLACED:
            yield place, kind, stage


def check_planted(program, place, kind, stage):
    trap = Trap(program)
    try:
        for number, words in enumerate(RUNS):
            if number == stage:
                trap.plant(place, kind)
            if kind == "hard link":  # the history's own text is the marker until it is replaced
                trap.check_archive = lambda: None
            trap.run(words)
    finally:
        trap.remove()


def check_hostile_names(program):
    """Each as an identity and as a copy's name; then the history must still be in order."""
    trap = Trap(program)
    os.symlink(trap.outside / "folder", trap.machine.history / "linked")
    names = (*HOSTILE, "linked", "linked/new", str(trap.outside), str(trap.outside / "new"))
    for number, name in enumerate(names):
        for words in (("-start", name), ("-logmessage", name, "-message", name),
                      ("-end", name, "-CopyName", f"copy{number}", "-Result", name),
                      ("-start", f"event{number}"),
                      ("-end", f"event{number}", "-CopyName", name)):
            trap.run(words)
    trap.run(("-report",))
    trap.machine.must("-start", "last")
    sections = trap.machine.sections()
    check(sections["History"]["Count"] == str(2 * len(names) + 1), "count")
    check("last" in sections, "last start")
    trap.remove()


def check_hostile_history(program):
    """A history file that names places outside as copies and identities."""
    trap = Trap(program)
    out = os.path.relpath(trap.outside, trap.machine.history)
    (trap.machine.history / "linked").symlink_to(trap.outside)
    text = "[History]\nCount=9\n"
    for name in (out, str(trap.outside), "linked", f"x/../{out}", "."):
        text += (f"[{name}]\nCopy_Name=\nLog_File_Name={trap.source}\n"
                 f"[{name}/folder]\nCopy_Name=\nLog_File_Name={trap.source}\n"
                 f"[in {name}]\nCopy_Name={name}\nLog_File_Name={trap.source}\n"
                 f"[folder {name}]\nCopy_Name={name}/folder\nTrace_File={trap.source}\n")
    trap.machine.ini.write_text(text)
    trap.run(("-report",))
    check(trap.archive.exists(), "no archive")
    trap.remove()


def check_archive_paths(program):
    """The archive in the history itself, and in the place of the history file."""
    trap = Trap(program)
    for words in RUNS:
        trap.run(words)
    inside = trap.machine.history / "C1" / "history.zip"
    for _ in range(2):
        trap.machine.must("-report", str(inside))
        check(not [name for name in common.check_archive(inside) if "zip" in name], "holds itself")
    (trap.machine.history / "alias.zip").symlink_to("History.ini")
    history = trap.machine.ini.read_bytes()
    for name in ("History.ini", "C1/../History.ini", "alias.zip"):
        trap.machine.must("-report", str(trap.machine.history / name), result=3)
        check(trap.machine.ini.read_bytes() == history, "history overwritten")
    trap.check_outside()
    trap.remove()


def check_linked_root(program):
    """An administrator may keep the history elsewhere: it is then what the link leads to."""
    trap = Trap(program)
    elsewhere = trap.machine.scratch / "elsewhere"
    trap.machine.history.rmdir()
    elsewhere.mkdir()
    trap.machine.history.symlink_to(elsewhere)
    trap.before = trap.beside()
    for words in RUNS:
        trap.run(words)
    check((elsewhere / "C1").is_dir() or (elsewhere / "7").is_dir(), "nothing recorded")
    check("History.ini" in common.check_archive(trap.archive), "nothing packed")
    trap.remove()


def as_nobody():
    os.setgroups([])
    os.setgid(NOBODY)
    os.setuid(NOBODY)


def check_foreign_history(program):
    """The history folder of another user: root adds to it and leaves it to its owner."""
    trap = Trap(program)
    os.chown(trap.machine.history, NOBODY, NOBODY)
    os.chmod(trap.archives, 0o777)
    trap.before = trap.beside()
    trap.machine.must("-start", "first", preexec_fn=as_nobody)
    os.chmod(trap.machine.ini, 0o640)
    for words in RUNS:
        trap.run(words)
    status = trap.machine.ini.stat()
    check((status.st_uid, stat.S_IMODE(status.st_mode)) == (NOBODY, 0o640), "owner or mode")
    trap.machine.must("-end", "first", preexec_fn=as_nobody)
    check(trap.machine.sections()["first"]["Complete_Flag"] == "TRUE", "owner shut out")
    trap.check_outside()
    trap.remove()


def check_read_only(program):
    """A user who may only read: nothing changes, and no installer is stopped."""
    trap = Trap(program)
    for words in RUNS:
        trap.run(words)
    trap.machine.must("-start", "open")
    os.chmod(trap.archives, 0o777)
    trap.archive.unlink()
    inside = {path: digest(path) for path in trap.machine.history.rglob("*")}
    for words in (*RUNS, ("-start", "new"), ("-end", "open", "-CopyName", "C9")):
        trap.run(words, preexec_fn=as_nobody)
    check(trap.archive.exists(), "no archive")
    check(inside == {path: digest(path) for path in trap.machine.history.rglob("*")}, "changed")
    os.chmod(trap.machine.history, 0o700)
    for words in RUNS:
        trap.run(words, preexec_fn=as_nobody)
    shutil.rmtree(trap.machine.root / "ZEK")
    trap.machine.must("-start", "new", result=1, preexec_fn=as_nobody)
    check(not (trap.machine.root / "ZEK").exists(), "made a folder")
    trap.remove()


def check_full_disk(program):
    """A small file system with less and less room."""
    trap = Trap(program)
    root = trap.machine.root
    shutil.rmtree(root / "ZEK")
    if subprocess.run(["mount", "-t", "tmpfs", "-o", "size=512k", "orx-test", str(root)],
                      check=False, stderr=subprocess.DEVNULL).returncode != 0:
        print("skipped: the full disk, as nothing can be mounted here")
        trap.remove()
        return
    try:
        trap.machine.must("-start", "7")
        filler = root / "filler"
        for room in (0, 4096, 8192, 12288, 20480, 65536):
            filler.unlink(missing_ok=True)
            left = os.statvfs(root).f_bavail * os.statvfs(root).f_bsize
            filler.write_bytes(bytes(max(left - room, 0)))
            old = trap.machine.sections()
            for words in (("-start", f"new{room}"), ("-logmessage", "7", "-message", "m" * 9000),
                          ("-report", str(root / "full.zip")), ("-end", "7"),
                          ("-report", str(trap.archive))):
                check(trap.machine.run(*words)[0] in (0, 3), f"result: {words}")
                new = trap.machine.sections()
                check(set(old) <= set(new), "lost a section")
                old = new
            common.check_archive(trap.archive)
        filler.unlink()
        (root / "full.zip").unlink(missing_ok=True)
        count = int(trap.machine.sections()["History"]["Count"])
        trap.machine.must("-start", "roomy")
        check(trap.machine.sections()["History"]["Count"] == str(count + 1), "does not recover")
    finally:
        subprocess.run(["umount", str(root)], check=True)
        trap.remove()


def check_hardening(program):
    def read(*options):
        return subprocess.run(["readelf", "-W", *options, str(program)], check=True,
                              capture_output=True, text=True).stdout
    dynamic, segments = read("-d"), read("-l")
    check("Flags: NOW PIE" in dynamic and "BIND_NOW" in dynamic, "no PIE, or not bound at start")
    check("GNU_RELRO" in segments, "no RELRO")
    check(any("GNU_STACK" in line and " RW " in line for line in segments.splitlines()),
          "stack can be executed")
    check("RPATH" not in dynamic and "RUNPATH" not in dynamic and "TEXTREL" not in dynamic,
          "RPATH or TEXTREL")
    check("__stack_chk_fail" in read("--dyn-syms"), "no stack protector")
    # Where the compiler can tell that no call needs it, the program holds no trace of it.
    commands = json.loads((program.parent / "compile_commands.json").read_text())
    check(all("-D_FORTIFY_SOURCE=2" in command["command"] and " -O" in command["command"]
              for command in commands), "compiled without FORTIFY")


ROOT_CASES = {"foreign history": check_foreign_history, "read-only history": check_read_only,
              "full disk": check_full_disk}
CASES = {"hardening": check_hardening, "hostile names": check_hostile_names,
         "hostile history": check_hostile_history, "archive paths": check_archive_paths,
         "linked root": check_linked_root}


def main():
    parser = common.arguments(__doc__, "for a sample of the planted links; the rest runs whole")
    options = parser.parse_args()
    outcome = common.Outcome()
    for name, case in CASES.items():
        outcome.attempt(name, lambda case=case: case(options.program))
    for name, case in ROOT_CASES.items():
        if os.geteuid() == 0:
            outcome.attempt(name, lambda case=case: case(options.program))
        else:
            print(f"skipped: {name}, as only root can be another user or mount")
    planted = list(planted_cases())
    random.Random(1).shuffle(planted)
    began = outcome.seconds()
    done = 0
    for case in planted:
        if options.seconds and outcome.seconds() - began > options.seconds:
            break
        outcome.attempt(", ".join(map(str, case)),
                        lambda case=case: check_planted(options.program, *case))
        done += 1
    print(f"{done} of {len(planted)} things planted, {outcome.seconds():.0f} s")
    outcome.end()


if __name__ == "__main__":
    main()
