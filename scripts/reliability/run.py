#!/usr/bin/env python3
"""Attacks on the program's promises.

    run.py [--program PATH] [--only NAME] [--seconds N] [--list]

Without options every attack runs against build/release/ORXInstallEventLog; what does not hold is
printed under the attack's name, and the exit code is 1. "--only NAME" runs the attacks whose name
contains NAME ("kill: report, write 117" is one of a family), "--program" another program, for
example an older one that must fail. "--seconds N" limits the three large families (kill, overlap,
planted) to about N seconds together, as a sample; all other attacks always run.

To add an attack, write a short function in one of the files of attacks/:

    @attack()
    def folder_as_archive_name(machine):
        machine.archive.mkdir()
        machine.report(code=3)

The machine (harness.Target) is its own and temporary; `check(holds, message)` states a promise.
After every attack nothing outside the history may have changed. Several rows of one attack are
written as a table, `@attack("Summary.txt", "History.ini")`. A new file in attacks/ is found by
itself.
"""

import argparse
import importlib
import sys
from pathlib import Path

sys.path.insert(0, str(Path(__file__).resolve().parents[1]))

import history  # noqa: E402
import kill  # noqa: E402
import overlap  # noqa: E402
import planted  # noqa: E402
from harness import ATTACKS, run_attack  # noqa: E402
from machine import Outcome  # noqa: E402

# Name, function that returns what it has done, share of the seconds of a sample.
FAMILIES = (("kill", kill.attack_calls, 0.6), ("overlap", overlap.attack_together, 0.2),
            ("planted", planted.attack_paths, 0.2))


def main():
    parser = argparse.ArgumentParser(description=__doc__,
                                     formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--program", type=Path, default=history.PROGRAM)
    parser.add_argument("--only", default="", metavar="NAME")
    parser.add_argument("--seconds", type=float, default=0)
    parser.add_argument("--list", action="store_true", help="print the names and do nothing")
    options = parser.parse_args()
    for file in sorted((Path(__file__).parent / "attacks").glob("*.py")):
        importlib.import_module(f"attacks.{file.stem}")
    attacks = [name for name in ATTACKS if options.only in name]
    families = [family for family in FAMILIES
                if options.only in family[0] or options.only.startswith(family[0] + ": ")]
    if options.list:
        print("\n".join([*attacks, *(family[0] for family in families)]))
        return
    if not attacks and not families:
        parser.error("no attack has that name")
    outcome = Outcome()
    for name in attacks:
        outcome.attempt(name, lambda: run_attack(options.program, ATTACKS[name]))
    print(f"{len(attacks)} attacks: {outcome.summary()}", flush=True)
    shares = sum(share for _, _, share in families)
    for name, attack_family, share in families:
        seconds = options.seconds * share / shares
        counts = outcome.attempt(
            name, lambda: attack_family(options.program, outcome, seconds, options.only))
        print(f"{name}: {counts}", flush=True)
    print(outcome.summary())
    sys.exit(1 if outcome.failures else 0)


if __name__ == "__main__":
    main()
