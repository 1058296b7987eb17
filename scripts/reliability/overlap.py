"""Runs of all kinds, sixteen at once, over one history: first undisturbed, then with every third
run killed at a random moment, then on a file system without locks. Meanwhile a reader parses the
history file. At the end everything that finished must be there, whole and once.
"""

import random
import threading
import time

import history
from harness import Machine, in_threads, injecting
from history import check

WORKERS = 16
SHARED = [f"shared{number}" for number in range(4)]
COPIES = 5


class Crowd:
    """The workers of one round and what they know to be finished. Lists and sets only grow, by one
    element at a time, which needs no lock."""

    has_whole_events = True

    def __init__(self, machine, seconds):
        self.machine = machine
        self.until = time.monotonic() + seconds
        self.results, self.reports = [], []
        self.looks = 0
        self.begun, self.started, self.ending = set(SHARED), set(SHARED), set()
        self.copies = {}  # event: copy, of the finished ends
        self.messages = {}  # event: texts of the finished runs
        self.cut = set()  # texts of the killed ones

    def before(self, chance):
        """The words before a run: none, or a command that kills it."""
        del chance
        return ()

    def run(self, chance, *words):
        """True for a run that finished."""
        before = self.before(chance)
        result, output = self.machine.run(*words, before=before, timeout=60)
        self.results.append(result)
        check(result == 0 or before, f"result {result}: {words} {output}")
        return result == 0

    def send(self, chance, event, text):
        if self.run(chance, "-logmessage", event, "-message", text):
            self.messages.setdefault(event, []).append(text)
        else:
            self.cut.add(text)

    def live(self, chance, worker, number):
        """One event from its start to its end."""
        event = f"{worker}-{number}"
        self.begun.add(event)
        if not self.run(chance, "-start", event, "-Product", f"P{event}"):
            return
        self.started.add(event)
        self.send(chance, event, f"{event} own first")
        length = chance.choice((10, 100, 5000, 60000))
        self.send(chance, SHARED[number % len(SHARED)], f"{event} {'x' * length} shared")
        self.send(chance, event, f"{event} own second")
        copy = f"C{chance.randrange(COPIES)}"
        self.ending.add(event)
        if self.run(chance, "-end", event, "-CopyName", copy, "-Result", f"R{event}"):
            self.copies[event] = copy
        if number % 10 == worker % 10:
            self.report(chance, worker)

    def report(self, chance, worker):
        archive = self.machine.scratch / f"{worker}.zip"
        if self.run(chance, "-report", str(archive)):
            entries = history.read_archive(archive)
            history.parse_history(entries["History.ini"], has_whole_events=True)
            self.reports.append(archive)

    def message_during_start(self, number):
        """A run appends a message while the start still writes the log."""
        event = f"early{number}"
        log = self.machine.history / event / history.LOG
        start = threading.Thread(target=self.machine.run, args=("-start", event))
        start.start()
        while not log.exists():
            time.sleep(0.0005)
        self.machine.must("-logmessage", event, "-message", "early message")
        start.join()
        lines = log.read_text(errors="replace").splitlines()
        check(lines.count("early message") == 1, "a start wrote over a message")
        self.begun.add(event)
        self.started.add(event)

    def work(self, outcome, worker):
        chance = random.Random(worker)
        number = 0
        while time.monotonic() < self.until:
            outcome.attempt(f"overlap, worker {worker}", lambda: self.live(chance, worker, number))
            number += 1

    def read(self, outcome):
        while time.monotonic() < self.until:
            outcome.attempt("overlap, reader", lambda: history.parse_history(
                self.machine.ini.read_bytes(), self.has_whole_events))
            self.looks += 1
            time.sleep(0.01)

    def go(self, outcome):
        for event in SHARED:
            self.machine.must("-start", event)
        for number in range(10):
            outcome.attempt("overlap, early message", lambda n=number: self.message_during_start(n))
        in_threads([(self.work, outcome, worker) for worker in range(WORKERS)]
                   + [(self.read, outcome)])
        self.judge(outcome)

    def judge(self, outcome):
        sections = (outcome.attempt("overlap, history", self.machine.sections)
                    or {"History": {"Count": "0"}})
        outcome.attempt("overlap, count", lambda: self.check_count(sections))
        for event in self.started:
            for check_part in self.check_event, self.check_log:
                outcome.attempt(f"overlap, event {event}",
                                lambda f=check_part, e=event: f(sections.get(e), e))
        outcome.attempt("overlap, last report", self.check_last_report)

    def check_count(self, sections):
        count = int(sections["History"]["Count"])
        check(len(self.started) <= count <= len(self.begun),
              f"count {count}, finished {len(self.started)}, begun {len(self.begun)}")

    def check_event(self, keys, event):
        check(keys, "lost section")
        check(keys["Complete_Flag"] == "TRUE" or event not in self.copies, "lost end")
        check(keys["Complete_Flag"] == "FALSE" or event in self.ending, "strange end")
        check(keys["Product"] == f"P{event}" or "-" not in event, "lost product")

    def check_log(self, keys, event):
        log = self.machine.log_of(event, keys["Copy_Name"] or "none")
        lines = log.read_text(errors="replace").splitlines()
        if event in self.copies:
            check(str(log) == keys["Event_Log_File"], "the key names another log")
            check("( End )" in lines[-1], "log does not end")
        sent = self.messages.get(event, [])
        found = [self.without_remains(line, sent) for line in lines
                 if line.endswith((" own first", " own second", " shared"))]
        check(sorted(line for line in found if line not in self.cut) == sorted(sent),
              "messages lost, torn or doubled")
        check(len(found) == len(set(found)), "a message twice")
        check(event in SHARED or [m for m in found if m in sent] == sent, "order")
        check(not any("own first" in line or " own second" in line or "xxx" in line
                      for line in lines if line not in found
                      and not any(text.startswith(line) for text in self.cut)), "torn message")

    def without_remains(self, line, sent):
        """The line without the beginning of a message whose run was killed in the middle of it: the
        next one follows on the same line."""
        if line in sent or line in self.cut:
            return line
        for text in sent:
            remains = line[:-len(text)]
            if line.endswith(text) and any(cut.startswith(remains) for cut in self.cut):
                return text
        return line

    def check_last_report(self):
        self.machine.check_report(timeout=120)
        self.machine.must("-start", "after")
        check(not (self.machine.history / ".History.tmp").exists(), "litter")


