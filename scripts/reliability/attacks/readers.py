"""Archives of all kinds of histories, read by other programs and compared with the folder."""

import itertools
import os
import random
import stat
import subprocess
import time
import zipfile

from harness import attack
from history import check
from make_history import make_history
from planted import listen


def expected_entries(folder, prefix=b""):
    """The names below a folder, parents first, without links, special files and dot names."""
    for name in sorted(os.listdir(folder)):
        path = os.path.join(folder, name)
        mode = os.lstat(path).st_mode
        if not name.startswith(b".") and (stat.S_ISDIR(mode) or stat.S_ISREG(mode)):
            yield prefix + name, path
        if not name.startswith(b".") and stat.S_ISDIR(mode):
            yield from expected_entries(path, prefix + name + b"/")


def expected_properties(path):
    """Attributes, local time and contents of an entry."""
    status = os.lstat(path)
    written = time.localtime(status.st_mtime)[:6]
    date = written[:5] + (written[5] // 2 * 2,)
    if stat.S_ISDIR(status.st_mode):
        return 0x10, date, b""
    with open(path, "rb") as file:
        return 0x80 if status.st_mode & 0o222 else 0, date, file.read()


def compare(archive_path, folder):
    with zipfile.ZipFile(archive_path) as archive:
        check(archive.testzip() is None, "a checksum is wrong")
        expected = dict(expected_entries(os.fsencode(folder)))
        # The names have no encoding mark, and so are read as bytes of code page 437.
        names = [info.filename.encode("cp437") for info in archive.infolist()]
        check(names == list(expected), f"names {names} instead of {list(expected)}")
        for info, (name, path) in zip(archive.infolist(), expected.items()):
            found = (info.external_attr, info.date_time, archive.read(info))
            for value, wanted in zip(found, expected_properties(path)):
                check(value == wanted, f"{name}: {value!s:.80} instead of {wanted!s:.80}")


def nothing(_):
    pass


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


# The readers' result for an archive without entries is a warning.
@attack(("an empty history", nothing, 1), ("events with their files", events_with_their_files, 0),
        ("files of all kinds", files_of_all_kinds, 0))
def archive_is_read_by_others(machine, make, accepted):
    make(machine)
    machine.watch()
    for _ in range(2):  # what the first report collects, the second one packs again
        machine.must("-report", str(machine.archive), timeout=60)
        for command in (("unzip", "-tq"), ("zipinfo",)):
            result = subprocess.run([*command, machine.archive], check=False,
                                    stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
            check(result.returncode <= accepted, f"{command[0]}: {result.stderr}")
        compare(machine.archive, machine.history)


@attack()
def names_that_another_program_lists(machine):
    make_history(machine.root, 1)
    machine.watch()
    machine.must("-report", str(machine.archive))
    listed = subprocess.run(["zipinfo", "-1", machine.archive], check=True, capture_output=True,
                            text=True).stdout.split("\n")
    parts = itertools.accumulate(("Copy0", "0000", "ORXInstallEvent.Log"), "{}/{}".format)
    check(listed == [*parts, "Copy0/Summary.txt", "History.ini", "Summary.txt", ""],
          f"names {listed}")
