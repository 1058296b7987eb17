#!/usr/bin/env python3
"""Runs the Windows program under Wine and the Linux program through the same histories.

    compare-windows.py WINDOWS_PROGRAM LINUX_PROGRAM SCRATCH_FOLDER

Exit codes, output, history files, reports, summaries and archives must be the same, but for
separators, line ends, times and what shows the machine itself. The readers beside the programs must
give the same answers for an archive. Ends with 1 and the differences.
WINEPREFIX names a Windows of its own: its history and its registry keys of the tool are replaced.
"""
import difflib
import json
import os
import re
import shutil
import subprocess
import sys
import time
import zipfile
from pathlib import Path

from history import HISTORY, REPOSITORY, check, parse_history

WINE = REPOSITORY / "scripts/wine.sh"
SOFTWARE = "HKEY_LOCAL_MACHINE\\SOFTWARE\\"
PRODUCTS = "Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products"
TOOL_KEYS = [SOFTWARE + "ZEK", SOFTWARE + "ODBC\\ODBCINST.INI", SOFTWARE + PRODUCTS]


class Side:
    """A program with its common application data folder, and a folder for an installer's files."""

    def __init__(self, command, separator, encoding, root, root_name, files, files_name):
        self.command = command
        self.encoding = encoding
        self.environment = dict(os.environ)
        self.separator = separator
        self.root_name, self.files_name = root_name, files_name
        self.files = files
        self.maker = root / "ZEK"
        self.history = root / HISTORY

    def reset(self):
        for folder in (self.history, self.files):
            shutil.rmtree(folder, ignore_errors=True)
        self.files.mkdir(parents=True)

    def start(self, arguments):
        beginning = self.files_name + self.separator
        return subprocess.Popen(
            self.command + [word.replace("{files}/", beginning) for word in arguments],
            env=self.environment, cwd=self.files, stdin=subprocess.DEVNULL,
            stdout=subprocess.PIPE, stderr=subprocess.STDOUT)

    def run(self, arguments):
        process = self.start(arguments)
        output = process.communicate()[0]
        return f"{arguments}\nresult {process.returncode}: {self.plain(output)}"

    def plain(self, data):
        """Text without what differs: the code page, the two folders, line ends, and times."""
        text = data.decode(self.encoding, "replace").replace("\r\n", "\n")
        text = text.replace(self.root_name, "{root}").replace(self.files_name, "{files}")
        text = re.sub(r"\{(root|files)\}[^\n']*", lambda m: m[0].replace("\\", "/"), text)
        return re.sub(r"\b\d{8} \d\d:\d\d:\d\d\b", "{time}", text)

    def contents(self, name, data):
        if name.endswith("History.ini"):
            return history_lines(self.plain(data))
        if name.endswith("ORXInstallEvent.Log"):
            return without_machine(self.plain(data))
        return self.plain(data)

    def tree(self):
        for path in sorted(self.history.rglob("*")):
            name = path.relative_to(self.history)
            yield (f"folder {name}" if path.is_dir() else
                   f"{name}:\n{self.contents(path.name, path.read_bytes())}")

    def archive(self):
        """Every entry, sorted: their order is the system's, but each comes after its folder."""
        path = self.files / "out.zip"
        if not path.exists():
            return
        with zipfile.ZipFile(path) as archive:
            entries = {}
            for info in archive.infolist():
                # The names have no mark for their code page, so that they come decoded as cp437.
                name = info.filename.encode("cp437").decode(self.encoding)
                assert self.separator == "/" or "/" not in name, name
                name = name.replace("\\", "/")
                assert "/" not in name or name.rsplit("/", 1)[0] in entries, name
                kind = "folder" if info.external_attr & 0x10 else "file"
                entries[name] = (f"{kind}, read-only {info.external_attr & 1}:\n"
                                 + self.contents(name, archive.read(info)))
        yield from (f"archive: {name}, {entries[name]}" for name in sorted(entries))


def history_lines(text):
    """Without blank lines between sections and blanks around a value: Wine leaves out those before
    it when it writes, Windows, by its documentation, only when it reads."""
    lines = re.sub(r"\n+", "\n", text).strip("\n")
    return re.sub(r"(?m)^([^=\n]*=)[ \t]*(.*?)[ \t]*$", r"\1\2", lines)


