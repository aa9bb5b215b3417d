#!/usr/bin/env python3
# Runs command lines of the tool and compares standard output, standard error and exit status,
# completely and byte for byte, with a file of cases. In such a file the first character of a line
# says what the line is:
#   = name of a case   $ command for sh -c   | output   ! error output   ? exit status (none: 0)
# Empty lines and lines that start with # are ignored. --update writes the answers found.
# --differing names a file of cases that another system or build answers differently, "GROUP: CASE
# -- reason"; a case in it that passes is a failure, so that the list stays correct. It may be given
# more than once.
import argparse
import difflib
import os
import subprocess
import sys
import tempfile

TIMEOUT_SECONDS = 120


class Case:
    def __init__(self, name):
        self.name = name
        self.comments = []
        self.lines = {"$": [], "|": [], "!": [], "?": []}

    def expected(self, version):
        status = self.lines["?"] or ["0"]
        texts = [self.lines["|"], self.lines["!"], status]
        return ["".join(line + "\n" for line in text).replace("@VERSION@", version)
                for text in texts]


def read_cases(text):
    head, cases = [], []
    for number, line in enumerate(text.split("\n"), 1):
        if line.startswith("="):
            cases.append(Case(line[1:].strip()))
        elif not line or line.startswith("#"):
            (cases[-1].comments if cases else head).append(line)
        elif cases and line[0] in cases[-1].lines:
            cases[-1].lines[line[0]].append(line[2:] if line[0] in "$?" else line[1:])
        else:
            raise ValueError(f"line {number} belongs to nothing: {line}")
    for case in cases:
        if not case.lines["$"]:
            raise ValueError(f"case '{case.name}' has no command")
    return head, cases


def write_cases(head, cases):
    text = "\n".join(head).rstrip("\n")
    for case in cases:
        text += f"\n\n= {case.name}\n"
        text += "".join(line + "\n" for line in case.comments if line)
        text += "".join(f"$ {line}\n" for line in case.lines["$"])
        text += "".join(f"|{line}\n" for line in case.lines["|"])
        text += "".join(f"!{line}\n" for line in case.lines["!"])
        text += "".join(f"? {line}\n" for line in case.lines["?"] if line != "0")
        text = text.rstrip("\n")
    return text.lstrip("\n") + "\n"


# Runs the command in an empty directory, without input, with the tool first on the PATH.
def run(command, tool):
    environment = dict(os.environ, LC_ALL="C")
    environment.pop("MAV_KQ_BOOL_EQUATION_DEBUG", None)
    environment["PATH"] = os.path.dirname(tool) + os.pathsep + environment.get("PATH", "")
    with tempfile.TemporaryDirectory() as directory:
        done = subprocess.run(["sh", "-c", command], cwd=directory, env=environment,
                              stdin=subprocess.DEVNULL, capture_output=True,
                              timeout=TIMEOUT_SECONDS, check=False)
    return [done.stdout.decode("latin-1"), done.stderr.decode("latin-1"), f"{done.returncode}\n"]


def differences(expected, got):
    report = []
    for name, want, have in zip(("output", "error output", "status"), expected, got):
        report += difflib.unified_diff(want.splitlines(True), have.splitlines(True),
                                       f"expected {name}", f"got {name}")
    return "".join(line if line.endswith("\n") else line + " (no line end)\n" for line in report)


def read_differing(path, group):
    with open(path, encoding="latin-1") as file:
        lines = [line.strip() for line in file if line.strip() and not line.startswith("#")]
    names = set()
    for line in lines:
        place, dashes, reason = line.partition(" -- ")
        if not dashes or not reason:
            raise ValueError(f"a reason is missing: {line}")
        if place.startswith(group + ": "):
            names.add(place[len(group) + 2:])
    return names


def check(cases, tool, version, differing=frozenset()):
    failures = 0
    unknown = differing - {case.name for case in cases}
    if unknown:
        raise ValueError(f"no such cases: {', '.join(sorted(unknown))}")
    for case in cases:
        got = run("\n".join(case.lines["$"]), tool)
        difference = differences(case.expected(version), got)
        if case.name in differing:
            if not difference:
                failures += 1
                print(f"FAILED: {case.name}\nit is listed as differing, and does not")
        elif difference:
            failures += 1
            print(f"FAILED: {case.name}\n{difference}")
    return failures


def update(path, head, cases, tool, version):
    for case in cases:
        got = run("\n".join(case.lines["$"]), tool)
        for key, text in zip("|!?", got):
            case.lines[key] = text.replace(version, "@VERSION@").split("\n")[:-1]
    with open(path, "w", encoding="latin-1") as file:
        file.write(write_cases(head, cases))


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    parser.add_argument("--version", required=True)
    parser.add_argument("--update", action="store_true")
    parser.add_argument("--differing", action="append", default=[])
    parser.add_argument("files", nargs="+")
    arguments = parser.parse_args()
    tool = os.path.abspath(arguments.tool)
    failures = count = 0
    for path in arguments.files:
        with open(path, encoding="latin-1") as file:
            head, cases = read_cases(file.read())
        count += len(cases)
        if arguments.update:
            update(path, head, cases, tool, arguments.version)
        else:
            group = os.path.splitext(os.path.basename(path))[0]
            differing = set().union(*(read_differing(name, group) for name in arguments.differing))
            failures += check(cases, tool, arguments.version, differing)
    print(f"{count} cases, {failures} failed")
    return 1 if failures or not count else 0


if __name__ == "__main__":
    sys.exit(main())
