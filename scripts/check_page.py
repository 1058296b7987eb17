#!/usr/bin/env python3
"""Opens the page of a hostile history in a headless Chromium and checks what it shows.

Every event must be there, as text; no script may have run and nothing may have been fetched.
"""
import html.parser
import re
import subprocess
import sys

import history
from machine import Machine

# What would run, load or hide something if it were not escaped, wherever it is put.
HOSTILE = [
    "<script>document.title='ran'</script>",
    "<img src=x onerror=\"document.title='ran'\">",
    "\" onload=\"document.title='ran'",
    "' autofocus onfocus='document.title=\"ran\"",
    "</details></main><style>*{display:none}</style>",
    "<a href=\"javascript:document.title='ran'\">x</a>",
    "<link rel=stylesheet href=http://localhost:9/x.css>",
    "]]><!--",
    "&lt;b&gt;&#x3c;i&#x3e;",
    "abc\u202egnp.exe",
    "\x1b[2Jbell\x07",
]

CHROMIUM = ["chromium", "--headless", "--no-sandbox", "--disable-gpu", "--disable-quic",
            "--no-first-run", "--disable-background-networking", "--disable-component-update",
            "--disable-sync"]


class Page(html.parser.HTMLParser):
    """What the browser made of the page: its elements, their attributes, and its text."""

    def __init__(self, dom):
        super().__init__()
        self.tags, self.attributes, self.text = [], [], ""
        self.feed(dom)

    def handle_starttag(self, tag, attrs):
        self.tags.append(tag)
        self.attributes += attrs

    def handle_data(self, data):
        self.text += data


def shown(text):
    """The text as the page shows it: what hides or orders text is shown by its number."""
    return re.sub("[\x00-\x1f\u202e]", lambda found: f"[U+{ord(found[0]):04X}]", text)


def record(machine):
    """A history in which every text is hostile. Returns the names of its events."""
    machine.root.mkdir()
    names = [f"{number}{text}".replace("/", "\u2215") for number, text in enumerate(HOSTILE)]
    for name, text in zip(names, HOSTILE):
        machine.must("-start", name, "-Product", text, "-Action", text, "-Command", text)
        machine.must("-logmessage", name, "-message", text)
        machine.must("-end", name, "-CopyName", name, "-Result", text)
    return names


def browse(machine, address):
    """Returns the DOM, and the addresses that the browser asked for."""
    log = machine.scratch / "net.json"
    dom = subprocess.run([*CHROMIUM, f"--user-data-dir={machine.scratch}/profile",
                          f"--log-net-log={log}", "--dump-dom", address], check=True,
                         timeout=120, stdout=subprocess.PIPE, stderr=subprocess.DEVNULL).stdout
    # The browser asks its maker's servers by itself; the hostile texts name these alone.
    return dom.decode(), set(re.findall(r'"url":"((?:file:|http://localhost)[^"]*)"',
                                        log.read_text()))


def faults_of(address, dom, requests, names):
    page = Page(dom)
    targets = {f"#{value}" for name, value in page.attributes if name == "id"}
    faults = [f"an element {tag}" for tag in page.tags
              if tag in ("script", "img", "link", "iframe", "object", "form", "base")]
    faults += [f"an attribute {name}" for name, _ in page.attributes
               if name.startswith("on") or name in ("src", "srcset", "action", "style")]
    faults += [f"a link to {value}" for name, value in page.attributes
               if name == "href" and value not in targets]
    faults += [f"fetched {url}" for url in requests if url != address]
    faults += [f"not shown: {name!r}" for name in names if page.text.count(shown(name)) < 3]
    if "<title>Installation history" not in dom:
        faults.append("the title has changed: a script has run")
    return faults


def main():
    with Machine(history.PROGRAM) as machine:
        names = record(machine)
        page = machine.scratch / "page.html"
        subprocess.run([history.READER, "--from", machine.history, "page", page], check=True)
        faults = faults_of(f"file://{page}", *browse(machine, f"file://{page}"), names)
    print("\n".join([*faults, f"{len(names)} events on the page, {len(faults)} faults"]))
    return 1 if faults else 0


if __name__ == "__main__":
    sys.exit(main())