MACHINE_LABELS = re.compile(
    "(Computer Name       |OS                  |Type                |Service Pack        |"
    "Number of processors|CPU                 |Logged on User|Processes):")
MACHINE_TABLES = ("Group Name ", "Group    ", "Process ID ", "Service Name ")


def without_machine(report):
    """A report without the values and table rows that show the machine."""
    lines = []
    rules_to_rows = 0  # 1: the next rule is above rows; 2: among rows
    for line in report.split("\n"):
        is_rule = line.startswith("-----")
        if rules_to_rows == 2 and not is_rule:
            continue
        rules_to_rows = 2 if rules_to_rows == 1 and is_rule else 0
        if line.startswith(MACHINE_TABLES):
            rules_to_rows = 1
        label = MACHINE_LABELS.match(line)
        lines.append(label[0] if label else line)
    return "\n".join(lines)


# --- The registry ---


def limits_export():
    """All kinds of values, and texts and names at the limits. In the order of the names, as the
    registry keeps keys; Wine keeps values so too, Windows in the order of their writing. No key's
    whole path is longer than 260 characters: Wine opens none by the narrow calls, Windows does."""
    kinds = [
        ("a text", '"plain"'), ("b empty", '""'), ("c quoted", '"\\"a\\" \\\\ b"'),
        ("d number", "dword:0000002a"), ("e zero", "dword:00000000"),
        ("f top bit", "dword:ffffffff"), ("g expand", "hex(2):25,00,61,00,25,00,00,00"),
        ("h multi", "hex(7):61,00,00,00,62,00,00,00,00,00"), ("i binary", "hex:01,02,03"),
        ("j quad", "hex(b):01,00,00,00,00,00,00,00"),
        ("k two texts", "hex(1):61,00,00,00,62,00,00,00"),
        ("l 99 bytes", '"%s"' % ("x" * 99)), ("m 100 bytes", '"%s"' % ("x" * 100)),
        ("n" * 29, '"fills its field"'), ("o" * 255, '"longest name"'),
        ("p" * 256, '"ends the list"'), ("q", '"after the end"'),
    ]
    copies = SOFTWARE + "ZEK\\ORX\\InstalledCopies\\"
    version = [("Last Modified Date", '"20260102"'), ("Modification", "dword:00000003"),
               ("ProductCode", '"{%s}"' % ("C" * 44)), ("Release", "dword:00000005"),
               ("Service Level", '"Service Level 2"'), ("Version", "dword:00000009")]
    keys = [
        (SOFTWARE + PRODUCTS + "\\0A\\InstallProperties",
         [("DisplayName", '"%s"' % ("N" * 70)), ("DisplayVersion", '"1.2.3"'),
          ("InstallDate", '"20260101"'), ("InstallLocation", '"C:\\\\ZEK\\\\"'),
          ("Language", "dword:00000409"), ("Publisher", '"The ZEK makers"')]),
        (SOFTWARE + PRODUCTS + "\\0B\\InstallProperties", [("Publisher", '"zek"')]),
        (SOFTWARE + PRODUCTS + "\\0C", []),
        (SOFTWARE + "ODBC\\ODBCINST.INI\\An ZEK ORX driver", kinds),
        (SOFTWARE + "ODBC\\ODBCINST.INI\\ODBC Drivers",
         [("An ZEK ORX driver", '"Installed"'), ("Other ZEK orx", '"Installed"'),
          ("ZEK ORX without a key", "dword:00000001")]),
        (SOFTWARE + "ZEK\\ORX\\ORX Old\\CurrentVersion", version),
        (copies + "C1\\ADM_PROFILES\\ADM1", kinds[:2]),
        (copies + "C1\\CurrentVersion", version),
        (copies + "C1\\GLOBAL_PROFILE", kinds),
        (copies + "C1\\ORX " + "k" * 190 + "\\CurrentVersion", version),
        (copies + "C1\\ORX Server\\CurrentVersion", version),
        (copies + "C1\\ORXNone\\CurrentVersion", version),
        (copies + "C1\\PROFILES\\" + "i" * 200, kinds),
        (copies + "C1\\PROFILES\\ORX1", []),
        (copies + "no product", []),
    ]
    text = "Windows Registry Editor Version 5.00\n"
    for key, values in keys:
        text += "\n[%s]\n" % key + "".join('"%s"=%s\n' % value for value in values)
    return text.replace("\n", "\r\n").encode("utf-16")


