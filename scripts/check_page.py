#!/usr/bin/env python3
"""Opens the page of a hostile history in a headless Chromium and looks at what it made of it.

usage: check_page.py RECORDER READER [FOLDER]

Every event must be there, as text; no script may have run and nothing may have been fetched. With a
folder, the page and pictures of it (wide, narrow, dark) are kept there.
"""
import html.parser
import json
import os
import re
import subprocess
import sys
import tempfile

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
            "--disable-sync", "--hide-scrollbars"]


class Page(html.parser.HTMLParser):
    """What the browser made of the page: its text, and all that could run or load something."""

    def __init__(self, dom):
        super().__init__()
        self.text = []
        self.faults = []
        self.links = set()
        self.ids = set()
        self.feed(dom)

    def handle_starttag(self, tag, attrs):
        if tag in ("script", "img", "link", "iframe", "object", "form", "base"):
            self.faults.append(f"an element {tag}")
        for name, value in attrs:
            if name.startswith("on") or name in ("src", "srcset", "action", "style"):
                self.faults.append(f"an attribute {name}")
            if name == "href":
                self.links.add(value)
            if name == "id":
                self.ids.add(value)

    def handle_data(self, data):
        self.text.append(data)


def shown(text):
    """The text as the page shows it: what hides or orders text is shown by its number."""
    return re.sub("[\x00-\x1f\u202e]", lambda found: f"[U+{ord(found[0]):04X}]", text)


def record(recorder, folder):
    """A history in which every text is hostile. Returns the names of its events."""
    os.makedirs(f"{folder}/ZEK")
    environment = {**os.environ, "ORX_COMMON_APPDATA": folder}

    def run(*arguments):
        subprocess.run([recorder, *arguments], env=environment, check=True,
                       stdout=subprocess.DEVNULL)

    names = []
    for number, text in enumerate(HOSTILE):
        identity = f"{number}{text}".replace("/", "\u2215")
        names.append(identity)
        run("-start", identity, "-Product", text, "-Action", text, "-Command", text)
        run("-logmessage", identity, "-message", text)
        run("-end", identity, "-CopyName", identity, "-Result", text)
    return f"{folder}/ZEK/ORXHistory", names


def browse(page, *options):
    """Returns the DOM, and the addresses that the browser asked for."""
    with tempfile.TemporaryDirectory() as profile:
        log = f"{profile}/net.json"
        dom = subprocess.run([*CHROMIUM, f"--user-data-dir={profile}", f"--log-net-log={log}",
                              *options, "--dump-dom", f"file://{page}"], check=True, timeout=120,
                             stdout=subprocess.PIPE, stderr=subprocess.DEVNULL).stdout.decode()
        with open(log, encoding="utf-8") as file:
            # The browser asks its maker's servers by itself; the hostile texts name these alone.
            requests = set(re.findall(r'"url":"((?:file:|http://localhost)[^"]*)"', file.read()))
    return dom, requests


def faults_of(page, dom, requests, names):
    seen = Page(dom)
    text = "".join(seen.text)
    faults = list(seen.faults)
    faults += [f"{link} leads nowhere" for link in seen.links
               if not link.startswith("#") or link[1:] not in seen.ids]
    faults += [f"fetched {url}" for url in requests if url != f"file://{page}"]
    faults += [f"not shown: {json.dumps(name)}" for name in names
               if text.count(shown(name)) < 3]
    if not re.search("<title>Installation history", dom):
        faults.append("the title has changed: a script has run")
    return faults


def main():
    recorder, reader = sys.argv[1:3]
    with tempfile.TemporaryDirectory() as scratch:
        folder = sys.argv[3] if len(sys.argv) > 3 else scratch
        os.makedirs(folder, exist_ok=True)
        page = os.path.abspath(f"{folder}/page.html")
        history, names = record(recorder, f"{scratch}/data")
        subprocess.run([reader, "--from", history, "page", page], check=True)
        dom, requests = browse(page)
        faults = faults_of(page, dom, requests, names)
        for fault in faults:
            print(f"page: {fault}")
        if folder != scratch:
            for name, *options in (("wide", "--window-size=1280,2000"),
                                   ("narrow", "--window-size=500,2000"),
                                   ("dark", "--window-size=1280,2000",
                                    "--blink-settings=preferredColorScheme=0")):
                browse(page, f"--screenshot={os.path.abspath(folder)}/{name}.png", *options)
    print(f"{len(names)} events on the page, {len(faults)} faults")
    return 1 if faults else 0


if __name__ == "__main__":
    sys.exit(main())
