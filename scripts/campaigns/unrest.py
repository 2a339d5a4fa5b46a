"""Files and folders that come, go and change while the tool works."""

import contextlib
import itertools
import random
import shutil
import threading

from campaigns.places import CLOSING, Faults, Whole
from campaigns.trial import BELOW, CACHE, HOSTS, ONE, PARTS, PINS, SPECS, TWO, Contents, ExpectedCache, Installation

DECLARATION = b'<?xml version="1.0"?>'


class Unrest:
    """Changes an installation as fast as it can, until the end of the scope, and puts it in order then."""

    def __init__(self, *steps):
        self.steps = steps
        self.isOver = False
        self.thread = threading.Thread(target=self.Go)

    def Go(self):
        chance = random.Random(1)
        while not self.isOver:
            for step in chance.sample(self.steps, len(self.steps)):
                step()

    def __enter__(self):
        self.thread.start()

    def __exit__(self, *_):
        self.isOver = True
        self.thread.join()


def AllCaches():
    """The caches of all runs to which some files weren't there."""
    files = [HOSTS, SPECS, ONE, PARTS, TWO, PINS]
    return {ExpectedCache(missing) for count in range(len(files) + 1)
            for missing in itertools.combinations(files, count)}


def AwayOf(installation, below):
    return installation.root / f"away {below.replace('/', ' ')}"


def MovesAway(installation, below):
    """Takes a file or folder out of the installation, and gives it back."""
    path = installation.root / below
    away = AwayOf(installation, below)

    def Step():
        if not away.exists():
            path.rename(away)
            return
        if path.is_dir():
            # The tool has made the folder of a copy in the meantime, and may be writing into it.
            shutil.rmtree(path, ignore_errors=True)
        with contextlib.suppress(OSError):
            away.rename(path)
    return Step


def CheckVanishing(isShort):
    """Files and folders that are moved away and back while the tool scans and copies."""
    caches = AllCaches()
    for round_, moved in enumerate([[ONE, TWO, HOSTS], [f"{BELOW}/one", "Elsewhere", SPECS], [PINS, "Menus/V5"],
                                    ["Menus/V5/deep", "Menus/S6/c.menu", TWO]]):
        with Installation() as installation:
            steps = [MovesAway(installation, below) for below in moved]
            with Unrest(*steps):
                for _ in range(10 if isShort else 200):
                    end = installation.Run()
                    cache = installation.root / CACHE
                    faults = [] if end in ("exit 0", "exit 5", "SIGABRT") else [end]
                    if cache.read_bytes() not in caches:
                        faults.append("a cache with something else")
                    yield [f"round {round_}: {fault}" for fault in faults]
            for step, below in zip(steps, moved):
                if AwayOf(installation, below).exists():
                    step()
            yield Faults(installation, installation.Run(), "exit 0", Whole(), f"round {round_}, in the end: ")


def CheckChanging(isShort):
    """Files that are emptied and written anew, byte by byte, while the tool reads them."""
    def Rewrites(path):
        content = path.read_bytes()

        def Step():
            with path.open("wb", buffering=0) as file:
                for start in range(0, len(content), 50):
                    file.write(content[start:start + 50])
        return Step
    with Installation() as installation:
        with Unrest(*[Rewrites(installation.root / below) for below in (ONE, PINS, TWO, "Menus/V5/a.menu")]):
            for _ in range(20 if isShort else 500):
                end = installation.Run()
                cache = (installation.root / CACHE).read_bytes()
                faults = [] if end in ("exit 0", "SIGTRAP") else [end]
                if not cache.startswith(DECLARATION) or not cache.endswith(CLOSING):
                    faults.append("a cache that isn't whole")
                copy = installation.root / f"{BELOW}/one/a.menu"
                if copy.exists() and not Contents(f"{BELOW}/one/a.menu").startswith(copy.read_bytes()):
                    faults.append("a copy with something else")
                yield faults
        yield Faults(installation, installation.Run(), "exit 0", Whole(), "in the end: ")
