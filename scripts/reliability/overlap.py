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


class Round:
    """The runs of one round, and what is known to be finished. Lists and sets are only added to,
    one element at a time, which needs no lock."""

    has_locks = True

    def __init__(self, machine, outcome, seconds, before):
        self.machine = machine
        self.outcome = outcome
        self.until = time.monotonic() + seconds
        self.before = before  # returns the command before a run
        self.numbers = itertools.count()
        self.codes, self.reports, self.parsed = [], [], []
        self.begun, self.started, self.ending = set(SHARED), set(SHARED), set()
        self.copies = {}  # event: copy, of the finished ends
        self.messages = {}  # event: messages of the finished runs
        self.killed_messages = set()

    def run(self, *arguments):
        """True for a run that finished."""
        before = self.before()
        code, output = self.machine.run(*arguments, before=before, timeout=60)
        self.codes.append(code)
        check(code == 0 or before, f"exit code {code}: {arguments} {output}")
        return code == 0

    def send(self, event, text):
        if self.run("-logmessage", event, "-message", f"^{text}$"):
            self.messages.setdefault(event, []).append(text)
        else:
            self.killed_messages.add(text)

    def record_event(self):
        """One event from its start to its end."""
        event = f"event{next(self.numbers)}"
        self.begun.add(event)
        if not self.run("-start", event, "-Product", f"P{event}"):
            return
        self.started.add(event)
        self.send(event, f"{event} first")
        length = random.choice((10, 100, 5000, 60000))
        self.send(random.choice(SHARED), f"{event} {'x' * length}")
        self.send(event, f"{event} second")
        copy = f"C{random.randrange(COPIES)}"
        self.ending.add(event)
        if self.run("-end", event, "-CopyName", copy, "-Result", f"R{event}"):
            self.copies[event] = copy
        if random.random() < 0.1:
            self.report(self.machine.scratch / f"{event}.zip")

    def report(self, archive):
        if self.run("-report", str(archive)):
            entries = history.read_archive(archive)
            history.parse_history(entries["History.ini"], self.has_locks)
            archive.unlink()
            self.reports.append(archive)

    def message_during_start(self):
        """A run appends a message while the start still writes the log."""
        event = f"early{next(self.numbers)}"
        log = self.machine.history / event / history.LOG
        start = self.machine.start("-start", event, "-Product", f"P{event}")
        wait_for(log.exists, "no log")
        self.machine.must("-logmessage", event, "-message", "^early$")
        check(start.wait(20) == 0, "exit code of a start")
        self.begun.add(event)
        self.started.add(event)
        self.messages[event] = ["early"]

    def read(self):
        data = self.machine.ini.read_bytes()
        self.parsed.append(history.parse_history(data, self.has_locks)["History"])
        time.sleep(0.01)

    def repeat(self, name, action):
        while time.monotonic() < self.until:
            self.outcome.attempt(f"overlap, {name}", action)

    def run_all(self):
        for event in SHARED:
            self.machine.must("-start", event, "-Product", f"P{event}")
        for _ in range(10 if self.has_locks else 0):
            self.outcome.attempt("overlap, early message", self.message_during_start)
        in_threads([(self.repeat, "worker", self.record_event)] * WORKERS
                   + [(self.repeat, "reader", self.read)])
        sections = self.outcome.attempt("overlap, history", self.machine.sections) or {}
        if self.has_locks:
            self.outcome.attempt("overlap, count", lambda: self.check_count(sections))
            for event in self.started:
                self.outcome.attempt(f"overlap, event {event}",
                                     lambda: self.check_event(sections.get(event), event))
            self.outcome.attempt("overlap, last report", self.check_last_report)

    def check_count(self, sections):
        check(self.started <= set(sections) - {"History"} <= self.begun, "sections")
        count = int(sections["History"]["Count"])
        check(len(self.started) <= count <= len(self.begun),
              f"count {count}, finished {len(self.started)}, begun {len(self.begun)}")

    def check_event(self, keys, event):
        check(keys, "lost section")
        check(keys["Complete_Flag"] == "TRUE" or event not in self.copies, "lost end")
        check(keys["Complete_Flag"] == "FALSE" or event in self.ending, "end without a run")
        check(keys["Product"] == f"P{event}", "lost product")
        self.check_log(keys, event)

    def check_log(self, keys, event):
        log = self.machine.log_of(event, keys["Copy_Name"] or "none")
        text = log.read_text(errors="replace")
        if event in self.copies:
            check(str(log) == keys["Event_Log_File"], "the key names another log")
            check("( End )" in text.splitlines()[-1], "log does not end")
        found = self.messages_in(text)
        check(len(found) == len(set(found)), "a message twice")
        finished = [message for message in found if message not in self.killed_messages]
        sent = self.messages.get(event, [])
        check(sorted(finished) == sorted(sent), "messages lost or torn")
        check(event in SHARED or finished == sent, "order")

    def messages_in(self, text):
        """The messages of a log. What a killed run has written of its message is before that of
        the next run."""
        check(not re.search(r"(?m)^[^^\n]+\^", text), "text before a message")
        messages = []
        for part in re.findall(r"\^[^^\n]*\n?", text):
            if part.endswith("$\n"):
                messages.append(part[1:-2])
            else:
                check(any(f"^{message}$".startswith(part.rstrip("\n"))
                          for message in self.killed_messages), "torn message")
        return messages

    def check_last_report(self):
        self.machine.check_report(timeout=120)
        self.machine.must("-start", "after")
        check(not list(self.machine.history.rglob(".*")), "leftover files")


class UnlockedRound(Round):
    """Runs may undo each other's changes here: only what each leaves must be complete."""

    has_locks = False

    def record_event(self):
        """Only what replaces the history file, as often as possible."""
        event = f"event{next(self.numbers)}"
        self.run("-start", event)
        self.run("-end", event, "-CopyName", "C")


# Name, share of the seconds, class, command before a run.
ROUNDS = (("undisturbed", 0.5, Round, lambda: ()), ("killed", 0.35, Round, sometimes_killing),
          ("without locks", 0.15, UnlockedRound, without_locks))


def attack_together(program, outcome, seconds, _):
    """Takes a minute and a half when nothing limits it."""
    counts = []
    for name, share, kind, before in ROUNDS:
        with Target(program) as machine:
            runs = kind(machine, outcome, (seconds or 90) * share, before)
            runs.run_all()
        killed = len(runs.codes) - runs.codes.count(0)
        counts.append(f"{name}: {len(runs.codes)} runs, {killed} of them killed, "
                      f"{len(runs.reports)} archives and {len(runs.parsed)} histories read")
    return "; ".join(counts)
