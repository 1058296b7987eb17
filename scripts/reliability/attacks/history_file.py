"""The history file: its readers, its lock, what the file system refuses, a full disk."""

import fcntl
import os
import re
import stat
import time

from harness import attack, injecting
from history import check


@attack()
def full_disk(machine):
    """A small file system with less and less space left."""
    machine.mount(machine.root, "512k")
    machine.history.mkdir(parents=True)
    machine.watch()
    machine.must("-start", "7")
    filler, archive = machine.root / "filler", machine.root / "full.zip"
    for left in (0, 4096, 8192, 12288, 20480, 65536):
        filler.unlink(missing_ok=True)
        status = os.statvfs(machine.root)
        filler.write_bytes(bytes(max(status.f_bavail * status.f_bsize - left, 0)))
        old = machine.sections()
        for arguments in (
                ("-start", f"new{left}"), ("-logmessage", "7", "-message", "m" * 9000),
                ("-report", str(archive)), ("-end", "7"), ("-report", str(machine.archive))):
            check(machine.run(*arguments)[0] in (0, 3), f"exit code: {arguments}")
            new = machine.sections()
            check(set(old) <= set(new), "lost a section")
            old = new
        machine.packed()
    filler.unlink()
    archive.unlink(missing_ok=True)
    count = machine.count()
    machine.must("-start", "after")
    check(machine.count() == count + 1, "does not recover")
    machine.watch()


@attack("fchown", "fchmod")
def temporary_file_of_a_closed_history(machine, call):
    """Killed at that call, the run leaves its temporary file as everybody could have seen it."""
    machine.must("-start", "7")
    machine.ini.chmod(0o600)
    machine.run("-start", "8", before=injecting(call, "signal=SIGKILL"))
    left = list(machine.history.glob(".*.tmp"))
    check(left, "no temporary file")
    check(all(stat.S_IMODE(file.stat().st_mode) == 0o600 for file in left), "others could read it")


@attack(*((f"{call} {error}", call, error, mode) for call, error, mode in (
    ("fdatasync", "EINVAL", 0o660), ("fdatasync", "EOPNOTSUPP", 0o660),
    ("fdatasync", "ENOSYS", 0o660), ("fgetxattr", "EOPNOTSUPP", 0o660), ("fgetxattr", "EIO", 0o600),
    ("fchown", "EPERM", 0o600), ("fchmod", "EPERM", 0o600))))
def refused_by_the_file_system(machine, call, error, mode):
    """The run goes on, and what it cannot keep gives nobody more rights."""
    machine.must("-start", "7", before=injecting(call, f"error={error}"))
    machine.ini.chmod(0o660)
    machine.must("-start", "8", before=injecting(call, f"error={error}"))
    check(machine.count() == 2, "not recorded")
    check(stat.S_IMODE(machine.ini.stat().st_mode) == mode, "permissions")


@attack("Summary.txt", "C1/Summary.txt")
def interrupted_opening_of(machine, name):
    machine.record("7")
    machine.report(before=injecting("openat", "error=EINTR:when=1+2", "-P", machine.history / name))
    check(machine.packed().get(name), "no summary")


@attack()
def lock_that_is_never_freed(machine):
    """Any program that may open the folder can hold its lock."""
    machine.must("-start", "7")
    holder = os.open(machine.history, os.O_RDONLY)
    machine.callback(os.close, holder)
    fcntl.flock(holder, fcntl.LOCK_EX)
    began = time.monotonic()
    runs = [machine.start(*arguments) for arguments in (("-start", "8"), ("-unknown",))]
    codes = [run.wait(timeout=20) for run in runs]
    check(codes == [0, 2], f"exit codes {codes}")
    check(time.monotonic() - began < 15, "waits again")
    check(machine.count() == 2, "not recorded")


@attack(("first start", "-start", "7"), ("start", "-start", "9"), ("restart", "-start", "8"),
        ("end", "-end", "8", "-CopyName", "C1"))
def replacements_of_the_history_file(machine, *arguments):
    """One for a start. An end makes a second one, for the log's new path, after the log is closed
    and its folder moved: Windows moves no folder with an open file."""
    if arguments != ("-start", "7"):
        machine.must("-start", "8")
    trace = machine.scratch / "trace"
    machine.must(*arguments, before=("strace", "-f", "-y", "-o", trace, "-e",
                                     "trace=/^rename|^close$"))
    steps = re.findall(r'(?m)(History\.ini"|Log>|C1/8").*= 0$', trace.read_text())
    if "-end" in arguments:
        check(steps == ['History.ini"', "Log>", 'C1/8"', 'History.ini"'], f"steps {steps}")
    else:
        check(steps.count('History.ini"') == 1, f"steps {steps}")
