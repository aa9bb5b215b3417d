#!/usr/bin/env python3
# Random equations through every export of the tool and the real program that reads it: the columns
# that the program computes must be those of the equations. If the program is missing, the status is
# 77, which counts as skipped.
import argparse
import itertools
import json
import os
import re
import shutil
import subprocess
import sys
import tempfile

import equations

TIMEOUT_SECONDS = 300


class Failure(Exception):
    pass


def run(command, **options):
    done = subprocess.run(command, capture_output=True, text=True, timeout=TIMEOUT_SECONDS,
                          check=False, **options)
    if done.returncode != 0:
        raise Failure(f"{' '.join(command)[:200]} ended with {done.returncode}:\n"
                      f"{(done.stdout + done.stderr)[-3000:]}")
    return done.stdout


class Bench:
    """The equations, the tool, and a directory for files passed between programs."""

    def __init__(self, tool, cases, directory):
        self.tool, self.cases, self.directory = tool, cases, directory
        self.texts = self.write("equations.txt", "".join(case[0] + "\n" for case in cases))

    def write(self, name, text):
        path = os.path.join(self.directory, name)
        with open(path, "w", encoding="utf-8") as file:
            file.write(text)
        return path

    def convert(self, target, *options):
        return run([self.tool, "convert", "--to", target, *options, "--file", self.texts])

    def compare(self, what, columns):
        """'columns' as texts, row 0 first, one for each equation."""
        if len(columns) != len(self.cases):
            raise Failure(f"{what}: {len(columns)} columns for {len(self.cases)} equations")
        wrong = 0
        for (text, names, column), found in zip(self.cases, columns):
            expected = "".join(map(str, column))
            if found != expected:
                wrong += 1
                print(f"{what}: {text}\n  over {names}\n  expected {expected}\n  found    {found}")
        if wrong:
            raise Failure(f"{what}: {wrong} of {len(columns)} differ")
        print(f"{what}: {len(columns)} equations agree")


def num_inputs(case):
    return len(case[1])


# Modules f_1, f_2, ... inside modules w_1, w_2, ..., whose inputs are one vector i with the first
# input as its highest bit. It has one more bit than there are inputs, so that it is always a
# vector.
def verilog_wrappers(bench, names=None):
    text = ""
    for number, case in enumerate(bench.cases, 1):
        count = num_inputs(case)
        wires = [f"i[{count - 1 - place}]" for place in range(count)]
        if names:
            ports = [f".\\{name} ({wire})" for name, wire in zip(names[number - 1], wires)]
            ports.append(f".\\{names[number - 1][count]} (y)")
        else:
            ports = wires + ["y"]
        text += (f"module w_{number}(input [{count}:0] i, output y);\n"
                 f"  f_{number} u({', '.join(ports)});\nendmodule\n")
    return text


def icarus_columns(bench, modules):
    bench_text = "module bench;\n"
    steps = ""
    for number, case in enumerate(bench.cases, 1):
        count = num_inputs(case)
        bench_text += (f"  reg [{count}:0] i{number}; wire y{number};\n"
                       f"  w_{number} u{number}(i{number}, y{number});\n")
        steps += (f"    for (i{number} = 0; i{number} < {2 ** count}; i{number} = i{number} + 1)\n"
                  f"      begin #1; $write(\"%b\", y{number}); end\n    $write(\"\\n\");\n")
    bench_text += f"  initial begin\n{steps}  end\nendmodule\n"
    source = bench.write("icarus.v", modules + verilog_wrappers(bench) + bench_text)
    program = os.path.join(bench.directory, "icarus.vvp")
    run(["iverilog", "-s", "bench", "-o", program, source])
    return run(["vvp", "-n", program]).split()


def check_icarus(bench):
    bench.compare("verilog, Icarus Verilog",
                  icarus_columns(bench, bench.convert("verilog", "--unit")))


def yosys_columns(bench, commands):
    script = commands + "hierarchy; proc; flatten; opt_clean\n"
    for number, _ in enumerate(bench.cases, 1):
        script += f"cd w_{number}\neval -table i -show y\ncd ..\n"
    log = run(["yosys", "-Q", "-T", bench.write("commands.ys", script)])
    columns = []
    for case, table in zip(bench.cases, log.split("Executing EVAL pass")[1:]):
        rows = re.findall(r"^ *\d+'[01]+ *\| *1'([01x])", table, re.M)
        columns.append("".join(rows)[:2 ** num_inputs(case)])
    return columns