def regedit(side, option, name, *arguments):
    """Runs it on a file of the installer's folder; a path of Linux would look like an option."""
    path = side.files_name + side.separator + name
    subprocess.run([WINE, "regedit", option, path, *arguments], check=True)


def load_registry(side, export):
    """Replaces the tool's keys by those of the export."""
    (side.files / "remove.reg").write_text(
        "REGEDIT4\n" + "".join(f"\n[-{key}]\n" for key in TOOL_KEYS), encoding="ascii")
    shutil.copy(export, side.files / "add.reg")
    for name in ("remove.reg", "add.reg"):
        regedit(side, "/S", name)


def export_registry(side, path):
    """Writes the tool's keys as the registry orders them."""
    text = ""
    for key in TOOL_KEYS:
        regedit(side, "/E", "part.reg", key)
        header, keys = (side.files / "part.reg").read_bytes().decode("utf-16").split("\r\n", 1)
        text = (text or header + "\r\n") + keys + "\r\n"
    path.write_bytes(text.encode("utf-16"))


# --- The histories ---

LONG = "".join(chr(ord("a") + i % 26) for i in range(300))
WHOLE_EVENT = [
    ["-start", "42", "-Product", "ORX Server Build 1907", "-Version", "9.5", "-ServiceLevel", "3",
     "-Type", "GUI", "-Action", "Install", "-Path", "C:\\ZEK\\ORX95", "-Command", "setup.exe /gui"],
    ["-logmessage", "42", "-message", "Copying files"],
    ["-logmessage", "42", "-message", ""],
    ["-end", "42", "-CopyName", "C1", "-Result", "Successful"],
]
REPORT = [["-report", "{files}/out.zip"]]
SCENARIOS = {
    "a whole event": WHOLE_EVENT + REPORT,
    "no event": [[], ["-help"], ["-report"], ["-x"], ["-start"], ["-start", ""]] + REPORT,
    "no history": REPORT,
    "repeated starts and ends": [
        ["-start", "1", "-Product", "first"], ["-start", "1", "-Type", "second"],
        ["-end", "1", "-CopyName", "C"], ["-end", "1", "-CopyName", "C"], ["-start", "1"],
        ["-logmessage", "1", "-message", "again"], ["-end", "1", "-CopyName", "C"],
        ["-start", "HISTORY"], ["-start", "2"], ["-end", "2", "-CopyName", "D"]] + REPORT,
    "no start": [
        ["-logmessage", "1", "-message", "lost"], ["-end", "2", "-Result", "r"],
        ["-end", "3", "-CopyName", "C", "-Action", "a", "-l", "{files}/none.log"]] + REPORT,
    "quotation marks and blanks": [
        ["-start", "an event", "-Product", '"quoted"', "-Type", "'single'", "-Path", '"half',
         "-Command", ' "C:\\a b\\setup.exe" "/x" ', "-Version", "  two  blanks  ",
         "-ServiceLevel", '""', "-Action", "a=b;c [x]"],
        ["-logmessage", "an event", "-message", ' "quoted" and \'single\' '],
        ["-start", "lines", "-Type", "one\ntwo", "-Path", "x\n[History]\nCount=99"],
        ["-start", "a;b=c", "-Action", "'"], ["-start", "[x]", "-Action", '"'],
        ["-end", "an event", "-CopyName", "a copy", "-Result", "\"it's\""]] + REPORT,
    "long values": [
        ["-start", "1", "-Product", LONG, "-Type", '"' + LONG + '"', "-Command", LONG * 20],
        ["-logmessage", "1", "-message", LONG * 20],
        ["-end", "1", "-CopyName", "C" * 60, "-Result", LONG, "-l", LONG]] + REPORT,
    "names that lead out": [
        ["-start", ".."], ["-start", "../x"], ["-start", "{files}/x"], ["-start", "none/x"],
        ["-start", "1"], ["-end", "1", "-CopyName", ".."], ["-end", "1", "-CopyName", "{files}/x"],
        ["-end", "1", "-CopyName", "."]],
    "collected files": [
        ["-start", "1", "-l", "{files}/setup.log", "-t", "{files}/sub/setup.log",
         "-u", "setup.rsp"],
        ["-end", "1", "-CopyName", "C"],
        ["-start", "2", "-l", "{files}/none.log", "-t", "{files}/setup.trc"],
        ["-end", "2"],
        ["-start", "3", "-l", "{files}/setup.log"],
        ["-start", "4"],
        ["-end", "4", "-CopyName", "C", "-l", "{files}/ORXInstallEvent.Log"]] + REPORT + REPORT,
}

