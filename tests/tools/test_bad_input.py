#!/usr/bin/env python3
# Bad input to every command that the tool's help lists must give a message, the right exit status,
# and nothing on standard output that looks like a result. With --json a refusal is the only object.
import argparse
import json
import os
import re
import subprocess
import sys
import tempfile

DONE, WRONG_USAGE, REFUSED = 0, 2, 3

# The words around the text, for each command.
WORDS = {
    "show": ([], []), "check": ([], []), "table": ([], []), "init": ([], []),
    "tree": ([], []), "kmap": ([], []), "eval": ([], ["A=1"]), "equal": ([], ["A"]),
    "explain": ([], []), "permute": (["--from", "A,B", "--to", "A,B"], []), "match": ([], ["A"]),
    "convert": (["--to", "verilog"], []), "lint": ([], []), "sat": ([], []),
    "minimize": ([], []),
}
NETLIST_WORDS = {"stats": [], "list": [], "check": [], "diff": ["good.blif"]}
GOOD_NETLIST = b".model x\n.inputs a b\n.outputs y\n.names a b y\n11 1\n.end\n"
BAD_NETLISTS = {
    "empty": b"", "blank": b" \n\t", "binary": bytes(range(256)), "words": b"A & B\n",
    "half of JSON": b'{"modules": {"top": {"cells": {"a": {"type": "$lut", ', "a list": b"[1, 2]\n",
    "deep": b'{"modules": ' + b"[" * 100000, "no modules": b'{"creator": "x"}',
    "wrong types": b'{"modules": {"top": {"cells": 3, "netnames": []}}}',
    "half of BLIF": b".model x\n.names a b y\n11", "half of EDIF": b"(edif x (edifVersion 2 0 0",
    "cut gzip": b"\x1f\x8b\x08\0\0\0\0\0\0\x03\x01\x02",
}
NAMES31 = ["v%d" % number for number in range(31)]
COLUMNS = {"table", "init", "kmap", "explain", "match"}  # at most 30 inputs
OWN_INPUTS = {"permute"}  # always lists A and B, by its own option
ONE_TABLE = {"minimize"}  # all lines give one answer, so the first bad line ends it


class Checker:
    def __init__(self, tool):
        self.tool = tool
        self.count = 0
        self.failures = 0

    def run(self, command, arguments, what, **options):
        self.count += 1
        words = [os.fsencode(word) for word in [self.tool, command, *arguments]]
        options.setdefault("stdin", subprocess.DEVNULL)
        options.setdefault("stdout", subprocess.PIPE)
        done = subprocess.run(words, stderr=subprocess.PIPE, timeout=120, check=False, **options)
        self.what = f"{command}: {what}"
        return done

    def expect(self, holds, done, reason):
        if not holds:
            self.failures += 1
            print(f"{self.what}: {reason}: status {done.returncode}\n"
                  f"  out {(done.stdout or b'')[:300]}\n  err {done.stderr[:300]}")

    def complains(self, done, status):
        self.expect(done.returncode == status, done, f"status {status} expected")
        self.expect(not done.stdout, done, "there is output")
        self.expect(done.stderr.startswith(b"booleq: "), done, "there is no message")
        self.expect(all(32 <= byte < 127 or byte == 10 for byte in done.stderr), done,
                    "the message is not printable")

    def refuses(self, command, text, what, options=()):
        before, behind = WORDS[command]
        words = [*options, *before, "--", text, *behind]
        self.complains(self.run(command, words, what), REFUSED)
        done = self.run(command, ["--json", *words], what + " as JSON")
        self.expect(done.returncode == REFUSED, done, "status 3 expected")
        lines = done.stdout.decode().splitlines()
        self.expect(len(lines) == 1, done, "one object expected")
        answer = json.loads(lines[0])
        self.expect(answer["command"] == command and answer["status"] == "refused" and
                    answer["refusal"]["reason"] and "result" not in answer, done, "no refusal")


def check_texts(checker, command):
    for text, what in (("", "empty"), (" \t", "blank"), ("A &", "half an equation"),
                       (b"\x80\xff\x01", "binary"), ("(" * 100000 + "A", "huge"),
                       ("A" * 100000 + " B", "a huge name"), ("%n %s {}", "formats")):
        checker.refuses(command, text, what)
    if command not in OWN_INPUTS | {"match"}:  # match names the inputs A, B, C itself
        checker.refuses(command, "0x8", "an init value without inputs")
    for text, what in (("0x88", "wrong width"), ("0b1", "too narrow"), ("0x8g", "no digit"),
                       ("0 | A", "an expression that begins with 0")):
        if command == "match" and what in ("wrong width", "too narrow"):
            continue  # inputs that do not fit are named by letters
        checker.refuses(command, text, what,
                        [] if command in OWN_INPUTS else ["--inputs", "A,B"])
    if command in COLUMNS:
        checker.refuses(command, "&".join(NAMES31), "31 inputs")
        checker.refuses(command, "A", "31 listed inputs", ["--inputs", ",".join(NAMES31)])