def check_yosys(bench):
    source = bench.write("yosys.v", bench.convert("verilog", "--unit") + verilog_wrappers(bench))
    bench.compare("verilog, Yosys", yosys_columns(bench, f"read_verilog {source}\n"))


def liberty_columns(bench, cells):
    names = [re.findall(r"pin \((.*)\)", cell)
             for cell in re.split(r"^cell ", cells, flags=re.M)[1:]]
    library = bench.write("cells.lib", "library (cells) {\n" + cells + "}\n")
    source = bench.write("liberty.v", verilog_wrappers(bench, names))
    return yosys_columns(bench, f"read_liberty {library}\nread_verilog {source}\n")


def check_liberty(bench):
    bench.compare("liberty, Yosys", liberty_columns(bench, bench.convert("liberty", "--unit")))


def check_ghdl(bench):
    text = bench.convert("vhdl", "--unit")
    text += ("library ieee;\nuse ieee.std_logic_1164.all;\nuse std.textio.all;\n\n"
             "entity bench is\nend entity;\n\narchitecture test of bench is\n")
    instances = steps = ""
    for number, case in enumerate(bench.cases, 1):
        count = num_inputs(case)
        text += (f"  signal i{number} : std_logic_vector({count} downto 0) := (others => '0');\n"
                 f"  signal y{number} : std_logic;\n")
        ports = [f"i{number}({count - 1 - place})" for place in range(count)] + [f"y{number}"]
        instances += f"  u{number} : entity work.f_{number} port map ({', '.join(ports)});\n"
        steps += f"    for row in 0 to {2 ** count - 1} loop\n      number := row;\n"
        steps += (f"      for bit_number in 0 to {count} loop\n"
                  f"        if number mod 2 = 1 then i{number}(bit_number) <= '1';\n"
                  f"        else i{number}(bit_number) <= '0'; end if;\n"
                  f"        number := number / 2;\n      end loop;\n      wait for 1 ns;\n"
                  f"      if y{number} = '1' then write(text_line, character'('1'));\n"
                  f"      elsif y{number} = '0' then write(text_line, character'('0'));\n"
                  f"      else write(text_line, character'('x')); end if;\n    end loop;\n"
                  f"    writeline(output, text_line);\n")
    text += (f"begin\n{instances}  process\n    variable text_line : line;\n"
             f"    variable number : integer;\n  begin\n{steps}    wait;\n"
             "  end process;\nend architecture;\n")
    bench.write("bench.vhd", text)
    for step in (["-a", "bench.vhd"], ["-e", "bench"]):
        run(["ghdl", *step], cwd=bench.directory)
    bench.compare("vhdl, GHDL", run(["ghdl", "-r", "bench"], cwd=bench.directory).split())


def c_columns(bench, functions, *flags):
    calls = ""
    for number, case in enumerate(bench.cases, 1):
        count = num_inputs(case)
        arguments = ", ".join(f"row >> {count - 1 - place} & 1" for place in range(count))
        calls += (f"    for (int row = 0; row < {2 ** count}; ++row)\n"
                  f"        putchar('0' + f_{number}({arguments}));\n    putchar('\\n');\n")
    source = bench.write("export.c", "#include <stdio.h>\n" + functions +
                         f"int main(void)\n{{\n{calls}    return 0;\n}}\n")
    program = os.path.join(bench.directory, "export")
    run([shutil.which("cc"), *flags, "-o", program, source])
    return run([program]).split()


def check_c(bench):
    bench.compare("c, C compiler", c_columns(bench, bench.convert("c", "--unit"), "-Wall", "-Werror"))


def check_python(bench):
    functions = {}
    exec(bench.convert("python", "--unit"), functions)  # the text under test is Python
    columns = []
    for number, case in enumerate(bench.cases, 1):
        count = num_inputs(case)
        rows = [[row >> (count - 1 - place) & 1 for place in range(count)]
                for row in range(2 ** count)]
        columns.append("".join(str(functions[f"f_{number}"](*row)) for row in rows))
    bench.compare("python, Python", columns)


def pla_column(path, names):
    """The column of a file that lists products of 1, over 'names' in their order."""
    with open(path, encoding="utf-8") as file:
        lines = file.read().splitlines()
    order = next((line.split()[1:] for line in lines if line.startswith(".ilb")), [])
    products = [line.split()[0] if len(line.split()) > 1 else "" for line in lines
                if line and line[0] not in ".#" and line.split()[-1] == "1"]
    column = ""
    for row in range(2 ** len(names)):
        values = {name: str(row >> (len(names) - 1 - place) & 1)
                  for place, name in enumerate(names)}
        bits = [values[name] for name in order]
        column += "1" if any(all(product in ("-", bit) for product, bit in zip(row_text, bits))
                             for row_text in products) else "0"
    return column


