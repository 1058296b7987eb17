"""The archive: who can read it, where a report writes it, and what it leaves when it fails."""

import contextlib
import os
import random
import stat
import subprocess
import time

import history
from harness import OLDER, RUNS, attack, injecting, require_root, wait_for
from history import check
from machine import check_equal
from make_history import make_history
from planted import KINDS, listen


def failing_report(machine, path, **options):
    """The output of a report that fails. It replaces nothing and leaves no new file."""
    def state():
        data = path.read_bytes() if path.is_file() else None
        return path.lstat().st_mode, data, sorted(os.listdir(path.parent))
    before = state()
    output = machine.must("-report", str(path), code=3, **options)
    check(state() == before, "replaced, or leftover files")
    return output


def check_refused(machine, path):
    output = failing_report(machine, path)
    check(output == f" Failed to create file '{path}'\n".encode(), f"prints {output}")


@attack()
def archive_in_the_history(machine):
    """It contains neither itself nor the older one, under any name."""
    for arguments in RUNS:
        machine.run_checked(*arguments)
    inside = machine.history / "C1" / "history.zip"
    for name in ("C1/history.zip", "C1/history.zip", "C1/../C1/history.zip"):
        machine.must("-report", str(machine.history / name))
        check(not [entry for entry in history.read_archive(inside) if "zip" in entry],
              "contains itself or the older one")
        (machine.history / "other zip").unlink(missing_ok=True)
        os.link(inside, machine.history / "other zip")


@attack(*(kind for kind in KINDS if kind != "hard link"), "device")
def archive_name_taken_by(machine, kind):
    machine.record("7")
    if kind == "device":
        require_root()
        os.mknod(machine.archive, stat.S_IFCHR | 0o600, os.makedev(1, 3))
    else:
        KINDS[kind](machine.archive, machine.outside)
    check_refused(machine, machine.archive)


@attack("History.ini", "C1/../History.ini", "C1/7/ORXInstallEvent.Log", "open/ORXInstallEvent.Log",
        "Summary.txt", "C1/Summary.txt", "linked/ORXInstallEvent.Log", "hard link")
def archive_in_place_of(machine, name):
    """Files that the history itself uses, also in other spellings."""
    machine.record("7")
    machine.must("-start", "open")
    (machine.history / "linked").symlink_to("C1/7")
    machine.report()
    os.link(machine.ini, machine.history / "hard link")
    check_refused(machine, machine.history / name)


@attack()
def archive_is_its_owners_alone(machine):
    machine.record("7")
    machine.report(umask=0)
    check(stat.S_IMODE(machine.archive.stat().st_mode) == 0o600, "others can read it")


def record_much(machine, megabytes):
    """An event, and so much that does not pack."""
    machine.record("7")
    (machine.history / "big").write_bytes(os.urandom(megabytes << 20))


def start_archive(machine, archive):
    """Starts a report and returns its process when it has written a part of the archive."""
    def is_being_written():
        with contextlib.suppress(FileNotFoundError):  # the temporary file gets its name
            return any(file.stat().st_size > 1 << 20 for file in archive.parent.iterdir())
    process = machine.start("-report", str(archive))
    wait_for(is_being_written, "writes no archive")
    return process


@attack()
def killed_report(machine):
    """Killed in the middle of the archive. What it leaves is in no later archive."""
    record_much(machine, megabytes=16)
    for archive in (machine.archive, machine.history / "C1/a.zip"):
        archive.write_bytes(OLDER)
        process = start_archive(machine, archive)
        process.kill()
        process.wait()
        check(archive.read_bytes() == OLDER, "older archive lost")
    machine.check_report()


@attack()
def reports_to_one_name(machine):
    """The history changes between two reports that overlap. The last one stays."""
    record_much(machine, megabytes=8)
    processes = [start_archive(machine, machine.archive)]
    (machine.history / "C1/7/new").write_bytes(os.urandom(4 << 20))
    processes.append(machine.start("-report", str(machine.archive)))
    for process in processes:
        check(process.wait(20) == 0, "exit code of a report")
        check("big" in machine.packed(), "incomplete")
    check(os.listdir(machine.archives) == [machine.archive.name], "leftover files")


@attack(("at once", 64 << 10), ("near the end", 4 << 20))
def archive_over_the_file_size_limit(machine, limit):
    record_much(machine, megabytes=4)
    machine.archive.write_bytes(OLDER)
    output = failing_report(machine, machine.archive, before=("prlimit", f"--fsize={limit}"))
    check(output == f"The file '{machine.archive}' is created successfully\n".encode(),
          f"prints {output}")


