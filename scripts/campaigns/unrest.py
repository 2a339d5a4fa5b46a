"""Files and folders that come, go and change while the tool works."""

import contextlib
import itertools
import os
import pathlib
import random
import shutil
import signal
import subprocess
import threading
import time

from campaigns.calls import CallsOf
from campaigns.places import CLOSING, Faults, OutputOf, Whole
from campaigns.trial import (BELOW, CACHE, COPIES, HOSTS, ONE, PARTS, PINS, SPECS, TWO, Contents, Differences,
                             EndOf, ExpectedCache, Installation, NoCoreFiles)

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


# --- One file goes at one moment ---

def StopAfter(installation, call):
    """Starts the tool and gives its process when it stands still behind a call; None if it ends before."""
    trace = installation.root / "browse"  # Not among the output.
    trace.unlink(missing_ok=True)
    strace = subprocess.Popen(["strace", "-o", trace, "-e", f"trace={call.name}", "-e",
                               f"inject={call.name}:signal=STOP:when={call.number}", installation.tool],
                              stdin=subprocess.DEVNULL, stderr=subprocess.DEVNULL, preexec_fn=NoCoreFiles)
    while strace.poll() is None:
        if trace.exists() and "stopped by SIGSTOP" in trace.read_text():
            return strace, int(pathlib.Path(f"/proc/{strace.pid}/task/{strace.pid}/children").read_text())
        time.sleep(0.001)
    return strace, None


def AfterLoss(victim, calls, at, prior):
    """The ends that a run may have in which a file is gone behind a call, each with its output."""
    def Indices(name, subject):
        return [i for i, call in enumerate(calls) if (call.name, call.subject) == (name, subject)]
    whole = {CACHE: ExpectedCache(), **{copy: Contents(copy) for copy in COPIES}}
    # What is open is read to its end.
    if at >= Indices("openat", victim)[0]:
        return [("exit 0", whole)]
    if victim in COPIES.values():
        copy = next(copy for copy, source in COPIES.items() if source == victim)
        output = {**whole, copy: prior[copy]}
        first, last = Indices("getdents64", victim.rpartition("/")[0])
        # What isn't listed isn't missed. A signal may cut the first part of a listing short.
        return [("exit 0", output)] * (at < last) + [("SIGABRT", output)] * (at >= first)
    missing = {**whole, CACHE: ExpectedCache([victim])}
    if victim == SPECS:
        return [("exit 5", {**missing, **{copy: prior[copy] for copy in COPIES}})]
    owner = {ONE: "/one/", TWO: "/two/"}.get(victim)
    return [("exit 0", {**missing, **{copy: prior[copy] for copy in COPIES if owner and owner in copy}})]


def CheckLosses(isShort):
    """A resource file, an included file or a menu file is moved away behind each call of a run in turn."""
    with Installation() as installation:
        calls = CallsOf(installation.Run, installation.root, installation.root / "browse")
        memory = ("mmap", "munmap", "brk", "madvise")
        chosen = [i for i, call in enumerate(calls[:-1]) if call.phase != "start" and call.name not in memory]
        for victim in (HOSTS, SPECS, ONE, PINS, TWO, "Menus/S6/c.menu"):
            for at in chosen[::23 if isShort else 1]:
                installation.Reset()
                strace, tool = StopAfter(installation, calls[at])
                away = AwayOf(installation, victim)
                (installation.root / victim).rename(away)
                if tool is not None:
                    os.kill(tool, signal.SIGCONT)
                end = EndOf(strace.wait(60))
                output = OutputOf(installation)
                faults = min((([] if end == expectedEnd else [f"{end}, not {expectedEnd}"]) +
                              Differences(expected, output)
                              for expectedEnd, expected in AfterLoss(victim, calls, at, installation.Prior())), key=len)
                faults += [] if tool is not None else ["was never reached"]
                away.rename(installation.root / victim)
                where = f"{victim} behind {calls[at].phase} {calls[at].kind} {calls[at].subject} #{calls[at].nth}: "
                yield [where + fault for fault in faults]
