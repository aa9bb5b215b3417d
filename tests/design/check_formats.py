"""Checks that one design has the same tables in four formats.

usage: check_formats.py [--booleq BOOLEQ] SHOW_DESIGN [FOLDER]

Yosys writes a design as JSON, BLIF, EDIF and Verilog; all four, read here, must be the same
functions of the same nets. Without FOLDER the design is a small one with hierarchy. With FOLDER
each BLIF file in it is a design, and the file itself is compared, too. With BOOLEQ its 'netlist
diff' must agree. Status 77: Yosys or the folder is missing.
"""

import argparse
import pathlib
import shutil
import subprocess
import sys
import tempfile

DESIGN = """
module stage(input [7:0] a, input [7:0] b, input select, output [7:0] y, output odd);
  assign y = select ? a + b : a ^ (b & {8{a[3]}});
  assign odd = ^y;
endmodule
module top(input [7:0] a, input [7:0] b, input [1:0] select, output [7:0] y, output odd, output same,
           output one);
  wire [7:0] middle;
  wire first;
  stage s0(.a(a), .b(b), .select(select[0]), .y(middle), .odd(first));
  stage s1(.a(middle), .b({b[6:0], 1'b1}), .select(select[1]), .y(y), .odd(odd));
  assign same = a[5];
  assign one = 1'b1;
endmodule
"""

# $lut as instances, because write_verilog cannot write it in any other way.
MAP = """
(* techmap_celltype = "$lut" *)
module map_lut(A, Y);
  parameter WIDTH = 0;
  parameter LUT = 0;
  input [WIDTH-1:0] A;
  output Y;
  generate
    if (WIDTH == 1) LUT1 #(.INIT(LUT)) cell_(.I0(A[0]), .O(Y));
    if (WIDTH == 2) LUT2 #(.INIT(LUT)) cell_(.I0(A[0]), .I1(A[1]), .O(Y));
    if (WIDTH == 3) LUT3 #(.INIT(LUT)) cell_(.I0(A[0]), .I1(A[1]), .I2(A[2]), .O(Y));
    if (WIDTH == 4) LUT4 #(.INIT(LUT)) cell_(.I0(A[0]), .I1(A[1]), .I2(A[2]), .I3(A[3]), .O(Y));
    if (WIDTH == 5) LUT5 #(.INIT(LUT)) cell_(.I0(A[0]), .I1(A[1]), .I2(A[2]), .I3(A[3]), .I4(A[4]),
                                             .O(Y));
    if (WIDTH == 6) LUT6 #(.INIT(LUT)) cell_(.I0(A[0]), .I1(A[1]), .I2(A[2]), .I3(A[3]), .I4(A[4]),
                                             .I5(A[5]), .O(Y));
  endgenerate
endmodule
"""

WRITE_MAPPED = (
    "techmap -map map.v; write_json mapped.json; write_edif mapped.edif; "
    "write_blif -param -cname mapped.blif; write_verilog -noattr -norename mapped.v"
)


def yosys(script, folder):
    run = subprocess.run(
        ["yosys", "-q", "-p", script], cwd=folder, capture_output=True, text=True, timeout=600
    )
    if run.returncode != 0:
        sys.exit(f"yosys: {script}\n{run.stdout}{run.stderr}")


def functions(show, file, reference):
    run = subprocess.run(
        [show, str(file), str(reference)], capture_output=True, text=True, timeout=600
    )
    if run.returncode != 0:
        sys.exit(f"{file}: {run.stderr}")
    return run.stdout.splitlines()


def diff(booleq, left, right):
    run = subprocess.run(
        [booleq, "netlist", "diff", str(left), str(right)], capture_output=True, text=True, timeout=600
    )
    if run.returncode != 0:
        sys.exit(f"diff of {left.name} and {right.name}: {run.stdout[-2000:]}{run.stderr}")


def compare(arguments, folder, files, minimum):
    show = str(arguments.show.resolve())
    reference = folder / files[0]
    expected = functions(show, reference, reference)
    if len(expected) < minimum:
        sys.exit(f"{files[0]}: only {len(expected)} tables")
    for file in files[1:]:
        found = functions(show, folder / file, reference)
        if found != expected:
            odd = sorted(set(found) ^ set(expected))
            sys.exit(f"{file} differs from {files[0]} in {len(odd)} lines:\n" + "\n".join(odd[:8]))
        if arguments.booleq:
            diff(arguments.booleq.resolve(), reference, folder / file)
            diff(arguments.booleq.resolve(), folder / file, folder / files[-1])
    return len(expected)


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--booleq", type=pathlib.Path)
    parser.add_argument("show", type=pathlib.Path)
    parser.add_argument("folder", type=pathlib.Path, nargs="?")
    arguments = parser.parse_args()
    if shutil.which("yosys") is None:
        print("skipped: yosys is not installed")
        return 77
    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)
        (folder / "map.v").write_text(MAP)
        mapped = ["mapped.json", "mapped.edif", "mapped.blif", "mapped.v"]
        if arguments.folder is None:
            (folder / "design.v").write_text(DESIGN)
            plain = "write_json plain.json; write_edif plain.edif; write_blif plain.blif; "
            yosys(
                "read_verilog design.v; hierarchy -top top; synth -top top; abc -lut 6; "
                + plain
                + WRITE_MAPPED,
                folder,
            )
            # BLIF without cell names has no names for instances of modules either.
            print(compare(arguments, folder, ["plain.json", "plain.edif"] + mapped, 40), "tables")
            yosys(
                "read_verilog design.v; synth -flatten -top top; abc -lut 6; clean; " + plain, folder
            )
            print(compare(arguments, folder, ["plain.json", "plain.edif", "plain.blif"], 30), "tables")
            return 0
        netlists = sorted(arguments.folder.glob("*.blif"))
        if not netlists:
            print("skipped: no BLIF files in", arguments.folder)
            return 77
        for netlist in netlists:
            shutil.copyfile(netlist, folder / "original.blif")
            yosys(
                "read_blif original.blif; write_json plain.json; write_edif plain.edif; "
                + WRITE_MAPPED,
                folder,
            )
            files = ["plain.json", "original.blif", "plain.edif"] + mapped
            print(netlist.name, compare(arguments, folder, files, 1), "tables", flush=True)
    return 0


sys.exit(main())
