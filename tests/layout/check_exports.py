#!/usr/bin/env python3
"""Tells whether Windows modules export the names of a list and no others: check_exports.py OBJDUMP LIST MODULE..."""
import re
import subprocess
import sys

# Of the list, what the system itself exports on Windows.
SYSTEM = {'CoTaskMemAlloc', 'CoTaskMemFree', 'CoTaskMemRealloc', 'SysAllocString', 'SysAllocStringLen', 'SysFreeString',
          'SysStringLen'}

objdump, names, *modules = sys.argv[1:]
with open(names) as f:
    expected = sorted(set(f.read().split()) - SYSTEM)
failed = not modules
for module in modules:
    output = subprocess.run([objdump, '-p', module], check=True, stdout=subprocess.PIPE).stdout.decode()
    table = output.split('[Ordinal/Name Pointer] Table')[1].split('\n\n')[0]
    found = re.findall(r'^\t\[ *\d+\] (\S+)$', table, re.MULTILINE)
    if found != expected:
        failed = True
        print('%s exports\n%s\nexpected\n%s' % (module, '\n'.join(found), '\n'.join(expected)))
sys.exit(failed)
