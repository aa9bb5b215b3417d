#!/usr/bin/env python3
"""Changes a small library in one way at a time; the check of the exported interface must
distinguish changes that break programs built earlier from others.

usage: abi_test.py [UNITTEST OPTION...] CHECK COMPILER
"""
import pathlib
import subprocess
import sys
import tempfile
import unittest

CHECK = COMPILER = None

HEADER = """#include <vector>
class Value {
  public:
    struct Hidden;
    Value();
    ~Value();
    std::vector<unsigned int> Get(unsigned int index) const;
    bool Set(unsigned int value);
  private:
    void Check() const;
    Value(unsigned int value, int);
    Hidden* m_hidden;
    unsigned int m_value;
};
"""
SOURCE = """#include "value.h"
struct Value::Hidden { int m_first = 1; void Use(); };
void Value::Hidden::Use() {}
void Value::Check() const { m_hidden->Use(); }
Value::Value(unsigned int value, int) : m_value(value) {}
Value::Value() : m_hidden(new Hidden), m_value(0) {}
Value::~Value() { delete m_hidden; }
std::vector<unsigned int> Value::Get(unsigned int index) const
{ return std::vector<unsigned int>(1, index + m_value); }
bool Value::Set(unsigned int value) { m_value = value; return true; }
"""


class Abi(unittest.TestCase):
    def setUp(self):
        directory = tempfile.TemporaryDirectory()
        self.addCleanup(directory.cleanup)
        self.directory = pathlib.Path(directory.name)
        self.build(HEADER, SOURCE)
        self.assertEqual(self.check("--update"), (0, ""))

    def build(self, header, source):
        include = self.directory / "include"
        include.mkdir(exist_ok=True)
        (include / "value.h").write_text(header)
        (self.directory / "value.cpp").write_text(source)
        subprocess.run([COMPILER, "-std=c++17", "-g", "-shared", "-fPIC", "-I", include,
                        self.directory / "value.cpp", "-o", self.directory / "libvalue.so"],
                       check=True)

    def check(self, *options):
        done = subprocess.run(
            [sys.executable, CHECK, self.directory / "libvalue.so", self.directory / "include",
             self.directory / "baseline.abi", *options],
            stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True, check=False)
        return done.returncode, done.stdout

    def changed(self, before, after):
        """The check's answer after 'before' was replaced by 'after' in header and source."""
        self.assertIn(before, HEADER + SOURCE)
        self.build(HEADER.replace(before, after), SOURCE.replace(before, after))
        return self.check()

    def expect_refused(self, before, after, message):
        status, output = self.changed(before, after)
        self.assertEqual(status, 1, output)
        self.assertIn(message, output)

    def test_same_library(self):
        self.assertEqual(self.check(), (0, ""))

    def test_baseline_without_places(self):
        self.assertNotIn(str(self.directory), (self.directory / "baseline.abi").read_text())

    def test_addition(self):
        self.build(HEADER.replace("bool Set", "void Reset();\n bool Set"),
                   SOURCE + "void Value::Reset() { m_value = 0; }\n")
        status, output = self.check()
        self.assertEqual(status, 0, output)
        self.assertIn("void Value::Reset()", output)

    def test_type_that_headers_do_not_define(self):
        self.assertEqual(self.changed("int m_first = 1;", "long m_first = 1; int m_more = 2;"),
                         (0, ""))
        self.assertEqual(self.changed("Use()", "Use2()"), (0, ""))

    def test_private_members(self):
        self.assertEqual(self.changed("Check()", "Check2()"), (0, ""))
        self.assertEqual(self.changed("Value(unsigned int value, int)",
                                      "Value(unsigned int value, long)"), (0, ""))

    def test_removal(self):
        self.build(HEADER.replace("bool Set(unsigned int value);", ""),
                   SOURCE[:SOURCE.index("bool Value::Set")])
        status, output = self.check()
        self.assertEqual(status, 1, output)
        self.assertIn("Removed function", output)

    def test_other_argument(self):
        self.expect_refused("Set(unsigned int value)", "Set(unsigned long value)", "Removed")

    def test_other_result(self):
        self.expect_refused("std::vector<unsigned int>", "std::vector<int>", "return type changed")

    def test_other_size(self):
        self.expect_refused("unsigned int m_value;", "unsigned int m_value; int m_more[4];", "size")

    def test_library_without_debug_information(self):
        subprocess.run(["strip", "--strip-debug", self.directory / "libvalue.so"], check=True)
        status, output = self.check()
        self.assertEqual(status, 1)
        self.assertIn("debug information", output)


if __name__ == "__main__":
    COMPILER = sys.argv.pop()
    CHECK = sys.argv.pop()
    unittest.main()
