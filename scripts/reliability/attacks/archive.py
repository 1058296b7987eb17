"""Where a report writes its archive, and what it leaves there when it fails."""

import contextlib
import os
import stat
import subprocess
import time

import history
from harness import attack, injecting
from history import check
from planted import RUNS, listen, run_any

OLDER = b"an older archive"


def failure_line(path):
    return f" Failed to create file '{path}'\n".encode()


def success_line(path):
    return f"The file '{path}' is created successfully\n".encode()


def check_older_stays(machine, **options):
    """A report that cannot be completed leaves the older archive and nothing else."""
    before = os.listdir(machine.archives)
    output = machine.must("-report", str(machine.archive), result=3, **options)
    check(machine.archive.read_bytes() == OLDER, "older archive lost")
    check(os.listdir(machine.archives) == before, "litter")
    return output


def wait_for(holds, message):
    until = time.monotonic() + 10
    while not holds():
        check(time.monotonic() < until, message)
        time.sleep(0.002)


@attack()
def archive_in_the_history(machine):
    """It contains neither itself nor the older one, under any name."""
    for words in RUNS:
        run_any(machine, words)
    inside = machine.history / "C1" / "history.zip"
    for _ in range(2):
        machine.must("-report", str(inside))
        check(not [name for name in history.read_archive(inside) if "zip" in name], "holds itself")
    os.link(inside, machine.history / "other zip")
    machine.must("-report", str(machine.history / "C1/../C1/history.zip"))
    check(not [name for name in history.read_archive(inside) if "zip" in name], "holds the older")


@attack(
    ("a pipe", os.mkfifo),
    ("a socket", listen),
    ("a folder", os.mkdir),
    ("a link to a file", lambda path: path.symlink_to("../outside/file")),
    ("a link to nothing", lambda path: path.symlink_to("../outside/new")))
def archive_name_taken_by(machine, make):
    machine.record("7")
    make(machine.archive)
    before = machine.archive.lstat()
    output = machine.must("-report", str(machine.archive), result=3)
    check(output == failure_line(machine.archive), f"prints {output}")
    after = machine.archive.lstat()
    check((after.st_ino, after.st_mode) == (before.st_ino, before.st_mode), "replaced")
    check(os.listdir(machine.archives) == [machine.archive.name], "litter")


@attack(needs_root=True)
def archive_name_taken_by_a_device(machine):
    os.mknod(machine.archive, stat.S_IFCHR | 0o600, os.makedev(1, 3))
    machine.record("7")
    machine.must("-report", str(machine.archive), result=3)
    check(stat.S_ISCHR(machine.archive.lstat().st_mode), "device replaced")


@attack(*((name, name) for name in (
    "History.ini", "C1/../History.ini", "C1/7/ORXInstallEvent.Log", "open/ORXInstallEvent.Log",
    "Summary.txt", "C1/Summary.txt", "linked/ORXInstallEvent.Log", "hard link")))
def archive_in_place_of(machine, name):
    """Files that the history itself uses, also in other spellings."""
    machine.record("7")
    machine.must("-start", "open")
    (machine.history / "linked").symlink_to("C1/7")
    machine.must("-report", str(machine.archive))
    os.link(machine.ini, machine.history / "hard link")
    before = (machine.history / name).read_bytes()
    path = machine.history / name
    output = machine.must("-report", str(path), result=3)
    check(output == failure_line(path), f"prints {output}")
    check(path.read_bytes() == before, "replaced")


@attack()
def archive_is_its_owners_alone(machine):
    machine.record("7")
    machine.must("-report", str(machine.archive), preexec_fn=lambda: os.umask(0))
    check(stat.S_IMODE(machine.archive.stat().st_mode) == 0o600, "others can read it")


def start_archive(machine, archive):
    """Starts a report and returns its process when it has written a part of the archive."""
    before = os.listdir(archive.parent)

    def is_being_written():
        names = [name for name in os.listdir(archive.parent)
                 if name not in before or name == archive.name]
        with contextlib.suppress(FileNotFoundError):
            return any((archive.parent / name).stat().st_size > 1 << 20 for name in names)
    process = machine.start("-report", str(archive))
    wait_for(is_being_written, "writes no archive")
    return process


@attack()
def killed_report(machine):
    """Killed in the middle of the archive. What it leaves is in no later archive."""
    machine.record("7")
    (machine.history / "big").write_bytes(os.urandom(16 << 20))
    for archive in (machine.archive, machine.history / "C1/a.zip"):
        archive.write_bytes(OLDER)
        process = start_archive(machine, archive)
        process.kill()
        process.wait()
        check(archive.read_bytes() == OLDER, "older archive lost")
    machine.must("-report", str(machine.archive))
    check("C1/a.zip" in history.read_archive(machine.archive), "incomplete")