class UndisturbedCrowd(Crowd):
    def check_count(self, sections):
        check(self.started == self.begun == set(sections) - {"History"}, "sections")
        check(int(sections["History"]["Count"]) == len(self.begun), "count")
        check(not list(self.machine.history.rglob(".*")), "litter")


class KilledCrowd(Crowd):
    def before(self, chance):
        if chance.random() < 2 / 3:
            return ()
        return ("timeout", "--signal=KILL", f"{chance.uniform(0.001, 0.08):.4f}")


class UnlockedCrowd(Crowd):
    """Runs may undo each other's changes here: only what each leaves must be whole."""

    has_whole_events = False

    def before(self, chance):
        # The delay, in microseconds, leaves a new file empty for so long.
        return injecting("flock", "error=ENOLCK", "-e", "trace=flock,fchmod",
                         "-e", "inject=fchmod:delay_enter=3000")

    def live(self, chance, worker, number):
        event = f"{worker}-{number}"
        self.run(chance, "-start", event)
        self.run(chance, "-end", event, "-CopyName", "C")

    def message_during_start(self, number):
        pass

    def judge(self, outcome):
        outcome.attempt("overlap, history", self.machine.sections)


ROUNDS = (("undisturbed", UndisturbedCrowd, 0.5), ("killed", KilledCrowd, 0.35),
          ("without locks", UnlockedCrowd, 0.15))


def attack_together(program, outcome, seconds, _):
    for name, kind, share in ROUNDS:
        with Machine(program) as machine:
            crowd = kind(machine, seconds * share)
            crowd.go(outcome)
        killed = len(crowd.results) - crowd.results.count(0)
        print(f"overlap, {name}: {len(crowd.results)} runs, {killed} of them killed, "
              f"{len(crowd.reports)} archives and {crowd.looks} histories read meanwhile",
              flush=True)