def check_usage(checker, command):
    before, behind = WORDS[command]
    words = [*before, "A", *behind]
    for arguments, what in ((["--no-such-option", *words], "an unknown option"),
                            (["--inputs", *words[:1]], "no equation"),
                            (["--inputs", "", *words], "no names"),
                            (["--inputs", "'A", *words], "an open quote"),
                            (["--lsb-first", *words], "an order without inputs"),
                            ([], "no words"),
                            (["--file", "no/such/file", *before, *behind], "a missing file"),
                            (["--file", "/", *before, *behind], "a directory")):
        if what != "an order without inputs" or command not in OWN_INPUTS:
            checker.complains(checker.run(command, arguments, what), WRONG_USAGE)


def check_lines(checker, command):
    before, behind = WORDS[command]
    with tempfile.TemporaryFile() as file:
        file.write(b"A\x00B\n\xff\n" + b"x" * 100000 + b"=\nA &\n")
        file.seek(0)
        done = checker.run(command, [*before, "-", *behind], "bad lines", stdin=file)
    checker.complains(done, REFUSED)
    if command in ONE_TABLE:
        checker.expect(b"booleq: line 1: " in done.stderr, done, "the first line is named")
    else:
        checker.expect(done.stderr.count(b"booleq: line ") == 4, done, "four lines are refused")
    done = checker.run(command, [*before, "-", *behind], "no line")
    checker.complains(done, REFUSED if command in ONE_TABLE else DONE)  # otherwise a warning


def check_streams(checker, command):
    before, behind = WORDS[command]
    words = [*before, "A", *behind]
    with open("/dev/full", "wb") as full:
        done = checker.run(command, words, "a full disk", stdout=full)
    checker.complains(done, WRONG_USAGE)
    reader, writer = os.pipe()
    os.close(reader)
    done = checker.run(command, words, "a closed pipe", stdout=writer)
    os.close(writer)
    checker.expect(done.returncode == DONE and not done.stderr, done,
                   "a reader that left is not an error")
    good = checker.run(command, words, "a good text")
    checker.expect(good.returncode in (DONE, 1) and good.stdout and not good.stderr, good,
                   "an answer")


def listed_commands(tool):
    text = subprocess.run([tool, "--help"], stdout=subprocess.PIPE, text=True, check=True).stdout
    block = re.search(r"^Commands:\n(.*?)^$", text, re.M | re.S)[1]
    return re.findall(r"^  (\w+) ", block, re.M)


def check_netlists(checker, command):
    """Files that are not netlists give a message with the file's name, or one object."""
    with tempfile.TemporaryDirectory() as directory:
        with open(os.path.join(directory, "good.blif"), "wb") as file:
            file.write(GOOD_NETLIST)
        for what, content in BAD_NETLISTS.items():
            with open(os.path.join(directory, "bad"), "wb") as file:
                file.write(content)
            words = [command, "bad", *NETLIST_WORDS[command]]
            done = checker.run("netlist", words, f"{command} of {what}", cwd=directory)
            checker.complains(done, REFUSED)
            checker.expect(b"bad" in done.stderr, done, "no file is named")
            done = checker.run("netlist", [*words, "--json"], f"{command} of {what} as JSON",
                               cwd=directory)
            checker.expect(done.returncode == REFUSED, done, "status 3 expected")
            answer = json.loads(done.stdout)
            checker.expect(answer["status"] == "refused" and answer["refusal"]["reason"], done,
                           "no refusal")
        for name in ("nowhere", directory):
            done = checker.run("netlist", [command, name, *NETLIST_WORDS[command]], "no file",
                               cwd=directory)
            checker.expect(done.returncode in (WRONG_USAGE, REFUSED), done, "a status expected")
            checker.expect(done.stderr.startswith(b"booleq: "), done, "there is no message")


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    tool = os.path.abspath(parser.parse_args().tool)
    checker = Checker(tool)
    # These commands do not read an equation.
    commands = [name for name in listed_commands(tool) if name not in ("batch", "netlist")]
    for command in NETLIST_WORDS:
        check_netlists(checker, command)
    missing = [name for name in commands if name not in WORDS]
    for command in commands:
        if command in missing:
            continue
        check_texts(checker, command)
        check_usage(checker, command)
        check_lines(checker, command)
        check_streams(checker, command)
    if missing:
        print("no words are known for: " + ", ".join(missing))
    print(f"{checker.count} calls of {len(commands)} commands, {checker.failures} failures")
    return 1 if checker.failures or missing else 0


if __name__ == "__main__":
    sys.exit(main())
