"""Histories that belong to others, and a history folder elsewhere."""

import os
import shutil
import stat

import history
from harness import AS_NOBODY, MARKER, NOBODY, RUNS, attack, digest, require_root
from history import check


@attack(("history folder", history.HISTORY), ("maker's folder", "ZEK"))
def linked_folder(machine, name):
    """Whoever came first may have made it: nothing is written through it, nothing packed."""
    elsewhere = machine.outside / "elsewhere"
    shutil.copytree(machine.outside / "folder", elsewhere / "ORXHistory")
    link = machine.root / name
    shutil.rmtree(link)
    link.symlink_to(elsewhere)
    machine.watch()
    for arguments in RUNS[:-1]:
        machine.must(*arguments, code=1)
    machine.report(code=3)


@attack()
def planted_section(machine):
    """The owner of a history has root collect files: his own, and one that only root may read."""
    require_root()
    secret, own = machine.outside / "file", machine.outside / "folder" / "own.log"
    own.write_text("the user's own words\n")
    os.chown(own, NOBODY, NOBODY)
    for path in (secret, own):
        path.chmod(0o600)
    machine.report_for_owner("-l", str(secret), "-t", str(own))
    check(MARKER not in b"".join(machine.packed().values()), "packed what its owner may not read")
    check("7/own.log" in machine.packed(), "a file of his own is missing")


@attack()
def foreign_history(machine):
    """The history folder of another user: root adds to it and leaves it to its owner."""
    require_root()
    os.chown(machine.history, NOBODY, NOBODY)
    os.chmod(machine.archives, 0o777)
    machine.must("-start", "first", **AS_NOBODY)
    os.chmod(machine.ini, 0o640)
    for arguments in RUNS:
        machine.run_checked(*arguments)
    status = machine.ini.stat()
    check((status.st_uid, stat.S_IMODE(status.st_mode)) == (NOBODY, 0o640), "owner or mode")
    machine.must("-end", "first", **AS_NOBODY)
    check(machine.sections()["first"]["Complete_Flag"] == "TRUE", "owner shut out")


@attack()
def read_only_history(machine):
    """A user who may only read: nothing changes, and no installer is stopped."""
    require_root()
    for arguments in RUNS:
        machine.run_checked(*arguments)
    machine.must("-start", "open")
    os.chmod(machine.archives, 0o777)
    machine.archive.unlink()
    inside = {path: digest(path) for path in machine.history.rglob("*")}
    for arguments in (*RUNS, ("-start", "new"), ("-end", "open", "-CopyName", "C9")):
        machine.run_checked(*arguments, **AS_NOBODY)
    check(machine.archive.exists(), "no archive")
    check(inside == {path: digest(path) for path in machine.history.rglob("*")}, "changed")
    os.chmod(machine.history, 0o700)
    for arguments in RUNS:
        machine.run_checked(*arguments, **AS_NOBODY)
    shutil.rmtree(machine.root / "ZEK")
    machine.watch()
    machine.must("-start", "new", code=1, **AS_NOBODY)
    check(not (machine.root / "ZEK").exists(), "made a folder")
