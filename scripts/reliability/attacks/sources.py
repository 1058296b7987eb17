"""The sources of a snapshot in any state: a name service, a registry export, processes."""

import contextlib
import os
import re
import resource
import shutil
import subprocess
import time
from pathlib import Path

import history
from harness import attack, require_root
from history import check
from machine import Skipped

HEADER = "Windows Registry Editor Version 5.00\n\n"
KEY = "[HKEY_LOCAL_MACHINE\\SOFTWARE\\ZEK\\ORX\\InstalledCopies\\C1\\GLOBAL_PROFILE]\n"
GOOD = KEY + '"Seen"="yes"\n'
DRIVERS = "HKEY_LOCAL_MACHINE\\SOFTWARE\\ODBC\\ODBCINST.INI"


def write_export(machine, text):
    (machine.root / "ZEK" / "Registry.reg").write_text(HEADER + text)
    machine.watch()


def event_report(machine, **options):
    machine.must("-start", "7", **options)
    return (machine.history / "7" / history.LOG).read_bytes()


@attack(("levels of a heading", lambda: "".join(
            f"[HKEY_LOCAL_MACHINE\\SOFTWARE\\ZEK\\{i}" + "\\k" * 500_000 + "]\n"
            for i in range(10))),
        ("levels of many headings", lambda: "".join(
            f"[HKEY_LOCAL_MACHINE\\SOFTWARE\\ZEK\\{i}" + "\\k" * 500 + "]\n"
            for i in range(10_000))),
        ("drivers with a backslash", lambda: f"[{DRIVERS}\\ODBC Drivers]\n" + "".join(
            f'"ZEK ORX {i}\\\\x"="Installed"\n' for i in range(500)) + "".join(
            f"[{DRIVERS}\\{i}]\n" for i in range(200_000))))
def hostile_registry_export(machine, make):
    """It costs a small multiple of its size in memory and little time, and the good lines count."""
    write_export(machine, make() + GOOD)
    began = resource.getrusage(resource.RUSAGE_CHILDREN).ru_utime
    report = event_report(machine, before=("prlimit", f"--as={800 << 20}"))
    seconds = resource.getrusage(resource.RUSAGE_CHILDREN).ru_utime - began
    check(seconds < 2, f"{seconds:.1f} s of CPU time")
    check(b"Seen:" in report, "the last key is missing")


@attack()
def registry_line_without_closing_quotation_mark(machine):
    write_export(machine, KEY + '"open"="text\n";next"="kept"\n')
    check(b";next:" in event_report(machine), "the next line is lost")


@attack()
def process_name_with_control_characters(machine):
    """It can neither add a line to the report nor send a terminal an escape sequence."""
    program = os.fsencode(machine.scratch) + b"/x\n4) Services\x1b[2J\xc2\x9b\x7f"
    shutil.copy(shutil.which("sleep"), program)
    machine.kill_at_end(subprocess.Popen([program, "60"]))
    report = event_report(machine)
    check(b"x?4) Services?[2J??\n" in report, "the name is not shown as agreed")
    check(b"\x1b" not in report and b"\n4) Services\x1b" not in report, "forged")


# Every other call is interrupted, from the first one on; each list has one entry.
INTERRUPTED_NAME_SERVICE = """
#include <errno.h>
#include <grp.h>
#include <pwd.h>
#include <stddef.h>
static char* members[] = {"bo", NULL};
static struct group staff = {.gr_name = "staff", .gr_gid = 100, .gr_mem = members};
static struct passwd ana = {.pw_name = "ana", .pw_gid = 100};
static void* answer(int call, void* entry) {
  if (call % 2 == 0) errno = EINTR;
  return call == 1 ? entry : NULL;
}
struct passwd* getpwuid(uid_t user) { static int call; return answer(call++, &ana); }
struct passwd* getpwent(void) { static int call; return answer(call++, &ana); }
struct group* getgrent(void) { static int call; return answer(call++, &staff); }
"""


@attack()
def interrupted_name_service(machine):
    report = event_report(machine, variables=machine.with_functions(INTERRUPTED_NAME_SERVICE))
    check(re.search(rb"Logged on User:\S+\\ana\n", report), "the user is not named")
    rows = re.findall(rb"(?m)^staff(?: +\S+\\(\w+))?$", report)
    check(rows == [b"", b"bo", b"ana"], f"rows of the group: {rows}")


@attack()
def interrupted_name_service_for_an_owners_groups(machine):
    """Root collects for the owner of a history what one of his groups may read."""
    require_root()
    os.chown(machine.source, 0, 100)
    machine.source.chmod(0o640)
    machine.report_for_owner("-l", str(machine.source),
                             variables=machine.with_functions(INTERRUPTED_NAME_SERVICE))
    check("7/setup.log" in machine.packed(), "not collected")


SILENT_NAME_SERVICE = """
#include <unistd.h>
struct passwd;
struct passwd* getpwent(void) { for (;;) pause(); }
"""


@attack()
def silent_name_service(machine):
    """It costs its rows and at most ten seconds."""
    variables = machine.with_functions(SILENT_NAME_SERVICE)
    began = time.monotonic()
    report = event_report(machine, variables=variables)
    seconds = time.monotonic() - began
    check(seconds < 12, f"{seconds:.0f} s")
    check(b"6) ORX ODBC Driver Info:" in report, "the rest of the snapshot is missing")
    for path in Path("/proc").glob("[0-9]*/cmdline"):
        with contextlib.suppress(OSError):  # a process that has ended meanwhile
            check(os.fsencode(machine.program[0]) not in path.read_bytes(), "a process is left")


@attack()
def groups_with_one_name(machine):
    wrapper = "/usr/lib/x86_64-linux-gnu/libnss_wrapper.so"
    if not Path(wrapper).exists():
        raise Skipped("needs the package libnss-wrapper")
    passwd, group = machine.scratch / "passwd", machine.scratch / "group"
    passwd.write_text("root:x:0:0::/:/bin/sh\n")
    group.write_text("twice:x:100:ana\ntwice:x:101:bo\n")
    report = event_report(machine, variables={
        "LD_PRELOAD": wrapper, "NSS_WRAPPER_PASSWD": str(passwd), "NSS_WRAPPER_GROUP": str(group)})
    rows = [line.split()[-1].split(b"\\")[-1] for line in report.splitlines()
            if line.startswith(b"twice")]
    check(rows == [b"twice", b"ana", b"bo"], f"{rows}")