@attack(*((f"{left} bytes", left) for left in (0, 4 << 10, 64 << 10, 1 << 20)))
def archive_on_a_full_disk(machine, left):
    """The older archive fills the disk, but for so much."""
    record_much(machine, megabytes=2)
    machine.mount(machine.archives, "4m")
    machine.archive.write_bytes(bytes((4 << 20) - left))
    failing_report(machine, machine.archive)


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
def link_in_place_of_the_temporary_file_of(machine, beginning, code):
    machine.record("7")
    machine.archive.write_bytes(OLDER)
    machine.report(code=code, variables={
        **machine.with_functions(SWAP), "TEMPORARY": f"{machine.scratch}/{beginning}",
        "OUTSIDE": str(machine.outside / "file")})
    links = [path for path in machine.scratch.rglob("[!.]*") if path.is_symlink()]
    check(not links, f"renamed: {links}")


@attack(("packed", "C1/7/appended", "read"), ("collected", "../../../setup.log", "sendfile"))
def file_that_grows_while_it_is(machine, name, call):
    """Somebody appends to it all the time, faster than it is read."""
    machine.record("7")
    path = machine.history / name
    writer = machine.kill_at_end(subprocess.Popen(
        ["sh", "-c", f"while sleep 0.002; do echo >>'{path}'; done"]))
    wait_for(path.exists, "does not grow")
    machine.report(before=injecting(call, "delay_enter=200000"))
    writer.kill()
    machine.watch()
    check({"C1/7/appended", "C1/7/setup.log"} & set(machine.packed()), "not packed")


@attack()
def file_that_is_cut_while_it_is_collected(machine):
    machine.record("7")
    report = machine.start("-report", str(machine.archive),
                           before=injecting("sendfile", "delay_enter=300000"))
    wait_for(lambda: list(machine.history.glob("C1/7/.*")), "copies nothing")
    machine.source.write_text("")
    machine.watch()
    check(report.wait(20) == 0, "exit code of the report")
    check("C1/7/setup.log" in machine.packed(), "not packed")


@attack()
def containers_with_equal_process_numbers(machine):
    """Two reports collect one file at once."""
    require_root()
    machine.record("7")
    processes = {}
    for call, microseconds in (("renameat2", 1000000), ("sendfile", 2000000)):
        before = ("unshare", "--pid", "--fork", *injecting(call, f"delay_enter={microseconds}"))
        archive = machine.archives / call
        processes[archive] = machine.start("-report", str(archive), before=before)
        time.sleep(0.3)
    for archive, process in processes.items():
        check(process.wait(20) == 0, "exit code of a report")
        copy = history.read_archive(archive)["C1/7/setup.log"]
        check(copy == machine.source.read_bytes(), "a copy is cut")


def files_of_all_kinds(machine):
    make_history(machine.root, 3)
    folder = machine.history
    (folder / "none.txt").touch()
    (folder / "large.bin").write_bytes(random.Random(1).randbytes(5_000_000))
    (folder / "bytes \udcff \u00fc.txt").write_text("text")
    (folder / "read-only.txt").write_text("text")
    (folder / "read-only.txt").chmod(0o444)
    for name, date in (("old", (1999, 12, 31, 23, 59, 59)), ("summer", (2024, 7, 1, 12, 0, 1))):
        (folder / name).write_text("text")
        moment = time.mktime((*date, 0, 0, -1))
        os.utime(folder / name, (moment, moment))
    (folder / "empty folder").mkdir()
    (folder / ".hidden").mkdir()
    (folder / ".hidden/inner.txt").write_text("text")
    os.mkfifo(folder / "pipe")
    listen(folder / "socket")
    (folder / "link").symlink_to("/etc")


# The readers' exit code for an archive without entries is that of a warning.
@attack(("an empty history", lambda _: None, 1), ("files of all kinds", files_of_all_kinds, 0),
        ("events with their files",
         lambda machine: make_history(machine.root, 200, collect=True), 0))
def archive_is_read_by_others(machine, make, accepted):
    make(machine)
    machine.watch()
    for _ in range(2):  # what the first report collects, the second one packs again
        machine.check_report(timeout=60)
        for command in (("unzip", "-tq"), ("zipinfo",)):
            result = subprocess.run([*command, machine.archive], check=False,
                                    stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
            check(result.returncode <= accepted, f"{command[0]}: {result.stderr}")


@attack()
def names_that_another_program_lists(machine):
    make_history(machine.root, 1)
    machine.watch()
    machine.report()
    listed = subprocess.run(["zipinfo", "-1", machine.archive], check=True, capture_output=True,
                            text=True).stdout
    check_equal(listed, "Copy0\nCopy0/0000\nCopy0/0000/ORXInstallEvent.Log\nCopy0/Summary.txt\n"
                "History.ini\nSummary.txt\n", "names")
