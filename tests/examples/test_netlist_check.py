#!/usr/bin/env python3
"""The example netlist_check on netlists that Yosys and berkeley-abc map from its Verilog source: as
they are, with every look-up table spoiled in turn, and malformed.

usage: test_netlist_check.py PROGRAM EXAMPLE
Exit status 77, which counts as skipped: neither program is there.
"""
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile

SKIPPED = 77


class Failure(Exception):
    pass


def run(*command):
    done = subprocess.run([str(part) for part in command], stdout=subprocess.PIPE,
                          stderr=subprocess.PIPE, text=True, timeout=120, check=False)
    return done.returncode, done.stdout, done.stderr


def must_run(*command):
    status, output, errors = run(*command)
    if status != 0:
        raise Failure(f"{command} ended with {status}\n{output}{errors}")


def expect(what, expected, found):
    if expected != found:
        raise Failure(f"{what}\n--- expected\n{expected}\n--- found\n{found}")


def map_by_yosys(source, directory):
    path = directory / "yosys.blif"
    must_run("yosys", "-q", "-p",
             f"read_verilog {source}; synth -top arbiter -lut 4; opt_clean; write_blif {path}")
    return path


def map_by_abc(source, directory):
    gates, path = directory / "gates.blif", directory / "abc.blif"
    must_run("yosys", "-q", "-p", f"read_verilog {source}; synth -top arbiter; abc -g AND;"
             f" write_blif {gates}")
    must_run("berkeley-abc", "-c", f"read_blif {gates}; strash; if -K 4; write_blif {path}")
    return path


class Netlist:
    """A second reader and evaluator of these files, which shares no code with the program."""

    def __init__(self, text):
        text = re.sub(r"#.*", "", text).replace("\\\n", " ")
        self.inputs, self.outputs, self.blocks = [], [], []
        for line in text.splitlines():
            words = line.split()
            if not words:
                continue
            if words[0] in (".inputs", ".outputs"):
                (self.inputs if words[0] == ".inputs" else self.outputs).extend(words[1:])
            elif words[0] == ".names":
                self.blocks.append((words[1:], []))
            elif not words[0].startswith("."):
                self.blocks[-1][1].append(words)

    def column(self, name, columns, everywhere):
        """The values of all rows as the bits of one number; 'columns' has those of the inputs."""
        if name in columns:
            return columns[name]
        signals, rows = next(block for block in self.blocks if block[0][-1] == name)
        listed = 0
        for row in rows:
            product = everywhere
            for wanted, signal in zip(row[0] if len(row) == 2 else "", signals):
                column = self.column(signal, columns, everywhere)
                product &= {"1": column, "0": ~column, "-": -1}[wanted]
            listed |= product
        columns[name] = listed if not rows or rows[0][-1] == "1" else everywhere & ~listed
        return columns[name]

    def outputs_of_all_rows(self):
        inputs, everywhere = input_columns(self.inputs)
        return [self.column(name, inputs, everywhere) for name in self.outputs]


def input_columns(names):
    """The inputs' columns, row k as bit k, the first name being k's highest bit; and all rows."""
    num_rows = 2 ** len(names)
    columns = {name: sum(1 << row for row in range(num_rows) if row >> place & 1)
               for place, name in enumerate(reversed(names))}
    return columns, (1 << num_rows) - 1


def plain(name):
    return name if re.fullmatch(r"[A-Za-z_]\w*", name) else f"'{name}'"


def spoiled(text):
    """The netlist with one block after another inverted."""
    lines = text.split("\n")
    starts = [place for place, line in enumerate(lines) if line.startswith(".names")]
    for start in starts:
        changed, place = list(lines), start
        while lines[place].endswith("\\"):
            place += 1
        end = place + 1
        while end < len(lines) and lines[end] and lines[end][0] in "01- ":
            changed[end] = lines[end][:-1] + ("0" if lines[end][-1] == "1" else "1")
            end += 1
        if end > place + 1:
            yield lines[start].split()[-1] if place == start else "", "\n".join(changed)


