#!/usr/bin/env python3
"""Breaks one rule at a time in a copy of the sources; the check must report exactly that.

usage: checks_can_fail.py [UNITTEST OPTION...] ROOT COMPILER
"""
import pathlib
import shutil
import subprocess
import sys
import tempfile
import unittest

ROOT = COMPILER = None
BUILDER = "s/tree/Builder.cpp"
SETTING = "s/equation/Setting.cpp"
MESSAGES = "s/message/Messages.h"


def run(*command):
    done = subprocess.run([str(part) for part in command], stdout=subprocess.PIPE,
                          stderr=subprocess.STDOUT, text=True, check=False)
    return done.returncode, done.stdout


class InCopy(unittest.TestCase):
    def setUp(self):
        self.directory = tempfile.TemporaryDirectory()
        self.addCleanup(self.directory.cleanup)
        self.copy = pathlib.Path(self.directory.name)


class Includes(InCopy):
    def setUp(self):
        super().setUp()
        for folder in ("include", "s", "port", "logic", "tools", "python"):
            shutil.copytree(ROOT / folder, self.copy / folder)
        self.before = self.check()[1]

    def check(self):
        status, output = run(sys.executable, ROOT / "scripts/check_includes.py", self.copy)
        return status, output.splitlines()

    # Violations in the sources as they are belong to another test.
    def find_new(self):
        status, lines = self.check()
        self.assertEqual(status, 1 if lines else 0)
        return [line for line in lines if line not in self.before]

    def expect(self, file, message):
        found = self.find_new()
        self.assertEqual(len(found), 1, found)
        self.assertTrue(found[0].startswith(file + ":"), found)
        self.assertIn(message, found[0])

    def append(self, file, text):
        path = self.copy / file
        path.parent.mkdir(parents=True, exist_ok=True)
        with path.open("a", encoding="utf-8") as stream:
            stream.write(text)

    def prepend(self, file, text):
        path = self.copy / file
        path.write_text(text + path.read_text(encoding="utf-8"), encoding="utf-8")

    def test_public_header_that_looks_up(self):
        path = self.copy / "include/Kq_BoolEquation.h"  # one more line could be too many
        path.write_text(path.read_text(encoding="utf-8").replace(
            "#include <vector>", "#include <Kq_BoolEquationImp.h>"), encoding="utf-8")
        self.expect("include/Kq_BoolEquation.h", "may not include")

    def test_header_of_a_room_by_its_path(self):
        self.append(BUILDER, '#include "../equation/Store.h"\n')
        self.expect(BUILDER, "may not include")

    def test_source_that_includes_a_source(self):
        self.append(BUILDER, '#include "Render.cpp"\n')
        self.expect(BUILDER, "may not include")

    def test_internal_header_in_angle_brackets(self):
        self.append(BUILDER, "#include <Walk.h>\n")
        self.expect(BUILDER, "may not include")

    def test_header_of_the_system(self):
        self.append(BUILDER, "#include <unistd.h>\n")
        self.expect(BUILDER, "may not include")

    def test_own_header_not_first(self):
        self.prepend(BUILDER, "#include <vector>\n")
        self.expect(BUILDER, "first include must be Builder.h")

    def test_long_header(self):
        self.append(MESSAGES, "// line\n" * 200)
        self.expect(MESSAGES, "the limit is 199")

    def test_long_source(self):
        self.append(SETTING, "// line\n" * 400)
        self.expect(SETTING, "the limit is 399")

    def test_constant_tables_have_no_size(self):
        self.append(SETTING, "const int kTable[] = {\n" + "    1,\n" * 600 + "};\n")
        self.assertEqual(self.find_new(), [])

    def test_byte_that_is_not_ascii(self):
        self.append("tools/booleq/text.cpp", "// \u00ab\n")
        self.expect("tools/booleq/text.cpp", "not plain ASCII")

    def test_host_that_knows_us(self):
        self.append("port/Port_Env.cpp", "class Kq_BoolEquation;\n")
        self.expect("port/Port_Env.cpp", "knows nothing of Kq_")

    def test_file_macro(self):
        self.append(BUILDER, "const char* const kName = __FILE__;\n")
        self.expect(BUILDER, "__FILE__")

    def test_foreign_declaration(self):
        self.append(BUILDER, "extern int s_other;\n")
        self.expect(BUILDER, "foreign declaration")

    def test_tool_that_uses_internals(self):
        self.append("tools/booleq/text.cpp", '#include "Kq_Internal.h"\n')
        self.expect("tools/booleq/text.cpp", "is internal")

    def test_room_that_uses_internals(self):
        self.append("logic/search/match.cpp", '#include "Kq_Internal.h"\n')
        self.expect("logic/search/match.cpp", "is internal")

    def test_room_that_is_named(self):
        self.append("logic/search/match.cpp", '#include "../column/rows.h"\n')
        self.expect("logic/search/match.cpp", "rooms are not named")

    def test_header_of_the_second_library_that_looks_up(self):
        self.append("include/kq_logic/match.h", '#include "rows.h"\n')
        self.expect("include/kq_logic/match.h", "may not include")

    def test_two_headers_of_one_name(self):
        self.append("logic/search/rows.h", "")
        self.expect("logic/search/rows.h", "logic/column/rows.h has the same name")

    def test_header_of_the_tool_named_like_a_room_s(self):
        self.append("tools/booleq/rows.h", "")
        self.expect("tools/booleq/rows.h", "logic/column/rows.h has the same name")

    def test_python_module_that_uses_the_engine(self):
        self.append("python/src/reports.cpp", "#include <Kq_BoolEquationImp.h>\n")
        self.expect("python/src/reports.cpp", "is not the facade's header")

    def test_model_that_uses_the_library(self):
        self.append("tests/reference/model.cpp", "#include <Kq_BoolEquation.h>\n")
        self.expect("tests/reference/model.cpp", "shares no code")


