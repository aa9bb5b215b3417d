#!/usr/bin/env python3
"""Checks that every exported public member is an operation whose allocations are made to fail.

usage: check_operations.py [--const] LIBRARY HEADERS SOURCE...

Public members are those that HEADERS, a folder, declares outside private parts; private ones are
reached through them. SOURCE contains the operations, named as in the symbol table. With --const
only const members count: those that several threads may call on one object. Prints a line for each
member without an operation, and for each operation without a member.
Exit status: 1 if something was found.
"""
import pathlib
import re
import subprocess
import sys

# Private overloads of names that are also public.
PRIVATE = {
    "Kq_BoolEquation::Handle::Handle(std::vector<unsigned int, std::allocator<unsigned int> >)",
    "Kq_BoolEquationImp::Node::Dbg(int) const",
}
CLASS = re.compile(r"class KQ_EXPORT ([\w:]+) \{")
MEMBER = re.compile(r"(operator\s*(?:\(\)|[^\s(]+(?:\s+\w+)*\*?)|~?\w+)\s*\(")


def public_members(headers):
    """'Class::name' of every function outside private parts."""
    for path in sorted(headers.glob("*.h")):
        name, is_public = None, False
        for line in path.read_text(encoding="utf-8").splitlines():
            line = line.split("//")[0]
            started = CLASS.search(line)
            if started:
                name, is_public = started[1], False
            elif re.match(r"\s*(public|private|protected):", line):
                is_public = "public" in line
            elif line == "};":
                name = None
            elif name and is_public:
                yield from (f"{name}::{found}" for found in MEMBER.findall(line))


def exported_functions(library):
    output = subprocess.run(["nm", "-DC", "--defined-only", library], stdout=subprocess.PIPE,
                            text=True, check=True).stdout
    symbols = (line.split(None, 2) for line in output.splitlines())
    return {name for _, kind, name in symbols if kind in "TW"}


def main():
    arguments = sys.argv[1:]
    is_const = arguments[0] == "--const"
    library, headers, *sources = arguments[is_const:]
    public = set(public_members(pathlib.Path(headers)))
    exported = {name for name in exported_functions(library)
                if name not in PRIVATE and re.match(r"(.*?[^:\s])\(", name)[1] in public
                and (name.endswith(") const") or not is_const)}
    text = "".join(pathlib.Path(source).read_text(encoding="utf-8") for source in sources)
    text = re.sub(r'"\s*\n\s*"', "", text)  # names on two lines
    operations = set(re.findall(r'\{"(Kq_\w+::[^"]*\)(?: const)?)",', text))
    found = [f"no operation: {name}" for name in sorted(exported - operations)]
    found += [f"no such member: {name}" for name in sorted(operations - exported)]
    print("\n".join([*found, f"{len(operations)} operations, {len(exported)} exported members"]))
    return 1 if found or not exported else 0


if __name__ == "__main__":
    sys.exit(main())