class Example:
    def __init__(self, program, folder, directory):
        self.program, self.directory = program, directory
        self.source = folder / "design/arbiter.v"
        self.equations = folder / "design/arbiter.eqn"

    def check(self, netlist, equations=None):
        return run(self.program, netlist, equations or self.equations)

    def write(self, name, text):
        path = self.directory / name
        path.write_text(text, encoding="utf-8")
        return path

    def check_good(self, path):
        netlist = Netlist(path.read_text(encoding="utf-8"))
        status, output, errors = self.check(path)
        expect(f"{path.name}: status", (0, ""), (status, errors))
        expect(f"{path.name}: outputs", [plain(name) for name in netlist.outputs],
               re.findall(r"^output (.*): agrees", output, re.M))
        inits = re.findall(r"^lut (.*)\n  inputs +(.*)\n  init +(.*)$", output, re.M)
        expect(f"{path.name}: number of look-up tables", len(netlist.blocks), len(inits))
        tables = {plain(signals[-1]): signals for signals, _ in netlist.blocks}
        for name, inputs, init in inits:
            signals = tables[name]
            if len(signals) == 1:
                continue
            expect(f"{path.name}: inputs of {name}", inputs, " ".join(map(plain, signals[:-1])))
            expect(f"{path.name}: init value of {name}",
                   netlist.column(signals[-1], *input_columns(signals[:-1])), int(init, 0))

    def check_spoiled(self, path):
        """Each inverted block is found exactly where the two netlists first differ."""
        text = path.read_text(encoding="utf-8")
        good = Netlist(text)
        expected_of = good.outputs_of_all_rows()
        num_found = 0
        for name, changed in spoiled(text):
            found_of = Netlist(changed).outputs_of_all_rows()
            status, output, errors = self.check(self.write("spoiled.blif", changed))
            is_bad = found_of != expected_of
            expect(f"{path.name}: status with {name} spoiled", (1 if is_bad else 0, ""),
                   (status, errors))
            num_found += is_bad
            for wire, expected, found in zip(good.outputs, expected_of, found_of):
                verdict = re.search(rf"^output {re.escape(plain(wire))}: (.*)$", output, re.M)[1]
                what = f"{path.name}: {wire} with {name} spoiled"
                differing = expected ^ found
                expect(what, bool(differing), verdict.startswith("DIFFERS"))
                if not differing:
                    continue
                row = (differing & -differing).bit_length() - 1  # the lowest bit set
                value = expected >> row & 1
                head, assignment = verdict.split(" at ")
                expect(what, f"DIFFERS, the equation is {value} and the netlist {1 - value}", head)
                # The first row that differs, over the inputs that matter: all others are 0 in it.
                given = dict(part.rsplit("=", 1) for part in assignment.split())
                bits = {plain(wire): str(row >> place & 1)
                        for place, wire in enumerate(reversed(good.inputs))}
                expect(f"{what}: first assignment", {name: bits[name] for name in given}, given)
        if num_found < 10:
            raise Failure(f"{path.name}: only {num_found} spoiled look-up tables make a difference")
        return num_found


FRAME = ".model m\n.inputs a b\n.outputs y\n%s.end\n"
# A netlist, and the message about it after "bad.blif"; the equation is "y = a & b".
MALFORMED = [
    ("", ":1: there is no .model; is this a BLIF file?"),
    (FRAME % ".names a b y\n11 1\n0 1\n",
     ":6: pattern '0' has 1 characters, but y has 2 inputs"),
    (FRAME % ".names a b y\n1x 1\n", ":5: 'x' in pattern '1x' is none of 0, 1 and -"),
    (FRAME % ".names a b y\n11 2\n", ":5: value '2' of a row is neither 0 nor 1"),
    (FRAME % ".names a b y\n11 1\n00 0\n",
     ":6: a row for 0 among rows for 1; a block lists either where it is 1 or where it is 0"),
    (FRAME % ".names a b y\n11\n",
     ":5: a row of y has 1 columns; it needs a pattern and a value"),
    (FRAME % "11 1\n", ":4: '11' stands outside of a .names block"),
    (FRAME % ".names a c y\n11 1\n",
     ":4: y reads c, which nothing drives; add it to the inputs, or the block that drives it"),
    (FRAME % ".names a y y\n11 1\n", ":4: .names lists y twice"),
    (FRAME % ".names a c y\n11 1\n.names y b c\n11 1\n",
     ":4: y depends on itself; only combinational networks can be checked"),
    (FRAME % ".names a y\n1 1\n.names b y\n1 1\n",
     ":6: y is driven a second time; the first is line 4"),
    (FRAME % ".names b a\n1 1\n.names a y\n1 1\n",
     ":4: a is an input of the model and cannot be driven"),
    (FRAME % "", ": nothing drives the output y; is the file cut off?"),
    (FRAME % ".latch a y\n",
     ":4: .latch: only combinational networks can be checked; cut the registers out"),
    (FRAME % ".gate and2 A=a B=b O=y\n",
     ":4: .gate: only .names blocks can be checked; map to look-up tables, flattened"),
    (FRAME % ".wire a\n",
     ":4: .wire is not known; blocks are .model .inputs .outputs .names .end"),
    (FRAME % ".names a b \\\n",
     None),  # the continuation includes .end, so nothing drives y
    (".model m\n.inputs a b\n.outputs y\n.names a b \\",
     ":4: the file ends within a line that '\\' continues; it is cut off"),
    (FRAME % ".names a it's y\n11 1\n",
     ":4: it's: a signal with a quote has no name in an equation; rename it"),
    (FRAME % (".names " + " ".join(f"i{number}" for number in range(17)) + " y\n"),
     ":4: y has 17 inputs, more than 16; map the design to look-up tables first"),
]
# Lines of equations for a netlist of y = a & b, and the message after "bad.eqn".
MALFORMED_EQUATIONS = [
    ("y a & b\n", ":1: there is no '='; write NAME = EQUATION"),
    ("\n# c\n = a & b\n", ":3: there is no name before '='; write NAME = EQUATION"),
    ("y = a && b\n", ":1:7: operator '&' has nothing on its right"),
    ("y = a[0]\n", ":1:6: '[' is not part of the syntax; a name with other characters than letters,"
     " digits and '_' is written between single quotes"),
    ("y = (a & b\n", ":1:5: '(' has no partner"),
    ("y =\n", ":1:4: there is no equation"),
    ("y = a & c\n", ":1: c is neither an input of the netlist nor defined above"),
    ("y = a\ny = b\n", ":2: y is an input or defined above already"),
]
GOOD = FRAME % ".names a b y\n11 1\n"