@attack()
def reports_to_one_name(machine):
    """The history changes between two reports that overlap. The last one stays."""
    machine.record("7")
    (machine.history / "big").write_bytes(os.urandom(8 << 20))
    processes = [start_archive(machine, machine.archive)]
    (machine.history / "C1/7/new").write_bytes(os.urandom(4 << 20))
    processes.append(machine.start("-report", str(machine.archive)))
    for process in processes:
        check(process.wait(20) == 0, "result of a report")
        check("big" in history.read_archive(machine.archive), "incomplete")
    check(os.listdir(machine.archives) == [machine.archive.name], "litter")


@attack(("at once", 64 << 10), ("near the end", 4 << 20))
def archive_over_the_file_size_limit(machine, limit):
    machine.record("7")
    (machine.history / "big").write_bytes(os.urandom(4 << 20))
    machine.archive.write_bytes(OLDER)
    output = check_older_stays(machine, before=("prlimit", f"--fsize={limit}"))
    check(output == success_line(machine.archive), f"prints {output}")


@attack(*((f"{room} bytes", room) for room in (0, 4 << 10, 64 << 10, 1 << 20)), needs_root=True)
def archive_on_a_full_disk(machine, room):
    """The disk of the archive has only that room."""
    machine.record("7")
    (machine.history / "big").write_bytes(os.urandom(2 << 20))
    machine.mount(machine.archives, "4m")
    machine.archive.write_bytes(OLDER)
    (machine.archives / "filler").write_bytes(bytes((4 << 20) - 4096 - room))
    check_older_stays(machine)


# Before a temporary file is opened again to write to it or to flush it, somebody replaces it by a
# link.
SWAP = """
#include <linux/fcntl.h>
#include <stdlib.h>
#include <string.h>
#include <sys/syscall.h>
#include <unistd.h>
int open(const char* path, int flags, int mode) {
  const char* beginning = getenv("TEMPORARY");
  if (strncmp(path, beginning, strlen(beginning)) == 0 && !(flags & O_CREAT)) {
    unlink(path);
    symlink(getenv("OUTSIDE"), path);
  }
  return syscall(SYS_openat, AT_FDCWD, path, flags, mode);
}
"""


@attack(("a collected copy", "root/ZEK/ORXHistory/C1/7/.", 0), ("the archive", "archives/.", 3))
def link_in_place_of_the_temporary_file_of(machine, beginning, result):
    machine.record("7")
    machine.archive.write_bytes(OLDER)
    machine.must("-report", str(machine.archive), result=result, variables={
        **machine.with_functions(SWAP), "TEMPORARY": f"{machine.scratch}/{beginning}",
        "OUTSIDE": str(machine.outside / "file")})
    links = [path for path in machine.scratch.rglob("[!.]*") if path.is_symlink()]
    check(not links, f"renamed: {links}")


@attack(("packed", "C1/7/growing", "read"), ("collected", "../../../setup.log", "sendfile"))
def file_that_grows_while_it_is(machine, name, call):
    """Somebody appends to it all the time, faster than it is read."""
    machine.record("7")
    path = machine.history / name
    writer = subprocess.Popen(["sh", "-c", f"while sleep 0.002; do echo >>'{path}'; done"])
    machine.callback(writer.wait)
    machine.callback(writer.kill)
    wait_for(path.exists, "does not grow")
    machine.must("-report", str(machine.archive), before=injecting(call, "delay_enter=200000"))
    writer.kill()
    machine.watch()
    entries = history.read_archive(machine.archive)
    check({"C1/7/growing", "C1/7/setup.log"} & set(entries), "not packed")


@attack(needs_root=True)
def containers_with_equal_process_numbers(machine):
    """Two reports collect one file at once."""
    machine.record("7")
    processes = []
    for call, microseconds in (("renameat2", 1000000), ("sendfile", 2000000)):
        archive = machine.archives / call
        before = ("unshare", "--pid", "--fork", *injecting(call, f"delay_enter={microseconds}"))
        processes.append((machine.start("-report", str(archive), before=before), archive))
        time.sleep(0.3)
    for process, archive in processes:
        check(process.wait(20) == 0, "result of a report")
        copy = history.read_archive(archive)["C1/7/setup.log"]
        check(copy == machine.source.read_bytes(), "a copy is cut")
