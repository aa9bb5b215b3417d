#!/usr/bin/env python3
"""Prints how many exact forms of random six-input functions a second bench_luts and berkeley-abc find.

usage: bench_npn.py BENCH_LUTS [--count N]

Both run on one core, one after the other. The exact methods of berkeley-abc are testnpn -A 10 and
11; its time is what it prints. Prints Markdown; exit status 1 if a program fails.
"""
import argparse
import json
import pathlib
import random
import re
import subprocess
import sys
import tempfile

EXACT = (10, 11)
TIME = re.compile(r"Classes = *(\d+) *Time = *([0-9.]+) sec")


def time_ours(executable, folder):
    result = folder / "luts.json"
    subprocess.run(
        [executable, "--benchmark_filter=npn/one_thread/ours", "--benchmark_min_time=0.5",
         f"--benchmark_out={result}", "--benchmark_out_format=json"],
        check=True, stdout=subprocess.DEVNULL)
    cases = json.loads(result.read_text(encoding="utf-8"))["benchmarks"]
    median = [case for case in cases if case.get("aggregate_name") == "median"][0]
    return 1 / median["per_table"]


def time_theirs(algorithm, count, folder):
    path = folder / "tables.txt"
    draw = random.Random(1)
    path.write_text("".join(f"{draw.getrandbits(64):016x}\n" for _ in range(count)),
                    encoding="ascii")
    done = subprocess.run(["berkeley-abc", "-c", f"testnpn -A {algorithm} {path}"], check=True,
                          capture_output=True, text=True)
    match = TIME.search(done.stdout)
    if not match:
        sys.exit(f"berkeley-abc: {done.stdout[-200:]}")
    return count / float(match[2])


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("bench_luts")
    parser.add_argument("--count", type=int, default=100000)
    arguments = parser.parse_args()
    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)
        print("| exact forms of random six-input functions, one core | a second |")
        print("|---|---|")
        print(f"| ours | {time_ours(arguments.bench_luts, folder):,.0f} |")
        for algorithm in EXACT:
            print(f"| berkeley-abc, testnpn -A {algorithm} "
                  f"| {time_theirs(algorithm, arguments.count, folder):,.0f} |")


main()
