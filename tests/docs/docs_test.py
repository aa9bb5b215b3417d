#!/usr/bin/env python3
"""Builds the documentation as it is, and from copies with one fault each.

usage: docs_test.py [UNITTEST OPTION...] ROOT
"""
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile
import unittest

SKIPPED = 77
ROOT = None
HEADER = "include/Kq_BoolEquation.h"


def build(root, output):
    done = subprocess.run([sys.executable, root / "scripts/build_docs.py", root, output],
                          stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True, check=False)
    return done.returncode, done.stdout


def contents(directory):
    return {path.relative_to(directory): path.read_bytes()
            for path in directory.rglob("*") if path.is_file()}


class Documentation(unittest.TestCase):
    def setUp(self):
        directory = tempfile.TemporaryDirectory()
        self.addCleanup(directory.cleanup)
        self.copy = pathlib.Path(directory.name) / "a copy"
        self.output = pathlib.Path(directory.name) / "html"
        for name in ("include", "docs", "scripts"):
            shutil.copytree(ROOT / name, self.copy / name)
        for name in ("README.md", "CONTRIBUTING.md", "CHANGELOG.md", "CMakeLists.txt"):
            shutil.copy(ROOT / name, self.copy / name)

    def append(self, file, text):
        with (self.copy / file).open("a", encoding="utf-8") as stream:
            stream.write(text)

    def add_members(self, text):
        """Inserts members before Dbg of the facade, after a blank line."""
        path = self.copy / HEADER
        header = path.read_text(encoding="utf-8")
        comment = header.index("    void Dbg() const; // writes all")
        path.write_text(header[:comment] + "\n" + text + "\n" + header[comment:], encoding="utf-8")
        return header[:comment].count("\n") + 2

    def page(self, name):
        return (self.output / name).read_text(encoding="utf-8")

    def expect(self, message):
        status, output = build(self.copy, self.output)
        self.assertEqual(status, 1, output)
        self.assertIn(message, output)
        self.assertEqual(len(output.splitlines()), 1, output)
        self.assertFalse(self.output.exists())

    def test_two_places_give_the_same_bytes(self):
        for root, name in ((ROOT, "first"), (self.copy, "second")):
            self.assertEqual(build(root, self.output.with_name(name)), (0, ""))
        first, second = (contents(self.output.with_name(name)) for name in ("first", "second"))
        self.assertEqual(sorted(first), sorted(second))
        self.assertEqual([name for name in first if first[name] != second[name]], [])

    def test_member_without_a_comment(self):
        line = self.add_members("    bool HasNothing() const;\n")
        self.expect(f"{HEADER}:{line}: error: Member HasNothing() const")

    def test_enumerator_without_a_comment(self):
        path = self.copy / "include/Kq_BoolEquationImpNode.h"
        header = path.read_text(encoding="utf-8")
        path.write_text(re.sub(r"(SENTINEL = 13) *//.*", r"\1", header), encoding="utf-8")
        line = header[:header.index("SENTINEL = 13")].count("\n") + 1
        self.expect(f"include/Kq_BoolEquationImpNode.h:{line}: enumerator without a comment")

    def test_comment_stands_for_all_below_it(self):
        self.add_members("    // Lorem.\n    bool First() const;\n    bool Second() const; // dolor\n"
                         "    bool Third(int one,\n               int two) const;\n")
        self.assertEqual(build(self.copy, self.output), (0, ""))
        page = self.page("classKq__BoolEquation.html")
        self.assertEqual([len(re.findall(word, page)) for word in ("Lorem[.]", "Dolor[.]")], [2, 1])

    def test_comment_ends_at_a_blank_line(self):
        line = self.add_members("    // Lorem.\n    bool First() const;\n\n    bool Second() const;\n")
        self.expect(f"{HEADER}:{line + 3}: error: Member Second() const")

    def test_comment_of_the_same_name_elsewhere(self):
        self.assertEqual(build(self.copy, self.output), (0, ""))
        for name in ("classKq__BoolEquation.html", "classKq__BoolEquationImp.html"):
            self.assertIn("false when there is no such variable", self.page(name))

    def test_comments_are_plain_text(self):
        self.add_members("    // Plain <b>, @see, \\ref, 100%, a*b*c, #x, ~y & \"z | ~ @\" of 'it'.\n"
                         "    bool First(bool it) const;\n")
        self.assertEqual(build(self.copy, self.output), (0, ""))
        self.assertIn("Plain &lt;b&gt;, @see, \\ref, 100%, a*b*c, #x, ~y &amp; "
                      "<code>\"z | ~ @\"</code> of <code>it</code>.",
                      self.page("classKq__BoolEquation.html"))

    def test_link_to_no_page(self):
        self.append("docs/booleq.md", "\n[nowhere](nowhere.md)\n")
        self.expect("nowhere")

    def test_link_to_no_heading(self):
        self.append("docs/booleq.md", "\n[nowhere](syntax.md#nowhere)\n")
        self.expect("page-syntax-nowhere")

    def test_picture_that_is_missing(self):
        self.append("docs/booleq.md", "\n![none](pictures/none.svg)\n")
        self.expect("page-booleq.html: the link to none.svg leads nowhere")

    def test_path_of_this_machine(self):
        self.append("docs/booleq.md", f"\nIt lies in {self.copy}.\n")
        self.expect(f"holds the path {self.copy}")


if __name__ == "__main__":
    ROOT = pathlib.Path(sys.argv.pop()).resolve()
    if not shutil.which("doxygen"):
        print("skipped: there is no doxygen")
        sys.exit(SKIPPED)
    unittest.main()
