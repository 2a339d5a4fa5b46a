"""The tests of a build with changes (mutanttree.py): which changes each comes by, and whether one of them notices."""

import concurrent.futures
import hashlib
import json
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
            "library_tests", "allocations_tests", "library_first_use_tests", "property_tests", "misuse_tests"]
SHORT_PROGRAMS = ["restree_tests", "restree_memory_tests", "property_tests"]
NEAREST = {"qn": "qn_dsc", "hostbridge": "hostbridge", "restree": "restree", "interfaces": "interfaces",
           "cachebuilder": "cachebuilder"}
# Tests that take longer, in seconds of the processor, are asked last.
SLOW = 0.25
# So long a process may go on with tests: a change that makes one of them go on for ever shouldn't take long, either.
AT_ONCE = 1
# The quick tests that are asked of a change, and the slow ones, may take so long together, the nearest first.
QUICK_IN_ALL = 4
SLOW_IN_ALL = 2
MEMORY = 6 << 30
FILE = 1 << 30


class Test:
    def __init__(self, program, name, subject, seconds, reached):
        self.program = program
        self.name = name
        self.subject = subject
        self.seconds = seconds
        self.reached = reached


class Run:
    """A run of some tests of a program. A process that takes far longer than it should is ended."""

    def __init__(self, build, program, names, seconds, scratch, environment):
        with tempfile.TemporaryDirectory(dir=scratch) as folder, tempfile.TemporaryFile(dir=scratch) as output:
            flags = pathlib.Path(folder) / "flags"
            flags.write_text("--gtest_fail_fast\n--gtest_brief=1\n--gtest_filter=" + ":".join(names) + "\n")
            own = pathlib.Path(folder) / "tests"
            own.mkdir()
            limit = int(4 + 2 * seconds)

            def Limit():
                resource.setrlimit(resource.RLIMIT_CPU, (limit, limit + 1))
                resource.setrlimit(resource.RLIMIT_AS, (MEMORY, MEMORY))
                resource.setrlimit(resource.RLIMIT_FSIZE, (FILE, FILE))
                resource.setrlimit(resource.RLIMIT_CORE, (0, 0))

            process = subprocess.Popen([build.folder / "bin" / program, f"--gtest_flagfile={flags}"], stdout=output,
                                       stderr=output, stdin=subprocess.DEVNULL, cwd=own, start_new_session=True,
                                       preexec_fn=Limit, env={**os.environ, "TMPDIR": str(own), **environment})
            timer = threading.Timer(30 + 30 * seconds, os.killpg, (process.pid, signal.SIGKILL))
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


def Listing(build, program, scratch):
    """The tests of a program: (program, name, file)."""
    report = scratch / f"{program}.json"
    subprocess.run([build.folder / "bin" / program, "--gtest_list_tests", f"--gtest_output=json:{report}"],
                   stdout=subprocess.DEVNULL, check=True)
    for suite in json.loads(report.read_text(encoding="utf-8"))["testsuites"]:
        for test in suite["testsuite"]:
            yield program, f"{suite['name']}.{test['name']}", pathlib.Path(test["file"])


def Trace(build, folder, scratch, jobs):
    """All tests, each run by itself once, or taken from an earlier run of the same changes and the same test."""
    changes = "".join(source.changed for source in build.sources)
    changesFile = folder / "sources"
    if not changesFile.is_file() or changesFile.read_text(encoding="utf-8") != changes:
        shutil.rmtree(folder, ignore_errors=True)
        folder.mkdir(parents=True)
        changesFile.write_text(changes, encoding="utf-8")
    wanted = [item for program in build.programs for item in Listing(build, program, scratch)]
    stamps = {file: hashlib.sha256(file.read_bytes()).hexdigest() for file in {file for _, _, file in wanted}}

    def TraceOne(item):
        program, name, file = item
        reached = folder / f"{program}-{name.replace('/', '-')}"
        done = reached.with_name(reached.name + ".done")
        known = done.read_text().split() if done.is_file() else []
        if known[1:] != [stamps[file]]:
            reached.write_bytes(bytes(65536))
            run = Run(build, program, [name], 60, scratch, {"ZKFPGA_MUTANTS_REACHED": str(reached)})
            if not run.isPassed:
                return f"{program}: {name}"
            known = [str(run.seconds)]
            done.write_text(f"{run.seconds} {stamps[file]}")
        return Test(program, name, file.stem.removesuffix("Test"), float(known[0]), reached.read_bytes())

    begin = time.monotonic()
    with concurrent.futures.ThreadPoolExecutor(jobs) as pool:
        tests = list(pool.map(TraceOne, wanted))
    # A few are about how the library is built, which isn't how it ships here.
    failing = [test for test in tests if isinstance(test, str)]
    tests = [test for test in tests if isinstance(test, Test)]
    for test in failing:
        print(f"mutate: fails without a change, and isn't asked: {test}", flush=True)
    if len(failing) > 5:
        raise SystemExit("mutate: too many of them")
    for program in build.programs:
        own = [test for test in tests if test.program == program]
        start = min(test.seconds for test in own)
        for test in own:
            test.seconds -= start
    print(f"mutate: {len(tests)} tests of {sum(test.seconds for test in tests):.0f} s, looked at in "
          f"{time.monotonic() - begin:.0f} s", flush=True)
    return tests


def Outcome(mutant, tests, build, scratch, isThorough):
    """What becomes of a change: "noticed: by whom", "survived: so many tests", or "not reached"."""
    near = NEAREST[mutant.path.split("/")[1]]
    subject = pathlib.PurePath(mutant.path).stem.partition("_")[0]

    def Rank(test):
        isSlow = test.seconds > SLOW
        return (isSlow, isSlow or not test.subject.startswith(subject), not test.program.startswith(near),
                build.programs.index(test.program))

    reaching = sorted((test for test in tests if test.reached[mutant.number]),
                      key=lambda test: (*Rank(test), test.seconds))
    batches = {}
    spent = {False: 0.0, True: 0.0}
    for test in reaching:
        isSlow = test.seconds > SLOW
        spent[isSlow] += test.seconds
        if isThorough or spent[isSlow] <= (SLOW_IN_ALL if isSlow else QUICK_IN_ALL):
            batches.setdefault((*Rank(test), test.program, int(spent[isSlow] / AT_ONCE)), []).append(test)
    asked = 0
    for key in sorted(batches):
        batch = batches[key]
        run = Run(build, batch[0].program, [test.name for test in batch], sum(test.seconds for test in batch), scratch,
                  {"ZKFPGA_MUTANT": str(mutant.number)})
        asked += len(batch)
        if not run.isPassed:
            return f"noticed: {batch[0].program}: {run.end}"
    return f"survived: {asked} of {len(reaching)} tests" if asked else "not reached"
