#!/usr/bin/env python3
"""Checks what the sources may include and look like; prints one line for each violation.

usage: check_includes.py ROOT

Checked: the floors (who may include whom), the own header first, no include of a .cpp file, sizes of
files and functions, plain ASCII, the names of the rooms' headers and in the host's folders, macros,
foreign declarations, where a test model may look. Exit status: 1 when something was found.
"""
import pathlib
import re
import sys

FACADE = "Kq_BoolEquation.h"
ENGINE = "Kq_BoolEquationImp.h"
NODE = "Kq_BoolEquationImpNode.h"
PUBLIC = {FACADE, ENGINE, NODE}
PREFIX = "Kq_BoolEquationImp"

# For each file, by its name without the prefix of the engine family: the headers of ours that it
# may include. Internal headers are named without the prefix too. Any file may include the standard
# library; PORT stands for the host's interfaces. A new file needs a line here, and a reason.
PORT = "port"
HEADER_FLOORS = {
    FACADE: {PORT},
    ENGINE: {PORT, FACADE},
    NODE: {PORT, ENGINE},
    "Diag.h": {PORT},
    "InitText.h": {PORT},
    "Spelling.h": {PORT, NODE},
    "Walk.h": {NODE},
    "Program.h": {NODE},  # a root goes in, steps come out
    "Writer.h": {"Program.h"},
    "Store.h": {NODE, "Walk.h", "Program.h", "InitText.h"},  # keeps what its tree is made of
    "Column.h": {NODE, "ColumnJoin.h", "Program.h"},  # a program goes in, bits come out
    "ColumnJoin.h": {"Program.h"},
    "ColumnKernel.h": {"Column.h", "Word.h"},
    "JoinKernel.h": {"ColumnJoin.h", "ColumnKernel.h"},
    "Results.h": {"Column.h", "Store.h"},  # chooses where bits come from
    "Word.h": set(),
}
SOURCE_HEADERS = {  # besides the host's interfaces and the public headers
    "Kq_BoolEquation.cpp": {"Diag.h"},
    ".cpp": {"Diag.h", "InitText.h", "Store.h", "Walk.h"},
    "Column.cpp": {"Column.h", "ColumnKernel.h", "JoinKernel.h", "Writer.h"},
    "ColumnAvx2.cpp": {"ColumnKernel.h", "JoinKernel.h"},
    "ColumnAvx512.cpp": {"ColumnKernel.h", "JoinKernel.h"},
    "ColumnJoin.cpp": {"ColumnJoin.h", "ColumnKernel.h"},
    "InitText.cpp": {"InitText.h", "Word.h"},
    "InitTree.cpp": {"Spelling.h", "Store.h"},
    "InitValue.cpp": {"InitText.h", "Results.h", "Store.h"},
    "Node.cpp": {"Spelling.h", "Diag.h", "Walk.h"},
    "NodeDbg.cpp": {"Spelling.h", "Diag.h", "Walk.h"},
    "NodeEval.cpp": {"Spelling.h", "Diag.h", "Walk.h"},
    "Program.cpp": {"Program.h", "Walk.h", "Word.h", "Writer.h"},
    "Refusal.cpp": {"InitText.h", "Store.h"},
    "Render.cpp": {"Store.h", "Walk.h"},
    "Store.cpp": {"Store.h", "Walk.h", "sys/mman.h"},  # large pages for large texts
    "StringMgr.cpp": set(),
    "Terms.cpp": {"InitText.h", "Store.h"},
    "Tokenizer.cpp": {"Spelling.h", "Store.h"},
    "Tree.cpp": {"Store.h", "Walk.h"},
    "TruthTable.cpp": {"Results.h"},
    "Variables.cpp": {"Store.h"},
}
# A source that has no header of its own name implements a part of a larger one.
OWN_HEADERS = {"ColumnAvx2.cpp": "ColumnKernel.h", "ColumnAvx512.cpp": "ColumnKernel.h",
               "InitTree.cpp": "Store.h", "NodeDbg.cpp": NODE, "NodeEval.cpp": NODE}

MAX_HEADER_LINES = 199
MAX_SOURCE_LINES = 499
MAX_FUNCTION_LINES = 59

INCLUDE = re.compile(r'^\s*#\s*include\s*([<"])([^>"]+)[>"]')
DEFINE = re.compile(r"^\s*#\s*define\s+(\w+)")
ALLOWED_MACRO = re.compile(r"KQ_EXPORT|KQ_(\w+_)?EMIT|PORT_PRINTF")
FOREIGN = re.compile(r'^\s*extern\b(?!\s*template)')
MAIN = re.compile(r"^int main\(")


