#!/usr/bin/env python3
# Runs the example that reports on look-up tables on its design and on lines that it must refuse.
# usage: test_lut_report.py PROGRAM SOURCES
import pathlib
import subprocess
import sys
import tempfile


def run(program, path):
    done = subprocess.run([program, path], capture_output=True, text=True, check=False)
    return done.returncode, done.stdout, done.stderr


def main():
    program, sources = sys.argv[1:]
    status, output, complaints = run(program, f"{sources}/design.luts")
    assert (status, complaints) == (0, ""), (status, complaints)
    for line in ["u_mux: multiplexer, select S: A for S=1; B for S=0",
                 "  like u_mux, with", "u_carry: majority of A, B, CI",
                 "u_sum: XOR of A, B, CI: 1 when an odd number is 1",
                 "u_enable: AND of EN, D", "u_keep: buffer of D",
                 "  without effect: EN, RST", "  short: D"]:
        assert any(found.startswith(line) for found in output.splitlines()), (line, output)

    with tempfile.TemporaryDirectory() as folder:
        path = pathlib.Path(folder, "bad.luts")
        path.write_text("a A,B\nb A,B 0xca\nc A,B A&B\nd A,B 0x8\ne 'x'+y,B 0x8\n")
        status, output, complaints = run(program, path)
    assert status == 1 and output.startswith("d: AND of A, B\n"), (status, output)
    assert [line.split(":")[0] for line in complaints.splitlines()] == [
        "line 1", "line 2", "line 3", "line 5"], complaints
    assert run(program, "no such file")[0] == 2


if __name__ == "__main__":
    sys.exit(main())
