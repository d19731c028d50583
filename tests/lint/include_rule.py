#!/usr/bin/env python3
"""Which layer may include what.

The extension's folders include the C++ standard library, each other and platform/; platform/
includes the standard library and itself; linux/ includes platform/, itself and libraries; host/
and cli/ may include everything but the extension, of which they see the entry header alone.
Tests may include test libraries and tests/ besides.

usage: include_rule.py ROOT
"""

import re
import sys

from tree import files_below, is_test, lines_of, report

EXTENSION = ("identity", "items", "enumeration", "fs", "provider", "applibraries", "support")
ENTRY_HEADER = "provider/VantrellModule.h"
PROGRAMS = ("host", "cli")

STANDARD = set("""
algorithm any array atomic barrier bit bitset charconv chrono codecvt compare complex concepts
condition_variable coroutine deque exception execution expected filesystem format forward_list
fstream functional future initializer_list iomanip ios iosfwd iostream istream iterator latch
limits list locale map memory memory_resource mutex new numbers numeric optional ostream queue
random ranges ratio regex scoped_allocator semaphore set shared_mutex source_location span
spanstream sstream stack stacktrace stdexcept stop_token streambuf string string_view strstream
syncstream system_error thread tuple type_traits typeindex typeinfo unordered_map unordered_set
utility valarray variant vector version
cassert cctype cerrno cfenv cfloat cinttypes climits clocale cmath csetjmp csignal cstdarg cstddef
cstdint cstdio cstdlib cstring ctime cuchar cwchar cwctype
""".split())
TEST_LIBRARIES = ("gtest/", "gmock/", "rapidcheck")

INCLUDE = re.compile(r'^\s*#\s*include\s*(?:<([^>]+)>|"([^"]+)")')


def layer_of(path):
    parts = path.split("/")
    return parts[1] if parts[0] == "src" and len(parts) > 2 else None


def objection(path, system, quoted):
    """Why the file at `path` must not include that, or None when it may."""
    layer = layer_of(path)
    if is_test(path) and ((system or "").startswith(TEST_LIBRARIES)
                          or (quoted or "").startswith("tests/")):
        return None
    if system is not None:
        if layer in EXTENSION + ("platform",) and system not in STANDARD:
            return "only the C++ standard library may be included here"
        return None
    target = quoted.split("/")[0]
    if "/" not in quoted:
        return "name the folder too: every path counts from src/"
    if layer == "platform" and target != "platform":
        return "platform/ includes itself alone"
    if layer in EXTENSION and target not in EXTENSION + ("platform",):
        return "the extension includes itself and platform/ alone"
    if layer == "linux" and target not in ("linux", "platform"):
        return "linux/ includes itself and platform/ alone"
    if layer in PROGRAMS and target in EXTENSION and quoted != ENTRY_HEADER:
        return f"programs see {ENTRY_HEADER} of the extension alone"
    return None


def violations_in(root, paths):
    for path in paths:
        for number, line in enumerate(lines_of(root, path), 1):
            match = INCLUDE.match(line)
            if match is None:
                continue
            why = objection(path, match.group(1), match.group(2))
            if why is not None:
                yield f"{path}:{number}: {line.strip()}: {why}"


if __name__ == "__main__":
    sources = files_below(sys.argv[1], ("src",), (".h", ".cpp", ".c"))
    report("include rule", sources, list(violations_in(sys.argv[1], sources)))
