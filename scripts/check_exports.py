#!/usr/bin/env python3
"""Checks what the built library shows to the dynamic linker; prints one line for each violation.

usage: check_exports.py LIBRARY [--host NAME] [--second FIRST] [--objects FILE...]

Exported names must belong to the classes Kq_BoolEquation and Kq_BoolEquationImp; the library may
need only the host library, the C++ library and the C library. With --second, LIBRARY is the second
library: its names belong to the namespace kq_logic, and it also needs FIRST, the first library, and
the libraries that read netlists. With --objects, static objects with a run-time initialiser are
also looked for: only the engine's main source may have them (and the node model its class
allocator), because the order of initialisation across files is undefined.
Exit status: 1 if something was found.
"""
import argparse
import pathlib
import re
import subprocess
import sys

# Mangled names, because the demangled name of a template's instance begins with its return type: an
# instance of a standard template over our classes would look like ours.
EXPORTED = re.compile(r"_ZNK?(15Kq_BoolEquation|18Kq_BoolEquationImp)")
SECOND = re.compile(r"_ZNK?8kq_logic")
NEEDED = re.compile(r"(libstdc\+\+|libc\+\+|libc\+\+abi|libgcc_s|libc|libm|ld-linux[-\w]*)\.so[.\d]*")
NETLIST_READERS = ["libsimdjson.so", "libz.so"]
WITH_INITIALISERS = {"Kq_BoolEquationImp.cpp.o", "Kq_BoolEquationImpNode.cpp.o"}


def output_of(*command):
    return subprocess.run(command, stdout=subprocess.PIPE, text=True, check=True).stdout


def find_foreign_exports(library, exported):
    names = [line.split()[2] for line in
             output_of("nm", "-D", "--defined-only", library).splitlines()]
    if not any(exported.match(name) for name in names):
        yield f"{library} exports nothing of ours"
    for name in names:
        if not exported.match(name):
            yield f"exported, but not ours: {output_of('c++filt', name).strip()}"


def find_foreign_libraries(library, ours, must):
    needed = re.findall(r"\(NEEDED\).*\[(.*)\]", output_of("readelf", "-dW", library))
    if not any(name.startswith(must + ".") for name in needed):
        yield f"{must} is not among the needed libraries"
    for name in needed:
        if not name.startswith(tuple(each + "." for each in ours)) and not NEEDED.fullmatch(name):
            yield f"needs {name}"


def find_initialisers(objects):
    for path in objects:
        if pathlib.Path(path).name not in WITH_INITIALISERS and "_GLOBAL__sub_I" in output_of(
                "nm", path):
            yield f"{path} has a static object with a run-time initialiser"


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("library")
    parser.add_argument("--host", default="libkq_port.so")
    parser.add_argument("--second")
    parser.add_argument("--objects", nargs="*", default=[])
    arguments = parser.parse_args()
    ours = [name.removesuffix(".so") + ".so" for name in (arguments.host, arguments.second) if name]
    known = ours + (NETLIST_READERS if arguments.second else [])
    found = [*find_foreign_exports(arguments.library, SECOND if arguments.second else EXPORTED),
             *find_foreign_libraries(arguments.library, known, ours[-1]),
             *find_initialisers(arguments.objects)]
    print("\n".join(found), end="\n" if found else "")
    return 1 if found else 0


if __name__ == "__main__":
    sys.exit(main())
