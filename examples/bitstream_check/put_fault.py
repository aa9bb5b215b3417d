#!/usr/bin/env python3
"""Puts a fault into one look-up table of a bitstream, as a careless program would.

usage: put_fault.py FAULT BITSTREAM.asc FAULTY.asc

FAULT is pins-swapped, digit-flipped, halves-exchanged, mask-shortened or output-inverted. The table
is one whose four pins are all routed and whose function looks different after each fault, so that
the fault can be identified. Prints the table's place, its init value and the faulty one.
"""
import itertools
import sys

sys.path.append("/usr/share/fpga-icestorm/python")
import icebox  # noqa: E402

# Where row k of a table is among the bits of its logic cell, as icebox.get_lutff_lut_bits reads.
BIT_OF_ROW = (4, 14, 15, 5, 6, 16, 17, 7, 3, 13, 12, 2, 1, 11, 10, 0)
FIRST_COLUMN = 36  # the first one of a tile with bits of logic cells
ROW_BITS = 10      # of a logic cell, in each of its two rows of bits


def with_pins(table, order):
    """The table whose pin k is pin order[k] of this one; pin 0 is the lowest bit of a row."""
    def row_of(row):
        return sum((row >> pin & 1) << source for pin, source in enumerate(order))
    return [table[row_of(row)] for row in range(16)]


FAULTS = {
    "pins-swapped": lambda table: with_pins(table, (1, 0, 2, 3)),
    "digit-flipped": lambda table: [bit ^ (row == 5) for row, bit in enumerate(table)],
    "halves-exchanged": lambda table: table[8:] + table[:8],
    "mask-shortened": lambda table: table[4:] + [0] * 4,  # the last digit is lost
    "output-inverted": lambda table: [1 - bit for bit in table],
}


def tells_faults_apart(table):
    """Whether no order of pins turns one fault's result into another's or into the table."""
    orders = list(itertools.permutations(range(4)))
    seen = {tuple(with_pins(table, order)) for order in orders}
    if len(seen) != len(orders):
        return False
    for fault in FAULTS.values():
        result = fault(table)
        if fault is not FAULTS["pins-swapped"] and tuple(result) in seen:
            return False
    results = [tuple(fault(table)) for fault in FAULTS.values()]
    return len(set(results)) == len(results)


def routed_pins(chip):
    return {wire for wires in chip.group_segments() for wire in wires if "/in_" in wire[2]}


def choose(chip):
    pins = routed_pins(chip)
    for column, row in sorted(chip.logic_tiles):
        for index in range(8):
            table = [int(bit) for bit in
                     icebox.get_lutff_lut_bits(chip.logic_tiles[(column, row)], index)]
            if (all((column, row, f"lutff_{index}/in_{pin}") in pins for pin in range(4)) and
                    tells_faults_apart(table)):
                return column, row, index, table
    sys.exit("no table of this bitstream tells all faults apart")


def write_table(chip, column, row, index, table):
    tile = chip.logic_tiles[(column, row)]
    for place, bit in enumerate(table):
        line, column_in_line = divmod(BIT_OF_ROW[place], ROW_BITS)
        text = list(tile[2 * index + line])
        text[FIRST_COLUMN + column_in_line] = str(bit)
        tile[2 * index + line] = "".join(text)
    if [int(bit) for bit in icebox.get_lutff_lut_bits(tile, index)] != table:
        sys.exit("the table that was written does not read back")


def hexadecimal(table):
    return f"0x{sum(bit << row for row, bit in enumerate(table)):04x}"


def main():
    if len(sys.argv) != 4 or sys.argv[1] not in FAULTS:
        sys.exit(__doc__)
    chip = icebox.iceconfig()
    chip.read_file(sys.argv[2])
    column, row, index, table = choose(chip)
    faulty = FAULTS[sys.argv[1]](table)
    write_table(chip, column, row, index, faulty)
    chip.write_file(sys.argv[3])
    print(f"{sys.argv[1]}: X{column}/Y{row}/lc{index}, {hexadecimal(table)} becomes "
          f"{hexadecimal(faulty)}")


if __name__ == "__main__":
    main()
