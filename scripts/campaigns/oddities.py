"""Odd files, odd names, long paths, big folders, and loops of links."""

import os
import pathlib
import socket
import subprocess

from campaigns.places import CLOSING, Faults, Whole
from campaigns.trial import BELOW, CACHE, COPIES, ONE, PINS, Installation, TargetBlock


def MakeOddFiles(folder, name):
    """Everything that isn't a regular file, under names with an ending. A node of a device needs root."""
    os.mkfifo(folder / f"pipe{name}")
    for number, target in enumerate(("/dev/zero", "/dev/tty", "/dev/null", "nowhere", f"link3{name}")):
        (folder / f"link{number}{name}").symlink_to(target)
    with socket.socket(socket.AF_UNIX) as server:
        here = os.getcwd()
        os.chdir(folder)  # The name of a socket has to be short.
        server.bind(f"socket{name}")
        os.chdir(here)
    if os.getuid() == 0:
        os.mknod(folder / f"device{name}", 0o600 | 0o020000, os.makedev(1, 5))


def CheckOddFiles(_):
    """Pipes, devices, sockets, folders and dead links where files are expected: none is waited for."""
    with Installation() as installation:
        MakeOddFiles(installation.root / BELOW, "_resource.xml")
        (installation.root / BELOW / "folder_resource.xml").mkdir()
        yield Faults(installation, installation.Run(), "exit 0", Whole(), "resource files: ")
    for kind in ("pipe", "folder"):
        for below, missing in ((ONE, [ONE]), (PINS, [PINS])):
            with Installation() as installation:
                path = installation.root / below
                path.unlink()
                os.mkfifo(path) if kind == "pipe" else path.mkdir()
                without = [copy for copy in COPIES if "/one/" in copy and below == ONE]
                expected = {**Whole(missing=missing), **dict.fromkeys(without)}
                yield Faults(installation, installation.Run(), "exit 0", expected, f"{kind} as {below}: ")
        with Installation() as installation:
            path = installation.root / "Menus/S6/b.menu"
            os.mkfifo(path) if kind == "pipe" else path.mkdir()
            # A pipe can't be opened and ends the pass; an empty folder is made.
            end, without = ("SIGABRT", [f"{BELOW}/two/c.menu"]) if kind == "pipe" else ("exit 0", [])
            yield Faults(installation, installation.Run(), end, {**Whole(), **dict.fromkeys(without)},
                         f"{kind} among menus: ")
        with Installation() as installation:
            path = installation.root / BELOW / "two/c.menu"
            os.mkfifo(path) if kind == "pipe" else path.mkdir()
            end = installation.Run()
            path.unlink() if kind == "pipe" else path.rmdir()
            yield Faults(installation, end, "SIGABRT", {**Whole(), f"{BELOW}/two/c.menu": None},
                         f"{kind} in the place of a copy: ")
    with Installation() as installation:
        path = installation.root / CACHE
        path.mkdir()
        end = installation.Run()
        path.rmdir()
        yield Faults(installation, end, "exit 5", installation.Prior(), "folder as the cache: ")
    with Installation() as installation:
        # Nobody reads: a pipe can't be opened to write then.
        path = installation.root / CACHE
        os.mkfifo(path)
        end = installation.Run()
        path.unlink()
        yield Faults(installation, end, "exit 5", installation.Prior(), "pipe as the cache: ")


def CheckNames(_):
    """Names that are no UTF-8, or hold a backslash, blanks, quotes, or line breaks. A byte b that is part of no
    character is the unit 0xDC00 + b, a backslash the unit 0xF05C; the cache gives each as three bytes."""
    shown = {b"\xff": b"\xed\xb3\xbf", b"\xe9": b"\xed\xb3\xa9", b"\\": b"\xef\x81\x9c", b"\xc3\xa9": b"\xc3\xa9",
             b"\xf0\x9f\x98\x80": b"\xed\xa0\xbd\xed\xb8\x80", b" ": b" ", b"'": b"&apos;", b"\n": b"\n"}
    for name, text in shown.items():
        with Installation() as installation:
            folder = bytes(installation.root / BELOW) + b"/x" + name
            os.mkdir(folder)
            source = (b'<Target name="Xtra"><FPGACompilation><DeviceFamily>spartan6</DeviceFamily></FPGACompilation>'
                      b'</Target>')
            pathlib.Path(os.fsdecode(folder + b"/y" + name + b"_resource.xml")).write_bytes(source)
            path = b"Targets\\QN\\FPGA\\x" + text + b"\\y" + text + b"_resource.xml"
            block = TargetBlock("Xtra", "@", "", "").encode().replace(b"@", path)
            expected = Whole()
            expected[CACHE] = expected[CACHE].removesuffix(CLOSING) + block + CLOSING
            faults = Faults(installation, installation.Run(), "exit 0", expected)
            if not os.path.exists(folder + b"/c.menu"):
                faults.append("no menus in its folder")
            yield [f"{name!r}: {fault}" for fault in faults]


