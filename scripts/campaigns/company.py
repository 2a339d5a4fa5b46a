"""Other tools on the same folder, and the settings of a user."""

import signal
import subprocess

from campaigns.places import AddTargets, Faults, Whole
from campaigns.trial import BELOW, CACHE, Differences, Installation, NoCoreFiles, Run


def CheckManyTools(isShort):
    """16 tools at once. A tool ends with an exception where another makes a folder between its look and its own
    making; the others, and what stands in the end, are not touched by that."""
    with Installation() as installation:
        for round_ in range(5 if isShort else 200):
            if round_ % 2 == 0:
                installation.Reset()
            tools = [subprocess.Popen([installation.tool], stderr=subprocess.DEVNULL, preexec_fn=NoCoreFiles)
                     for _ in range(16)]
            ends = [tool.wait(60) for tool in tools]
            isNew = round_ % 2 == 0
            faults = [f"ended with {end}" for end in ends if end != 0 and not (isNew and end == -signal.SIGABRT)]
            if 0 not in ends:
                faults.append("no tool came through")
            yield [f"round {round_}: {fault}" for fault in faults + Differences(Whole(), installation.Output())]


def CheckSettings(_):
    """Languages, time zones, closed standard files, and masks of permission bits: the same bytes, and bits as the mask
    leaves them."""
    languages = ["C", "POSIX", "C.UTF-8", "en_US.UTF-8", "de_DE.UTF-8", "tr_TR.UTF-8", "ja_JP.UTF-8", "ja_JP.SJIS",
                 "lt_LT", "xx_YY", ""]
    zones = ["UTC", "Asia/Kathmandu", "America/St_Johns", "Pacific/Kiritimati", "nonsense", ""]
    settings = [{"LC_ALL": language} for language in languages] + [{"LANG": language} for language in languages]
    settings += [{"TZ": zone} for zone in zones] + [{}, {"LC_ALL": "tr_TR.UTF-8", "TZ": "Asia/Kathmandu"}]
    # Names in whose order or equality languages differ.
    with Installation() as installation:
        cache = AddTargets(installation, ["AA"], b"<FpgaDeviceSpecs>")
        cache = AddTargets(installation, ["Ia", "ib", "IC"], b'<Target name="One"', cache)
        cache = AddTargets(installation, ["y1", "Z1"], b"</ProviderResourceTreeRoot>", cache)
        expected = {**Whole(), CACHE: cache}
        for setting in settings:
            installation.Reset()
            yield Faults(installation, installation.Run(env=setting), "exit 0", expected, f"{setting}: ")
        for closed in ("<&-", ">&-", "2>&-", "<&- >&- 2>&-"):
            installation.Reset()
            end = Run(["sh", "-c", f'"$0" {closed}', installation.tool])
            yield Faults(installation, end, "exit 0", expected, f"{closed}: ")
        for mask in (0o000, 0o002, 0o022, 0o027, 0o077):
            installation.Reset()
            end = installation.Run(umask=mask)
            faults = Faults(installation, end, "exit 0", expected)
            for below, bits in ((CACHE, 0o666), (f"{BELOW}/two/c.menu", 0o600), (f"{BELOW}/one/deep", 0o777)):
                mode = (installation.root / below).stat().st_mode & 0o777
                if mode != bits & ~mask:
                    faults.append(f"{below} has {mode:o}")
            yield [f"mask {mask:03o}: {fault}" for fault in faults]
