#!/usr/bin/env python3
"""Runs the Windows program under Wine and the Linux program through the same histories.

    compare-windows.py WINDOWS_PROGRAM LINUX_PROGRAM SCRATCH_FOLDER

Exit codes, output, history files, reports, summaries and archives must be the same, but for
separators, line ends, times and what shows the machine itself. The readers beside the programs must
print the same for an archive. The exit code is 1 after differences, which are printed.
WINEPREFIX names a Windows of its own: its history and its registry keys of the tool are replaced.
"""
import json
import os
import re
import shlex
import shutil
import string
import subprocess
import sys
import time
from pathlib import Path

from history import REPOSITORY, archive_entries, check, parse_history
from machine import Machine, Outcome, check_equal, contents

WINE = REPOSITORY / "scripts/wine.sh"
HISTORIES = REPOSITORY / "scripts/comparison/histories.txt"
SOFTWARE = "HKEY_LOCAL_MACHINE\\SOFTWARE"
PRODUCTS = "Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products"
TOOL_KEYS = [f"{SOFTWARE}\\{key}" for key in ("ZEK", "ODBC\\ODBCINST.INI", PRODUCTS)]
INSTALLER_FILES = ("setup.log", "sub/setup.log", "setup.rsp", "setup.trc", "ORXInstallEvent.Log",
                   "予定表.log", "表/予定表.log")


class Side(Machine):
    """A program in a folder, with its common application data folder and one for an installer's
    files. The beginning is that of a path in the folder, as the program's system spells it."""

    def __init__(self, program, folder, beginning, encoding):
        super().__init__(*program, root=folder / "ProgramData")
        self.files = folder / "files"
        self.files_name = f"{beginning}files"
        self.root_name = f"{beginning}ProgramData"
        self.separator = beginning[-1]
        self.encoding = encoding
        self.reader = Machine(*program[:-1], program[-1].with_stem("orxhistory"), root=folder)
        self.options |= {"cwd": self.files, "stdout": subprocess.PIPE, "stderr": subprocess.STDOUT}

    def reset(self):
        for folder in (self.history, self.files):
            shutil.rmtree(folder, ignore_errors=True)
        self.history.parent.mkdir(parents=True, exist_ok=True)
        for name in INSTALLER_FILES:
            (self.files / name).parent.mkdir(parents=True, exist_ok=True)
            (self.files / name).write_text(f"the installer's file of {len(name)} letters")

    def popen(self, arguments, **options):
        beginning = self.files_name + self.separator
        return super().popen([word.replace("{files}/", beginning) for word in arguments], **options)

    def output_of(self, arguments):
        """A run's exit code and output in a text."""
        code, output = self.run(*arguments, timeout=120)
        return f"{arguments}\nexit code {code}: {self.comparable(output)}"

    def comparable(self, data):
        """Text without what differs: the code page, the two folders, line ends, and times."""
        text = data.decode(self.encoding, "replace").replace("\r\n", "\n")
        text = text.replace(self.root_name, "{root}").replace(self.files_name, "{files}")
        text = re.sub(r"\{(root|files)\}[^\n']*", lambda m: m[0].replace("\\", "/"), text)
        return re.sub(r"\b\d{8} \d\d:\d\d:\d\d\b", "{time}", text)

    def contents(self, name, data):
        clean = {"History.ini": history_lines, "ORXInstallEvent.Log": without_machine}
        return clean.get(name.rsplit("/", 1)[-1], str)(self.comparable(data))

    def tree(self):
        for path in sorted(self.history.rglob("*")):
            name = path.relative_to(self.history)
            yield (f"folder {name}" if path.is_dir() else
                   f"{name}:\n{self.contents(path.name, path.read_bytes())}")

    def archive(self):
        """Every entry, sorted: their order is the system's, but each comes after its folder."""
        path = self.files / "out.zip"
        entries = {}
        for name, info, data in archive_entries(path, self.encoding) if path.exists() else ():
            check(self.separator == "/" or "/" not in name, f"separator of {name}")
            name = name.replace("\\", "/")
            check("/" not in name or name.rsplit("/", 1)[0] in entries, f"{name} before its folder")
            kind = "folder" if info.external_attr & 0x10 else "file"
            entries[name] = (f"{kind}, read-only {info.external_attr & 1}:\n"
                             + self.contents(name, data))
        yield from (f"archive: {name}, {entries[name]}" for name in sorted(entries))

    def outcome_of(self, runs):
        """Makes runs in a new history. Returns what they print and leave."""
        self.reset()
        outputs = [self.output_of(arguments) for arguments in runs]
        return "\n".join([*outputs, *self.tree(), *self.archive()])

    def read_archive(self, folder):
        """What the reader prints for the archive in the folder."""
        def read(*arguments):
            code, output = self.reader.run("--from", "out.zip", *arguments, cwd=folder, timeout=120)
            return f"{arguments}\n" + output.decode().replace("\r\n", "\n") + f"exit code {code}"
        listed = read("list", "--json")
        events = dict.fromkeys(json.loads(line)["event"] for line in listed.split("\n")
                               if line.startswith("{"))
        return "\n".join([listed, read("list"), read("check", "--json"),
                          read("find", "--json", "e"),
                          *(read("show", "--json", "--", event) for event in events)])