# In code page 932 the second byte of 表 is that of a backslash.
JAPANESE = [
    ["-start", "1", "-Product", "製品表", "-l", "{files}/予定表.log"],
    ["-end", "1", "-CopyName", "試験表", "-Result", "成功表"],
    ["-start", "表", "-t", "{files}/表/予定表.log"], ["-end", "表", "-CopyName", "C"]] + REPORT


def outcome(side, outputs):
    return "\n".join([*outputs, *side.tree(), *side.archive()])


def run_steps(side, steps):
    side.reset()
    for name in ("setup.log", "sub/setup.log", "setup.rsp", "setup.trc", "ORXInstallEvent.Log",
                 "予定表.log", "表/予定表.log"):
        (side.files / name).parent.mkdir(exist_ok=True)
        (side.files / name).write_text(f"the installer's file of {len(name)} letters")
    return outcome(side, [side.run(step) for step in steps])


def run_section_names(side):
    """Reports over files whose section names end below, at and above the limit."""
    texts = []
    for last in (227, 228, 229, 900):
        side.reset()
        side.history.mkdir(parents=True)
        names = ["History", *(letter * 999 for letter in "abcdefghij"), "z" * (last + 2), "after"]
        (side.history / "History.ini").write_text(
            "".join(f"[{name}]\nAction={len(name)}\n" for name in names))
        texts.append(outcome(side, [side.run(REPORT[0])]))
    return "\n".join(texts)


def run_overlapping(side):
    """Starts at once, then messages for one event at once, in the order that the system likes."""
    side.reset()
    results = []
    for call in (lambda i: ["-start", str(i), "-Product", f"P{i}"],
                 lambda i: ["-logmessage", "0", "-message", f"message {i} " * 1000]):
        processes = [side.start(call(i)) for i in range(12)]
        results += [str((process.communicate()[0], process.returncode)) for process in processes]
    separators = {"History.ini": "\n[", "0/ORXInstallEvent.Log": "\n"}
    for item in side.tree():
        name = item.split(":\n", 1)[0]
        results += sorted(item.split(separators[name])) if name in separators else [item]
    return "\n".join(results)


def run_links(side):
    """A link instead of the history folder, then of the maker's: nothing is written through it."""
    texts = []
    target = side.files / "elsewhere"
    for linked in (side.history, side.maker):
        side.reset()
        (target / "ORXHistory").mkdir(parents=True)
        kept = linked.with_suffix(".kept")
        if linked.exists():
            linked.rename(kept)
        linked.symlink_to(target)
        try:
            texts += [side.run(step) for step in WHOLE_EVENT[:1] + REPORT]
        finally:
            linked.unlink()
            if kept.exists():
                kept.rename(linked)
        names = sorted(path.name for path in target.rglob("*"))
        check(names == ["ORXHistory"], f"made through the link: {names}")
    return "\n".join(texts)


def run_killed(side):
    """Starts that are killed at all of their moments leave whole sections, and no run waits."""
    side.reset()
    began = time.monotonic()
    side.run(["-start", "whole"])
    lasts = time.monotonic() - began
    count = 16
    for i in range(count):
        process = side.start(["-start", str(i)])
        time.sleep(lasts * i / count)
        process.kill()
        process.communicate()
    side.start(["-start", "last"]).communicate(timeout=60)
    text = side.plain((side.history / "History.ini").read_bytes())
    sections = parse_history((history_lines(text) + "\n").encode(), has_complete_events=True)
    check(sections["History"]["Count"] == str(len(sections) - 1), f"count of {list(sections)}")
    check(not list(side.history.glob(".*")), "litter")
    return "whole"


