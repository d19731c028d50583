"""What the rules share: which files they look at, and how they report."""

import os
import sys

SOURCE_FOLDERS = ("src", "tests", "bench")
TEXT_FOLDERS = SOURCE_FOLDERS + ("cmake", "docs", "packaging", ".ci")
CODE_SUFFIXES = (".h", ".cpp", ".c")
TEXT_SUFFIXES = CODE_SUFFIXES + (".md", ".txt", ".cmake", ".py", ".sh", ".json", ".in", ".ini", ".xml")
# Files without a suffix, or at the top, that people write too.
TOP_FILES = ("CMakeLists.txt", "CMakePresets.json", "README.md", "CHANGELOG.md", "run", "test",
             ".clang-format", ".clang-tidy", ".gitignore", ".ci/run")


def files_below(root, folders, suffixes):
    """Paths relative to `root`, sorted, of the files in `folders` that end in one of `suffixes`."""
    found = []
    for folder in folders:
        for path, subfolders, names in os.walk(os.path.join(root, folder)):
            subfolders[:] = [name for name in subfolders if name != "__pycache__"]
            found += [os.path.relpath(os.path.join(path, name), root)
                      for name in names if name.endswith(suffixes)]
    return sorted(found)


def lines_of(root, path):
    with open(os.path.join(root, path), encoding="utf-8", errors="surrogateescape") as file:
        return file.read().split("\n")


def is_test(path):
    return path.endswith("_test.cpp") or path.startswith("tests/")


def report(rule, looked_at, violations):
    """Prints the violations and ends the program: 0 when there are none in at least one file."""
    for violation in violations:
        print(violation)
    if not looked_at:
        print(f"{rule}: there was nothing to look at")
        sys.exit(1)
    print(f"{rule}: {len(looked_at)} files, {len(violations)} violations")
    sys.exit(1 if violations else 0)
