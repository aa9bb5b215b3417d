#!/usr/bin/env python3
"""Compiles each header alone, and twice in a row, with nothing else before it.

usage: check_headers.py --compiler CXX --include DIR... -- HEADER...

Prints the compiler's messages. Exit status: 1 when a header does not compile.
"""
import argparse
import pathlib
import subprocess
import sys


def compiles_alone(header, compiler, include_dirs):
    path = pathlib.Path(header).resolve()
    text = f'#include "{path}"\n#include "{path}"\n'
    command = [compiler, "-std=c++17", "-Wall", "-Wextra", "-Werror", "-fsyntax-only", "-x", "c++",
               *(f"-I{directory}" for directory in include_dirs), "-"]
    done = subprocess.run(command, input=text, stderr=subprocess.STDOUT, stdout=subprocess.PIPE,
                          text=True, check=False)
    if done.returncode != 0:
        print(f"{header} does not compile alone:\n{done.stdout}")
    return done.returncode == 0


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--compiler", required=True)
    parser.add_argument("--include", nargs="*", default=[])
    parser.add_argument("headers", nargs="+")
    arguments = parser.parse_args()
    results = [compiles_alone(header, arguments.compiler, arguments.include)
               for header in arguments.headers]
    print(f"{sum(results)} of {len(results)} headers compile alone")
    return 0 if all(results) else 1


if __name__ == "__main__":
    sys.exit(main())