def history_lines(text):
    """Without blank lines between sections and blanks around a value: Wine leaves out those before
    it when it writes, Windows, by its documentation, only when it reads."""
    lines = re.sub(r"\n+", "\n", text).strip("\n")
    return re.sub(r"(?m)^([^=\n]*=)[ \t]*(.*?)[ \t]*$", r"\1\2", lines)


def without_machine(report):
    """A report without the values and table rows that show the machine."""
    report = re.sub(r"(?m)^((?=.{20}:)(?:Computer Name|OS|Type|Service Pack|Number of processors|"
                    r"CPU) *:|Logged on User:|Processes:).*", r"\1", report)
    # The rows are between the rule below the head of a table and the next rule.
    return re.sub(r"(?m)^((?:Group Name|Group   |Process ID|Service Name) .*\n-----.*\n)"
                  r"(?:(?!-----).*\n)*", r"\1", report)


# --- The histories ---


def read_histories():
    """The runs of each history by its name; a run is a list of arguments."""
    histories = {}
    for line in HISTORIES.read_text("utf-8").replace("\\\n", "").splitlines():
        if line.startswith("## "):
            histories[line[3:]] = []
        elif line.startswith("$"):
            arguments = shlex.split(line[1:])
            histories[list(histories)[-1]].append([filled(word) for word in arguments])
    return histories


def filled(word):
    word = word.replace("{newline}", "\n")
    return re.sub(r"\{(\d+)-letters\}", lambda m: (string.ascii_lowercase * 240)[:int(m[1])], word)


def run_overlapping(side):
    """Starts at once, then messages for one event at once, in the order that the system likes."""
    side.reset()
    results = []
    for call in (lambda i: ["-start", str(i), "-Product", f"P{i}"],
                 lambda i: ["-logmessage", "0", "-message", f"message {i} " * 1000]):
        processes = [side.popen(call(i)) for i in range(12)]
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
    for linked in (side.history, side.history.parent):
        side.reset()
        side.history.mkdir()
        linked.rename(target)
        linked.symlink_to(target)
        before = contents(target)
        try:
            texts += [side.output_of(arguments)
                      for arguments in (["-start", "42"], ["-report", "{files}/out.zip"])]
        finally:
            linked.unlink()
            target.rename(linked)
        check_equal(contents(linked), before, "changed through the link")
    return "\n".join(texts)


