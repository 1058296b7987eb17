#!/usr/bin/env python3
"""Compares a report's archive with the history folder that it was made of.

    compare-archive.py ARCHIVE FOLDER

Names, order, kinds, attributes, local times and contents are looked at. Ends with 1 and a line for
each difference.
"""
import os
import stat
import sys
import time
import zipfile


def expected_entries(folder, prefix=b""):
    """The names below a folder, parents first, without links, special files and dot names."""
    for name in sorted(os.listdir(folder)):
        path = os.path.join(folder, name)
        mode = os.lstat(path).st_mode
        if name.startswith(b".") or not (stat.S_ISDIR(mode) or stat.S_ISREG(mode)):
            continue
        yield prefix + name, path, mode
        if stat.S_ISDIR(mode):
            yield from expected_entries(path, prefix + name + b"/")


def differences(archive, info, path, mode):
    is_folder = stat.S_ISDIR(mode)
    is_read_only = mode & 0o222 == 0
    attributes = 0x10 if is_folder else 0 if is_read_only else 0x80
    if info.external_attr != attributes:
        yield "attributes %#x instead of %#x" % (info.external_attr, attributes)
    written = time.localtime(os.lstat(path).st_mtime)[:6]
    if info.date_time != written[:5] + (written[5] // 2 * 2,):
        yield "time %s instead of %s" % (info.date_time, written)
    contents = b"" if is_folder else open(path, "rb").read()
    if archive.read(info) != contents:
        yield "other contents"


def main():
    archive = zipfile.ZipFile(sys.argv[1])
    faults = []
    if archive.testzip() is not None:
        faults.append("a checksum is wrong")
    expected = list(expected_entries(os.fsencode(sys.argv[2])))
    infos = archive.infolist()
    # The names have no encoding mark, and so are read as bytes of code page 437.
    names = [info.filename.encode("cp437") for info in infos]
    if names != [name for name, _, _ in expected]:
        faults.append("names %s instead of %s" % (names, [name for name, _, _ in expected]))
    else:
        for info, (name, path, mode) in zip(infos, expected):
            faults += ["%s: %s" % (name, fault) for fault in differences(archive, info, path, mode)]
    print("\n".join(faults) or "%d entries are as in the folder" % len(infos))
    return 1 if faults else 0


if __name__ == "__main__":
    sys.exit(main())
