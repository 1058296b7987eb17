"""A history of many ended events, to try and to measure programs on."""

import random

import history

PROGRAMS = ("orxserver.exe", "msiexec.exe", "Name Server", "Net Driver 9.1")


def make_log(generator, size):
    """Text that packs about as well as a real report."""
    lines = []
    length = 0
    while length < size:
        lines.append(f"{generator.randrange(100000):<19}{generator.choice(PROGRAMS)}"
                     + " " * generator.randrange(30))
        length += len(lines[-1]) + 1
    return "\n".join(lines) + "\n"


def make_history(root, events, log_bytes=8000, collect=False):
    """The root becomes the common application data folder; it must not have a history yet. With
    `collect` each event names three files of the installer that the first report collects. The same
    arguments make the same files. Returns the root."""
    folder = root / history.HISTORY
    folder.mkdir(parents=True, exist_ok=True)
    generator = random.Random(1)
    sections = {"History": {"Count": str(events)}}
    for number in range(events):
        name = f"{number:04}"
        copy = f"Copy{number % 20}"
        log = folder / copy / name / history.LOG
        log.parent.mkdir(parents=True)
        log.write_text(make_log(generator, log_bytes))
        files = dict.fromkeys(("log", "trc", "rsp"), "")
        for kind in files if collect else ():
            files[kind] = (root / "installer" / name / f"setup.{kind}").resolve()
            files[kind].parent.mkdir(parents=True, exist_ok=True)
            files[kind].write_text(make_log(generator, 1000))
        sections[name] = history.event(
            name, log, Command_Line="setup.exe -silent", Start_Time="20261124 21:05:07",
            End_Time="20261124 21:09:41", Action="Install", Type="GUI",
            Product=f"Server 9.1 build {number}", Version="9.1", Service_Level="SP2",
            Path=f"/opt/orx/{copy}", Copy_Name=copy, Complete_Flag="TRUE",
            Log_File_Name=files["log"], Trace_File=files["trc"], Response_File=files["rsp"],
            Result="Success")
    (folder / "History.ini").write_text(history.format_history(sections), newline="\n")
    return root
