"""Where a report writes its archive."""

import history
from harness import attack
from history import check
from planted import RUNS, run_any


@attack()
def archive_in_the_history(machine):
    """The archive in the history itself, and in the place of the history file."""
    for words in RUNS:
        run_any(machine, words)
    inside = machine.history / "C1" / "history.zip"
    for _ in range(2):
        machine.must("-report", str(inside))
        check(not [name for name in history.read_archive(inside) if "zip" in name], "holds itself")
    (machine.history / "alias.zip").symlink_to("History.ini")
    before = machine.ini.read_bytes()
    for name in ("History.ini", "C1/../History.ini", "alias.zip"):
        machine.must("-report", str(machine.history / name), result=3)
        check(machine.ini.read_bytes() == before, "history overwritten")
    machine.check_outside()
