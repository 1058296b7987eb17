#!/usr/bin/env python3
"""Runs the Windows program under Wine and the Linux program through the same histories.

    compare-windows.py WINDOWS_PROGRAM LINUX_PROGRAM SCRATCH_FOLDER

Exit results, output, history files, reports, summaries and archives must be the same, but for
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

HERE = os.path.dirname(os.path.abspath(__file__))
WINE = os.path.join(HERE, "wine.sh")
SOFTWARE = "HKEY_LOCAL_MACHINE\\SOFTWARE\\"
PRODUCTS = "Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products"
TOOL_KEYS = [SOFTWARE + "ZEK", SOFTWARE + "ODBC\\ODBCINST.INI", SOFTWARE + PRODUCTS]
SECTION_NAMES_SIZE = 10240


class Side:
    """A program with its common application data folder, and a folder for an installer's files."""

    def __init__(self, command, environment, separator, encoding, root, root_name, files,
                 files_name):
        self.command = command
        self.encoding = encoding
        self.environment = dict(os.environ, **environment)
        self.separator = separator
        self.root, self.root_name = root, root_name
        self.files, self.files_name = files, files_name
        self.maker = os.path.join(root, "ZEK")
        self.history = os.path.join(self.maker, "ORXHistory")

    def reset(self):
        for folder in (self.history, self.files):
            shutil.rmtree(folder, ignore_errors=True)
        os.makedirs(self.files)

    def start(self, arguments):
        arguments = [
            a.replace("{files}/", self.files_name + self.separator) for a in arguments
        ]
        return subprocess.Popen(
            self.command + arguments, env=self.environment, cwd=self.files,
            stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT)

    def run(self, arguments):
        process = self.start(arguments)
        output = process.communicate()[0]
        return "%s\nresult %d: %s" % (arguments, process.returncode, self.plain(output))

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
        for folder, _, names in sorted(os.walk(self.history)):
            yield "folder " + os.path.relpath(folder, self.history)
            for name in sorted(names):
                path = os.path.join(folder, name)
                with open(path, "rb") as file:
                    yield "%s:\n%s" % (os.path.relpath(path, self.history),
                                       self.contents(name, file.read()))

    def archive(self):
        """Every entry; beside others the order is the system's, but each is behind its folder."""
        path = os.path.join(self.files, "out.zip")
        if not os.path.exists(path):
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
                entries[name] = "%s, read-only %d:\n%s" % (
                    kind, info.external_attr & 1, self.contents(name, archive.read(info)))
        for name in sorted(entries):
            yield "archive: %s, %s" % (name, entries[name])


def history_lines(text):
    """A blank line may stand between sections, and blanks around a value do not belong to it: Wine
    leaves out those in front, as Windows is documented to do only when it reads."""
    lines = []
    for line in filter(None, text.split("\n")):
        key, equals, value = line.partition("=")
        lines.append(key + equals + value.strip(" \t"))
    return "\n".join(lines)


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
        ("p" * 256, '"ends the list"'), ("q", '"behind the end"'),
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
    with open(os.path.join(side.files, "remove.reg"), "w", encoding="ascii") as file:
        file.write("REGEDIT4\n" + "".join("\n[-%s]\n" % key for key in TOOL_KEYS))
    regedit(side, "/S", "remove.reg")
    shutil.copy(export, os.path.join(side.files, "add.reg"))
    regedit(side, "/S", "add.reg")


def export_registry(side, path):
    """Writes the tool's keys as the registry orders them."""
    texts = []
    for key in TOOL_KEYS:
        regedit(side, "/E", "part.reg", key)
        with open(os.path.join(side.files, "part.reg"), encoding="utf-16", newline="") as file:
            texts.append(file.read())
    header = texts[0].split("\r\n")[0]
    with open(path, "w", encoding="utf-16", newline="") as file:
        file.write("\r\n".join([texts[0]] + [text.replace(header, "", 1) for text in texts[1:]]))


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
    return "\n".join(outputs + list(side.tree()) + list(side.archive()))


def run_steps(side, steps):
    side.reset()
    for name in ("sub", "表"):
        os.makedirs(os.path.join(side.files, name))
    for name in ("setup.log", "sub/setup.log", "setup.rsp", "setup.trc", "ORXInstallEvent.Log",
                 "予定表.log", "表/予定表.log"):
        with open(os.path.join(side.files, name), "w", encoding="utf-8") as file:
            file.write("the installer's file of %d letters" % len(name))
    return outcome(side, [side.run(step) for step in steps])


def run_section_names(side):
    """Reports over files whose section names end below, at and above the limit."""
    texts = []
    for last in (227, 228, 229, 900):
        side.reset()
        os.makedirs(side.history)
        names = ["History"] + [letter * 999 for letter in "abcdefghij"]
        names += ["z" * (last + 2), "behind"]
        with open(os.path.join(side.history, "History.ini"), "w", encoding="ascii") as file:
            file.writelines("[%s]\nAction=%d\n" % (name, len(name)) for name in names)
        texts.append(outcome(side, [side.run(REPORT[0])]))
    return "\n".join(texts)


def run_overlapping(side):
    """Starts at once, then messages for one event at once, in the order that the system likes."""
    side.reset()
    results = []
    for call in (lambda i: ["-start", str(i), "-Product", "P%d" % i],
                 lambda i: ["-logmessage", "0", "-message", ("message %d " % i) * 1000]):
        processes = [side.start(call(i)) for i in range(12)]
        results += [str((process.communicate()[0], process.returncode)) for process in processes]
    separators = {"History.ini": "\n[", "0/ORXInstallEvent.Log": "\n"}
    for item in side.tree():
        name = item.split(":\n", 1)[0]
        results += sorted(item.split(separators[name])) if name in separators else [item]
    return "\n".join(results)


