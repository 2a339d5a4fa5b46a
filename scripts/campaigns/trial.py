"""A small installation to try the tool on, what a run of the tool is to leave in it, and ways to run the tool.

The expected cache is put together here from its parts, not taken from a run: FILES says which resource file makes which
block, and ExpectedCache writes the blocks of the files that could be read.
"""

import os
import pathlib
import resource
import shutil
import signal
import stat
import subprocess
import tempfile

REPOSITORY = pathlib.Path(__file__).resolve().parents[2]
TOOL_NAME = "zkfpga_make_resource_cache"
BELOW = "Targets/QN/FPGA"
CACHE = f"{BELOW}/resource_cache.xml"
BLOCK = 4096  # Resource files are read, and menus copied, in blocks of this size.

HOSTS = f"{BELOW}/hosts_resource.xml"
SPECS = f"{BELOW}/specs_resource.xml"
ONE = f"{BELOW}/one/one_resource.xml"
PINS = f"{BELOW}/one/pins.xml"
TWO = f"{BELOW}/two/two_resource.xml"
PARTS = f"{BELOW}/more/parts_resource.xml"  # "more" is a link to a folder elsewhere.

# "One" takes two of the kept properties from an included file that is longer than a block: the first stands in its
# first block, the second in its second. "Two" has its family, and so its menus, from a prototype.
FILES = {
    "Zarvik.exe": b"MZ",
    HOSTS: b'<FPGAHostSet><HostA>1</HostA></FPGAHostSet>',
    SPECS: b"<FpgaDeviceSpecs><Virtex5><XIPINMenusPath>Menus/V5</XIPINMenusPath></Virtex5>"
           b"<Virtex6><x/></Virtex6><spartan6><XIPINMenusPath>Menus/S6</XIPINMenusPath></spartan6></FpgaDeviceSpecs>",
    ONE: b'<Target name="One"><FPGACompilation><DeviceFamily>virtex5</DeviceFamily></FPGACompilation>'
         b'<:Include what="children">Targets/QN/FPGA/one/pins.xml</:Include>'
         b'<Pin names="P[i=0..1]"><Label>#{name} #{i}</Label></Pin><:Link name="L">P1</:Link></Target>',
    PINS: b"<Pins><DeviceIDs>1,2</DeviceIDs><Filler>" + b"x" * BLOCK +
          b"</Filler><FPGAItemSubType>Board</FPGAItemSubType></Pins>",
    TWO: b'<Target name="Two"><Family><DeviceFamily>spartan6</DeviceFamily></Family>'
         b'<FPGACompilation prototype="Family"><x/></FPGACompilation></Target>',
    "Elsewhere/parts_resource.xml": b'<Parts><Part name="P"><Size>3</Size></Part></Parts>',
    "Menus/V5/a.menu": b"a" * (BLOCK + 100),
    "Menus/V5/deep/b.menu": b"menu b",
    "Menus/S6/c.menu": b"menu c",
}
LINKS = {f"{BELOW}/more": "../../../Elsewhere"}

# What the device pass copies, in the order in which it does so.
COPIES = {
    f"{BELOW}/one/a.menu": "Menus/V5/a.menu",
    f"{BELOW}/one/deep/b.menu": "Menus/V5/deep/b.menu",
    f"{BELOW}/two/c.menu": "Menus/S6/c.menu",
}
OLD = b"old bytes\n"


def FindTool():
    """The tool of the optimised build; another one by the environment variable ZKFPGA_TOOL."""
    tool = pathlib.Path(os.environ.get("ZKFPGA_TOOL", REPOSITORY / "build/release/bin" / TOOL_NAME))
    if not tool.is_file():
        raise SystemExit(f"no {tool}: build it with cmake --preset release && cmake --build --preset release")
    return tool


def Contents(copy):
    return FILES[COPIES[copy]]


def OldCopy(copy):
    """What an earlier run has left: of one menu the beginning is as it should be, of one nothing, of one all."""
    return {"a.menu": Contents(copy)[:BLOCK] + OLD, "b.menu": OLD, "c.menu": Contents(copy)}[copy.rpartition("/")[2]]


def TargetBlock(name, path, ids, subtype):
    lines = [("DeviceCategory", ""), ("EIOItemIconName", "fpga\\IO.png"), ("EIOItemTypeName", "FPGA I/O"),
             ("FPGAItemSubType", subtype), ("SupportedFPGAHostList", ""), ("TargetClass", f"COM.QN.FPGA.{name}"),
             ("TargetXMLPath", path), ("LocalizedInformationToDisplayWhenAddingNewTarget", ""),
             ("FindTargetVIPath", ""), ("DeviceIDs", ids), ("CustomFPGAMethodList", "")]
    text = "".join(f"\n      <{key}>{value}</{key}>" for key, value in lines)
    return f'\n   <Target name="{name}" ordered="true">{text}\n   </Target>'


def OtherBlock(name, path):
    return (f"\n   <{name}>\n      <Protocols></Protocols>\n      <FPGA_XMLSource>{path}</FPGA_XMLSource>"
            f"\n   </{name}>")


