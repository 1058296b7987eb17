"""Runs of all kinds, sixteen at once, over one history: first undisturbed, then with every third
run killed at a random moment, then on a file system without locks. Meanwhile a reader parses the
history file. At the end everything that finished must be there, complete and once.
"""

import itertools
import random
import re
import time

import history
from harness import Target, in_threads, injecting, wait_for
from history import check

WORKERS = 16
SHARED = [f"shared{number}" for number in range(4)]
COPIES = 5


def sometimes_killing():
    """For every third run the command that kills it."""
    if random.random() < 2 / 3:
        return ()
    return ("timeout", "--signal=KILL", f"{random.uniform(0.001, 0.08):.4f}")


def without_locks():
    # The delay, in microseconds, leaves a new file empty for so long.
    return injecting("flock", "error=ENOLCK", "-e", "trace=flock,fchmod",
                     "-e", "inject=fchmod:delay_enter=3000")


def named_by(option, runs):
    """The events, or archives, of the runs of one kind."""
    return {name for kind, name in runs if kind == option}


class Round:
    """The runs of one round. Of those that finished and of those that were killed it keeps the last
    arguments, by option and event. They are only added to, one at a time, which needs no lock."""

    def __init__(self, machine, outcome, seconds, before, has_locks):
        self.machine = machine
        self.outcome = outcome
        self.until = time.monotonic() + seconds
        self.before = before  # returns the command before a run
        self.has_locks = has_locks
        self.numbers = itertools.count()
        self.finished, self.killed = {}, {}
        self.histories_read = 0

    def run(self, *arguments, before=None):
        """True for a run that finished."""
        before = self.before() if before is None else before
        code, output = self.machine.run(*arguments, before=before, timeout=60)
        runs = self.killed if code else self.finished
        runs.setdefault(arguments[:2], []).append(arguments[-1])
        check(code == 0 or before, f"exit code {code}: {arguments} {output}")
        return code == 0

    def record_event(self):
        """One event from its start to its end."""
        event = f"event{next(self.numbers)}"
        if not self.run("-start", event, "-Product", f"P{event}"):
            return
        long = "x" * random.choice((10, 100, 5000, 60000))
        for log, text in ((event, "first"), (random.choice(SHARED), long), (event, "second")):
            self.run("-logmessage", log, "-message", f"^{event} {text}$")
        copy = f"C{random.randrange(COPIES)}"
        self.run("-end", event, "-CopyName", copy, "-Result", f"R{event}")
        archive = self.machine.scratch / f"{event}.zip"
        if random.random() < 0.1 and self.run("-report", str(archive)):
            entries = history.read_archive(archive)
            history.parse_history(entries["History.ini"], self.has_locks)
            archive.unlink()

    def replace_history(self):
        """What replaces the history file, and nothing else, so as often as possible."""
        event = f"event{next(self.numbers)}"
        self.run("-start", event)
        self.run("-end", event, "-CopyName", "C")

    def message_during_start(self):
        """A run appends a message while the start still writes the log."""
        event = f"early{next(self.numbers)}"
        log = self.machine.history / event / history.LOG
        start = self.machine.start("-start", event, "-Product", f"P{event}")
        wait_for(log.exists, "no log")
        self.run("-logmessage", event, "-message", "^early$", before=())
        check(start.wait(20) == 0, "exit code of a start")
        self.finished["-start", event] = [f"P{event}"]

    def read(self):
        history.parse_history(self.machine.ini.read_bytes(), self.has_locks)
        self.histories_read += 1
        time.sleep(0.01)

    def repeat(self, name, action):
        while time.monotonic() < self.until:
            self.outcome.attempt(f"overlap, {name}", action)

    def run_all(self):
        for event in SHARED:
            self.run("-start", event, "-Product", f"P{event}", before=())
        for _ in range(10 if self.has_locks else 0):
            self.outcome.attempt("overlap, early message", self.message_during_start)
        # Without locks runs may undo each other's changes: only what each leaves must be complete.
        work = self.record_event if self.has_locks else self.replace_history
        in_threads([(self.repeat, "worker", work)] * WORKERS
                   + [(self.repeat, "reader", self.read)])
        sections = self.outcome.attempt("overlap, history", self.machine.sections) or {}
        if self.has_locks:
            self.outcome.attempt("overlap, count", lambda: self.check_count(sections))
            for event in named_by("-start", self.finished):
                self.outcome.attempt(f"overlap, event {event}",
                                     lambda: self.check_event(sections.get(event), event))
            self.outcome.attempt("overlap, last report", self.check_last_report)

    def check_count(self, sections):
        started = named_by("-start", self.finished)
        begun = started | named_by("-start", self.killed)
        check(started <= set(sections) - {"History"} <= begun, "sections")
        count = int(sections["History"]["Count"])
        check(len(started) <= count <= len(begun),
              f"count {count}, finished {len(started)}, begun {len(begun)}")

    def check_event(self, keys, event):
        end = ("-end", event)
        check(keys, "lost section")
        check(keys["Complete_Flag"] == "TRUE" or end not in self.finished, "lost end")
        check(keys["Complete_Flag"] == "FALSE" or end in self.finished or end in self.killed,
              "end without a run")
        check(keys["Product"] == f"P{event}", "lost product")
        log = self.machine.log_of(event, keys["Copy_Name"] or "none")
        text = log.read_text(errors="replace")
        if end in self.finished:
            check(str(log) == keys["Event_Log_File"], "the key names another log")
            check("( End )" in text.splitlines()[-1], "log does not end")
        self.check_messages(text, event)

    def check_messages(self, text, event):
        """What a killed run has written of its message is before that of the next run."""
        sent, killed = (runs.get(("-logmessage", event), [])
                        for runs in (self.finished, self.killed))
        check(not re.search(r"(?m)^[^^\n]+\^", text), "text before a message")
        found = []
        for part in re.findall(r"\^[^^\n]*\n?", text):
            message = part.rstrip("\n")
            if part.endswith("$\n"):
                found.append(message)
            else:
                check(any(whole.startswith(message) for whole in killed), "torn message")
        check(len(found) == len(set(found)), "a message twice")
        finished = [message for message in found if message not in killed]
        check(sorted(finished) == sorted(sent), "messages lost or torn")
        check(event in SHARED or finished == sent, "order")

    def check_last_report(self):
        self.machine.check_report(timeout=120)
        self.machine.must("-start", "after")
        check(not list(self.machine.history.rglob(".*")), "leftover files")


# Name, share of the seconds, command before a run, whether it has locks.
ROUNDS = (("undisturbed", 0.5, lambda: (), True), ("killed", 0.35, sometimes_killing, True),
          ("without locks", 0.15, without_locks, False))


def attack_together(program, outcome, seconds, _):
    """Takes a minute and a half when nothing limits it."""
    counts = []
    for name, share, *kind in ROUNDS:
        with Target(program) as machine:
            runs = Round(machine, outcome, (seconds or 90) * share, *kind)
            runs.run_all()
        finished, killed = (sum(map(len, kept.values())) for kept in (runs.finished, runs.killed))
        counts.append(f"{name}: {finished + killed} runs, {killed} of them killed, "
                      f"{len(named_by('-report', runs.finished))} archives and "
                      f"{runs.histories_read} histories read")
    return "; ".join(counts)
