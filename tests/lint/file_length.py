#!/usr/bin/env python3
"""A file that has grown beyond 400 lines holds more than one thing.

usage: file_length.py ROOT
"""

import sys

from tree import CODE_SUFFIXES, files_below, is_test, lines_of, report

LONGEST = 400


def violations_in(root, paths):
    for path in paths:
        length = len(lines_of(root, path)) - 1  # the last line ends with a newline
        if length > LONGEST:
            yield f"{path}: {length} lines, at most {LONGEST} are allowed"


if __name__ == "__main__":
    sources = [path for path in files_below(sys.argv[1], ("src", "bench"), CODE_SUFFIXES)
               if not is_test(path)]
    report("file length", sources, list(violations_in(sys.argv[1], sources)))
