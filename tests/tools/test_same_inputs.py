#!/usr/bin/env python3
# Random texts, init values and odd names: every command of the tool, and with --python every member
# of the module on the path, must report the inputs and the column of the library itself.
import argparse
import io
import json
import random
import subprocess
import sys

NAMES = ["A", "B", "C", "a", "b", "'a'", "'a b'", "'a'+b", "'x,y'", "n1", "'a'&'b'", "'a'b", "'q'~"]
OPERATORS = ["&", "|", "^", "~&", "~|", "!^", "+", "*", "@", ".AND.", ".NOR."]
COMMANDS = ["check", "show", "init", "table", "explain", "match", "equal", "convert", "lint", "kmap",
            "tree", "sat"]


def random_text(rng):
    if rng.random() < 0.45:
        is_hex = rng.random() < 0.6
        digits = rng.choice([1, 1, 2, 2, 4, 8, 16] if is_hex else [1, 2, 3, 4, 7, 8, 16])
        return ("0x" if is_hex else "0b") + "".join(
            rng.choice("0123456789abcdefF" if is_hex else "01") for _ in range(digits))
    operands = [rng.choice(["", "~"]) + rng.choice(NAMES + ["1", "0"])
                for _ in range(rng.randrange(1, 5))]
    text = operands[0]
    for operand in operands[1:]:
        text = f"{text} {rng.choice(OPERATORS)} {operand}"
        if rng.random() < 0.3:
            text = f"({text})"
    return text


class Group:
    """Texts that are read over one list of inputs, and the library's answer for each."""

    def __init__(self, rng, helper):
        self.inputs = rng.sample(NAMES, rng.randrange(1, 5)) if rng.random() < 0.8 else None
        flags = ["--lsb-first", "--reverse"]
        self.flags = rng.sample(flags, rng.randrange(0, 3)) if self.inputs else []
        self.texts = [random_text(rng) for _ in range(12)]
        # Only tool and module read one digit over one input.
        if self.inputs and len(self.inputs) == 1:
            self.texts = [text for text in self.texts if not (text[:1] == "0" and len(text) == 3)]
        if self.inputs: # an init value of each width that may fit
            for width in range(1, 7):
                self.texts.append("0b" + "".join(rng.choice("01") for _ in range(1 << width)))
        listed = ["--inputs", *self.inputs] if self.inputs else []
        answer = run([helper, *self.flags, *listed], self.texts)
        self.known = [None if line == "refused" else line.split("\t") for line in answer]
        assert len(self.known) == len(self.texts)

    def options(self):
        return self.flags + (["--inputs", ",".join(self.inputs)] if self.inputs else [])

    def column(self, index):
        return self.known[index][0]

    def names(self, index):
        return self.known[index][1:]


def run(command, lines):
    done = subprocess.run(command, input="".join(line + "\n" for line in lines), text=True,
                          capture_output=True, check=False)
    assert done.returncode in (0, 1, 2, 3), (command, done.returncode, done.stderr)
    return done.stdout.splitlines()


# What the answer of a command says about inputs and column, if it does.
def reported(command, result):
    if command == "kmap":
        return result["row_inputs"] + result["column_inputs"], None
    if command == "init":
        return result["inputs"], result["msb_first"]["hex"]
    if command == "convert":
        return [pair["input"] for pair in result["inputs"]], None
    if command == "match":
        return result["first_inputs"], None
    if command == "table":
        rows = result["rows"]
        ones = sum(row[-1] << number for number, row in enumerate(rows))
        return result["inputs"], f"0x{ones:0{max(1, len(rows) // 4)}x}"
    return result["inputs"], result.get("hex")


def column_of(known):
    return int(known[0], 16) if known[0] != "-" else None


# The rows in any of the cubes, as an init value; None without inputs.
def ones_of(cubes, num_inputs):
    if num_inputs == 0:
        return None
    value = 0
    for cube in cubes:
        digits = cube.split(" ")[0]
        for row in range(1 << num_inputs):
            if all(digit in ("-", bit)
                   for digit, bit in zip(digits, f"{row:0{num_inputs}b}")):
                value |= 1 << row
    return value


class Comparison:
    def __init__(self):
        self.differences = []
        self.num_compared = 0

    def expect(self, expected, found, *where):
        self.num_compared += 1
        if expected != found:
            self.differences.append(f"{' '.join(map(str, where))}: {found}, not {expected}")


