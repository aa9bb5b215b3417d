#!/usr/bin/env python3
"""The look-up tables of a bitstream as a netlist that booleq reads.

usage: read_bitstream.py BITSTREAM.asc NETLIST.json

Reads the text form of a bitstream (iceunpack) and fpga-icestorm's description of the chip, which
says what each bit is and which wires a routed net consists of. Writes one cell for each logic cell
that holds a table or a flip-flop, with its place in the attribute NEXTPNR_BEL, as in the placed
netlist. Names are lost: nets are numbered.
"""
import json
import re
import sys

sys.path.append("/usr/share/fpga-icestorm/python")
import icebox  # noqa: E402

INPUTS = ("I0", "I1", "I2", "I3")


def read_chip(path):
    chip = icebox.iceconfig()
    chip.read_file(path)
    return chip


def wires_to_nets(chip):
    """The net number of each wire; a net is the set of wires that switches join."""
    nets = {}
    # The outputs of logic cells are nets even before a switch joins them to anything. This format
    # does not use the numbers 0 and 1 for nets.
    for number, wires in enumerate(sorted(chip.group_segments()), start=2):
        for wire in wires:
            nets[wire] = number
    return nets


def is_used(table, settings, wires, nets):
    has_wire = any(wire in nets for wire in wires)
    return "1" in table or settings[1] == "1" or (has_wire and settings[0] == "1")


def cell_at(chip, nets, column, row, index):
    """The logic cell's table, None when the cell holds nothing."""
    tile = chip.logic_tiles[(column, row)]
    table = icebox.get_lutff_lut_bits(tile, index)     # starts with the row of all zeros
    settings = icebox.get_lutff_seq_bits(tile, index)  # carry, flip-flop, set, asynchronous

    def wire(name):
        return (column, row, f"lutff_{index}/{name}")

    inputs = [wire(f"in_{pin}") for pin in range(len(INPUTS))]
    if not is_used(table, settings, inputs + [wire("out")], nets):
        return None
    connections = {}
    for pin, source in zip(INPUTS, inputs):
        # A pin that no switch joins to a wire reads 0.
        connections[pin] = [nets[source]] if source in nets else ["0"]
    if wire("out") in nets:
        connections["O"] = [nets[wire("out")]]
    return {"hide_name": 0, "type": "SB_LUT4",
            "parameters": {"LUT_INIT": "".join(reversed(table))},
            "attributes": {"NEXTPNR_BEL": f"X{column}/Y{row}/lc{index}"},
            "port_directions": {**dict.fromkeys(INPUTS, "input"), "O": "output"},
            "connections": connections}


def read_tables(path):
    chip = read_chip(path)
    nets = wires_to_nets(chip)
    cells = {}
    for column, row in sorted(chip.logic_tiles):
        for index in range(8):
            cell = cell_at(chip, nets, column, row, index)
            if cell:
                cells[f"table_{column}_{row}_{index}"] = cell
    used = {bit for cell in cells.values() for bits in cell["connections"].values() for bit in bits
            if isinstance(bit, int)}
    names = {f"n{number}": {"hide_name": 0, "bits": [number], "attributes": {}}
             for number in sorted(used)}
    return {"creator": "read_bitstream.py",
            "modules": {"chip": {"attributes": {"top": "1"}, "ports": {}, "cells": cells,
                                 "netnames": names}}}


def main():
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    netlist = read_tables(sys.argv[1])
    with open(sys.argv[2], "w", encoding="ascii") as file:
        json.dump(netlist, file, indent=1)
        file.write("\n")


if __name__ == "__main__":
    main()
