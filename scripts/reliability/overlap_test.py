"""Runs of all kinds, sixteen at once, over one history: first undisturbed, then with every third
run killed at some moment, then on a file system that gives no locks. All the while a reader parses
the history file. At the end what finished must be there, whole and once.
"""

import random
import threading
import time

import common
from common import check

WORKERS = 16
SHARED = 4
COPIES = 5


class Crowd:
    """The workers of one round and what they know to be finished."""

    def __init__(self, program, seconds):
        self.machine = common.Machine(program)
        self.until = time.monotonic() + seconds
        self.lock = threading.Lock()
        self.runs = self.killed = self.reports = self.looks = self.begun = 0
        self.started, self.ended, self.attempted = set(), set(), set()
        self.messages = {}  # event: texts of the finished runs
        self.cut = set()  # texts of the killed ones

    def before(self, chance):
        """The words before a run: nothing, or what kills it."""
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
            entries = common.check_archive(archive)
            check_sections(common.parse_history(entries["History.ini"]))
            self.reports += 1

    def message_during_start(self, number):
        """A message that a run appends while the start still writes the log."""
        event = f"early{number}"
        log = self.machine.history / event / "ORXInstallEvent.Log"
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
            outcome.attempt(f"worker {worker}", lambda: self.live(chance, worker, number))
            number += 1

    def read(self, outcome):
        while time.monotonic() < self.until:
            outcome.attempt("reader", self.look)
            self.looks += 1
            time.sleep(0.01)

    def look(self):
        check_sections(self.machine.sections())

    def go(self, outcome):
        for number in range(SHARED):
            self.machine.must("-start", f"shared{number}")
        self.started |= {f"shared{number}" for number in range(SHARED)}
        self.begun += SHARED
        for number in range(10):
            outcome.attempt("early message", lambda n=number: self.message_during_start(n))
        threads = [threading.Thread(target=self.work, args=(outcome, worker))
                   for worker in range(WORKERS)]
        threads.append(threading.Thread(target=self.read, args=(outcome,)))
        for thread in threads:
            thread.start()
        for thread in threads:
            thread.join()
        self.judge(outcome)
        self.machine.remove()

    def judge(self, outcome):
        sections = outcome.attempt("history", self.machine.sections) or {"History": {"Count": "0"}}
        outcome.attempt("count", lambda: self.check_count(sections))
        for event in self.started:
            outcome.attempt(f"event {event}", lambda e=event: self.check_event(sections, e))
            outcome.attempt(f"log {event}", lambda e=event: self.check_log(sections, e))
        outcome.attempt("last report", self.check_last_report)

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
        places = [folder / event / "ORXInstallEvent.Log" for folder in
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
        entries = common.check_archive(archive)
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
        outcome.attempt("history", self.machine.sections)


def check_sections(sections):
    for name, keys in sections.items():
        check(name == "History" or set(keys) == set(common.EVENT_KEYS), f"part of section {name}")


def main():
    parser = common.arguments(__doc__, "of all rounds together")
    options = parser.parse_args()
    seconds = options.seconds or 90
    outcome = common.Outcome()
    rounds = (("undisturbed", UndisturbedCrowd, 0.5), ("killed", KilledCrowd, 0.35),
              ("without locks", UnlockedCrowd, 0.15))
    for name, kind, share in rounds:
        crowd = kind(options.program, seconds * share)
        crowd.go(outcome)
        print(f"{name}: {crowd.runs} runs, {crowd.killed} of them killed, {crowd.reports} archives "
              f"and {crowd.looks} histories read meanwhile", flush=True)
    print(f"{outcome.seconds():.0f} s")
    outcome.end()


if __name__ == "__main__":
    main()
