#!/usr/bin/env python3
"""From Verilog to a bitstream and back: is every look-up table still what it was?

usage: demo.py BOOLEQ DIRECTORY

Runs yosys, nextpnr-ice40 and the programs of fpga-icestorm on processor.v, in DIRECTORY, and compares
with booleq: the synthesised netlist with the placed one, and the placed one with the bitstream.
Then each fault of put_fault.py is put into the bitstream, and the comparison must name it. Exits
with status 1 when anything is not as it should be.
"""
import pathlib
import shlex
import subprocess
import sys

HERE = pathlib.Path(__file__).resolve().parent
# What the comparison says about each fault.
CAUSES = {
    "pins-swapped": "pins swapped without the init value",
    "digit-flipped": "one digit of the init value changed",
    "halves-exchanged": "the halves of the init value are exchanged",
    "mask-shortened": "the digits of the init value are shifted: 1 hexadecimal digit to the right",
    "output-inverted": "the output is inverted",
}


class Demonstration:
    def __init__(self, booleq, directory):
        self.booleq = str(pathlib.Path(booleq).resolve())
        self.directory = directory
        self.failed = []

    def run(self, *command, status=0):
        """Runs a command, shows it and its output, and returns the output."""
        shown = [pathlib.Path(word).name if word in (self.booleq, *self.scripts()) else word
                 for word in command]
        print("$", " ".join(shlex.quote(word) for word in shown), flush=True)
        done = subprocess.run(command, cwd=self.directory, stdout=subprocess.PIPE,
                              stderr=subprocess.STDOUT, text=True, check=False)
        print(done.stdout, end="", flush=True)
        if done.returncode != status:
            self.failed.append(f"{shown[0]} ended with status {done.returncode}, not {status}")
        return done.stdout

    @staticmethod
    def scripts():
        return [str(path) for path in HERE.iterdir()]

    def script(self, name, *arguments):
        return self.run(str(HERE / name), *arguments)

    def diff(self, *arguments, status=0):
        return self.run(self.booleq, "netlist", "diff", "--cells", str(HERE / "placed.cells"),
                        *arguments, status=status)

    def build(self):
        print("# Synthesis, place and route, bitstream.")
        self.run("yosys", "-q", "-p",
                 "synth_ice40 -top processor; write_json synthesised.json",
                 str(HERE / "processor.v"))
        self.run("nextpnr-ice40", "-q", "--hx1k", "--package", "tq144", "--seed", "1",
                 "--json", "synthesised.json", "--asc", "routed.asc",
                 "--write", "placed.json")
        self.run("icepack", "routed.asc", "processor.bin")

    def compare(self):
        print("\n# Is every table still there after placement?")
        self.script("unpack_cells.py", "synthesised.json", "placed.json", "unpacked.json",
                    "renames.txt")
        self.diff("synthesised.json", "unpacked.json", "--rename", "renames.txt")
        print("\n# Back from the bitstream: is every table in it that of the placed netlist?")
        self.run("iceunpack", "processor.bin", "processor.asc")
        self.script("read_bitstream.py", "processor.asc", "bitstream.json")
        self.diff("placed.json", "bitstream.json", "--key", "NEXTPNR_BEL", "--allow-wires")

    def put_faults(self):
        for fault, cause in CAUSES.items():
            print(f"\n# A fault: {fault}.")
            self.script("put_fault.py", fault, "processor.asc", "faulty.asc")
            self.run("icepack", "faulty.asc", "faulty.bin")
            self.run("iceunpack", "faulty.bin", "unpacked.asc")
            self.script("read_bitstream.py", "unpacked.asc", "faulty.json")
            answer = self.diff("placed.json", "faulty.json", "--key", "NEXTPNR_BEL",
                               "--allow-wires", status=1)
            if cause not in answer:
                self.failed.append(f"{fault} is not named")

    def report(self):
        print()
        for failure in self.failed:
            print("FAILED:", failure)
        if not self.failed:
            print(f"Every table of the bitstream is that of the netlist; {len(CAUSES)} faults of "
                  f"{len(CAUSES)} are named.")
        return 1 if self.failed else 0


def main():
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    directory = pathlib.Path(sys.argv[2])
    directory.mkdir(parents=True, exist_ok=True)
    demonstration = Demonstration(sys.argv[1], directory)
    demonstration.build()
    demonstration.compare()
    demonstration.put_faults()
    return demonstration.report()


if __name__ == "__main__":
    sys.exit(main())
