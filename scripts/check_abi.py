#!/usr/bin/env python3
"""Compares the exported interface of the built library with the stored one.

usage: check_abi.py LIBRARY HEADERS BASELINE [--update]

LIBRARY carries debug information, HEADERS is the folder of the public headers, BASELINE the text
that --update writes. What programs built before rely on must stay: functions, their arguments and
results, sizes and layouts of public classes. Types that are only declared in HEADERS do not count.
Additions are printed and allowed.
Exit status: 1 when something was removed or changed.
"""
import argparse
import pathlib
import re
import subprocess
import sys
import tempfile

ABIDW = ["abidw", "--exported-interfaces-only", "--no-parameter-names", "--no-write-default-sizes",
         "--drop-private-types", "--no-comp-dir-path", "--no-corpus-path", "--no-show-locs"]


def read_interface(library, headers):
    text = subprocess.run([*ABIDW, "--headers-dir", headers, library], stdout=subprocess.PIPE,
                          text=True, check=True).stdout
    # Where the sources lie is no part of the interface.
    return re.sub(r" path='[^']*/([^'/]*)'", r" path='\1'", text)


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