def compare_commands(tool, group, comparison):
    for command in COMMANDS:
        more = {"equal": ["(1)"], "match": ["(1)"], "convert": ["--to", "alt1"]}.get(command, [])
        answers = run([tool, command, "--json", "--file", "-", *group.options(), *more],
                      group.texts)
        comparison.expect(len(group.texts), len(answers), command, group.options())
        for index, line in enumerate(answers):
            answer = json.loads(line)
            text = group.texts[index]
            where = (command, group.options(), text)
            known = group.known[index]
            is_init = text[:2] in ("0x", "0b")
            if known is None and command == "match" and is_init:
                continue # without listed inputs it names them by letters
            if known is None:
                comparison.expect("refused", answer["status"], *where)
                continue
            if "refusal" in answer:
                assert answer["refusal"]["code"] == "unsuitable", (where, answer)
                continue
            if command == "tree":
                continue
            names, column = reported(command, answer["result"])
            if command == "sat": # the first row that is 1, found without the column
                value = column_of(known)
                if value is not None:
                    comparison.expect((value & -value).bit_length() - 1 if value else None,
                                      answer["result"]["row"], *where)
            if command == "equal":
                comparison.expect(True, set(group.names(index)) <= set(names), *where)
                continue
            comparison.expect(group.names(index), names, *where)
            if column is not None and known[0] != "-":
                comparison.expect(known[0], column, *where)


def compare_values(tool, group, comparison):
    for index, known in enumerate(group.known):
        if known is None or known[0] == "-":
            continue
        row = index % (1 << len(group.names(index)))
        values = [f"{name}={row >> place & 1}"
                  for place, name in enumerate(reversed(group.names(index)))]
        answer = run([tool, "eval", *group.options(), "--", group.texts[index], *values], [])
        comparison.expect([str(int(known[0], 16) >> row & 1)], answer, "eval", group.options(),
                          group.texts[index], values)


# For 'minimize' the lines of a file are outputs of one table, so it gets one text at a time.
def compare_minimize(tool, group, comparison):
    for index, known in enumerate(group.known):
        where = ("minimize", group.options(), group.texts[index])
        answer = json.loads(run([tool, "minimize", "--json", *group.options(), "--",
                                 group.texts[index]], [])[0])
        if known is None:
            comparison.expect("refused", answer["status"], *where)
            continue
        names = group.names(index)
        comparison.expect(names, answer["result"]["inputs"], *where)
        comparison.expect(column_of(known), ones_of(answer["result"]["cubes"], len(names)), *where)


# The columns as look-up tables of a netlist, in which pins have nets instead of names; and for each
# output its nets and its value.
def netlist_of(group):
    gates, expected = [], {}
    for index, known in enumerate(group.known):
        if known is None or known[0] == "-" or len(known) > 7:
            continue
        nets = [f"n{place}" for place in range(len(known) - 1)]
        pins = " ".join(f"I{bit}={net}" for bit, net in enumerate(reversed(nets)))
        gates.append(f".gate LUT{len(nets)} {pins} O=f{index}\n"
                     f".param INIT {int(known[0], 16):0{1 << len(nets)}b}")
        expected[f"f{index}"] = (nets, int(known[0], 16))
    return [".model m", ".inputs n0 n1 n2 n3 n4 n5", f".outputs {' '.join(expected)}", *gates,
            ".end"], expected


def compare_netlist(tool, group, comparison):
    lines, expected = netlist_of(group)
    tables = [json.loads(line) for line in run([tool, "netlist", "list", "--json", "-"], lines)]
    comparison.expect(sorted(expected), sorted(table["output"] for table in tables), "netlist list")
    for table in tables:
        nets, value = expected[table["output"]]
        where = ("netlist list", hex(value))
        comparison.expect(nets, table["pins"], *where)
        comparison.expect(value, int(table["init"], 0), *where)
        again = json.loads(run([tool, "init", "--json", "--inputs", ",".join(nets), "--",
                                table["equation"]], [])[0])["result"]
        comparison.expect(nets, again["inputs"], *where)
        comparison.expect(value, int(again["msb_first"]["hex"], 16), *where)


def compare_batch(tool, group, comparison):
    if group.flags or not group.inputs: # a table has neither
        return
    rows = [{"inputs": group.inputs, "init" if text[:2] in ("0x", "0b") else "equation": text}
            for text in group.texts]
    lines = run([tool, "batch", "--format", "jsonl", "-"], [json.dumps(row) for row in rows])
    for index, line in enumerate(lines):
        row = json.loads(line)
        where = ("batch", group.inputs, group.texts[index])
        if group.known[index] is None:
            comparison.expect("refused", row["result"], *where)
        elif row["result"] == "filled":
            comparison.expect(group.names(index), row["inputs"], *where)
            comparison.expect(int(group.column(index), 16), int(row["init"], 0), *where)


def compare_permute(tool, group, comparison):
    if not group.inputs or "--reverse" in group.flags:
        return
    order = ",".join(reversed(group.inputs))
    lines = run([tool, "permute", "--json", "--file", "-", *group.flags, "--from",
                 ",".join(group.inputs), "--to", order], group.texts)
    for index, line in enumerate(lines):
        answer = json.loads(line)
        where = ("permute", group.options(), group.texts[index])
        if group.known[index] is None:
            comparison.expect("refused", answer["status"], *where)
        elif answer["status"] == "done":
            comparison.expect(group.names(index), answer["result"]["from"]["inputs"], *where)
            comparison.expect(group.column(index), answer["result"]["from"]["hex"], *where)
        else:
            comparison.expect(True, len(group.names(index)) > len(group.inputs), *where)


