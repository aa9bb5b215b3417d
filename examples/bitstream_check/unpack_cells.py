#!/usr/bin/env python3
"""The look-up tables of a placed netlist as the cells that they were before placement.

usage: unpack_cells.py SYNTHESISED.json PLACED.json NETLIST.json RENAMES

A logic cell of a placed netlist is a table, a flip-flop and a carry. Where the flip-flop is used, the
net between table and flip-flop has lost its name; it gets one. Cells without a table of the design
are left out: those that only pass a net to their flip-flop or serve their carry, and constants.
RENAMES are the nets that placement renames: these, and those between pads and logic.
"""
import json
import sys

SUFFIX = "_LC"  # nextpnr puts this after the name of a table
TO_FLIP_FLOP = "$to_flip_flop"
INPUTS = ("I0", "I1", "I2", "I3")


def read_module(path):
    with open(path, encoding="utf-8") as file:
        modules = json.load(file)["modules"]
    return next(module for module in modules.values() if "top" in module["attributes"])


def is_table(name, cell):
    return (cell["type"] == "ICESTORM_LC" and name.endswith(SUFFIX) and
            not name.endswith("_DFFLC") and not name.startswith("$PACKER_"))


def constants_of(module):
    """The constant digit of each net that a constant cell drives."""
    digits = {}
    for name, cell in module["cells"].items():
        if name.startswith("$PACKER_"):
            for bit in cell["connections"]["O"]:
                digits[bit] = "1" if name.startswith("$PACKER_VCC") else "0"
    return digits


def unpack(module):
    cells, names = {}, dict(module["netnames"])
    constants = constants_of(module)
    next_net = 1 + max(bit for net in names.values() for bit in net["bits"]
                       if isinstance(bit, int))
    for packed_name, cell in module["cells"].items():
        if not is_table(packed_name, cell):
            continue
        name = packed_name[:-len(SUFFIX)]
        connections = {pin: [constants.get(bit, bit) for bit in cell["connections"][pin]]
                       for pin in INPUTS}
        connections["O"] = cell["connections"]["O"]
        if cell["parameters"]["DFF_ENABLE"] == "1":
            connections["O"] = [next_net]
            names[name + TO_FLIP_FLOP] = {"hide_name": 0, "bits": [next_net], "attributes": {}}
            next_net += 1
        cells[name] = {"hide_name": 0, "type": "SB_LUT4", "attributes": {},
                       "parameters": {"LUT_INIT": cell["parameters"]["LUT_INIT"]},
                       "port_directions": {**dict.fromkeys(INPUTS, "input"), "O": "output"},
                       "connections": connections}
    return {"attributes": {"top": "1"}, "ports": {}, "cells": cells, "netnames": names}


def net_names(module):
    """A name for each net; bits of wider ones are named as booleq names them."""
    names = {}
    for name, net in module["netnames"].items():
        for place, bit in enumerate(net["bits"]):
            names.setdefault(bit, name if len(net["bits"]) == 1 else f"{name}[{place}]")
    return names


def renames(synthesised, unpacked):
    """The names after placement of the nets of pads, and of those from tables to flip-flops."""
    for name, port in synthesised["ports"].items():
        suffix = "$SB_IO_IN" if port["direction"] == "input" else "$SB_IO_OUT"
        for place in range(len(port["bits"])):
            own = name if len(port["bits"]) == 1 else f"{name}[{place}]"
            yield own, own + suffix
    tables = {cell["connections"]["O"][0]: name for name, cell in synthesised["cells"].items()
              if cell["type"] == "SB_LUT4"}
    names = net_names(synthesised)
    for cell in synthesised["cells"].values():
        data = cell["connections"]["D"][0] if cell["type"].startswith("SB_DFF") else None
        if data in tables and tables[data] + TO_FLIP_FLOP in unpacked["netnames"]:
            yield names[data], tables[data] + TO_FLIP_FLOP


def main():
    if len(sys.argv) != 5:
        sys.exit(__doc__)
    synthesised, placed = read_module(sys.argv[1]), read_module(sys.argv[2])
    unpacked = unpack(placed)
    with open(sys.argv[3], "w", encoding="utf-8") as file:
        json.dump({"creator": "unpack_cells.py", "modules": {"top": unpacked}}, file, indent=1)
        file.write("\n")
    with open(sys.argv[4], "w", encoding="utf-8") as file:
        file.writelines(f"{old} {new}\n" for old, new in renames(synthesised, unpacked))


if __name__ == "__main__":
    main()
