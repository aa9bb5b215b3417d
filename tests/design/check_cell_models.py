"""Checks that the cell types in cells.txt agree with Yosys' simulation models of the cells.

usage: check_cell_models.py SHOW_DESIGN CELLS

Icarus Verilog simulates every model of every table with random init values for all values of its
pins; the same cell in a netlist, read here, must have the same rows. Status 77: a program is
missing.
"""

import json
import pathlib
import random
import re
import shutil
import subprocess
import sys
import tempfile

MODELS = pathlib.Path("/usr/share/yosys")
REPETITIONS = 3
MODULE = re.compile(r"^[ \t]*(?:\(\*[^\n]*\*\)\s*)*module\s+(\\?[^\s(#;]+).*?^[ \t]*endmodule", re.M | re.S)


class Type:
    def __init__(self, name):
        self.name = name
        self.inputs = []
        self.outputs = []
        self.inits = {}


def read_types(file):
    """Only names, pins and parameters; the reader decides what the bits mean."""
    types = []
    for line in pathlib.Path(file).read_text().splitlines():
        words = line.split("#")[0].split()
        if not words:
            continue
        if words[0] == "cell":
            types.append(Type(words[1]))
        elif words[0] == "input":
            types[-1].inputs += words[1:]
        elif words[0] == "table":
            types[-1].outputs.append(words[1])
        elif words[0] == "init" and len(words) > 2:
            types[-1].inits[words[1]] = int(words[2])
    return [each for each in types if each.inputs and each.outputs]


def modules_of(file):
    text = re.sub(r"//[^\n]*|/\*.*?\*/", "", file.read_text(), flags=re.S)
    return {match.group(1): match.group(0) for match in MODULE.finditer(text)}


def with_dependencies(name, modules):
    wanted = [name]
    for each in wanted:
        for other in modules:
            if other not in wanted and re.search(rf"\b{re.escape(other)}\b", modules[each]):
                wanted.append(other)
    return "\n".join(modules[each] for each in wanted)


def has_pins(text, pins):
    return all(re.search(rf"\b{re.escape(pin)}\b", text) for pin in pins)


def literal(value, bits, own_text, parameter):
    """Some models need a string of hexadecimal digits."""
    if re.search(rf'parameter\s+{parameter}\s*=\s*"0x', own_text):
        return f'"0x{value:0{bits // 4}x}"'
    return f"{bits}'h{value:x}"


def spelled(value, bits, rng):
    """One of the spellings that occur in netlists."""
    forms = [f"{value:0{bits}b}", f"{bits}'h{value:x}", f"{bits}'d{value}", f"{bits}'b{value:b}"]
    if bits >= 4:
        forms += [f"0x{value:0{bits // 4}x}", f"0x{value:0{bits // 4}X}"]
    if bits <= 32:
        forms.append(value)
    return rng.choice(forms)


def simulate(kind, text, own_text, inits, file, folder):
    """The outputs of each repetition, by the value of the pins."""
    bench = ["`timescale 1ns/1ps", "module bench;", f"reg [{len(kind.inputs)}:0] row;"]
    for index, values in enumerate(inits):
        parameters = ", ".join(
            f".{name}({literal(value, kind.inits[name], own_text, name)})" for name, value in values.items()
        )
        pins = [f".{pin}(row[{place}])" for place, pin in enumerate(kind.inputs)]
        pins += [f".{pin}(o{index}_{pin})" for pin in kind.outputs]
        bench += [f"wire o{index}_{pin};" for pin in kind.outputs]
        bench.append(f"{kind.name} #({parameters}) u{index}({', '.join(pins)});")
    shown = ", ".join(f"o{index}_{pin}" for index in range(len(inits)) for pin in kind.outputs)
    count = len(inits) * len(kind.outputs)
    bench += [
        f"initial for (row = 0; row < {1 << len(kind.inputs)}; row = row + 1) begin",
        f'#1000 $display("{"%b" * count}", {shown});',
        "end",
        "endmodule",
    ]
    (folder / "bench.v").write_text("\n".join(bench) + "\n")
    (folder / "model.v").write_text("`timescale 1ns/1ps\n" + text)
    define = ["-DICE40_HX"] if file.parent.name == "ice40" else []
    macros = [f"-D{name}=" for name in re.findall(r"`(ICE40_DEFAULT\w+|ABC9_\w+)", text)]
    command = ["iverilog", "-g2012", "-I", str(file.parent), "-o", "bench", "-s", "bench"]
    for step in (command + define + sorted(set(macros)) + ["model.v", "bench.v"], ["vvp", "bench"]):
        run = subprocess.run(step, cwd=folder, capture_output=True, text=True, timeout=300)
        if run.returncode != 0:
            sys.exit(f"{kind.name} of {file}: {step[0]}\n{run.stdout}{run.stderr}")
    lines = [line for line in run.stdout.splitlines() if re.fullmatch("[01xz]+", line)]
    if len(lines) != 1 << len(kind.inputs):
        sys.exit(f"{kind.name} of {file}: {len(lines)} rows")
    return lines