def run_killed(side):
    """Starts that are killed at all of their moments leave complete sections, and no run waits."""
    side.reset()
    began = time.monotonic()
    side.output_of(["-start", "complete"])
    lasts = time.monotonic() - began
    count = 16
    for i in range(count):
        # Without a pipe: a server of Wine that it has started keeps the pipe open.
        process = side.popen(["-start", str(i)], stdout=subprocess.DEVNULL)
        time.sleep(lasts * i / count)
        process.kill()
        process.wait()
    side.run("-start", "last", timeout=60)
    text = history_lines(side.comparable(side.ini.read_bytes())) + "\n"
    sections = parse_history(text.encode(), has_complete_events=True)
    check(sections["History"]["Count"] == str(len(sections) - 1), f"count of {list(sections)}")
    check(not list(side.history.glob(".*")), "leftover files")
    return "complete"


# --- The comparison ---


class Comparison:
    def __init__(self, windows_program, linux_program, scratch):
        drive = Path(os.environ["WINEPREFIX"]).absolute() / "drive_c"
        self.windows = Side([WINE, windows_program], drive, "C:\\", "cp1252")
        self.linux = Side([linux_program], scratch, f"{scratch}/", "utf-8")
        self.export = self.linux.history.parent / "Registry.reg"
        self.outcome = Outcome()
        for side in (self.windows, self.linux):
            side.reset()

    def compare(self, name, run, *arguments):
        def check_same():
            windows, linux = (run(side, *arguments) for side in (self.windows, self.linux))
            check_equal(windows, linux, "Windows differs from Linux")
            lines = linux.count("\n") + 1
            print(f"{name:40} same ({lines} lines)", flush=True)
        self.outcome.attempt(name, check_same)

    def compare_readers(self):
        """Both builds of the reader over the archives that the last history has left."""
        for system, side in (("Windows", self.windows), ("Linux", self.linux)):
            self.compare(f"  read, archive of {system}", Side.read_archive, side.files)

    def regedit(self, option, name, *arguments):
        """On a file of the installer's folder: a path of Linux would look like an option."""
        path = self.windows.files_name + self.windows.separator + name
        subprocess.run([WINE, "regedit", option, path, *arguments], check=True)

    def load(self, name):
        """Replaces the tool's keys on both systems by those of an export."""
        header, keys = (REPOSITORY / "scripts" / name).read_text("utf-8").split("\n", 1)
        removed = "".join(f"\n[-{key}]\n" for key in TOOL_KEYS)
        for path, text in ((self.export, keys), (self.windows.files / "load.reg", removed + keys)):
            path.write_text(f"{header}\n{text}", "utf-16", newline="\r\n")
        self.regedit("/S", "load.reg")

    def load_from_windows(self):
        """Makes the export of Linux from the registry, in its order."""
        self.regedit("/E", "registry.reg", SOFTWARE)
        shutil.move(self.windows.files / "registry.reg", self.export)


def main():
    comparison = Comparison(*(Path(word).absolute() for word in sys.argv[1:]))
    histories = read_histories()
    japanese = histories.pop("second bytes like separators")
    comparison.load("sample-machine/Registry.reg")
    comparison.load_from_windows()
    comparison.compare("the sample machine", Side.outcome_of, histories["a complete event"])
    comparison.compare_readers()
    # All kinds of values, and texts and names at the limits. In the order of the names, as the
    # registry keeps keys; Wine keeps values so too, Windows in the order of their writing. No path
    # of a key is longer than 260 characters: Wine opens none by the narrow calls, Windows does.
    comparison.load("comparison/Limits.reg")
    for name, runs in histories.items():
        comparison.compare(name, Side.outcome_of, runs)
    comparison.compare_readers()
    for name, run in (("links instead of the folders", run_links),
                      ("overlapping starts", run_overlapping), ("killed starts", run_killed)):
        comparison.compare(name, run)
    # In code page 932 the second byte of 表 is that of a backslash.
    comparison.windows.encoding = "cp932"
    comparison.windows.variables["ORX_LOCALE"] = "ja_JP.UTF-8"
    comparison.compare("second bytes like separators", Side.outcome_of, japanese)
    print(comparison.outcome.summary())
    return 1 if comparison.outcome.failures else 0


if __name__ == "__main__":
    sys.exit(main())
