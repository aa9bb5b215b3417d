#!/usr/bin/env python3
"""Gives clang-tidy a source with one fault for each check that replaces a rule of ours.

usage: tidy_can_fail.py ROOT
"""
import pathlib
import subprocess
import sys
import tempfile

LINES = "".join(f"    total += total % {number};\n" for number in range(2, 62))
SOURCE = f"""#define MAXIMUM 7
int Fall(int depth)
{{
    return depth == 0 ? 0 : 1 + Fall(depth - 1);
}}
int GoOn(int total)
{{
{LINES}    return total;
}}
int go_on(int Total)
{{
    return Total;
}}
"""
FAULTS = {"cppcoreguidelines-macro-usage": "'MAXIMUM'",
          "misc-no-recursion": "'Fall'",
          "readability-function-size": "'GoOn'",
          "readability-identifier-naming": "'go_on'"}


def main():
    root = pathlib.Path(sys.argv[1]).resolve()
    with tempfile.TemporaryDirectory() as folder:
        source = pathlib.Path(folder) / "faults.cpp"
        source.write_text(SOURCE)
        done = subprocess.run(
            ["clang-tidy", "-quiet", f"--config-file={root / '.clang-tidy'}", source, "--", "-std=c++17"],
            capture_output=True, text=True, check=False)
    lines = done.stdout.splitlines()
    missing = [check for check, name in FAULTS.items()
               if not any(name in line and f"[{check}" in line for line in lines)]
    for check in missing:
        print(f"not found: {check}")
    if missing or done.returncode == 0:
        print(done.stdout + done.stderr)
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