def compare_netlist_members(group, comparison):
    import booleq
    lines, expected = netlist_of(group)
    netlist = booleq.read_netlist(io.StringIO("".join(line + "\n" for line in lines)))
    comparison.expect(len(expected), len(netlist), "read_netlist")
    for table in netlist:
        comparison.expect(expected[table.output], (list(table.inputs), int(table.init, 0)),
                          "read_netlist", table)
    values = sorted(int(value) for width in netlist.widths for value in netlist.tables(width).words[:, 0])
    comparison.expect(sorted(value for _, value in expected.values()), values, "Netlist.tables")


def compare_members(group, comparison):
    import booleq
    if "--reverse" in group.flags: # the module has no such option
        return
    for index, text in enumerate(group.texts):
        where = ("Equation", group.options(), text)
        try:
            equation = booleq.Equation(text, group.inputs, lsb_first="--lsb-first" in group.flags)
        except booleq.ParseError:
            comparison.expect(group.known[index], None, *where)
            continue
        if group.known[index] is None:
            comparison.expect("refused", equation, *where)
            continue
        names, column = group.names(index), group.column(index)
        comparison.expect(tuple(names), equation.inputs, *where)
        comparison.expect(names, list(equation.explain().inputs), "explain", *where)
        comparison.expect(tuple(names), equation.minimize().inputs, "minimize", *where)
        turned = equation.permute(reversed(names))
        comparison.expect(tuple(reversed(names)), turned.inputs, "permute", *where)
        comparison.expect(True, bool(equation.equivalent(turned)), "equivalent", *where)
        comparison.expect(tuple(names), (~equation).inputs, "invert", *where)
        for member, found in [
                ("lint", equation.lint().inputs),
                ("convert", [name for name, _ in equation.convert("paren").names]),
                ("match", [name for name, *_ in equation.match(equation).mapping] +
                 list(equation.explain().without_effect)),
                ("satisfiable", equation.satisfiable().assignment or names),
                ("compose", equation.compose({}).inputs), ("rename", equation.rename({}).inputs),
                ("equations", booleq.equations([text], group.inputs, equation.lsb_first)[0].inputs),
                ("kmap", equation.kmap().row_inputs + equation.kmap().column_inputs
                 if 1 <= len(names) <= 6 else names)]:
            ordered = [name for name in names if name in found] if member == "match" else list(found)
            comparison.expect(names, ordered, member, *where)
        comparison.expect((1 << len(names), len(names) + 1), equation.truth_table().shape,
                          "truth_table", *where)
        if column == "-":
            continue
        value = int(column, 16)
        bits = [value >> row & 1 for row in range(1 << len(names))]
        comparison.expect(column, equation.hex_init(), "hex_init", *where)
        comparison.expect(value, int(equation.binary_init(), 2), "binary_init", *where)
        comparison.expect(f"{1 << len(names)}'h{value:0{max(1, (1 << len(names)) // 4)}x}",
                          equation.sized_init(), "sized_init", *where)
        comparison.expect(bin(value).count("1"), equation.count_ones(), "count_ones", *where)
        matters = [name for weight, name in zip(reversed(range(len(names))), names)
                   if any(bit != bits[row ^ 1 << weight] for row, bit in enumerate(bits))]
        comparison.expect(tuple(matters), equation.support, "support", *where)
        comparison.expect(bits, equation.column().tolist(), "column", *where)
        comparison.expect(bits, equation.truth_table()[:, -1].tolist(), "truth_table", *where)
        comparison.expect(bits, equation.eval_many(equation.truth_table()[:, :-1]).tolist(),
                          "eval_many", *where)
        words = [int(word) for word in equation.packed_column()]
        comparison.expect(value, sum(word << 64 * place for place, word in enumerate(words)),
                          "packed_column", *where)


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool")
    parser.add_argument("--helper", required=True)
    parser.add_argument("--python", action="store_true")
    parser.add_argument("--seed", type=int, default=1)
    parser.add_argument("--groups", type=int, default=40)
    options = parser.parse_args()
    rng = random.Random(options.seed)
    comparison = Comparison()
    num_accepted = 0
    for _ in range(options.groups):
        group = Group(rng, options.helper)
        num_accepted += sum(known is not None for known in group.known)
        if options.python:
            compare_members(group, comparison)
            compare_netlist_members(group, comparison)
        else:
            compare_commands(options.tool, group, comparison)
            compare_values(options.tool, group, comparison)
            compare_batch(options.tool, group, comparison)
            compare_permute(options.tool, group, comparison)
            compare_minimize(options.tool, group, comparison)
            compare_netlist(options.tool, group, comparison)
    for difference in comparison.differences[:20]:
        print(difference)
    print(f"{num_accepted} accepted texts, {comparison.num_compared} comparisons, "
          f"{len(comparison.differences)} differences")
    assert num_accepted > 3 * options.groups
    return 1 if comparison.differences else 0


if __name__ == "__main__":
    sys.exit(main())