def read_back(show, kind, inits, folder, rng):
    """The tables of a netlist with these cells, by repetition and output pin."""
    bits = {pin: 2 + place for place, pin in enumerate(kind.inputs)}
    nets = {pin: {"bits": [bit]} for pin, bit in bits.items()}
    cells = {}
    for index, values in enumerate(inits):
        connections = {pin: [bit] for pin, bit in bits.items()}
        for place, pin in enumerate(kind.outputs):
            bit = 1000 + 16 * index + place
            connections[pin] = [bit]
            nets[f"out{index}_{pin}"] = {"bits": [bit]}
        parameters = {name: spelled(value, kind.inits[name], rng) for name, value in values.items()}
        cells[f"u{index}"] = {
            "type": kind.name,
            "parameters": parameters,
            "connections": connections,
        }
    netlist = {"modules": {"top": {"cells": cells, "netnames": nets}}}
    (folder / "netlist.json").write_text(json.dumps(netlist))
    run = subprocess.run([show, "netlist.json"], cwd=folder, capture_output=True, text=True, timeout=60)
    if run.returncode != 0:
        sys.exit(run.stderr)
    tables = {}
    for line in run.stdout.splitlines():
        output, rows, pins = re.fullmatch(r"\S+ \S+: (\S+) = ([0-9a-f]+)\((.*)\)", line).groups()
        tables[output] = (int(rows, 16), pins.split(", "))
    return tables


def check(show, kind, file, modules, folder, rng):
    inits = [
        {name: rng.getrandbits(bits) for name, bits in kind.inits.items()} for _ in range(REPETITIONS)
    ]
    text = with_dependencies(kind.name, modules)
    lines = simulate(kind, text, modules[kind.name], inits, file, folder)
    tables = read_back(show, kind, inits, folder, rng)
    for index in range(REPETITIONS):
        for place, pin in enumerate(kind.outputs):
            rows, pins = tables[f"out{index}_{pin}"]
            for row, line in enumerate(lines):
                # The last pin is the least significant one.
                number = 0
                for name in pins:
                    number = number << 1 | (row >> kind.inputs.index(name) & 1)
                expected = line[index * len(kind.outputs) + place]
                if str(rows >> number & 1) != expected:
                    sys.exit(
                        f"{kind.name}.{pin} of {file}: the model says {expected} for row {row} "
                        f"of {inits[index]}"
                    )


def main():
    show, cells = (str(pathlib.Path(each).resolve()) for each in sys.argv[1:])
    if shutil.which("iverilog") is None or not MODELS.is_dir():
        print("skipped: iverilog or yosys is not installed")
        return 77
    rng = random.Random(3)
    types = read_types(cells)
    models = [(file, modules_of(file)) for file in sorted(MODELS.glob("**/*sim*.v"))]
    num_models = 0
    with tempfile.TemporaryDirectory() as name:
        for kind in types:
            own = [
                (file, modules)
                for file, modules in models
                if kind.name in modules and has_pins(modules[kind.name], kind.inputs + kind.outputs)
            ]
            if not own:
                sys.exit(f"no model of {kind.name} with the pins {kind.inputs} {kind.outputs}")
            for file, modules in own:
                check(show, kind, file, modules, pathlib.Path(name), rng)
                num_models += 1
    print(len(types), "types,", num_models, "models agree")
    return 0


sys.exit(main())
