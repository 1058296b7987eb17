"""Disks that fill up."""

import os

import history
from harness import attack
from history import check


@attack(needs_root=True)
def full_disk(machine):
    """A small file system with less and less room."""
    machine.mount(machine.root, "512k")
    machine.history.mkdir(parents=True)
    machine.watch()
    machine.must("-start", "7")
    filler = machine.root / "filler"
    for room in (0, 4096, 8192, 12288, 20480, 65536):
        filler.unlink(missing_ok=True)
        left = os.statvfs(machine.root).f_bavail * os.statvfs(machine.root).f_bsize
        filler.write_bytes(bytes(max(left - room, 0)))
        old = machine.sections()
        for words in (("-start", f"new{room}"), ("-logmessage", "7", "-message", "m" * 9000),
                      ("-report", str(machine.root / "full.zip")), ("-end", "7"),
                      ("-report", str(machine.archive))):
            check(machine.run(*words)[0] in (0, 3), f"result: {words}")
            new = machine.sections()
            check(set(old) <= set(new), "lost a section")
            old = new
        history.read_archive(machine.archive)
    filler.unlink()
    (machine.root / "full.zip").unlink(missing_ok=True)
    count = int(machine.sections()["History"]["Count"])
    machine.must("-start", "roomy")
    check(machine.sections()["History"]["Count"] == str(count + 1), "does not recover")
    machine.watch()
