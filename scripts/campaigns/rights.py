"""An ordinary user without the rights to all files."""

import os

from campaigns.places import Faults, Whole
from campaigns.trial import BELOW, CACHE, COPIES, HOSTS, ONE, PARTS, PINS, SPECS, TWO, Installation, NoCoreFiles

ORDINARY_USER = 65534
DEEP = f"{BELOW}/one/deep/b.menu"


def AsOrdinaryUser():
    NoCoreFiles()
    if os.getuid() == 0:
        os.setgroups([])
        os.setgid(ORDINARY_USER)
        os.setuid(ORDINARY_USER)


def CheckRights(_):
    """Folders and files that an ordinary user may not read, enter or write."""
    everything = [HOSTS, SPECS, ONE, PARTS, TWO]

    def After(missing=(), end="exit 0", without=()):
        return lambda prior: (end, {**Whole(missing=missing), **{name: prior[name] for name in without}})
    refused = After(end="exit 5", without=[CACHE, *COPIES])
    ofOne = [copy for copy in COPIES if "/one/" in copy]
    ofTwo = [copy for copy in COPIES if "/two/" in copy]
    cases = [
        # Path, permission bits, what is to come of it, and whether only with or without earlier output.
        (BELOW, 0o555, refused, False),
        (BELOW, 0o555, After(), True),  # Files that stand can be written all the same, unless a folder is to be made.
        (BELOW, 0o311, After(everything, "exit 5", COPIES), None),
        (BELOW, 0o111, refused, False),
        (CACHE, 0o444, refused, True),
        (CACHE, 0o000, refused, True),
        (f"{BELOW}/one", 0o000, After([ONE], without=ofOne), None),
        (f"{BELOW}/one", 0o444, After([ONE], without=ofOne), None),
        (f"{BELOW}/one", 0o111, After([ONE], without=ofOne), None),
        (f"{BELOW}/one", 0o555, After(end="SIGABRT", without=COPIES), False),
        (f"{BELOW}/two", 0o000, After([TWO], without=ofTwo), None),
        (f"{BELOW}/Utilities", 0o111, After(), None),
        ("Elsewhere", 0o000, After([PARTS]), None),
        (HOSTS, 0o000, After([HOSTS]), None),
        (SPECS, 0o000, After([SPECS], "exit 5", COPIES), None),
        (ONE, 0o000, After([ONE], without=ofOne), None),
        (PINS, 0o200, After([PINS]), None),
        ("Menus/V5", 0o000, After(without=ofOne), None),
        ("Menus/V5", 0o111, After(without=ofOne), None),
        ("Menus/V5/a.menu", 0o000, After(end="SIGABRT", without=COPIES), None),
        ("Menus/V5/deep", 0o000, After(without=[DEEP]), None),
        ("Menus/S6/c.menu", 0o000, After(end="SIGABRT", without=ofTwo), None),
        (f"{BELOW}/one/a.menu", 0o444, After(end="SIGABRT", without=COPIES), True),
        (f"{BELOW}/two/c.menu", 0o444, After(end="SIGABRT", without=ofTwo), True),
        ("Menus", 0o000, After(without=COPIES), None),
        (".", 0o311, After(), None),
    ]
    for below, bits, after, onlyUsed in cases:
        for isUsed in (False, True) if onlyUsed is None else (onlyUsed,):
            with Installation(isUsed) as installation:
                paths = [installation.root, *installation.root.rglob("*")]
                if os.getuid() == 0:
                    for path in paths:
                        os.chown(path, ORDINARY_USER, ORDINARY_USER, follow_symlinks=False)
                path = installation.root / below
                usual = path.stat().st_mode
                path.chmod(bits)
                end = installation.Run(preexec_fn=AsOrdinaryUser)
                path.chmod(usual)
                expectedEnd, expected = after(installation.Prior())
                yield Faults(installation, end, expectedEnd, expected, f"{below} {bits:o}{', used' * isUsed}: ")