def ExpectedCache(missing=(), pathsFrom="", ids="1,2", subtype="Board"):
    """The cache of a run to which the files `missing` were not there. `pathsFrom` stands in front of each path, `ids`
    and `subtype` are what came out of the included file."""
    if PINS in missing:
        ids = subtype = ""
    blocks = [  # In the order of their names.
        (SPECS, lambda path: OtherBlock("FpgaDeviceSpecs", path)),
        (HOSTS, lambda path: "\n   <FPGAHostSet>\n      <HostA>1</HostA>\n   </FPGAHostSet>"),
        (ONE, lambda path: TargetBlock("One", path, ids, subtype)),
        (PARTS, lambda path: OtherBlock("Parts", path)),
        (TWO, lambda path: TargetBlock("Two", path, "", "")),
    ]
    text = '<?xml version="1.0"?>\n<ProviderResourceTreeRoot name="">'
    for file, block in blocks:
        if file not in missing:
            text += block(pathsFrom + file.replace("/", "\\"))
    return (text + "\n</ProviderResourceTreeRoot>").encode()


class Installation:
    """The files above in a new folder that goes when this does. With `used`, an earlier run has left old bytes in the
    places of the cache and of the copies (OldCopy)."""

    def __init__(self, used=False, parent=None, oldCache=OLD):
        self.oldCache = oldCache
        self.root = pathlib.Path(tempfile.mkdtemp(prefix="trial-", dir=parent))
        self.used = used
        for name, content in FILES.items():
            path = self.root / name
            path.parent.mkdir(parents=True, exist_ok=True)
            path.write_bytes(content)
        for name, target in LINKS.items():
            (self.root / name).symlink_to(target)
        self.tool = self.root / BELOW / "Utilities" / TOOL_NAME
        self.host = self.root / "browse"  # Where a host's program goes, for those who want one.
        self.tool.parent.mkdir()
        CopyProgram(FindTool(), self.tool)
        self.Reset()

    def __enter__(self):
        return self

    def __exit__(self, *_):
        shutil.rmtree(self.root, ignore_errors=True)

    def Prior(self):
        """Output file -> the bytes that stand there before a run; None where nothing does."""
        olds = {CACHE: self.oldCache, **{copy: OldCopy(copy) for copy in COPIES}}
        return olds if self.used else dict.fromkeys(olds)

    def Reset(self):
        shutil.rmtree(self.root / BELOW / "one/deep", ignore_errors=True)
        for name, content in self.Prior().items():
            path = self.root / name
            path.unlink(missing_ok=True)
            if content is not None:
                path.parent.mkdir(exist_ok=True)
                path.write_bytes(content)

    def Output(self):
        """Output file -> its bytes, None if there is no such file; and every other file that came into being. What is
        no regular file isn't read."""
        found = {name: None for name in (CACHE, *COPIES)}
        known = {self.root / name for name in FILES} | {self.tool, self.host, self.root / BELOW / "more"}
        for folder, _, names in os.walk(self.root):
            for name in names:
                path = pathlib.Path(folder) / name
                if path not in known:
                    isRegular = stat.S_ISREG(path.lstat().st_mode)
                    found[str(path.relative_to(self.root))] = path.read_bytes() if isRegular else b"no regular file"
        return found

    def Restore(self, output):
        """Makes the output files what Output gave before."""
        self.Reset()
        for name in {*self.Output(), *output}:
            path = self.root / name
            if output.get(name) is None:
                path.unlink(missing_ok=True)
            else:
                path.parent.mkdir(exist_ok=True)
                path.write_bytes(output[name])

    def MakeOld(self):
        """Sets the times of all resource files back, so that any cache is newer."""
        for name in (HOSTS, SPECS, ONE, PARTS, TWO):
            os.utime(self.root / name, (946684800, 946684800))

    def Run(self, before=(), **options):
        """Runs the tool, behind the command `before`, and gives its end: "exit 5", "SIGTRAP"."""
        return Run([*before, str(self.tool)], **options)


def CopyProgram(source, target):
    """By a process of its own: what another thread starts meanwhile would inherit a file that is open here for writing,
    and as long as anybody has it open so the copy can't be run."""
    subprocess.run(["cp", source, target], check=True)


def NoCoreFiles():
    resource.setrlimit(resource.RLIMIT_CORE, (0, 0))


def EndOf(status):
    return f"exit {status}" if status >= 0 else signal.Signals(-status).name


def Run(command, seconds=60, **options):
    """The end of a command; "hangs" if it took too long, and everything that it started is gone then."""
    options = {"stdin": subprocess.DEVNULL, "stdout": subprocess.DEVNULL, "stderr": subprocess.DEVNULL,
               "preexec_fn": NoCoreFiles, **options}
    with subprocess.Popen([str(part) for part in command], start_new_session=True, **options) as process:
        try:
            return EndOf(process.wait(seconds))
        except subprocess.TimeoutExpired:
            os.killpg(process.pid, signal.SIGKILL)
            return "hangs"


def BuildHost(folder):
    """The program examples/host/browse, linked to the shared library beside the tool."""
    program = pathlib.Path(folder) / "browse"
    sources = REPOSITORY / "examples/host/browse"
    libraries = FindTool().parent.parent / "lib"
    subprocess.run(["cc", "-std=c99", "-rdynamic", sources / "browse.c", sources / "runtime.c",
                    f"-I{REPOSITORY / 'include'}", f"-L{libraries}", "-lzkfpgarestree", f"-Wl,-rpath,{libraries}",
                    "-o", program], check=True)
    return program


def Shown(content):
    """Bytes as a line that a report can show."""
    if content is None:
        return "none"
    return f"{len(content)} bytes {content[:24]!r}{'...' if len(content) > 24 else ''}"


def Differences(expected, found):
    return [f"{name}: {Shown(found.get(name))}, not {Shown(expected.get(name))}"
            for name in sorted({*expected, *found}) if expected.get(name) != found.get(name)]
