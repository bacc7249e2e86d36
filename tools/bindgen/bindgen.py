#!/usr/bin/env python3
"""Writes the bound classes of one CxF3 group from its table description.

    bindgen.py <description.schema> <output directory>

Reads a description such as cxf/v3/schema/cxf3.schema (format in README.md
beside this script) and writes <stem>.h and <stem>.cpp into the output
directory, <stem> being the source stem of the group line. A file is only
rewritten when its text changes, so that the build does not recompile what
did not change. Any error in the description stops the run with the file
name and line number.
"""

import os
import re
import sys

from model import DescriptionError, parse
from layout import fold
from writer import Generator


def write_if_changed(path, lines):
    text = '\n'.join(fold(lines)) + '\n'
    try:
        with open(path, encoding='utf-8') as f:
            if f.read() == text:
                return
    except OSError:
        pass
    with open(path, 'w', encoding='utf-8') as f:
        f.write(text)


def main(argv):
    if len(argv) != 3:
        sys.stderr.write('usage: bindgen.py <description.schema> <output directory>\n')
        return 2
    description, out_dir = argv[1], argv[2]
    try:
        group, classes = parse(description)
        shown = description
        # Name the description by its place in the repository, not the build's.
        match = re.search(r'(cxf/v3/schema/[^/]+)$', description.replace(os.sep, '/'))
        if match:
            shown = match.group(1)
        gen = Generator(group, classes, shown)
        header, source = gen.header(), gen.source()
    except DescriptionError as e:
        sys.stderr.write('bindgen: %s\n' % e)
        return 1
    os.makedirs(out_dir, exist_ok=True)
    write_if_changed(os.path.join(out_dir, group.stem + '.h'), header)
    write_if_changed(os.path.join(out_dir, group.stem + '.cpp'), source)
    return 0


if __name__ == '__main__':
    sys.exit(main(sys.argv))
