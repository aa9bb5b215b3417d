"""Reading of netlists: time and memory, beside Python's json and Yosys.

usage: bench_netlist.py MAKE_NETLIST SHOW_DESIGN [TABLES]

Writes netlists of TABLES (1,000,000) six-input tables and reads each three times with
'SHOW_DESIGN --count', the least time of which counts; Python and Yosys read 100,000 of them.
"""

import pathlib
import resource
import shutil
import subprocess
import sys
import tempfile
import time


def measure(command):
    before = resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss
    best = float("inf")
    for _ in range(3):
        start = time.perf_counter()
        subprocess.run(command, check=True, stdout=subprocess.DEVNULL, timeout=600)
        best = min(best, time.perf_counter() - start)
    after = resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss
    memory = f"{after // 1024} MB" if after > before else f"under {before // 1024} MB"
    return f"{best:.2f} s, {memory}"


def write(make, form, count, folder):
    file = folder / f"{count}.{form}"
    with file.open("wb") as stream:
        subprocess.run([make, form, str(count)], check=True, stdout=stream, timeout=600)
    return file


def main():
    make, show = sys.argv[1:3]
    count = int(sys.argv[3]) if len(sys.argv) > 3 else 1000000
    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)
        small = write(make, "json", 100000, folder)
        print("100,000 tables, here:", measure([show, "--count", str(small)]))
        print("100,000 tables, Python:", measure([sys.executable, "-c", f"import json; json.load(open({str(small)!r}))"]))
        if shutil.which("yosys"):
            print("100,000 tables, Yosys:", measure(["yosys", "-q", "-p", f"read_json {small}; stat"]))
        for form in ("blif", "edif", "json"):
            file = write(make, form, count, folder)
            size = file.stat().st_size // 1000000
            print(f"{count} tables, {form} of {size} MB:", measure([show, "--count", str(file)]), flush=True)
            file.unlink()


main()