def split_files(text, start):
    """Texts that each begin with a line 'start', including the comments before it."""
    return re.findall(rf"(?:^#.*\n)*^{re.escape(start)}(?:(?!^#|^{re.escape(start)}).*\n)*", text,
                      re.M)


def check_abc(bench, target, start):
    # A constant has no inputs, so no rows of a sum of products to write.
    numbers = [number for number, case in enumerate(bench.cases) if num_inputs(case) > 0]
    kept = [bench.cases[number] for number in numbers]
    own = Bench(bench.tool, kept, bench.directory)
    files = split_files(own.convert(target), start)
    if len(files) != len(kept):
        raise Failure(f"{target}: {len(files)} files for {len(kept)} equations")
    script = ""
    for number, text in enumerate(files):
        path = own.write(f"in{number}.{target}", text)
        result = os.path.join(own.directory, f"out{number}.pla")
        # After a refused file, the previous network must not be used.
        script += f"empty\nread {path}\nstrash\ncollapse\nsop\nwrite_pla {result}\n"
    log = run(["berkeley-abc", "-f", own.write("commands.abc", script)])
    columns = []
    for number, (text, case) in enumerate(zip(files, kept)):
        found = re.search(r"^(?:\.inputs|\.ilb|INORDER =)(.*?);?$", text, re.M)
        path = os.path.join(own.directory, f"out{number}.pla")
        if not os.path.exists(path):
            raise Failure(f"berkeley-abc wrote no answer for {case[0]}:\n{text}\n{log[-2000:]}")
        try:
            columns.append(pla_column(path, found[1].split()))
        except KeyError as name:
            raise Failure(f"berkeley-abc answers over {name} for {case[0]}:\n{text}") from name
    own.compare(f"{target}, berkeley-abc", columns)


def check_library(bench):
    for target in ("primary", "alt1", "alt2", "alt3", "paren"):
        lines = bench.convert(target).splitlines()
        path = bench.write("again.txt", "".join(line + "\n" for line in lines))
        answers = run([bench.tool, "show", "--json", "--file", path]).splitlines()
        columns = []
        for answer, case in zip(answers, bench.cases):
            if num_inputs(case) == 0:
                columns.append(re.search(r'"value":(\d)', answer)[1])
            else:
                columns.append(re.search(r'"binary":"0b(\d+)"', answer)[1][::-1])
        bench.compare(f"{target}, read again", columns)


# --- how lint reads texts of the library's syntax as other languages ---------------------------

def lint_cases(bench, notation):
    """Cases that lint reads in 'notation', with the column that it finds, and texts it refuses."""
    answers = subprocess.run([bench.tool, "lint", "--json", "--file", bench.texts], check=False,
                             capture_output=True, text=True, timeout=TIMEOUT_SECONDS).stdout
    read, refused = [], []
    for answer, (text, names, _) in zip(answers.splitlines(), bench.cases):
        result = json.loads(answer)["result"]
        reader = next(one for one in result["readers"] if one["notation"] == notation)
        if not reader["reads"]:
            refused.append((text, names))
            continue
        bits = bin(int(reader["hex"], 16))[2:].zfill(2 ** len(names))[::-1]
        read.append((text, names, [int(bit) for bit in bits]))
    if len(read) < 50:
        raise Failure(f"lint, {notation}: only {len(read)} texts are read")
    return Bench(bench.tool, read, bench.directory), refused


def verilog_module(number, text, names):
    ports = "".join(f"input {name}, " for name in names)
    return f"module f_{number}({ports}output y);\n  assign y = {text};\nendmodule\n"


def verilog_modules(bench):
    return "".join(verilog_module(number, text, names)
                   for number, (text, names, _) in enumerate(bench.cases, 1))


def must_refuse(what, texts, accepts):
    accepted = [text for text in texts if accepts(text)]
    if accepted:
        raise Failure(f"{what} takes what lint says it refuses: {accepted[:5]}")
    print(f"{what}: {len(texts)} texts refused by both")


def lint_icarus(bench):
    own, refused = lint_cases(bench, "Verilog")
    own.compare("lint of Verilog, Icarus Verilog", icarus_columns(own, verilog_modules(own)))

    def accepts(case):
        source = bench.write("refused.v", verilog_module(1, *case))
        return subprocess.run(["iverilog", "-t", "null", source], capture_output=True,
                              check=False).returncode == 0

    # Some tools accept "~&" and "~|" between operands, which are not in the language.
    texts = [case for case in refused if not re.search(r"[~!][&|]", case[0])]
    must_refuse("lint of Verilog, Icarus Verilog", texts[:60], accepts)


