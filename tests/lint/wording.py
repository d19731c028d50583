#!/usr/bin/env python3
"""Words that have no place in what we write.

Nothing here refers to a document outside this tree, or to a path of the machine it was written
on; nothing is left for later in a comment; and no test waits by sleeping.
The patterns are spelled so that none matches itself.

usage: wording.py ROOT
"""

import os
import re
import sys

from tree import TEXT_FOLDERS, TEXT_SUFFIXES, TOP_FILES, files_below, is_test, lines_of, report

EVERYWHERE = [
    (re.compile(r"\bParts? \d+\.\d"), "refers to a document that is not here"),
    (re.compile(r"\bspec\.m[d]\b"), "refers to a document that is not here"),
    (re.compile(r"\bspecificatio[n]", re.IGNORECASE), "refers to a document that is not here"),
    (re.compile(r"\b[Ii]ssue #?\d"), "refers to a note that is not here"),
    (re.compile(r"(?<![\w.])/wor[k]/|(?<![\w.])/roo[t]/"), "is a path of one machine"),
    (re.compile(r"\b(TOD[O]|FIXM[E]|XX[X])\b"), "leaves something for later"),
]
IN_TESTS = [
    (re.compile(r"\b(sleep_(for|until)|u?slee[p]|nanoslee[p])\s*\("), "waits without knowing for what"),
]


def violations_in(root, paths):
    for path in paths:
        patterns = EVERYWHERE + (IN_TESTS if is_test(path) else [])
        for number, line in enumerate(lines_of(root, path), 1):
            for pattern, why in patterns:
                match = pattern.search(line)
                if match:
                    yield f'{path}:{number}: "{match.group(0).strip()}" {why}'


if __name__ == "__main__":
    top = sys.argv[1]
    texts = files_below(top, TEXT_FOLDERS, TEXT_SUFFIXES)
    texts += [name for name in TOP_FILES if os.path.exists(os.path.join(top, name))]
    report("wording", texts, list(violations_in(top, texts)))
