"""What the checks of scripts/hard-places compare. A check is a function of one argument, whether the short form is
wanted; it gives, for each of its cases, the faults as lines: none if all is well."""

from campaigns.trial import BELOW, CACHE, COPIES, Contents, Differences, ExpectedCache, TargetBlock

CLOSING = b"\n</ProviderResourceTreeRoot>"


def Whole(**options):
    return {CACHE: ExpectedCache(**options), **{copy: Contents(copy) for copy in COPIES}}


def OutputOf(installation):
    """The cache and the copies alone, where a check makes files of its own."""
    return {name: content for name, content in installation.Output().items() if name in (CACHE, *COPIES)}


def Faults(installation, end, expectedEnd, expected, what=""):
    faults = [] if end == expectedEnd else [f"{end}, not {expectedEnd}"]
    return [f"{what}{fault}" for fault in faults + Differences(expected, OutputOf(installation))]


def AddTargets(installation, names, before, cache=None):
    """Adds targets that hold nothing, and gives the cache with their blocks in front of the tag `before`."""
    cache = cache or ExpectedCache()
    blocks = b""
    for name in names:
        below = f"{BELOW}/w{name}_resource.xml"
        (installation.root / below).write_bytes(f'<Target name="{name}"/>'.encode())
        blocks += TargetBlock(name, below.replace("/", "\\"), "", "").encode()
    at = cache.index(b"\n" + before) if before.startswith(b"</") else cache.index(b"\n   " + before)
    return cache[:at] + blocks + cache[at:]
