#!/usr/bin/env python3
"""Compiles and runs the example at the top of each public header; it must print what the comments
after its lines say.

usage: header_examples.py COMPILER INCLUDE SCRATCH HEADER... -- LINK_OPTION...

Exit status: 1 if a header has no example, or an example does not do what it says.
"""
import pathlib
import re
import subprocess
import sys

SAYS = re.compile(r"<< '\\n'; // (.*)$|\.text; // (.*)$")


def example_of(header):
    """The indented lines of the comment at the top, and what they must print."""
    lines = []
    for line in header.read_text(encoding="utf-8").splitlines():
        if not line.startswith("//"):
            break
        if line.startswith("//     "):
            lines.append(line[len("//     "):])
    says = [match[1] or match[2] for match in map(SAYS.search, lines) if match]
    return lines, says


def main():
    compiler, include, scratch, *rest = sys.argv[1:]
    headers, options = rest[:rest.index("--")], rest[rest.index("--") + 1:]
    folder = pathlib.Path(scratch)
    folder.mkdir(parents=True, exist_ok=True)
    num_wrong = 0
    for header in map(pathlib.Path, headers):
        lines, says = example_of(header)
        source, program = folder / f"{header.stem}.cpp", folder / header.stem
        code = "\n".join(f"    {line}" for line in lines)
        name = header.resolve().relative_to(pathlib.Path(include).resolve())
        source.write_text(f"#include <iostream>\n\n#include <{name}>\n\n"
                          f"int main()\n{{\n{code}\n    return 0;\n}}\n", encoding="utf-8")
        subprocess.run([compiler, "-std=c++17", "-Wall", "-Wextra", "-Werror", f"-I{include}",
                        source, "-o", program, *options], check=True)
        done = subprocess.run([program], stdout=subprocess.PIPE, text=True, check=False)
        if done.returncode != 0 or not says or done.stdout.splitlines() != says:
            print(f"{header.name}: status {done.returncode}\n  says   {says}\n"
                  f"  prints {done.stdout.splitlines()}")
            num_wrong += 1
    print(f"{len(headers)} headers, {num_wrong} wrong")
    return 1 if num_wrong else 0


if __name__ == "__main__":
    sys.exit(main())
