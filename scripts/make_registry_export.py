"""A registry export of a given size, laid out as a machine's own: key by key down the tree."""

import random

MICROSOFT = "SOFTWARE\\Microsoft\\Windows\\CurrentVersion"
USER_DATA = f"{MICROSOFT}\\Installer\\UserData\\S-1-5-18"


def guid(generator):
    digits = f"{generator.getrandbits(128):032X}"
    return f"{{{digits[:8]}-{digits[8:12]}-{digits[12:16]}-{digits[16:20]}-{digits[20:]}}}"


def key(path, *values):
    return f"[HKEY_LOCAL_MACHINE\\{path}]\n" + "".join(f"{value}\n" for value in values) + "\n"


def component(generator, root):
    path = f"{root}\\{guid(generator)}"
    rows = (",".join(["a0"] * 25) for _ in range(generator.randint(1, 8)))
    return key(path, '@="Component of the machine"') + key(
        f"{path}\\InprocServer32",
        f'@="C:\\\\Windows\\\\System32\\\\module{generator.randint(1, 9999)}.dll"',
        '"ThreadingModel"="Both"', f'"Flags"=dword:{generator.getrandbits(32):08x}',
        '"Bin"=hex:' + ",\\\n  ".join(rows))


def products(generator):
    for number in range(400):
        path = f"{USER_DATA}\\Products\\{generator.getrandbits(128):032X}"
        yield key(path)
        yield key(f"{path}\\InstallProperties", f'"DisplayName"="Product {number}"',
                  '"DisplayVersion"="1.0"', '"InstallDate"="20200101"', '"InstallLocation"=""',
                  '"Language"=dword:00000409', '"Publisher"="ZEK"')


def drivers(_):
    root = "SOFTWARE\\ODBC\\ODBCINST.INI"
    names = [f"ZEK ORX {number}" for number in range(60)]
    yield key(f"{root}\\ODBC Drivers", *(f'"{name}"="Installed"' for name in names))
    for name in names:
        yield key(f"{root}\\{name}", '"Driver"="orxodbc.dll"', '"UsageCount"=dword:1')


def copies(_):
    for number in range(5):
        yield key(f"SOFTWARE\\ZEK\\ORX\\InstalledCopies\\COPY{number}\\GLOBAL_PROFILE",
                  *(f'"ORXPARAMETER{parameter}"="value"' for parameter in range(60)))


# In the order of the tree: a key with components, its share of the export in per cent, and the keys
# after it.
TREE = (("SOFTWARE\\Classes\\CLSID", 22, None),
        ("SOFTWARE\\Classes\\Interface", 10, None),
        (f"{MICROSOFT}\\Component Based Servicing\\Packages", 22, None),
        (f"{USER_DATA}\\Components", 8, products),
        (f"{MICROSOFT}\\SideBySide\\Winners", 8, drivers),
        ("SOFTWARE\\WOW6432Node\\Classes\\CLSID", 12, copies),
        ("SYSTEM\\CurrentControlSet\\Enum", 18, None))


def make_registry_export(megabytes, encoding, name):
    generator = random.Random(7)
    code, mark = ("utf-16-le", b"\xff\xfe") if encoding == "utf-16" else ("utf-8", b"")
    with open(name, "wb") as export:
        def put(text):
            return export.write(text.replace("\n", "\r\n").encode(code))
        export.write(mark)
        put("Windows Registry Editor Version 5.00\n\n")
        for root, share, others in TREE:
            left = megabytes * 1_000_000 * share // 100
            while left > 0:
                left -= put("".join(component(generator, root) for _ in range(100)))
            for text in others(generator) if others else ():
                put(text)
