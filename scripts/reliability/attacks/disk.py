"""Disks that fill up."""

import os

from harness import attack
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