def lint_yosys(bench):
    own, _ = lint_cases(bench, "Verilog")
    source = own.write("lint.v", verilog_modules(own) + verilog_wrappers(own))
    own.compare("lint of Verilog, Yosys", yosys_columns(own, f"read_verilog {source}\n"))


def lint_liberty(bench):
    own, _ = lint_cases(bench, "Liberty")
    cells = ""
    for number, (text, names, _) in enumerate(own.cases, 1):
        pins = "".join(f"    pin ({name}) {{\n        direction : input;\n    }}\n"
                       for name in names)
        cells += (f"cell (f_{number}) {{\n{pins}    pin (y) {{\n        direction : output;\n"
                  f"        function : \"{text}\";\n    }}\n}}\n")
    own.compare("lint of Liberty, Yosys", liberty_columns(own, cells))


def c_function(number, text, names):
    parameters = ", ".join(f"int {name}" for name in names) or "void"
    return f"int f_{number}({parameters})\n{{\n    return ({text}) != 0;\n}}\n"


def lint_c(bench):
    own, refused = lint_cases(bench, "C")
    own.compare("lint of C, C compiler", c_columns(own, "".join(
        c_function(number, text, names) for number, (text, names, _) in enumerate(own.cases, 1))))

    def accepts(case):
        source = bench.write("refused.c", c_function(1, *case))
        return subprocess.run(["cc", "-std=c11", "-w", "-fsyntax-only", source],
                              capture_output=True, check=False).returncode == 0

    must_refuse("lint of C, C compiler", refused[:60], accepts)


def lint_python(bench):
    own, refused = lint_cases(bench, "Python")
    columns = []
    for text, names, column in own.cases:
        code = compile(text, "text", "eval")
        columns.append("".join(
            str(int(bool(eval(code, dict(zip(names, row)))))) for row in
            itertools.product((0, 1), repeat=len(names))))
    own.compare("lint of Python, Python", columns)

    def accepts(case):
        try:
            eval(compile(case[0], "text", "eval"), {name: 1 for name in case[1]})
            return True
        except (SyntaxError, TypeError, AttributeError):
            return False

    must_refuse("lint of Python, Python", refused, accepts)


# By name: the required programs, and the check, which is one of lint if the name says so.
CHECKS = {
    "library": ([], check_library),
    "icarus": (["iverilog", "vvp"], check_icarus),
    "yosys": (["yosys"], check_yosys),
    "liberty": (["yosys"], check_liberty),
    "ghdl": (["ghdl"], check_ghdl),
    "c": (["cc"], check_c),
    "python": ([], check_python),
    "blif": (["berkeley-abc"], lambda bench: check_abc(bench, "blif", ".model")),
    "pla": (["berkeley-abc"], lambda bench: check_abc(bench, "pla", ".i ")),
    "eqn": (["berkeley-abc"], lambda bench: check_abc(bench, "eqn", "INORDER")),
    "lint_icarus": (["iverilog", "vvp"], lint_icarus),
    "lint_yosys": (["yosys"], lint_yosys),
    "lint_liberty": (["yosys"], lint_liberty),
    "lint_c": (["cc"], lint_c),
    "lint_python": ([], lint_python),
}
SKIPPED = 77


def lint_equations(seed, count):
    """Names and operators that other languages also have, and some that they do not have."""
    cases = []
    names = ["a", "b", "c", "d"]
    for spelling in (0, 1):
        cases += equations.equations(seed + 1 + spelling, count, names=names,
                                     operators=("and", "or", "xor"), spelling=spelling,
                                     inversion="~" if spelling else "!")
        cases += equations.equations(seed + 3 + spelling, count // 4, names=names,
                                     inversion="~")
    return cases


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    parser.add_argument("--count", type=int, default=300)
    parser.add_argument("--seed", type=int, default=1)
    parser.add_argument("check", choices=CHECKS)
    arguments = parser.parse_args()
    programs, check = CHECKS[arguments.check]
    missing = [program for program in programs if not shutil.which(program)]
    if missing:
        print(f"skipped: {' and '.join(missing)} is not installed")
        return SKIPPED
    make = lint_equations if arguments.check.startswith("lint") else equations.equations
    with tempfile.TemporaryDirectory() as directory:
        try:
            check(Bench(os.path.abspath(arguments.tool), make(arguments.seed, arguments.count),
                        directory))
        except Failure as failure:
            print(f"FAILED: {failure}")
            return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
