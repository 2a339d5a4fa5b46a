"""The system calls of a run of the tool, as strace tells them."""

import re

from campaigns.trial import BELOW, CACHE, HOSTS

# The errors that each call is made to fail with. A call that isn't here is not made to fail: execve is that of strace,
# exit_group has no failure, and those of the process's set-up can't fail in a system that runs.
ERRORS = {
    "access": ["EACCES"],
    "openat": ["EACCES", "EIO", "ENOENT", "EMFILE", "ENFILE", "ENOMEM", "EINTR", "ELOOP", "ENOTDIR", "ENAMETOOLONG"],
    "openat for writing": ["EACCES", "EIO", "ENOENT", "EMFILE", "ENOMEM", "EINTR", "ENOSPC", "EROFS", "EDQUOT",
                           "EPERM"],
    "read": ["EIO", "EINTR", "ENOMEM", "ESTALE"],
    "pread64": ["EIO"],
    "write": ["EIO", "ENOSPC", "EDQUOT", "EFBIG", "EINTR", "ENOMEM"],
    "ftruncate": ["EIO", "EINTR", "EPERM", "ENOSPC"],
    "lseek": ["ESPIPE"],
    "close": ["EIO", "EINTR", "ENOSPC"],
    "getdents64": ["EIO", "ENOENT", "EINTR", "ENOMEM"],
    "newfstatat": ["EACCES", "EIO", "ENOENT", "ELOOP", "ENOMEM"],
    "fstat": ["EIO", "ENOMEM"],
    "statx": ["EACCES", "EIO", "ENOSYS", "ENOMEM"],
    "mkdirat": ["EACCES", "EEXIST", "EIO", "ENOENT", "ENOSPC", "EROFS", "ENOMEM"],
    "readlink": ["EACCES", "EIO", "ENOENT", "ENOMEM"],
    "getcwd": ["EACCES", "ENOENT", "ENOMEM"],
    "fcntl": ["EPERM", "ENOMEM"],
    "mmap": ["ENOMEM", "EAGAIN"],
    "mprotect": ["ENOMEM"],
    "munmap": ["ENOMEM"],
    "madvise": ["ENOMEM", "EINVAL"],
    "getrandom": ["ENOSYS", "EINTR"],
}


class Call:
    """One system call of the undisturbed run: how strace is told to meet it, and what it is for."""

    def __init__(self, name, number, line):
        self.name = name  # As strace names it.
        self.number = number  # Among the calls of that name.
        self.line = line
        self.phase = self.subject = ""
        self.nth = 0

    @property
    def kind(self):
        return "fstat" if self.name == "newfstatat" and "AT_EMPTY_PATH" in self.line else self.name

    @property
    def errors(self):
        forWriting = self.name == "openat" and re.search("O_WRONLY|O_RDWR", self.line)
        return ERRORS.get(f"{self.kind} for writing" if forWriting else self.kind, [])


def PathOf(line, root):
    """The path that a call speaks of, below `root` where it lies there."""
    call, folder, opened, name = re.match(
        r'(\w*)\((?:(AT_FDCWD|\d+)(?:<([^>]*)>)?(?:, )?)?(?:"([^"]*)")?', line).groups()
    if call in ("read", "pread64", "write", "getrandom", "getcwd"):
        name = None  # Those are bytes, or the answer.
    if name and not name.startswith("/") and folder != "AT_FDCWD":
        name = f"{opened}/{name}"
    path = name or (opened if folder != "AT_FDCWD" else "") or ""
    return {str(root): ".", "/proc/self/exe": "exe"}.get(path, path.removeprefix(f"{root}/"))


def CallsOf(run, root, trace):
    """The calls of an undisturbed run, in their order. `run` runs the tool behind the command that it is given."""
    end = run(["strace", "-f", "-y", "-o", trace])
    if end != "exit 0":
        raise SystemExit(f"the undisturbed run ended with {end}")
    numbers = {}
    calls = []
    phase = "start"
    seen = {}
    for line in trace.read_text().splitlines():
        match = re.match(r"\d+ +(\w+)\(", line)
        if match is None or match[1] == "execve":
            continue
        numbers[match[1]] = numbers.get(match[1], 0) + 1
        call = Call(match[1], numbers[match[1]], line.split(maxsplit=1)[1])
        call.subject = PathOf(call.line, root)
        phase = NextPhase(phase, call, seen)
        call.phase = phase
        key = (phase, call.kind, call.subject)
        seen[key] = call.nth = seen.get(key, 0) + 1
        calls.append(call)
    return calls


def NextPhase(phase, call, seen):
    if phase == "start" and (call.subject == "exe" or call.name == "getcwd"):
        return "scan"
    if phase == "scan" and call.subject == "exe" and ("scan", "getdents64", BELOW) in seen:
        return "host"
    if phase == "host" and call.subject == HOSTS:
        return "read"
    if phase == "read" and call.subject == CACHE:
        return "cache"
    if phase == "cache" and call.subject == "exe":
        return "copy"
    return phase
