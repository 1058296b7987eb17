"""The program file itself."""

import json
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
    check("RPATH" not in dynamic and "RUNPATH" not in dynamic and "TEXTREL" not in dynamic,
          "RPATH or TEXTREL")
    check("__stack_chk_fail" in read("--dyn-syms"), "no stack protector")
    # Where the compiler can tell that no call needs it, the program holds no trace of it.
    commands = json.loads((machine.built.parent / "compile_commands.json").read_text())
    check(all("-D_FORTIFY_SOURCE=2" in command["command"] and " -O" in command["command"]
              for command in commands), "compiled without FORTIFY")
