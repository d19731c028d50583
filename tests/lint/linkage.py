#!/usr/bin/env python3
"""What the built extension is made of.

usage: linkage.py module FILE    the module exports its entry routine alone, and needs nothing
                                 but platform/ and the language's own libraries
       linkage.py tests FILE...  the extension's test programs hold nothing of linux/
"""

import re
import subprocess
import sys

ENTRY = "vantrellCreateExtension"
MODULE_NEEDS = re.compile(r"lib(vantrell-platform|stdc\+\+|m|c|gcc_s|asan|tsan|ubsan)\.so(\.\d+)*"
                          r"|ld-linux[\w.-]*")
SYSTEM_LAYER = "vantrell::linuxos::"
SYSTEM_LIBRARIES = re.compile(r"lib(sqlite3|systemd|glib|gio)")


def output_of(*command):
    return subprocess.run(command, check=True, capture_output=True, text=True).stdout


def needed_by(file):
    return re.findall(r"\(NEEDED\).*\[(.+)\]", output_of("readelf", "-dW", file))


def exported_by(file):
    listed = output_of("nm", "--dynamic", "--defined-only", "--format=posix", file)
    symbols = [line.split() for line in listed.splitlines()]
    # Weak and unique ones are templates and inline functions that every program shares.
    return [name for name, kind, *_ in symbols if kind in "TDBR"]


def objections_to_module(file):
    exported = exported_by(file)
    if exported != [ENTRY]:
        yield f"{file}: exports {exported}, not {ENTRY} alone"
    for library in needed_by(file):
        if not MODULE_NEEDS.fullmatch(library):
            yield f"{file}: needs {library}"


def objections_to_test(file):
    names = output_of("nm", "--demangle", file)
    if "vantrell::" not in names:
        yield f"{file}: holds nothing of ours; was it stripped?"
    if SYSTEM_LAYER in names:
        first = next(line for line in names.splitlines() if SYSTEM_LAYER in line)
        yield f"{file}: holds a piece of linux/: {first.strip()}"
    for library in needed_by(file):
        if SYSTEM_LIBRARIES.match(library):
            yield f"{file}: needs {library}"


if __name__ == "__main__":
    what, files = sys.argv[1], sys.argv[2:]
    check = {"module": objections_to_module, "tests": objections_to_test}[what]
    violations = [violation for file in files for violation in check(file)]
    for violation in violations:
        print(violation)
    print(f"linkage of {what}: {len(files)} files, {len(violations)} violations")
    sys.exit(1 if violations or not files else 0)
