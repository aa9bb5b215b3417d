#!/usr/bin/env python3
"""The example bitstream_check: the whole way from Verilog to a bitstream and back, and five faults.

usage: test_bitstream_check.py BOOLEQ EXAMPLE
"""
import pathlib
import shutil
import subprocess
import sys
import tempfile
import unittest

BOOLEQ = EXAMPLE = None
PROGRAMS = ("yosys", "nextpnr-ice40", "icepack", "iceunpack")
NO_TEST = 77


class BitstreamCheck(unittest.TestCase):
    maxDiff = None

    @classmethod
    def setUpClass(cls):
        with tempfile.TemporaryDirectory() as directory:
            done = subprocess.run([sys.executable, str(EXAMPLE / "demo.py"), BOOLEQ, directory],
                                  stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True,
                                  timeout=600, check=False)
        cls.status, cls.output = done.returncode, done.stdout
        cls.parts = {part.splitlines()[0]: part for part in cls.output.split("\n# ")}

    def test_everything_is_as_it_should_be(self):
        self.assertEqual(self.status, 0, self.output)
        self.assertTrue(self.output.endswith(
            "Every table of the bitstream is that of the netlist; 5 faults of 5 are named.\n"),
            self.output)

    def test_tables_of_the_bitstream(self):
        part = self.parts["Back from the bitstream: is every table in it that of the placed "
                          "netlist?"]
        self.assertRegex(part, r"\nsame +[1-9]\d+ same, 0 different, ")
        self.assertIn("nets are matched by the tables around them", part)

    def test_only_one_table_differs(self):
        faults = [part for title, part in self.parts.items() if title.startswith("A fault: ")]
        self.assertEqual(len(faults), 5)
        for part in faults:
            self.assertRegex(part, r"\nnot the same +\d+ same, 1 different, ")
            became = part.split(", 0x")[1].split(" ")[0]
            self.assertIn(f"\n  should be     0x{became}, right's pins being ", part)


if __name__ == "__main__":
    if not all(shutil.which(program) for program in PROGRAMS):
        sys.exit(NO_TEST)
    BOOLEQ, EXAMPLE = sys.argv[1], pathlib.Path(sys.argv[2])
    unittest.main(argv=sys.argv[:1])
