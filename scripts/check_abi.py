#!/usr/bin/env python3
"""Compares the exported interface of the built library with the stored one.

usage: check_abi.py LIBRARY HEADERS BASELINE [--update]

LIBRARY has debug information; HEADERS is the folder of the public headers; BASELINE is the text
that --update writes. What programs built earlier rely on must stay: functions, their arguments and
results, sizes and layouts of public classes. Private member functions and types that are only
declared in HEADERS do not count, because no inline function of the headers calls them. Additions
are printed and allowed. abidw and abidiff of libabigail do the work; this script leaves out private
members and paths, which they would also compare.
Exit status: 1 if something was removed or changed.
"""
import argparse
import pathlib
import subprocess
import sys
import tempfile
from xml.etree import ElementTree

ABIDW = ["abidw", "--exported-interfaces-only", "--no-parameter-names", "--no-write-default-sizes",
         "--drop-private-types", "--no-comp-dir-path", "--no-corpus-path", "--no-show-locs"]


def internal_functions(root):
    """The symbols of member functions that are private, or of classes that headers only declare."""
    for each in root.iter("class-decl"):
        is_internal = each.get("is-declaration-only") == "yes"
        for member in each.findall("member-function"):
            if is_internal or member.get("access") == "private":
                yield from (function.get("mangled-name") for function in member)


def read_interface(library, headers):
    text = subprocess.run([*ABIDW, "--headers-dir", headers, library], stdout=subprocess.PIPE,
                          text=True, check=True).stdout
    root = ElementTree.fromstring(text)
    internal = set(internal_functions(root))
    # A constructor has several symbols, one of which names the others as its aliases.
    for symbol in root.iter("elf-symbol"):
        names = {symbol.get("name"), *filter(None, symbol.get("alias", "").split(","))}
        if names & internal:
            internal |= names
    for parent in list(root.iter()):
        for child in list(parent):
            functions = list(child) if child.tag == "member-function" else [child]
            if any((function.tag == "function-decl" and function.get("mangled-name") in internal) or
                   (function.tag == "elf-symbol" and function.get("name") in internal)
                   for function in functions):
                parent.remove(child)
    # The location of the sources is not part of the interface.
    for unit in root.iter("abi-instr"):
        unit.set("path", unit.get("path").rpartition("/")[2])
    return ElementTree.tostring(root, encoding="unicode") + "\n"


def compare(*arguments):
    done = subprocess.run(["abidiff", *arguments], stdout=subprocess.PIPE, text=True, check=False)
    # Bits 0 and 1 are failures of the comparison itself; a signal is negative.
    if done.returncode < 0 or done.returncode & 3:
        sys.exit(f"abidiff ends with {done.returncode}\n{done.stdout}")
    return done.returncode, done.stdout


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("library")
    parser.add_argument("headers")
    parser.add_argument("baseline", type=pathlib.Path)
    parser.add_argument("--update", action="store_true")
    arguments = parser.parse_args()
    interface = read_interface(arguments.library, arguments.headers)
    if "<function-decl" not in interface:
        sys.exit(f"{arguments.library} shows no functions; was it built with debug information?")
    if arguments.update:
        arguments.baseline.write_text(interface, encoding="utf-8")
        return 0

    with tempfile.TemporaryDirectory() as directory:
        new = pathlib.Path(directory) / "interface.abi"
        new.write_text(interface, encoding="utf-8")
        status, changes = compare("--no-added-syms", arguments.baseline, new)
        if status != 0:
            print(f"The exported interface differs from {arguments.baseline.name}:\n{changes}"
                  "If that is meant: ./dev abi --update, and say so in the commit.")
            return 1
        additions = compare(arguments.baseline, new)[1]
    if additions:
        print(f"Added to the exported interface:\n{additions}")
    return 0


if __name__ == "__main__":
    sys.exit(main())
