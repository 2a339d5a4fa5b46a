"""A copy of the tree with every change of its sources built in (mutants.py), and its build."""

import os
import pathlib
import re
import shutil
import subprocess
import sys

from campaigns.mutants import Source

# Built in place of the project's own options: nothing of a change is to be optimised away, and warnings are no matter.
OPTIONS = "add_library(zkfpga_options INTERFACE)\n"
SWITCH = pathlib.Path(__file__).with_name("mutants.h")


def Sources(root, names):
    """All sources that are built on Linux with the allocator that ships, each change with a number of its own."""
    wanted = [(pathlib.Path.cwd() / name).resolve() for name in names or [root / "src"]]
    sources = []
    number = 0
    for path in sorted((root / "src").rglob("*")):
        if path.suffix in (".cpp", ".h") and not path.stem.endswith(("_windows", "_malloc")):
            source = Source(str(path.relative_to(root)), path.read_text(encoding="utf-8"))
            source.isChosen = any(path == name or name in path.parents for name in wanted)
            for mutant in source.mutants:
                mutant.number = number
                number += 1
            sources.append(source)
    return sources


def WriteIfOther(path, text):
    if not path.is_file() or path.read_text(encoding="utf-8") != text:
        path.parent.mkdir(parents=True, exist_ok=True)
        path.write_text(text, encoding="utf-8")


class Build:
    def __init__(self, root, work, sources, programs):
        self.root = root
        self.tree = work / "tree"
        self.folder = work / "build"
        self.log = work / "build.log"
        self.sources = sources
        self.programs = programs
        self.deadFile = work / "stillborn.txt"
        self.dead = set(self.deadFile.read_text().splitlines() if self.deadFile.is_file() else [])
        self.spans = {}
        self.stillborn = 0

    def CopyOthers(self):
        """What isn't changed, taken as it is; the build's own options are replaced."""
        names = subprocess.run(["git", "ls-files", "-z", "--cached", "--others", "--exclude-standard"], cwd=self.root,
                               capture_output=True, text=True, check=True).stdout.split("\0")
        changed = {source.path for source in self.sources}
        for name in names:
            source, target = self.root / name, self.tree / name
            if name in changed or not source.is_file():
                continue
            content = source.read_bytes()
            if name == "cmake/CompileOptions.cmake":
                content = OPTIONS.encode()
            elif name == "tests/CMakeLists.txt":
                content = b"add_compile_options(-O0)\n" + content
            if not target.is_file() or target.read_bytes() != content:
                target.parent.mkdir(parents=True, exist_ok=True)
                target.write_bytes(content)
                shutil.copymode(source, target)

    def Mark(self):
        """Tells what compiles from what doesn't, and makes the sources with it."""
        for source in self.sources:
            for mutant in source.mutants:
                mutant.isAlive = mutant.name not in self.dead
            alive = [mutant for mutant in source.mutants if mutant.isAlive]
            source.changed, self.spans[source.path] = source.With(alive)
        self.stillborn = sum(not mutant.isAlive for source in self.sources for mutant in source.mutants)

    def Write(self):
        self.Mark()
        for source in self.sources:
            WriteIfOther(self.tree / source.path, source.changed)

    def Make(self, jobs):
        """Builds the test programs; what keeps them from compiling is left out, as often as need be."""
        self.CopyOthers()
        self.Write()
        flags = f"-O1 -w -Wno-narrowing -D_GLIBCXX_ASSERTIONS -include {SWITCH}"
        with open(self.log, "w", encoding="utf-8") as log:
            subprocess.run(["cmake", "-S", self.tree, "-B", self.folder, "-G", "Ninja", "-D", "CMAKE_BUILD_TYPE=Debug",
                            "-D", f"CMAKE_CXX_FLAGS_DEBUG={flags}", "-D", "CMAKE_C_FLAGS_DEBUG=-O1 -w",
                            "-D", "CMAKE_EXE_LINKER_FLAGS=-fuse-ld=gold", "-D", "CMAKE_COLOR_DIAGNOSTICS=OFF"],
                           stdout=log, stderr=log, check=True)
        targets = ["zkfpga"]
        while True:
            done = subprocess.run(["ninja", "-C", self.folder, "-k", "0", "-j", str(jobs), *targets],
                                  stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True, check=False,
                                  env={**os.environ, "LC_ALL": "C"})
            self.log.write_text(done.stdout, encoding="utf-8")
            if done.returncode == 0:
                if targets == self.programs:
                    break
                targets = self.programs
                continue
            found = self.Blamed(done.stdout)
            if not found:
                sys.exit(f"mutate: the tree doesn't build; see {self.log}")
            print(f"mutate: {len(found)} changes don't compile", flush=True)
            self.dead |= found
            self.deadFile.write_text("".join(name + "\n" for name in sorted(self.dead)), encoding="utf-8")
            self.Write()

    def Blamed(self, output):
        """The names of the changes that the compiler speaks of: by the place of the error, or by what first used a
        template that it is in."""
        names = set()
        byPath = {source.path: source for source in self.sources}
        users = []
        place = re.compile(rf"{re.escape(str(self.tree))}/(src/[^:]+):(\d+):(\d+):\s+(error:|required from)")
        for line in output.splitlines():
            match = place.match(line)
            if match and match.group(4) != "error:":
                users.append(match.groups())
            elif " error: " in line:
                path, number, column, _ = match.groups() if match else users[0] if users else ("", 0, 0, "")
                if path in byPath:
                    names |= self.At(byPath[path], int(number), int(column))
                users = []
            elif ": In " in line:
                users = []
        return names

    def At(self, source, line, column):
        """The innermost change at this place, which counts bytes; without one, all of the line."""
        lines = source.changed.encode().splitlines(keepends=True)
        at = len(b"".join(lines[:line - 1]).decode()) + len(lines[line - 1][:column - 1].decode())
        around = {}
        for begin, end, mutant in self.spans[source.path]:
            first, last = around.get(mutant, (begin, end))
            around[mutant] = (min(first, begin), max(last, end))
        inside = [(last - first, mutant.number, mutant.name) for mutant, (first, last) in around.items()
                  if first <= at < last]
        if inside:
            return {min(inside)[2]}
        return {mutant.name for mutant in source.mutants if mutant.isAlive and mutant.line == line}