def read_archive(side, readers):
    """What both builds of the reader say of the side's archive, each in a text."""
    def read(reader, *arguments):
        process = subprocess.run(
            reader + ["--from", "out.zip", *arguments], cwd=side.files, stdin=subprocess.DEVNULL,
            stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, check=False)
        output = process.stdout.decode("utf-8").replace("\r\n", "\n")
        return process.returncode, output

    _, lines = read(readers[1], "list", "--json")
    events = dict.fromkeys(json.loads(line)["event"] for line in lines.splitlines())
    calls = [["list", "--json"], ["list"], ["check", "--json"], ["find", "--json", "e"],
             *(["show", "--json", "--", event] for event in events)]
    return ["\n".join("{}\nresult {}: {}".format(call, *read(reader, *call)) for call in calls)
            for reader in readers]


def same_texts(name, texts):
    texts = [text.split("\n") for text in texts]
    difference = list(difflib.unified_diff(*texts, "Windows", "Linux", lineterm="", n=2))
    print(f"{name:40} {'differs' if difference else 'same'} ({len(texts[0])} lines)")
    print("\n".join(difference[:60]), end="\n" if difference else "")
    return not difference


class Comparison:
    """The two sides, and whether all that was compared is the same."""

    def __init__(self, windows_program, linux_program, scratch):
        drive = Path(os.environ["WINEPREFIX"]).absolute() / "drive_c"
        root, files = scratch / "root", scratch / "files"
        self.windows = Side([WINE, windows_program], "\\", "cp1252", drive / "ProgramData",
                            "C:\\ProgramData", drive / "files", "C:\\files")
        self.linux = Side([linux_program], "/", "utf-8", root, str(root), files, str(files))
        self.linux.environment["ORX_COMMON_APPDATA"] = str(root)
        self.sides = {"Windows": self.windows, "Linux": self.linux}
        self.readers = [[WINE, windows_program.with_name("orxhistory.exe")],
                        [linux_program.with_name("orxhistory")]]
        self.export = self.linux.maker / "Registry.reg"
        self.is_same = True
        self.linux.maker.mkdir(parents=True, exist_ok=True)
        for side in self.sides.values():
            side.reset()

    def compare(self, name, run, *arguments):
        texts = [run(side, *arguments) for side in self.sides.values()]
        self.is_same = same_texts(name, texts) and self.is_same

    def compare_readers(self):
        """Both builds of the reader over the archives that the last scenario has left."""
        for system, side in self.sides.items():
            if (side.files / "out.zip").exists():
                texts = read_archive(side, self.readers)
                self.is_same = same_texts(f"  read, archive of {system}", texts) and self.is_same

    def use_sample_machine(self):
        """An export in UTF-8 is nothing that Windows knows; in the registry's own order it comes
        back."""
        sample = (REPOSITORY / "scripts/sample-machine/Registry.reg").read_text("utf-8")
        self.export.write_text(sample, "utf-16", newline="\r\n")
        load_registry(self.windows, self.export)
        export_registry(self.windows, self.export)

    def use_limits(self):
        self.export.write_bytes(limits_export())
        load_registry(self.windows, self.export)

    def compare_japanese(self):
        self.windows.environment["ORX_LOCALE"] = "ja_JP.UTF-8"
        self.windows.encoding = "cp932"
        self.compare("second bytes like separators", run_steps, JAPANESE)
        del self.windows.environment["ORX_LOCALE"]
        self.windows.encoding = "cp1252"


def main():
    comparison = Comparison(*(Path(word).absolute() for word in sys.argv[1:]))
    comparison.use_sample_machine()
    comparison.compare("the sample machine", run_steps, WHOLE_EVENT)
    comparison.compare_readers()
    comparison.use_limits()
    for name, steps in SCENARIOS.items():
        comparison.compare(name, run_steps, steps)
    comparison.compare_readers()
    comparison.compare_japanese()
    for name, run in (("links instead of the folders", run_links),
                      ("section names at the limit", run_section_names),
                      ("overlapping starts", run_overlapping), ("killed starts", run_killed)):
        comparison.compare(name, run)
    return 0 if comparison.is_same else 1


if __name__ == "__main__":
    sys.exit(main())
