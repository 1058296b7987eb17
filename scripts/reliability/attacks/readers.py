"""Archives of all kinds of histories, read by other programs and compared with the folder."""

import os
import random
import subprocess
import time

from harness import attack
from history import check
from machine import check_equal
from make_history import make_history
from planted import listen


def events_with_their_files(machine):
    make_history(machine.root, 200, collect=True)


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
        ("events with their files", events_with_their_files, 0))
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
