"""The history file and the archive, as all scripts read and write them."""

import re
import zipfile
import zlib
from pathlib import Path

REPOSITORY = Path(__file__).resolve().parents[1]
PROGRAM = REPOSITORY / "build/release/ORXInstallEventLog"
READER = PROGRAM.with_name("orxhistory")
HISTORY = Path("ZEK", "ORXHistory")  # below the common application data folder
LOG = "ORXInstallEvent.Log"

# The keys of an event that was started, in the order of the file.
EVENT_KEYS = tuple(re.findall(
    r'"(\w+)"', (REPOSITORY / "tests/support/event_keys.inc").read_text()))
TIME = re.compile(r"\d{8} \d\d:\d\d:\d\d")


class Failure(Exception):
    """A promise that does not hold."""


def check(holds, message):
    if not holds:
        raise Failure(message)


def event(identity, log="", **keys):
    """An event's keys as a start leaves them, with some other values."""
    values = dict.fromkeys(EVENT_KEYS, "")
    return values | {"Event_ID": identity, "Copy_Name": "(Unknown)", "Complete_Flag": "FALSE",
                     "Event_Log_File": log} | keys


def format_history(sections):
    return "".join(f"[{name}]\n" + "".join(f"{key}={value}\n" for key, value in keys.items())
                   for name, keys in sections.items())


def parse_history(data, has_complete_events=False):
    """The sections of a history file as the program writes it, in file order. Failures are a line
    that is neither section nor key, a repeated name, a cut last line and, on request, an event
    without all keys of a start."""
    check(data.endswith(b"\n"), "the history does not end with a line end")
    sections = {}
    keys = None
    for line in data.decode("utf-8", "surrogateescape")[:-1].split("\n"):
        if line.startswith("[") and line.endswith("]"):
            check(line[1:-1] not in sections, f"section twice: {line!r}")
            keys = sections[line[1:-1]] = {}
            continue
        key, sign, value = line.partition("=")
        check(sign and keys is not None, f"neither section nor key: {line!r}")
        check(key in EVENT_KEYS or key == "Count", f"unknown key: {line!r}")
        check(key not in keys, f"key twice: {line!r}")
        keys[key] = value
    check(re.fullmatch(r"\d+", sections.get("History", {}).get("Count", "")), "no Count")
    for name, keys in sections.items():
        check(not has_complete_events or name == "History" or set(keys) == set(EVENT_KEYS),
              f"part of section {name}")
    return sections


def changed(sections, *changes):
    """The sections after some keys, by section, were set. Setting an identity is a start, which
    counts."""
    result = {name: dict(keys) for name, keys in sections.items()}
    for name, keys in changes:
        result.setdefault(name, {}).update(keys)
        if "Event_ID" in keys:
            count = result.setdefault("History", {"Count": "0"})
            count["Count"] = str(int(count["Count"]) + 1)
    return result


def archive_entries(path, encoding="utf-8"):
    """The entries of a valid archive in its order: name, zipfile's properties, contents."""
    try:
        with zipfile.ZipFile(path) as archive:
            # The names have no mark for their encoding, and so are decoded as code page 437.
            return [(info.filename.encode("cp437").decode(encoding, "surrogateescape"), info,
                     archive.read(info)) for info in archive.infolist()]
    except (zipfile.BadZipFile, OSError, ValueError, EOFError, zlib.error) as error:
        raise Failure(f"no valid archive: {error}") from error


def read_archive(path, has_blank_names=False):
    """The contents of an archive's entries by name; no part of a name begins with a dot. The
    program cuts blanks around a name off, so that two names of nothing else are one."""
    packed = archive_entries(path)
    entries = {name: data for name, _, data in packed}
    check(has_blank_names or len(entries) == len(packed), "an entry twice")
    for name in entries:
        check(not re.search(r"(^|/)\.", name), f"temporary file packed: {name}")
    return entries