def CheckLongPaths(_):
    """A resource file at the end of a path of 4,095 bytes, the longest that a system call takes, and of longer ones."""
    for length in (255, 260, 4094, 4095, 4096, 6000, 10000):
        with Installation() as installation:
            top = bytes(installation.root / BELOW)
            fileName = b"z_resource.xml"
            left = length - len(top) - 1 - len(fileName)
            names = []
            while left > 0:
                # Every name takes a slash as well, and the last one takes what is left.
                take = min(left, 200) if left <= 200 or left - 200 >= 2 else left - 2
                names.append(b"d" * (take - 1))
                left -= take
            folder = os.open(top, os.O_RDONLY)
            for name in names:
                os.mkdir(name, dir_fd=folder)
                below = os.open(name, os.O_RDONLY, dir_fd=folder)
                os.close(folder)
                folder = below
            with open(os.open(fileName, os.O_WRONLY | os.O_CREAT, dir_fd=folder), "wb") as file:
                file.write(b'<Target name="Zed"><DeviceIDs>5</DeviceIDs></Target>')
            os.close(folder)
            path = "\\".join(["Targets\\QN\\FPGA", *(name.decode() for name in names), fileName.decode()])
            expected = Whole()
            expected[CACHE] = (expected[CACHE].removesuffix(CLOSING) + TargetBlock("Zed", path, "5", "").encode() +
                               CLOSING)
            result = installation.Run()
            faults = [] if result == "exit 0" else [result]
            if (installation.root / CACHE).read_bytes() != expected[CACHE]:
                faults.append("another cache")
            subprocess.run(["rm", "-rf", installation.root], check=True)
            yield [f"{length} bytes: {fault}" for fault in faults]


def CheckBigFolders(isShort):
    """100,000 files beside the resource files, and among the menus."""
    count = 2000 if isShort else 100_000
    with Installation() as installation:
        for number in range(count):
            (installation.root / BELOW / f"file{number}.txt").touch()
        yield Faults(installation, installation.Run(), "exit 0", Whole(), "beside: ")
    with Installation() as installation:
        for number in range(count):
            (installation.root / f"Menus/S6/m{number}.menu").write_bytes(b"%d" % number)
        faults = Faults(installation, installation.Run(seconds=300), "exit 0", Whole(), "menus: ")
        copies = [installation.root / f"{BELOW}/two/m{number}.menu" for number in range(count)]
        wrong = [copy for number, copy in enumerate(copies) if not copy.exists() or copy.read_bytes() != b"%d" % number]
        yield faults + [f"{len(wrong)} of {count} copies are wrong" for _ in wrong[:1]]


def CheckLoops(_):
    """Links that lead up, to themselves, to each other, or to a folder that is reached otherwise as well."""
    def Link(installation, target, below):
        (installation.root / below).symlink_to(target)
    with Installation() as installation:
        for target, below in ((".", f"{BELOW}/loop"), ("..", f"{BELOW}/one/up"), ("../..", f"{BELOW}/two/far"),
                              ("b", f"{BELOW}/a"), ("a", f"{BELOW}/b"), ("self", f"{BELOW}/self"),
                              ("/", f"{BELOW}/../../root_of_nothing")):
            Link(installation, target, below)
        yield Faults(installation, installation.Run(), "exit 0", Whole(), "scan: ")
    with Installation() as installation:
        Link(installation, ".", "Menus/V5/self")
        Link(installation, "..", "Menus/V5/deep/up")
        Link(installation, "../../Targets/QN/FPGA/one", "Menus/V5/into")
        faults = Faults(installation, installation.Run(), "exit 0", Whole(), "menus: ")
        made = [name for name in ("self", "deep/up", "into") if (installation.root / BELOW / "one" / name).exists()]
        yield faults + [f"menus: {name} was copied" for name in made]
    with Installation() as installation:
        # Entered twice, and read twice: the paths are those of the second time.
        Link(installation, "../one", f"{BELOW}/two/aside")
        expected = Whole()
        expected[CACHE] = expected[CACHE].replace(b"FPGA\\one\\one_", b"FPGA\\two\\aside\\one_")
        yield Faults(installation, installation.Run(), "exit 0", expected, "twice: ")
