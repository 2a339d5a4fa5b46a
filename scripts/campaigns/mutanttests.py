"""The tests of a build with changes (mutanttree.py): which changes each comes by, and whether one of them notices."""

import concurrent.futures
import os
import pathlib
import re
import resource
import shutil
import signal
import subprocess
import tempfile
import threading
import time

PROGRAMS = ["qn_dsc_tests", "qn_dsc_call_tests", "hostbridge_tests", "restree_tests", "restree_memory_tests",
            "interfaces_tests", "interfaces_failure_tests", "cachebuilder_tests", "cachebuilder_failure_tests",
            "library_tests", "library_failure_tests", "library_first_use_tests", "property_tests", "misuse_tests"]
NEAREST = {"qn": "qn_dsc", "hostbridge": "hostbridge", "restree": "restree", "interfaces": "interfaces",
           "cachebuilder": "cachebuilder"}
# Tests that take longer, in seconds of the processor, are asked last.
SLOW = 0.25
# The whole of a change's slow tests may take so long; the others of them aren't asked.
SLOW_IN_ALL = 20
MEMORY = 6 << 30
FILE = 1 << 30


class Test:
    def __init__(self, program, name, seconds, reached):
        self.program = program
        self.name = name
        self.seconds = seconds
        self.reached = reached


class Run:
    """A run of some tests of a program. A process that takes far longer than it should is ended."""

    def __init__(self, build, program, names, seconds, scratch, environment):
        with tempfile.TemporaryDirectory(dir=scratch) as folder, tempfile.TemporaryFile() as output:
            flags = pathlib.Path(folder) / "flags"
            flags.write_text("--gtest_fail_fast\n--gtest_brief=1\n--gtest_filter=" + ":".join(names) + "\n")
            own = pathlib.Path(folder) / "tests"
            own.mkdir()
            limit = int(5 + 4 * seconds)

            def Limit():
                resource.setrlimit(resource.RLIMIT_CPU, (limit, limit + 1))
                resource.setrlimit(resource.RLIMIT_AS, (MEMORY, MEMORY))
                resource.setrlimit(resource.RLIMIT_FSIZE, (FILE, FILE))
                resource.setrlimit(resource.RLIMIT_CORE, (0, 0))

            process = subprocess.Popen([build.folder / "bin" / program, f"--gtest_flagfile={flags}"], stdout=output,
                                       stderr=output, stdin=subprocess.DEVNULL, cwd=own, start_new_session=True,
                                       preexec_fn=Limit, env={**os.environ, "TMPDIR": str(own), **environment})
            timer = threading.Timer(30 + 20 * seconds, os.killpg, (process.pid, signal.SIGKILL))
            timer.start()
            _, status, usage = os.wait4(process.pid, 0)
            timer.cancel()
            process.returncode = os.waitstatus_to_exitcode(status)
            try:
                os.killpg(process.pid, signal.SIGKILL)  # What it may have left running.
            except ProcessLookupError:
                pass
            self.isPassed = process.returncode == 0
            self.seconds = usage.ru_utime + usage.ru_stime
            output.seek(0)
            failed = re.search(rb"^\[  FAILED  \] (\S+\.\S+)", output.read(1 << 20), re.MULTILINE)
            self.end = failed.group(1).decode().rstrip(",") if failed else f"ends with {process.returncode}"
            shutil.rmtree(own, ignore_errors=True)


def NamesOf(build, program):
    listing = subprocess.run([build.folder / "bin" / program, "--gtest_list_tests"], capture_output=True, text=True,
                             check=True).stdout
    suite = ""
    for line in listing.splitlines():
        name = line.partition("#")[0].rstrip()
        if line.startswith("  "):
            if "DISABLED_" not in name:
                yield suite + name.strip()
        else:
            suite = name


def Trace(build, folder, scratch, jobs):
    """All tests, each run by itself once, or taken from an earlier run of the same changes."""
    stamp = "".join(source.changed for source in build.sources)
    stampFile = folder / "sources"
    if not stampFile.is_file() or stampFile.read_text(encoding="utf-8") != stamp:
        shutil.rmtree(folder, ignore_errors=True)
        folder.mkdir(parents=True)
    wanted = [(program, name) for program in build.programs for name in NamesOf(build, program)]

    def TraceOne(item):
        program, name = item
        file = folder / f"{program}-{name.replace('/', '-')}"
        done = file.with_name(file.name + ".seconds")
        if not done.is_file():
            file.write_bytes(bytes(65536))
            run = Run(build, program, [name], 60, scratch, {"ZKFPGA_MUTANTS_REACHED": str(file)})
            if not run.isPassed:
                return f"{program}: {name}"
            done.write_text(str(run.seconds))
        reached = file.read_bytes()
        return Test(program, name, float(done.read_text()), reached)

    start = time.monotonic()
    with concurrent.futures.ThreadPoolExecutor(jobs) as pool:
        tests = list(pool.map(TraceOne, wanted))
    # A few are about how the library is built, which isn't how it ships here.
    failing = [test for test in tests if isinstance(test, str)]
    tests = [test for test in tests if isinstance(test, Test)]
    for test in failing:
        print(f"mutate: fails without a change, and isn't asked: {test}", flush=True)
    if len(failing) > 5:
        raise SystemExit("mutate: too many of them")
    stampFile.write_text(stamp, encoding="utf-8")
    print(f"mutate: {len(tests)} tests of {sum(test.seconds for test in tests):.0f} s, looked at in "
          f"{time.monotonic() - start:.0f} s", flush=True)
    return tests


def Outcome(mutant, tests, build, scratch):
    """What becomes of a change: "noticed: by whom", "survived: so many tests", or "not reached"."""
    near = NEAREST[mutant.path.split("/")[1]]
    subject = pathlib.PurePath(mutant.path).stem.partition("_")[0]

    def Rank(test):
        return (test.seconds > SLOW, not test.program.startswith(near), build.programs.index(test.program))

    reaching = sorted((test for test in tests if test.reached[mutant.number]), key=Rank)
    batches = {}
    slow = 0
    for test in reaching:
        if test.seconds > SLOW:
            slow += test.seconds
            if slow > SLOW_IN_ALL and len(batches) > 0:
                continue
        isOwn = test.name.startswith(subject) and test.seconds <= SLOW
        batches.setdefault((not isOwn, *Rank(test)), []).append(test)
    asked = 0
    for key in sorted(batches):
        batch = batches[key]
        run = Run(build, batch[0].program, [test.name for test in batch], sum(test.seconds for test in batch), scratch,
                  {"ZKFPGA_MUTANT": str(mutant.number)})
        asked += len(batch)
        if not run.isPassed:
            return f"noticed: {batch[0].program}: {run.end}"
    return f"survived: {asked} tests" if asked else "not reached"
