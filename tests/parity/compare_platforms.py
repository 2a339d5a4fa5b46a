#!/usr/bin/env python3
"""Holds the Linux and the Windows build against each other.

    compare_platforms.py LINUX_BUILD WINDOWS_BUILD      (the folders of the two presets)

The tool of each runs on the example installation and on 200 made-up ones: exit status, files and the bytes of the cache
must be the same, where CR LF counts as LF, and the drive of Wine's root as that of Linux. Then the order of 20,000
texts: that of printable ASCII must be the same; for the other kinds docs/platforms.md says what differs.
Last line: N passed, N failed.
"""
import os
import shutil
import subprocess
import sys
import tempfile

sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
import installations  # noqa: E402

SOURCE = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))
WINE = os.path.join(SOURCE, 'scripts', 'wine')
TOOL = 'zkfpga_make_resource_cache'
COUNT = 200
# Whose order is the same on both platforms; docs/platforms.md tells how the others differ.
SAME_ORDER = {'ascii', 'ascii-names'}
OTHER_ORDER = {'ascii-controls', 'latin-1', 'greek', 'cyrillic', 'cjk', 'combining', 'c1-controls', 'surrogates'}
ENVIRONMENT = dict(os.environ, LC_ALL='C.UTF-8')


def example_files():
    files = {}
    base = os.path.join(SOURCE, 'examples', 'installation')
    for folder, _, names in os.walk(base):
        for name in names:
            path = os.path.join(folder, name)
            with open(path, 'rb') as f:
                files[os.path.relpath(path, base)] = f.read()
    return files


def lay_out(files, root):
    shutil.rmtree(root, ignore_errors=True)
    for path, data in files.items():
        full = os.path.join(root, path)
        os.makedirs(full if data is None else os.path.dirname(full), exist_ok=True)
        if data is not None:
            with open(full, 'wb') as f:
                f.write(data)


def snapshot(root):
    found = {}
    for folder, folders, names in os.walk(root):
        for name in folders:
            found[os.path.relpath(os.path.join(folder, name), root)] = None
        for name in names:
            path = os.path.join(folder, name)
            with open(path, 'rb') as f:
                data = f.read()
            if name.lower() == 'resource_cache.xml':
                data = data.replace(b'\r\n', b'\n').replace(b'Z:\\', b'C:\\')
            found[os.path.relpath(path, root)] = data
    return found


def run(files, root, command, with_argument):
    """The low byte of the exit status, and what stands afterwards. A trap and an uncaught exception count as such."""
    lay_out(files, root)
    folder = os.path.join(root, 'Targets', 'QN', 'FPGA')
    tool = os.path.join(folder, 'Tool', os.path.basename(command[-1]))
    os.makedirs(os.path.dirname(tool), exist_ok=True)
    shutil.copy2(command[-1], tool)
    argument = [('Z:' if len(command) > 1 else 'C:') + folder.replace('/', '\\')] if with_argument else []
    status = subprocess.run(command[:-1] + [tool] + argument, cwd='/', env=ENVIRONMENT, stdin=subprocess.DEVNULL,
                            stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, timeout=120).returncode
    os.remove(tool)
    return ('crash' if status < 0 or (len(command) > 1 and status == 3) else status), snapshot(root)


def describe(one, other):
    if one[0] != other[0]:
        return 'exit status %s on Linux, %s on Windows' % (one[0], other[0])
    for path in sorted(set(one[1]) | set(other[1])):
        if one[1].get(path, 0) != other[1].get(path, 0):
            return '%s differs: %r on Linux, %r on Windows' % (path, one[1].get(path), other[1].get(path))
    return None


def compare_installations(linux, windows, base):
    failed = []
    outcomes = {}
    for number in range(COUNT + 1):
        files = example_files() if number == 0 else installations.make(number)
        root = os.path.join(base, 'installation')
        results = [run(files, root, command, number % 2 == 1)
                   for command in ([os.path.join(linux, 'bin', TOOL)], [WINE, os.path.join(windows, 'bin', TOOL + '.exe')])]
        outcomes[results[0][0]] = outcomes.get(results[0][0], 0) + 1
        difference = describe(*results)
        if difference:
            failed.append('installation %d: %s' % (number, difference[:600]))
    print('outcomes on Linux: %s' % ', '.join('%s: %d' % item for item in sorted(outcomes.items(), key=str)))
    return COUNT + 1, failed


def read_order(command):
    kinds = {}
    output = subprocess.run(command, env=dict(ENVIRONMENT, LC_ALL='C'), check=True, stdout=subprocess.PIPE).stdout
    for line in output.decode().splitlines():
        words = line.split()
        if words[0] == 'kind':
            kinds[words[1]] = []
            current = kinds[words[1]]
        else:
            current.append((words[0], words[1]))
    return kinds


def compare_orders(linux, windows):
    failed = []
    one = read_order([os.path.join(linux, 'bin', 'text_order')])
    other = read_order([WINE, os.path.join(windows, 'bin', 'text_order.exe')])
    if set(one) != SAME_ORDER | OTHER_ORDER or sum(len(texts) for texts in one.values()) != 20000:
        failed.append('texts: not the kinds or the number that were asked for')
    for kind in one:
        if sorted(int(text[0]) for text in other[kind]) != list(range(len(one[kind]))):
            failed.append('texts of %s: not all are there on Windows' % kind)
        if (one[kind] == other[kind]) != (kind in SAME_ORDER):
            failed.append('texts of %s: the order is %s' % (kind, 'another' if kind in SAME_ORDER else 'the same now'))
    return len(one), failed


def main():
    if len(sys.argv) != 3:
        print(__doc__, file=sys.stderr)
        return 2
    linux, windows = sys.argv[1:]
    base = tempfile.mkdtemp(prefix='zkfpga-parity-')
    try:
        counts, failures = zip(compare_installations(linux, windows, base), compare_orders(linux, windows))
    finally:
        shutil.rmtree(base, ignore_errors=True)
    failed = sum(failures, [])
    print('\n'.join(failed))
    print('%d passed, %d failed' % (sum(counts) - len(failed), len(failed)))
    return 1 if failed else 0


if __name__ == '__main__':
    sys.exit(main())
