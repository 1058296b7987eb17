#!/usr/bin/env python3
"""Writes a registry export of a given size, laid out as a machine's own: key by key down the tree.

usage: make-registry-export.py MEGABYTES utf-8|utf-16 FILE
"""
import random
import sys

SHARES = (  # of the whole, in the order of the tree
    ("SOFTWARE\\Classes\\CLSID", 22),
    ("SOFTWARE\\Classes\\Interface", 10),
    ("SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Component Based Servicing\\Packages", 22),
    ("SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Components", 8),
    ("SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\SideBySide\\Winners", 8),
    ("SOFTWARE\\WOW6432Node\\Classes\\CLSID", 12),
    ("SYSTEM\\CurrentControlSet\\Enum", 18),
)
random.seed(7)

def guid():
    h = "%032X" % random.getrandbits(128)
    return "{%s-%s-%s-%s-%s}" % (h[:8], h[8:12], h[12:16], h[16:20], h[20:])

def key(path, *values):
    return "[HKEY_LOCAL_MACHINE\\%s]\n%s\n" % (path, "".join(v + "\n" for v in values))

def component(root):
    path = "%s\\%s" % (root, guid())
    rows = (",".join(["a0"] * 25) for _ in range(random.randint(1, 8)))
    return key(path, '@="Component of the machine"') + key(
        path + "\\InprocServer32",
        '@="C:\\\\Windows\\\\System32\\\\module%d.dll"' % random.randint(1, 9999),
        '"ThreadingModel"="Both"', '"Flags"=dword:%08x' % random.getrandbits(32),
        '"Bin"=hex:' + ",\\\n  ".join(rows))

def products():
    root = "SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products"
    for i in range(400):
        path = "%s\\%032X" % (root, random.getrandbits(128))
        yield key(path) + key(path + "\\InstallProperties", '"DisplayName"="Product %d"' % i,
            '"DisplayVersion"="1.0"', '"InstallDate"="20200101"', '"InstallLocation"=""',
            '"Language"=dword:00000409', '"Publisher"="ZEK"')

def drivers():
    root = "SOFTWARE\\ODBC\\ODBCINST.INI"
    yield key(root + "\\ODBC Drivers", *('"ZEK ORX %d"="Installed"' % i for i in range(60)))
    for i in range(60):
        yield key("%s\\ZEK ORX %d" % (root, i), '"Driver"="orxodbc.dll"', '"UsageCount"=dword:1')

def copies():
    for i in range(5):
        yield key("SOFTWARE\\ZEK\\ORX\\InstalledCopies\\COPY%d\\GLOBAL_PROFILE" % i,
            *('"ORXPARAMETER%d"="value"' % j for j in range(60)))

BEHIND = {3: products, 4: drivers, 5: copies}

def main():
    size, encoding, name = int(sys.argv[1]) * 1000000, sys.argv[2], sys.argv[3]
    code = "utf-16-le" if encoding == "utf-16" else "utf-8"
    with open(name, "wb") as out:
        if encoding == "utf-16":
            out.write(b"\xff\xfe")
        def put(text):
            return out.write(text.replace("\n", "\r\n").encode(code))
        put("Windows Registry Editor Version 5.00\n\n")
        for number, (root, share) in enumerate(SHARES):
            left = size * share // 100
            while left > 0:
                left -= put("".join(component(root) for _ in range(100)))
            for part in BEHIND.get(number, tuple)():
                put(part)

main()
