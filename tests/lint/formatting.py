#!/usr/bin/env python3
"""Code is laid out as .clang-format says.

The layout differs between versions of the tool; the one that counts is named here and in
packaging/debian-packages.txt.

usage: formatting.py ROOT
"""

import os
import subprocess
import sys

from tree import CODE_SUFFIXES, SOURCE_FOLDERS, files_below, report

TOOL = "clang-format-14"


def violations_in(root, paths):
    for path in paths:
        full = os.path.join(root, path)
        checked = subprocess.run([TOOL, "--dry-run", "--ferror-limit=1", "--Werror", full],
                                 capture_output=True, text=True, errors="replace", check=False)
        if checked.returncode != 0:
            first = (checked.stderr.splitlines() or ["no reason given"])[0].replace(root + "/", "")
            yield f"{first}\n  mend it with: {TOOL} -i {path}"


if __name__ == "__main__":
    sources = files_below(sys.argv[1], SOURCE_FOLDERS, CODE_SUFFIXES)
    report("formatting", sources, list(violations_in(sys.argv[1], sources)))
