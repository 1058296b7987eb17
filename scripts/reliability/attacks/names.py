"""Identities, copy names and history files that lead out of the history folder."""

import os

from harness import attack
from history import check

HOSTILE = ("..", "../outside", "../../../outside", "a/../../../../outside", ".", "./7", "7/.",
           "7/..", "...", ".. ", " ..", "..\\..", "C:\\outside", "\\\\host\\share", "History",
           "History.ini", "Summary.txt", ".History.tmp", ".copy-1.tmp", "-start", "[x]", "]", "=",
           "a=b", ";c", "#", "a\nb", "a\r\n[History]\r\nCount=99", "\t", "\x01\x7f", "a/b/c",
           "/", "//", "n" * 256, "n/" * 3000, "\udcc3(\udcff", "C1", "%s%n", "~", "$(id)", "*")

PATH = "x\n[History]\nCount=99"
LONG = "v" * 65536


@attack()
def hostile_names(machine):
    """Each as an identity and as a copy's name; then the history must still be in order."""
    (machine.outside / "folder" / "inside").mkdir()
    machine.watch()
    os.symlink(machine.outside / "folder", machine.history / "linked")
    names = (*HOSTILE, "linked", "linked/new", "linked/inside", str(machine.outside),
             str(machine.outside / "new"))
    for number, name in enumerate(names):
        event = f"event{number}"
        machine.run_checked("-start", name, "-Path", PATH, "-Command", LONG)
        machine.run_checked("-logmessage", name, "-message", LONG)
        machine.run_checked("-end", name, "-CopyName", f"copy{number}", "-Result", LONG)
        machine.run_checked("-start", event)
        machine.run_checked("-end", event, "-CopyName", name)
    machine.run_checked("-report")
    machine.must("-start", "last")
    check(machine.count() == 2 * len(names) + 1, "count")
    sections = machine.sections()
    check("last" in sections, "last start")
    for name in names:
        keys = sections[name.replace("\r\n", " ").replace("\n", " ").strip()]
        check((keys["Path"], keys["Command_Line"], keys["Result"]) ==
              ("x [History] Count=99", LONG, LONG), f"values of {name!r}")


@attack()
def hostile_history(machine):
    """A history file whose copies and identities lead out."""
    out = os.path.relpath(machine.outside, machine.history)
    (machine.history / "linked").symlink_to(machine.outside)
    text = "[History]\nCount=9\n"
    for name in (out, str(machine.outside), "linked", f"x/../{out}", "."):
        text += (f"[{name}]\nCopy_Name=\nLog_File_Name={machine.source}\n"
                 f"[{name}/folder]\nCopy_Name=\nLog_File_Name={machine.source}\n"
                 f"[in {name}]\nCopy_Name={name}\nLog_File_Name={machine.source}\n"
                 f"[folder {name}]\nCopy_Name={name}/folder\nTrace_File={machine.source}\n")
    machine.ini.write_text(text)
    machine.run_checked("-report")
    check(machine.archive.exists(), "no archive")