class Report:
    def __init__(self, root):
        self.root = root
        self.count = 0

    def add(self, path, line, text):
        self.count += 1
        print(f"{path.relative_to(self.root)}:{line}: {text}")


def short_name(name):
    """The name without the engine prefix, for internal files; public headers keep theirs."""
    if name in PUBLIC or not name.startswith(PREFIX):
        return name
    return name[len(PREFIX):]


def read_lines(path):
    return path.read_text(encoding="utf-8", errors="replace").splitlines()


def includes(lines):
    """(line number, bracket, name) of each include."""
    found = ((number, INCLUDE.match(line)) for number, line in enumerate(lines, 1))
    return [(number, match[1], match[2]) for number, match in found if match]


def is_ours(name):
    return "/" in name or name.startswith("Kq_") or name.endswith((".h", ".cpp"))


def check_floors(path, lines, allowed, report):
    for number, bracket, name in includes(lines):
        if bracket == "<" and not is_ours(name):
            continue  # the standard library
        if name.startswith("port/"):
            fits = PORT in allowed and bracket == "<"
        else:
            is_internal = name.startswith("Kq_") and name not in PUBLIC
            fits = short_name(name) in allowed and bracket == ('"' if is_internal else "<")
        if not fits:
            report.add(path, number, f"may not include {name} here")


def own_header(path):
    name = short_name(path.name)
    if name in OWN_HEADERS:
        return OWN_HEADERS[name]
    for folder in (path.parent, path.parent.parent / "include"):
        header = path.with_suffix(".h").name
        if (folder / header).exists():
            return short_name(header)
    return ENGINE


def check_own_header(path, lines, report):
    found = includes(lines)
    wanted = own_header(path)
    if not found or short_name(found[0][2]) != wanted:
        report.add(path, found[0][0] if found else 1, f"the first include must be {wanted}")


def table_lines(lines):
    """Indices of lines inside constant tables: 'const ... = {' at the margin to '};'."""
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

    # A brace alone on its line opens a function; the next one alone with the same indent ends it.
    start, indent = None, ""
    for index, line in enumerate(lines):
        if start is None and line.strip() == "{":
            start, indent = index, line[:line.index("{")]
        elif start is not None and line == indent + "}":
            length = sum(1 for at in range(start + 1, index) if at not in tables)
            if length > MAX_FUNCTION_LINES:
                report.add(path, start + 1, f"function of {length} lines, "
                                            f"the limit is {MAX_FUNCTION_LINES}")
            start = None


def check_ascii(path, report):
    for number, line in enumerate(path.read_bytes().split(b"\n"), 1):
        if any(byte > 126 or (byte < 32 and byte != 9) for byte in line):
            report.add(path, number, "not plain ASCII")


def check_macros(path, lines, report):
    guard = re.sub(r"\W", "_", path.name).upper()
    for number, line in enumerate(lines, 1):
        match = DEFINE.match(line)
        if match and match[1] != guard and not ALLOWED_MACRO.fullmatch(match[1]):
            report.add(path, number, f"macro {match[1]}: only export, assert and diagnostics")


def check_library_text(path, lines, report):
    for number, line in enumerate(lines, 1):
        if "__FILE__" in line.split("//")[0]:
            report.add(path, number, "__FILE__: dumps name their module by a constant")
        if FOREIGN.match(line):
            report.add(path, number, "hand-written foreign declaration")
        if MAIN.match(line):
            report.add(path, number, "the library has no main")


def check_library(root, report):
    for path in sorted([*root.glob("include/*.h"), *root.glob("s/*.h"), *root.glob("s/*.cpp")]):
        lines = read_lines(path)
        name = short_name(path.name)
        if path.suffix == ".h" and name in HEADER_FLOORS:
            check_floors(path, lines, HEADER_FLOORS[name], report)
        elif path.suffix == ".cpp" and name in SOURCE_HEADERS:
            check_floors(path, lines, {PORT} | PUBLIC | SOURCE_HEADERS[name], report)
            check_own_header(path, lines, report)
        else:
            report.add(path, 1, "not in the tables of scripts/check_includes.py")
        if not path.name.startswith("Kq_BoolEquation"):
            report.add(path, 1, "the name does not start with Kq_BoolEquation")
        check_sizes(path, lines, report)
        check_macros(path, lines, report)
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
        check_macros(path, lines, report)


def check_users(root, report):
    """Tool and logic see the public headers only, the Python module the facade's and logic's; the
    reference model nothing of the library."""
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
    """Headers of rooms are included by name alone, and what links them sees the folders of all: one
    of a name that another has, or tool or module, would be taken for it."""
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
    check_all_ascii(root, report)
    return 1 if report.count else 0


if __name__ == "__main__":
    sys.exit(main())
