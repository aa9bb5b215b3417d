#!/usr/bin/env python3
"""Checks what the sources may include and look like; prints one line for each violation.

usage: check_includes.py ROOT

Checked: the floors (who may include whom), a source's own header first, no include of a .cpp file,
sizes of files, plain ASCII, names of the rooms' headers and in the host's folders, foreign
declarations, what a test model may include. clang-tidy checks functions' sizes, macros and names
('./dev check'). Exit status: 1 if something was found.
"""
import pathlib
import re
import sys

FACADE = "Kq_BoolEquation.h"
ENGINE = "Kq_BoolEquationImp.h"
NODE = "Kq_BoolEquationImpNode.h"
PUBLIC = {FACADE, ENGINE, NODE}

# What a public header may include of the other two: each knows only those below it. Inside the
# library, the build enforces the floors: a room's compiler sees only the headers of the rooms
# before it.
PUBLIC_FLOORS = {FACADE: set(), ENGINE: {FACADE}, NODE: {ENGINE}}
SYSTEM_HEADERS = {"sys/mman.h"}  # large pages for large texts, if the system has them

MAX_HEADER_LINES = 199
MAX_SOURCE_LINES = 399

INCLUDE = re.compile(r'^\s*#\s*include\s*([<"])([^>"]+)[>"]')
FOREIGN = re.compile(r'^\s*extern\b(?!\s*template)')
MAIN = re.compile(r"^int main\(")


class Report:
    def __init__(self, root):
        self.root = root
        self.count = 0

    def add(self, path, line, text):
        self.count += 1
        print(f"{path.relative_to(self.root)}:{line}: {text}")


def read_lines(path):
    return path.read_text(encoding="utf-8", errors="replace").splitlines()


def includes(lines):
    """(line number, bracket, name) of each include."""
    found = ((number, INCLUDE.match(line)) for number, line in enumerate(lines, 1))
    return [(number, match[1], match[2]) for number, match in found if match]


def is_ours(name):
    return "/" in name or name.startswith("Kq_") or name.endswith((".h", ".cpp"))


def check_library_includes(path, lines, report):
    """Public headers are in angle brackets, headers of rooms by their bare names in quotes."""
    others = PUBLIC_FLOORS.get(path.name, PUBLIC)
    for number, bracket, name in includes(lines):
        if bracket == "<":
            fits = (not is_ours(name) or name in others or name in SYSTEM_HEADERS
                    or name.startswith("port/"))
        else:
            fits = path.name not in PUBLIC and re.fullmatch(r"\w+\.h", name) and name not in PUBLIC
        if not fits:
            report.add(path, number, f"may not include {name} here")


def check_own_header(path, lines, report):
    """A source includes its own header first, which shows that the header is complete."""
    own = path.with_suffix(".h")
    if path.suffix == ".cpp" and own.exists():
        found = includes(lines)
        if not found or found[0][2] != own.name:
            report.add(path, found[0][0] if found else 1, f"the first include must be {own.name}")


def table_lines(lines):
    """The indices of lines inside constant tables: from 'const ... = {' at the margin to '};'."""
    inside, indices = False, set()
    for index, line in enumerate(lines):
        if inside and re.match(r"\s*\}+;", line):
            inside = False
        elif inside:
            indices.add(index)
        elif re.match(r"\s*(static |inline )*const(expr)? .*=\s*\{+\s*$", line):
            inside = True
    return indices


def check_sizes(path, lines, report):
    tables = table_lines(lines)
    counted = [line for index, line in enumerate(lines) if index not in tables and line.strip()]
    limit = MAX_HEADER_LINES if path.suffix == ".h" else MAX_SOURCE_LINES
    if len(counted) > limit:
        report.add(path, 1, f"{len(counted)} lines that are not blank, the limit is {limit}")


def check_ascii(path, report):
    for number, line in enumerate(path.read_bytes().split(b"\n"), 1):
        if any(byte > 126 or (byte < 32 and byte != 9) for byte in line):
            report.add(path, number, "not plain ASCII")


def check_library_text(path, lines, report):
    for number, line in enumerate(lines, 1):
        if "__FILE__" in line.split("//")[0]:
            report.add(path, number, "__FILE__: dumps name their module by a constant")
        if FOREIGN.match(line):
            report.add(path, number, "hand-written foreign declaration")
        if MAIN.match(line):
            report.add(path, number, "the library has no main")