def check_malformed(example):
    equations = example.write("good.eqn", "y = a & b\n")
    expect("small netlist", 0, example.check(example.write("good.blif", GOOD), equations)[0])
    for text, message in MALFORMED:
        path = example.write("bad.blif", text)
        status, _, errors = example.check(path, equations)
        expect(text, 2, status)
        if message is not None:
            expect(text, f"netlist_check: {path}{message}\n", errors)
    for text, message in MALFORMED_EQUATIONS:
        path = example.write("bad.eqn", text)
        status, _, errors = example.check(example.directory / "good.blif", path)
        expect(text, (2, f"netlist_check: {path}{message}\n"), (status, errors))
    missing = example.directory / "missing.blif"
    expect("no file", (2, "", f"netlist_check: {missing}: cannot be read\n"),
           example.check(missing, equations))
    status, output, _ = example.check(example.directory / "good.blif",
                                      example.write("other.eqn", "z = a & b\n"))
    expect("output without an equation", 1, status)
    if "output y: NOT CHECKED" not in output:
        raise Failure(output)


def check_forms(example):
    """Off-sets, constants, buffers and other forms of a model, each with its equation."""
    for block, equation, init in [
            (".names a b y\n0- 0\n-0 0\n", "a & b", "0x8"), (".names a b y\n", "0", "0x0"),
            (".names a b y\n-- 1\n", "1", "0xf"), (".names a y\n0 1\n", "~a", "0b01"),
            (".names y\n1\n", "1", "none"), (".names y\n0\n", "0", "none"),
            (".names y\n", "0", "none"), (".names b a y\n10 1 # b & ~a\n", "b & ~a", "0x4")]:
        status, output, errors = example.check(example.write("form.blif", FRAME % block),
                                               example.write("form.eqn", f"y = {equation}\n"))
        expect(block + output, (0, "", [init]),
               (status, errors, re.findall(r"^  init +(\S+)$", output, re.M)))


def main():
    program, folder = pathlib.Path(sys.argv[1]).resolve(), pathlib.Path(sys.argv[2])
    with tempfile.TemporaryDirectory() as directory:
        example = Example(program, folder, pathlib.Path(directory))
        check_malformed(example)
        check_forms(example)
        if not shutil.which("yosys"):
            print("skipped: there is no yosys")
            return SKIPPED
        mappers = [map_by_yosys] + ([map_by_abc] if shutil.which("berkeley-abc") else [])
        for mapper in mappers:
            netlist = mapper(example.source, example.directory)
            example.check_good(netlist)
            print(f"{netlist.name}: agrees; {example.check_spoiled(netlist)} spoiled look-up tables"
                  " found")
    return 0


if __name__ == "__main__":
    try:
        sys.exit(main())
    except Failure as failure:
        sys.exit(f"FAILED: {failure}")
