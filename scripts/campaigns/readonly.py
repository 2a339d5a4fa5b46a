"""A view of the file system in which a process can only write where it may. What runs on purpose with a fault in it can
do anything that its user can: a copy that takes ".." for the name of a folder empties every file on its way."""

import os
import pathlib
import subprocess
import sys

INSIDE = "ZKFPGA_READONLY_INSIDE"
NAMESPACE = "/proc/self/ns/mnt"
# These are not of the file system on the disk.
OTHERS = ("/proc", "/dev")


def GoOnReadOnly(folder, scratch):
    """Starts this program anew, with the same arguments, and goes on there: only what is below the folder can be
    written, and /tmp, which is `scratch` there. Whoever isn't root needs the right to make namespaces."""
    if not IsInside():
        os.environ[INSIDE] = os.readlink(NAMESPACE)
        own = [] if os.geteuid() == 0 else ["--map-root-user"]
        os.execvp("unshare", ["unshare", *own, "--mount", "--propagation", "private", sys.executable, *sys.argv])
    # The path itself, as the C library has it too.
    for source, place in ((scratch, "/tmp"), (folder, folder)):
        subprocess.run(["mount", "--bind", source, place], check=True)
    for line in pathlib.Path("/proc/self/mounts").read_text(encoding="utf-8").splitlines():
        place, _, options = line.split()[1:4]
        if place in ("/tmp", str(folder)) or place.startswith(OTHERS):
            continue
        # What the system has shut stays so.
        flags = [flag for flag in options.split(",") if flag in ("nosuid", "nodev", "noexec", "noatime", "relatime")]
        subprocess.run(["mount", "-o", ",".join(["remount", "bind", "ro", *flags]), place], check=True)
    for place in (pathlib.Path(__file__).parent, pathlib.Path.home(), pathlib.Path("/usr")):
        if os.access(place, os.W_OK):
            sys.exit(f"{place} can still be written; nothing is run like that")


def IsInside():
    return os.environ.get(INSIDE, os.readlink(NAMESPACE)) != os.readlink(NAMESPACE)