def run_links(side):
    """A link in place of the history folder, then of the maker's: nothing is written through it."""
    texts = []
    target = os.path.join(side.files, "elsewhere")
    for linked in (side.history, side.maker):
        side.reset()
        os.makedirs(os.path.join(target, "ORXHistory"))
        kept = linked + ".kept"
        if os.path.exists(linked):
            os.rename(linked, kept)
        os.symlink(target, linked)
        try:
            texts += [side.run(step) for step in WHOLE_EVENT[:1] + REPORT]
        finally:
            os.unlink(linked)
            if os.path.exists(kept):
                os.rename(kept, linked)
        names = sorted(name for _, folders, files in os.walk(target) for name in folders + files)
        texts.append("elsewhere: %s" % names)
        assert names == ["ORXHistory"], names
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
    with open(os.path.join(side.history, "History.ini"), "rb") as file:
        sections = history_lines(side.plain(file.read()))[1:].split("\n[")
    assert sections[0] == "History]\nCount=%d" % (len(sections) - 1), sections
    assert {section.count("\n") for section in sections[1:]} == {17}, sections
    assert not [name for name in os.listdir(side.history) if name.startswith(".")]
    return "whole"


def read_archive(side, readers):
    """What both builds of the reader say of the side's archive, each in a text."""
    folder = side.files

    def read(reader, *arguments):
        process = subprocess.run(
            reader + ["--from", "out.zip", *arguments], cwd=folder, stdin=subprocess.DEVNULL,
            stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, check=False)
        output = process.stdout.decode("utf-8").replace("\r\n", "\n")
        return "%s\nresult %d: %s" % (arguments, process.returncode, output)

    events = [json.loads(line)["event"] for line in subprocess.run(
        readers[1] + ["--from", "out.zip", "list", "--json"], cwd=folder, stdout=subprocess.PIPE,
        check=True).stdout.splitlines()]
    calls = [["list", "--json"], ["list"], ["check", "--json"], ["find", "--json", "e"]]
    calls += [["show", "--json", "--", event] for event in dict.fromkeys(events)]
    return ["\n".join(read(reader, *call) for call in calls) for reader in readers]


def same_texts(name, texts):
    texts = [text.split("\n") for text in texts]
    difference = list(difflib.unified_diff(*texts, "Windows", "Linux", lineterm="", n=2))
    print("%-40s %s (%d lines)" % (name, "differs" if difference else "same", len(texts[0])))
    print("\n".join(difference[:60]), end="\n" if difference else "")
    return not difference


def compare(name, run, windows, linux):
    return same_texts(name, [run(side) for side in (windows, linux)])


def compare_readers(windows, linux, readers):
    """Both builds of the reader over the archives that the scenario has left."""
    return all([same_texts("  read, archive of " + system, read_archive(side, readers))
                for system, side in (("Windows", windows), ("Linux", linux))
                if os.path.exists(os.path.join(side.files, "out.zip"))])


def main():
    windows_program, linux_program, scratch = map(os.path.abspath, sys.argv[1:])
    drive = os.path.join(os.environ["WINEPREFIX"], "drive_c")
    windows = Side([WINE, windows_program], {}, "\\", "cp1252", os.path.join(drive, "ProgramData"),
                   "C:\\ProgramData", os.path.join(drive, "files"), "C:\\files")
    root, files = os.path.join(scratch, "root"), os.path.join(scratch, "files")
    linux = Side([linux_program], {"ORX_COMMON_APPDATA": root}, "/", "utf-8", root, root, files,
                 files)
    os.makedirs(linux.maker, exist_ok=True)
    for side in (windows, linux):
        side.reset()
    export = os.path.join(linux.maker, "Registry.reg")

    # An export in UTF-8 is nothing that Windows knows; in the registry's own order it comes back.
    with open(os.path.join(HERE, "sample-machine", "Registry.reg"), encoding="utf-8") as file:
        sample = file.read()
    with open(export, "w", encoding="utf-16", newline="\r\n") as file:
        file.write(sample)
    load_registry(windows, export)
    export_registry(windows, export)
    readers = [[WINE, os.path.join(os.path.dirname(windows_program), "orxhistory.exe")],
               [os.path.join(os.path.dirname(linux_program), "orxhistory")]]
    same = [compare("the sample machine", lambda s: run_steps(s, WHOLE_EVENT), windows, linux),
            compare_readers(windows, linux, readers)]

    with open(export, "wb") as file:
        file.write(limits_export())
    load_registry(windows, export)
    for name, steps in SCENARIOS.items():
        same.append(compare(name, lambda s: run_steps(s, steps), windows, linux))
    same.append(compare_readers(windows, linux, readers))
    same.append(compare("links in place of the folders", run_links, windows, linux))
    windows.environment["ORX_LOCALE"] = "ja_JP.UTF-8"
    windows.encoding = "cp932"
    same.append(compare("second bytes like separators", lambda s: run_steps(s, JAPANESE), windows,
                        linux))
    del windows.environment["ORX_LOCALE"]
    windows.encoding = "cp1252"
    same.append(compare("section names at the limit", run_section_names, windows, linux))
    same.append(compare("overlapping starts", run_overlapping, windows, linux))
    same.append(compare("killed starts", run_killed, windows, linux))
    return 0 if all(same) else 1


if __name__ == "__main__":
    sys.exit(main())
