#!/usr/bin/env python3
"""Prints how long 'booleq netlist' takes for a million tables, next to Yosys and Python's json.

usage: bench_netlist.py MAKE_NETLIST BOOLEQ [TABLES [RUNS]]

Writes netlists of TABLES (1,000,000) six-input tables and runs each command RUNS times (2); the
least time counts. Yosys and Python read 100,000 tables. Answers go to a temporary file, which is
checked once. Prints Markdown; exit status 1 if a command fails or its answer is wrong.
"""
import os
import pathlib
import shutil
import subprocess
import sys
import tempfile
import time


def run(command, folder):
    """Seconds, peak memory in MB, and the last line of the answer."""
    answer = folder / "answer"
    with answer.open("wb") as stream, open(os.devnull, "wb") as nothing:
        start = time.perf_counter()
        process = subprocess.Popen(command, stdout=stream, stderr=nothing)
        _, status, usage = os.wait4(process.pid, 0)
        seconds = time.perf_counter() - start
        process.returncode = os.waitstatus_to_exitcode(status)
    with answer.open("rb") as stream:
        stream.seek(max(0, answer.stat().st_size - 4096))
        lines = stream.read().decode("utf-8", "replace").splitlines()
    answer.unlink()
    return process.returncode, seconds, usage.ru_maxrss / 1000, lines[-1] if lines else ""


def measure(name, command, folder, size, runs, wanted=(0,), ending=""):
    best, peak = float("inf"), 0.0
    for _ in range(runs):
        status, seconds, memory, last = run(command, folder)
        if status not in wanted or ending not in last:
            sys.exit(f"{' '.join(map(str, command))}: status {status}, {last}")
        best, peak = min(best, seconds), max(peak, memory)
    print(f"| {name} | {size / 1e6:.0f} MB | {best:.2f} s | {peak:.0f} MB | {peak * 1e6 / size:.1f} |",
          flush=True)


def write(make, form, count, folder, *more):
    file = folder / f"{count}{''.join(more)}.{form}"
    with file.open("wb") as stream:
        subprocess.run([make, form, str(count), *more], check=True, stdout=stream)
    return file, file.stat().st_size


def main():
    if len(sys.argv) not in (3, 4, 5):
        sys.exit(__doc__)
    make, booleq = sys.argv[1:3]
    count = int(sys.argv[3]) if len(sys.argv) > 3 else 1000000
    runs = int(sys.argv[4]) if len(sys.argv) > 4 else 2
    print("| | text | time | peak memory | memory / text |\n|---|---|---|---|---|")
    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)
        netlist = [booleq, "netlist"]
        json, size = write(make, "json", count, folder)
        of = f"{count:,} tables, JSON"
        measure(f"`stats`, {of}", [*netlist, "stats", json], folder, size, runs)
        measure(f"`check`, {of}", [*netlist, "check", json], folder, size, runs, (0, 1), "finding")
        measure(f"`list`, {of}", [*netlist, "list", json, "--format", "csv"], folder, size, runs)
        other, more = write(make, "json", count, folder, "1", "shuffled")
        measure(f"`diff`, two of {of}, pins in another order", [*netlist, "diff", json, other],
                folder, size + more, runs, (0,), "0 different")
        other.unlink()
        for form in ("blif", "edif"):
            file, size = write(make, form, count, folder)
            measure(f"`stats`, {count:,} tables, {form.upper()}", [*netlist, "stats", file], folder,
                    size, runs)
            file.unlink()
        json.unlink()
        json, size = write(make, "json", 100000, folder)
        measure("`stats`, 100,000 tables, JSON", [*netlist, "stats", json], folder, size, runs)
        code = f"import json; json.load(open({str(json)!r}))"
        measure("Python's `json.load`, the same", [sys.executable, "-c", code], folder, size, runs)
        if shutil.which("yosys"):
            measure("`yosys -p \"read_json ...; stat\"`, the same",
                    ["yosys", "-q", "-p", f"read_json {json}; stat"], folder, size, runs)


main()
