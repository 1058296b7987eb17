"""Runs of all kinds, sixteen at once, over one history: first undisturbed, then with every third
run killed at a random moment, then on a file system without locks. Meanwhile a reader parses the
history file. At the end everything that finished must be there, whole and once.
"""

import random
import threading
import time

import history
from harness import Machine, in_threads
from history import check

WORKERS = 16
SHARED = 4
COPIES = 5


class Crowd:
    """The workers of one round and what they know to be finished."""

    def __init__(self, machine, seconds):
        self.machine = machine
        self.until = time.monotonic() + seconds
        self.lock = threading.Lock()
        self.runs = self.killed = self.reports = self.looks = self.begun = 0
        self.started, self.ended, self.attempted = set(), set(), set()
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
        with self.lock:
            self.runs += 1
            self.killed += result != 0
        check(result == 0 or before, f"result {result}: {words} {output}")
        return result == 0

    def send(self, chance, event, text):
        finished = self.run(chance, "-logmessage", event, "-message", text)
        with self.lock:
            if finished:
                self.messages.setdefault(event, []).append(text)
            else:
                self.cut.add(text)

    def live(self, chance, worker, number):
        """One event from its start to its end."""
        event = f"{worker}-{number}"
        with self.lock:
            self.begun += 1
        if not self.run(chance, "-start", event, "-Product", f"P{event}"):
            return
        with self.lock:
            self.started.add(event)
        self.send(chance, event, f"{event} own first")
        length = chance.choice((10, 100, 5000, 60000))
        self.send(chance, f"shared{number % SHARED}", f"{event} {'x' * length} shared")
        self.send(chance, event, f"{event} own second")
        copy = f"C{chance.randrange(COPIES)}"
        with self.lock:
            self.attempted.add(event)
        if self.run(chance, "-end", event, "-CopyName", copy, "-Result", f"R{event}"):
            with self.lock:
                self.ended.add(event)
        if number % 10 == worker % 10:
            self.report(chance, worker)

    def report(self, chance, worker):
        archive = self.machine.scratch / f"{worker}.zip"
        if self.run(chance, "-report", str(archive)):
            entries = history.read_archive(archive)
            history.parse_history(entries["History.ini"], has_whole_events=True)
            self.reports += 1

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
        with self.lock:
            self.started.add(event)
            self.begun += 1
            self.runs += 2

    def work(self, outcome, worker):
        chance = random.Random(worker)
        number = 0
        while time.monotonic() < self.until:
            outcome.attempt(f"overlap, worker {worker}", lambda: self.live(chance, worker, number))
            number += 1

    def read(self, outcome):
        while time.monotonic() < self.until:
            outcome.attempt("overlap, reader", self.look)
            self.looks += 1
            time.sleep(0.01)

    def look(self):
        history.parse_history(self.machine.ini.read_bytes(), has_whole_events=True)

    def go(self, outcome):
        for number in range(SHARED):
            self.machine.must("-start", f"shared{number}")
        self.started |= {f"shared{number}" for number in range(SHARED)}
        self.begun += SHARED
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
                                lambda f=check_part, e=event: f(sections, e))
        outcome.attempt("overlap, last report", self.check_last_report)

    def check_count(self, sections):
        count = int(sections["History"]["Count"])
        check(len(self.started) <= count <= self.begun,
              f"count {count}, finished {len(self.started)}, begun {self.begun}")

    def check_event(self, sections, event):
        check(event in sections, "lost section")
        keys = sections[event]
        check(keys["Complete_Flag"] == "TRUE" or event not in self.ended, "lost end")
        check(keys["Complete_Flag"] == "FALSE" or event in self.attempted, "strange end")
        if "-" in event:
            check(keys["Product"] == f"P{event}", "lost product")

    def log_of(self, keys, event):
        """The log's file, which a killed end may have moved without turning the key."""
        places = [folder / event / history.LOG for folder in
                  (self.machine.history, self.machine.history / (keys["Copy_Name"] or "none"))]
        found = [place for place in places if place.exists()]
        check(len(found) == 1, f"{len(found)} logs")
        check(event not in self.ended or str(found[0]) == keys["Event_Log_File"], "key of place")
        return found[0]

    def check_log(self, sections, event):
        lines = self.log_of(sections[event], event).read_text(errors="replace").splitlines()
        check(event not in self.ended or "( End )" in lines[-1], "log does not end")
        sent = self.messages.get(event, [])
        found = [self.without_remains(line, sent) for line in lines
                 if line.endswith((" own first", " own second", " shared"))]
        check(sorted(line for line in found if line not in self.cut) == sorted(sent),
              "messages lost, torn or doubled")
        check(len(found) == len(set(found)), "a message twice")
        check(event.startswith("shared") or [m for m in found if m in sent] == sent, "order")
        check(not any("own first" in line or " own second" in line or "xxx" in line
                      for line in lines if line not in found
                      and not any(text.startswith(line) for text in self.cut)), "torn message")

    def without_remains(self, line, sent):
        """The line without the beginning of a message whose run was killed in the middle of it:
        the next one stands directly behind."""
        if line in sent or line in self.cut:
            return line
        for text in sent:
            remains = line[:-len(text)]
            if line.endswith(text) and any(cut.startswith(remains) for cut in self.cut):
                return text
        return line

    def check_last_report(self):
        archive = self.machine.scratch / "last.zip"
        self.machine.must("-report", str(archive), timeout=120)
        entries = history.read_archive(archive)
        check(entries["History.ini"] == self.machine.ini.read_bytes(), "history in the archive")
        temporary = self.machine.history / ".History.tmp"
        self.machine.must("-start", "after")
        check(not temporary.exists(), "litter")


class UndisturbedCrowd(Crowd):
    def check_count(self, sections):
        count = int(sections["History"]["Count"])
        check(count == len(self.started) == self.begun, f"count {count} of {self.begun}")
        check(set(sections) == self.started | {"History"}, "sections")
        check(not list(self.machine.history.rglob(".*")), "litter")


class KilledCrowd(Crowd):
    def before(self, chance):
        if chance.random() < 2 / 3:
            return ()
        return ("timeout", "--signal=KILL", f"{chance.uniform(0.001, 0.08):.4f}")


class UnlockedCrowd(Crowd):
    """Runs may undo each other's changes here: only what each leaves must be whole."""

    def before(self, chance):
        # The delay, in microseconds, leaves a new file empty for so long.
        return ("strace", "-f", "--seccomp-bpf", "-o", "/dev/null", "-e", "trace=flock,fchmod",
                "-e", "inject=flock:error=ENOLCK", "-e", "inject=fchmod:delay_enter=3000")

    def live(self, chance, worker, number):
        event = f"{worker}-{number}"
        self.run(chance, "-start", event)
        self.run(chance, "-end", event, "-CopyName", "C")

    def go(self, outcome):
        self.machine.must("-start", "first")
        super().go(outcome)

    def message_during_start(self, number):
        pass

    def look(self):
        self.machine.sections()

    def judge(self, outcome):
        outcome.attempt("overlap, history", self.machine.sections)


ROUNDS = (("undisturbed", UndisturbedCrowd, 0.5), ("killed", KilledCrowd, 0.35),
          ("without locks", UnlockedCrowd, 0.15))


def attack_together(program, outcome, seconds, _):
    for name, kind, share in ROUNDS:
        with Machine(program) as machine:
            crowd = kind(machine, seconds * share)
            crowd.go(outcome)
        print(f"overlap, {name}: {crowd.runs} runs, {crowd.killed} of them killed, {crowd.reports} "
              f"archives and {crowd.looks} histories read meanwhile", flush=True)