class Exports(InCopy):
    def build(self, source, *options):
        (self.copy / "host.cpp").write_text("void HostCall() {}\n")
        (self.copy / "library.cpp").write_text(source)
        compiler = (COMPILER, "-shared", "-fPIC", "-fvisibility=hidden")
        host = self.copy / "libkq_port.so"
        for command in (
                (COMPILER, "-shared", "-fPIC", "-Wl,-soname,libkq_port.so.1",
                 self.copy / "host.cpp", "-o", host),
                (COMPILER, "-c", "-fPIC", "-fvisibility=hidden", self.copy / "library.cpp",
                 "-o", self.copy / "library.o"),
                (*compiler, self.copy / "library.o", host, "-o", self.copy / "library.so",
                 *options)):
            status, output = run(*command)
            self.assertEqual(status, 0, output)

    def check(self, *arguments):
        return run(sys.executable, ROOT / "scripts/check_exports.py", self.copy / "library.so",
                   *arguments)

    GOOD = """
void HostCall();
struct __attribute__((visibility("default"))) Kq_BoolEquation { void Use(); };
void Kq_BoolEquation::Use() { HostCall(); }
"""

    def test_good_library(self):
        self.build(self.GOOD)
        self.assertEqual(self.check("--objects", self.copy / "library.o"), (0, ""))

    def test_foreign_export(self):
        self.build(self.GOOD + '__attribute__((visibility("default"))) void Helper() {}\n')
        self.assertEqual(self.check(), (1, "exported, but not ours: Helper()\n"))

    def test_foreign_library(self):
        self.build(self.GOOD, "-Wl,--no-as-needed", "-lpthread", "-lresolv")
        status, output = self.check()
        self.assertEqual(status, 1)
        self.assertIn("needs libresolv.so.2\n", output)

    def test_no_host(self):
        self.build(self.GOOD.replace("{ HostCall(); }", "{}"), "-Wl,--as-needed")
        status, output = self.check("--host", "libother.so")
        self.assertEqual(status, 1)
        self.assertIn("libother.so is not among the needed libraries\n", output)

    def test_run_time_initialiser(self):
        self.build(self.GOOD + "int Number();\nstatic int s_number = Number();\n"
                   "int Number() { return s_number; }\n")
        status, output = self.check("--objects", self.copy / "library.o")
        self.assertEqual(status, 1)
        self.assertIn("run-time initialiser", output)


class Version(InCopy):
    CHANGELOG = "## [Unreleased]\n\n## [1.2.3] - 2026-01-31\n\n## [1.2.2] - 2026-01-30\n"
    PROJECT = "project(Example VERSION 1.2.3 LANGUAGES CXX)\n"

    def check(self, **texts):
        files = {"CMakeLists.txt": self.PROJECT, "CHANGELOG.md": self.CHANGELOG,
                 **{name.replace("_", "."): text for name, text in texts.items()}}
        for name, text in files.items():
            (self.copy / name).write_text(text, encoding="utf-8")
        return run(sys.executable, ROOT / "scripts/check_version.py", "1.2.3", self.copy)

    def expect(self, message, **texts):
        status, output = self.check(**texts)
        self.assertEqual((status, output.count("\n")), (1, 1), output)
        self.assertIn(message, output)

    def test_one_version(self):
        self.assertEqual(self.check(other_txt="version 1.2.3.4, 11.2.3, 1.2.30\n"), (0, ""))

    def test_version_in_another_file(self):
        self.expect("other.txt:2: states the version", other_txt="\nversion 1.2.3.\n")

    def test_changelog_without_the_release(self):
        self.expect("newest release is 1.2.2",
                    CHANGELOG_md=self.CHANGELOG.replace("## [1.2.3] - 2026-01-31", ""))

    def test_release_without_a_date(self):
        self.expect("'## [1.2.3]' is not of the form",
                    CHANGELOG_md=self.CHANGELOG.replace(" - 2026-01-31", ""))

    def test_pyproject_that_states_one(self):
        self.expect("states a version", pyproject_toml='[project]\nversion = "1.2.4"\n[tool]\n')
        self.expect("does not say dynamic", pyproject_toml='[project]\nname = "example"\n')
        self.assertEqual(self.check(pyproject_toml="[build-system]\nrequires = []\n"), (0, ""))
        self.assertEqual(self.check(pyproject_toml='[project]\ndynamic = ["version"]\n'), (0, ""))

    def test_installed_package_of_another_version(self):
        self.check()
        package = self.copy / "lib/pkgconfig/kq_boolequation.pc"
        package.parent.mkdir(parents=True)
        package.write_text("Name: a\nDescription: b\nVersion: 1.2.4\n", encoding="utf-8")
        status, output = run(sys.executable, ROOT / "scripts/check_version.py", "1.2.3", self.copy,
                             self.copy)
        self.assertEqual(status, 1)
        self.assertIn("pkg-config says '1.2.4', CMakeLists.txt 1.2.3\n", output)
        self.assertIn("the CMake package is not there", output)


if __name__ == "__main__":
    COMPILER = sys.argv.pop()
    ROOT = pathlib.Path(sys.argv.pop()).resolve()
    unittest.main()
