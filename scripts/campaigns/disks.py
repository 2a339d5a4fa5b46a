"""Disks that are full, or can't be written."""

import os
import pathlib
import subprocess
import tempfile

from campaigns.places import AddTargets, Faults, Whole
from campaigns.trial import BELOW, CACHE, ExpectedCache, Installation, Run

PAGE = 4096


def CheckSizeLimit(isShort):
    """No file may grow beyond a size: every size up to that of the longest output."""
    with Installation() as installation:
        longest = max(len(content) for content in Whole().values())
        sizes = range(0, longest + 2, 97 if isShort else 1)
        for size in [*sizes, longest]:
            installation.Reset()
            end = Run(["prlimit", f"--fsize={size}", installation.tool], restore_signals=False)
            # The limit is for each file, so it doesn't run out.
            expected, expectedEnd = dict(installation.Prior()), "exit 0"
            for name, content in Whole().items():
                expected[name] = content[:size]
                if len(content) > size:
                    expectedEnd = "exit 5" if name == CACHE else "SIGABRT"
                    break
            yield Faults(installation, end, expectedEnd, expected, f"{size} bytes: ")


def CheckFullDevice(_):
    """The cache leads to a device that takes nothing."""
    with Installation() as installation:
        (installation.root / CACHE).symlink_to("/dev/full")
        end = installation.Run()
        expected = {**installation.Prior(), CACHE: b""}
        (installation.root / CACHE).unlink()
        (installation.root / CACHE).write_bytes(b"")
        yield Faults(installation, end, "exit 5", expected)


def Mount(*arguments):
    subprocess.run(["mount", *map(str, arguments)], check=True)


def MountFullDisk(isShort):
    """A disk with room for every number of pages, from none to enough for all output."""
    with tempfile.TemporaryDirectory() as disk:
        Mount("-t", "tmpfs", "-o", "size=16m,huge=never", "trial", disk)
        # Large enough for the cache to take several pages.
        targets = [f"Na{number:02}" for number in range(40)]
        for isUsed in (False, True):
            with Installation(isUsed, disk) as installation:
                whole = {**Whole(), CACHE: AddTargets(installation, targets, b'<Target name="One"')}
                for room in range(sum(map(Pages, whole.values())) + 2):
                    installation.Reset()
                    ballast = pathlib.Path(disk) / "ballast"
                    with ballast.open("wb") as file:
                        os.posix_fallocate(file.fileno(), 0, (os.statvfs(disk).f_bavail - room) * PAGE)
                    end = installation.Run()
                    ballast.unlink()
                    expected, expectedEnd = FilledUp(installation.Prior(), whole, room)
                    yield Faults(installation, end, expectedEnd, expected, f"{room} pages{', used' * isUsed}: ")
        subprocess.run(["umount", disk], check=True)


def Pages(content):
    return -(-len(content or b"") // PAGE)


def FilledUp(prior, whole, room):
    """What is left where the output files are written in turn until a disk has no page left, and the end of that."""
    output = dict(prior)
    for name, content in whole.items():
        room += Pages(prior[name])  # Old bytes give their pages back.
        output[name] = content[:room * PAGE]
        if Pages(content) > room:
            return output, "exit 5" if name == CACHE else "SIGABRT"
        room -= Pages(content)
    return output, "exit 0"


def MountReadOnly(_):
    """A disk that can't be written: all of it, or where the copies go."""
    for isUsed in (False, True):
        with Installation(isUsed) as installation:
            Mount("--bind", installation.root, installation.root)
            Mount("-o", "remount,bind,ro", installation.root)
            end = installation.Run()
            subprocess.run(["umount", installation.root], check=True)
            yield Faults(installation, end, "exit 5", installation.Prior(), "all: ")
            one = installation.root / BELOW / "one"
            Mount("--bind", one, one)
            Mount("-o", "remount,bind,ro", one)
            end = installation.Run()
            subprocess.run(["umount", one], check=True)
            yield Faults(installation, end, "SIGABRT", {**installation.Prior(), CACHE: ExpectedCache()}, "a target: ")
