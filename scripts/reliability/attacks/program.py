"""The program file itself, and the standard streams that it gets from its caller."""

import json
import os
import subprocess

from harness import attack
from history import check


@attack()
def hardening(machine):
    def read(*options):
        return subprocess.run(["readelf", "-W", *options, str(machine.built)], check=True,
                              capture_output=True, text=True).stdout
    dynamic, segments = read("-d"), read("-l")
    check("Flags: NOW PIE" in dynamic and "BIND_NOW" in dynamic, "no PIE, or not bound at start")
    check("GNU_RELRO" in segments, "no RELRO")
    check(any("GNU_STACK" in line and " RW " in line for line in segments.splitlines()),
          "stack can be executed")
    for entry in ("RPATH", "RUNPATH", "TEXTREL"):
        check(entry not in dynamic, entry)
    check("__stack_chk_fail" in read("--dyn-syms"), "no stack protector")
    # Where the compiler can tell that no call needs it, the program holds no trace of it.
    commands = json.loads((machine.built.parent / "compile_commands.json").read_text())
    check(all("-D_FORTIFY_SOURCE=2" in command["command"] and " -O" in command["command"]
              for command in commands), "compiled without FORTIFY")


@attack(("input and output", "<&- >&-"), ("all", "<&- >&- 2>&-"), ("output", ">&-"))
def closed_descriptors(machine, closing):
    """No file may get the number of a standard stream, as it would receive that stream's text."""
    trace = machine.scratch / "trace"
    caller = ("strace", "-f", "-o", trace, "-e", "trace=openat", "sh", "-c",
              f'exec "$@" {closing}', "sh")
    for arguments in (("-start", "7", "-l", str(machine.source)), ("-start", "../x"),
                      ("-report", str(machine.archive))):
        machine.must(*arguments, before=caller)
        opened = [line for line in trace.read_text().splitlines() if str(machine.root) in line]
        taken = [line for line in opened if line.endswith((" = 0", " = 1", " = 2"))]
        check(not taken, f"opened as a standard stream: {taken[:1]}")
        check(any(line.endswith(" = 3") for line in opened), "a descriptor is left open")
    check(len(machine.sections()) == 3, "not recorded")


@attack(("start", "-start", "../x"), ("report", "-report", "{archive}"), ("help", "-help"))
def closed_pipe_on_standard_output(machine, *arguments):
    """The work is done, and the exit code says so."""
    reader, writer = os.pipe()
    os.close(reader)
    machine.callback(os.close, writer)
    machine.must("-start", "6")
    machine.must(*(word.format(archive=machine.archive) for word in arguments), stdout=writer)
