#!/usr/bin/env python3
"""Each rule must catch what it forbids, let pass what it allows, and refuse to judge nothing.

usage: lint_test.py   (the compiler is ${CXX:-c++})
"""

import os
import subprocess
import sys
import tempfile
import unittest

HERE = os.path.dirname(os.path.abspath(__file__))


def judged(rule, *arguments):
    done = subprocess.run([sys.executable, os.path.join(HERE, rule), *arguments],
                          capture_output=True, text=True, check=False)
    return done.returncode, done.stdout + done.stderr


class RuleTest(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = folder.name

    def write(self, path, text):
        full = os.path.join(self.root, path)
        os.makedirs(os.path.dirname(full), exist_ok=True)
        with open(full, "w", encoding="utf-8") as file:
            file.write(text)
        return full

    def assert_passes(self, rule, *arguments):
        status, output = judged(rule, *(arguments or [self.root]))
        self.assertEqual(status, 0, output)

    def assert_caught(self, rule, words, *arguments):
        status, output = judged(rule, *(arguments or [self.root]))
        self.assertEqual(status, 1, output)
        self.assertIn(words, output)

    def test_an_empty_tree_is_no_pass(self):
        for rule in ("include_rule.py", "wording.py", "file_length.py", "formatting.py"):
            self.assert_caught(rule, "nothing to look at")


class IncludeRuleTest(RuleTest):
    def forbidden(self, path, include):
        self.write(path, f"#include {include}\n")
        self.assert_caught("include_rule.py", f"{path}:1: #include {include}")
        os.remove(os.path.join(self.root, path))

    def test_what_each_layer_must_not_include_is_caught(self):
        for path, include in [
                ("src/items/A.cpp", "<unistd.h>"),
                ("src/items/A.cpp", "<sys/stat.h>"),
                ("src/items/A.cpp", "<sqlite3.h>"),
                ("src/items/A.cpp", "<fmt/format.h>"),
                ("src/items/A.h", '"linux/PosixError.h"'),
                ("src/provider/A.cpp", '"host/EmbeddedHost.h"'),
                ("src/items/A_test.cpp", "<dirent.h>"),
                ("src/platform/log/A.h", "<systemd/sd-journal.h>"),
                ("src/platform/log/A.h", '"items/LocalItem.h"'),
                ("src/platform/log/A.h", '"LogSink.h"'),
                ("src/linux/log/A.h", '"provider/VantrellModule.h"'),
                ("src/linux/log/A.h", '"items/LocalItem.h"'),
                ("src/linux/log/A.h", '"host/EmbeddedHost.h"'),
                ("src/host/A.cpp", '"items/LocalItem.h"'),
                ("src/cli/A.cpp", '"provider/LocalDochost.h"'),
                ("src/cli/A.cpp", '  "support/Log.h"')]:
            with self.subTest(path=path, include=include):
                self.forbidden(path, include.strip())

    def test_what_each_layer_may_include_passes(self):
        for path, include in [
                ("src/items/A.cpp", "<vector>"),
                ("src/items/A.cpp", "<cerrno>"),
                ("src/items/A.cpp", '"identity/FndURL+ZubFileObjectIdentifier.h"'),
                ("src/items/A.h", '"platform/foundation/FndURL.h"'),
                ("src/items/A_test.cpp", "<gtest/gtest.h>"),
                ("src/items/A_test.cpp", '"tests/fakes/TestSystem.h"'),
                ("src/platform/log/A.h", '"platform/log/LogSink.h"'),
                ("src/linux/log/A.h", "<systemd/sd-journal.h>"),
                ("src/host/A.cpp", '"provider/VantrellModule.h"'),
                ("src/cli/A.cpp", '"host/EmbeddedHost.h"')]:
            with self.subTest(path=path, include=include):
                self.write(path, f"#include {include}\n")
                self.assert_passes("include_rule.py")


class WordingTest(RuleTest):
    def test_forbidden_words_are_caught(self):
        for text in ["// see Part " + "3.4", "// see spec" + ".md", "// the Specifi" + "cation says",
                     "// fixed in issue" + " #12", 'open("/wor' + 'k/main")', "// TO" + "DO: later"]:
            with self.subTest(text=text):
                self.write("src/items/A.cpp", f"int a;\n{text}\n")
                self.assert_caught("wording.py", "src/items/A.cpp:2:")

    def test_forbidden_words_are_caught_wherever_people_write(self):
        for path in ("README.md", "test", ".ci/run", "docs/a.md", "cmake/a.cmake", "packaging/a.sh",
                     "bench/a.cpp", "tests/a/CMakeLists.txt"):
            with self.subTest(path=path):
                full = self.write(path, "see Part " + "1.1\n")
                self.assert_caught("wording.py", f"{path}:1:")
                os.remove(full)

    def test_sleeping_is_caught_in_tests_alone(self):
        sleep = "std::this_thread::sleep" + "_for(delay);\n"
        self.write("src/linux/SystemClock.cpp", sleep)
        self.assert_passes("wording.py")
        self.write("src/linux/SystemClock_test.cpp", sleep)
        self.assert_caught("wording.py", "SystemClock_test.cpp:1:")

    def test_ordinary_words_pass(self):
        self.write("src/items/A.cpp", "// Part of the path; a special case, specific to folders.\n")
        self.assert_passes("wording.py")


class FileLengthTest(RuleTest):
    def test_400_lines_pass_and_401_are_caught(self):
        self.write("src/items/A.cpp", "\n" * 400)
        self.assert_passes("file_length.py")
        self.write("src/items/B.h", "\n" * 401)
        self.assert_caught("file_length.py", "src/items/B.h: 401 lines")

    def test_tests_may_be_longer(self):
        self.write("src/items/A.cpp", "\n")
        self.write("src/items/A_test.cpp", "\n" * 900)
        self.assert_passes("file_length.py")


class FormattingTest(RuleTest):
    def test_a_line_that_is_laid_out_otherwise_is_caught(self):
        self.write(".clang-format", "BasedOnStyle: Google\nColumnLimit: 100\n")
        self.write("src/items/A.cpp", "int a = 1;\n")
        self.assert_passes("formatting.py")
        self.write("src/items/A.cpp", "int  a=1;\n")
        self.assert_caught("formatting.py", "src/items/A.cpp:1:")


class LinkageTest(RuleTest):
    def built(self, name, code, *flags):
        source = self.write(name + ".cpp", code)
        file = os.path.join(self.root, name)
        compiler = os.environ.get("CXX", "c++")
        subprocess.run([compiler, "-fvisibility=hidden", source, "-o", file, *flags], check=True)
        return file

    ENTRY = ('extern "C" __attribute__((visibility("default"))) '
             "void* vantrellCreateExtension() { return nullptr; }\n")

    def test_a_module_with_the_entry_alone_passes(self):
        module = self.built("good.so", self.ENTRY, "-shared", "-fPIC")
        self.assert_passes("linkage.py", "module", module)

    def test_a_second_exported_function_is_caught(self):
        more = '__attribute__((visibility("default"))) int more() { return 1; }\n'
        module = self.built("more.so", self.ENTRY + more, "-shared", "-fPIC")
        self.assert_caught("linkage.py", "exports", "module", module)

    def test_a_module_that_needs_the_database_is_caught(self):
        module = self.built("sqlite.so", self.ENTRY, "-shared", "-fPIC", "-Wl,--no-as-needed",
                            "-lsqlite3")
        self.assert_caught("linkage.py", "needs libsqlite3", "module", module)

    def test_a_test_program_with_a_piece_of_the_system_layer_is_caught(self):
        ours = "namespace vantrell { int ours() { return 1; } }\nint main() {}\n"
        self.assert_passes("linkage.py", "tests", self.built("good", ours))
        theirs = "namespace vantrell::linuxos { int theirs() { return 1; } }\n"
        self.assert_caught("linkage.py", "holds a piece of linux/", "tests",
                           self.built("bad", theirs + ours))

    def test_a_program_without_names_is_no_pass(self):
        self.assert_caught("linkage.py", "was it stripped", "tests",
                           self.built("bare", "int main() {}\n", "-s"))


if __name__ == "__main__":
    unittest.main()
