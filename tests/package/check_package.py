#!/usr/bin/env python3
"""Packs a release and runs it where nothing else is.

    check_package.py BUILD_FOLDER CPACK SOURCE_FOLDER [EMULATOR]

A .deb is installed by dpkg below an empty folder, a .zip is unpacked into one. The tool from there then runs on a copy
of the example installation, whose cache must be the reviewed one; and all that hosts need must be there.
"""
import glob
import os
import shutil
import subprocess
import sys
import tempfile
import zipfile

TOOL_FOLDER = os.path.join('Targets', 'QN', 'FPGA', 'Utilities')
CACHE = os.path.join('Targets', 'QN', 'FPGA', 'resource_cache.xml')


def run(command, **more):
    done = subprocess.run(command, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, **more)
    if done.returncode != 0:
        sys.exit('%s: exit status %d\n%s' % (' '.join(command), done.returncode, done.stdout.decode(errors='replace')))
    return done.stdout.decode()


def install_deb(package, place):
    """Below `place`, with a record of its own. What the package depends on isn't there, and isn't looked for; nor is it
    configured (the linker's cache), for which there would have to be a shell."""
    admin = os.path.join(place, 'var', 'lib', 'dpkg')
    for folder in ('info', 'updates', 'triggers'):
        os.makedirs(os.path.join(admin, folder))
    open(os.path.join(admin, 'status'), 'w').close()
    run(['dpkg', '--root=' + place, '--force-not-root,depends,bad-path', '--unpack', package])
    if 'libexpat1' not in run(['dpkg-deb', '--field', package, 'Depends']):
        sys.exit('the package does not name what it depends on')
    run(['dpkg', '--root=' + place, '--verify', 'zkfpga'])
    return os.path.join(place, 'usr')


def unpack_zip(package, place):
    with zipfile.ZipFile(package) as archive:
        archive.extractall(place)
    (top,) = os.listdir(place)
    return os.path.join(place, top)


def main():
    build, cpack, source = sys.argv[1:4]
    emulator = sys.argv[4:]
    base = tempfile.mkdtemp(prefix='zkfpga-package-')
    try:
        run([cpack, '-B', base], cwd=build)
        (package,) = glob.glob(os.path.join(base, '*.zip' if emulator else '*.deb'))
        place = os.path.join(base, 'place')
        os.mkdir(place)
        prefix = (unpack_zip if emulator else install_deb)(package, place)
        tool = 'zkfpga_make_resource_cache' + ('.exe' if emulator else '')
        library = glob.glob(os.path.join(prefix, 'bin/zkfpgarestree.dll' if emulator else 'lib*/**/libzkfpgarestree.so'),
                            recursive=True)
        for path in ['include/zkfpga/zkfpga.h', 'share/doc/zkfpga/platforms.md', 'lib*/**/zkfpgaConfig.cmake',
                     'lib*/**/zkfpga.pc', 'lib/libzkfpgarestree.dll.a' if emulator else 'lib*/**/libzkfpgarestree.so']:
            if not glob.glob(os.path.join(prefix, path), recursive=True):
                sys.exit('not in the package: ' + path)
        if len(library) != 1:
            sys.exit('the package has no library')
        installation = os.path.join(base, 'installation')
        shutil.copytree(os.path.join(source, 'examples', 'installation'), installation)
        placed = os.path.join(installation, TOOL_FOLDER, tool)
        shutil.copy2(os.path.join(prefix, 'bin', tool), placed)
        run(emulator + [placed], cwd='/')
        with open(os.path.join(installation, CACHE), 'rb') as f:
            cache = f.read()
        with open(os.path.join(source, 'tests', 'data', 'example_resource_cache.xml'), 'rb') as f:
            reviewed = f.read()
        if cache != (reviewed.replace(b'\n', b'\r\n') if emulator else reviewed):
            sys.exit('the cache is not the reviewed one')
    finally:
        shutil.rmtree(base, ignore_errors=True)


main()