def check_library(root, report):
    for path in sorted([*root.glob("include/*.h"), *root.glob("s/**/*.h"), *root.glob("s/**/*.cpp")]):
        lines = read_lines(path)
        check_library_includes(path, lines, report)
        check_own_header(path, lines, report)
        check_sizes(path, lines, report)
        check_library_text(path, lines, report)


def check_host(root, report):
    for path in sorted([*root.glob("include/port/*"), *root.glob("port/*.cpp"),
                        *root.glob("port/*.h")]):
        lines = read_lines(path)
        for number, line in enumerate(lines, 1):
            if "Kq_" in line:
                report.add(path, number, "the host library knows nothing of Kq_")
        for number, _, name in includes(lines):
            if is_ours(name) and not (name.startswith("port/") and path.parent.name == "port"
                                      and path.suffix == ".cpp"):
                report.add(path, number, f"may not include {name} here")
        check_sizes(path, lines, report)


def check_users(root, report):
    """Tool and logic see only the public headers, the Python module the facade's and logic's, and
    the reference model nothing of the library."""
    for path in sorted([*root.glob("logic/**/*"), *root.glob("tools/**/*")]):
        if path.suffix in (".h", ".cpp"):
            for number, _, name in includes(read_lines(path)):
                if "Kq_" in name and name not in PUBLIC:
                    report.add(path, number, f"{name} is internal")
    for path in sorted(root.glob("python/src/*")):
        for number, _, name in includes(read_lines(path)):
            if "Kq_" in name and name != FACADE:
                report.add(path, number, f"{name} is not the facade's header")
    for path in sorted(root.glob("tests/reference/*")):
        for number, _, name in includes(read_lines(path)):
            if "Kq_" in name:
                report.add(path, number, "the reference model shares no code with the library")


def check_rooms(root, report):
    """Headers of rooms are included by name alone, and what links them sees the folders of all. So
    two with the same name, in rooms, tool or module, would be confused."""
    seen = {}
    for path in sorted([*root.glob("logic/*/*.h"), *root.glob("tools/booleq/*.h"),
                        *root.glob("python/src/*.h")]):
        first = seen.setdefault(path.name, path)
        if path != first and "logic" in (first.parent.parent.name, path.parent.parent.name):
            report.add(path, 1, f"{first.relative_to(root)} has the same name")
    for path in sorted([*root.glob("logic/*/*.h"), *root.glob("logic/*/*.cpp")]):
        lines = read_lines(path)
        for number, bracket, name in includes(lines):
            if bracket == '"' and "/" in name:
                report.add(path, number, f"{name}: rooms are not named, the links say which are seen")
        check_sizes(path, lines, report)


def check_second_library(root, report):
    """Headers of the second library show nothing of the rooms under it."""
    for path in sorted(root.glob("include/kq_logic/*")):
        lines = read_lines(path)
        for number, bracket, name in includes(lines):
            if is_ours(name) and not (bracket == "<" and (name.startswith("kq_logic/") or
                                                          name == FACADE)):
                report.add(path, number, f"may not include {name} here")
        check_sizes(path, lines, report)


def check_all_ascii(root, report):
    files = [root / "dev", root / "CMakeLists.txt"]
    for folder in ("include", "s", "port", "logic", "tools", "scripts", "cmake", "python", "tests", "bench",
                   "fuzz"):
        files += [path for path in root.glob(f"{folder}/**/*")
                  if path.suffix in (".h", ".cpp", ".py", ".sh", ".txt", ".cmake")]
    for path in sorted(files):
        if path.exists():
            check_ascii(path, report)


def main():
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    root = pathlib.Path(sys.argv[1]).resolve()
    if not (root / "include" / FACADE).exists():
        sys.exit(f"check_includes.py: {root} is not this repository")
    report = Report(root)
    check_library(root, report)
    check_host(root, report)
    check_users(root, report)
    check_rooms(root, report)
    check_second_library(root, report)
    check_all_ascii(root, report)
    return 1 if report.count else 0


if __name__ == "__main__":
    sys.exit(main())
