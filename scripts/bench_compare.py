#!/usr/bin/env python3
"""Compares two builds by running the benchmark executables of both alternately.

usage: bench_compare.py OLD NEW [--rounds N] [--filter REGEX] [NAME...]

OLD and NEW are build directories that contain a bench folder. NAME is bench_set and the like;
without a NAME, all executables that both have are run. A case counts as changed only if the slowest
run of one build is faster than the fastest run of the other. Times are processor time. This script
exists because the compare.py of libbenchmark-tools runs all rounds of one executable and then all
of the other, so that a machine that grows warm or busy looks like a change.
Exit status: 1 if something became slower.
"""
import argparse
import json
import pathlib
import statistics
import subprocess
import sys
import tempfile

NANOSECONDS = {"ns": 1, "us": 1e3, "ms": 1e6, "s": 1e9}


def list_executables(build):
    return {path.name for path in (pathlib.Path(build) / "bench").glob("bench_*")
            if path.is_file() and path.stat().st_mode & 0o111}


def run_once(build, name, arguments, times):
    with tempfile.NamedTemporaryFile(suffix=".json") as output:
        command = [str(pathlib.Path(build).resolve() / "bench" / name),
                   f"--benchmark_filter={arguments.filter}", "--benchmark_repetitions=1",
                   f"--benchmark_min_time={arguments.min_time}",
                   f"--benchmark_out={output.name}", "--benchmark_out_format=json"]
        done = subprocess.run(command, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE, text=True,
                              check=False)
        if done.returncode != 0:
            sys.exit(f"{command[0]} failed\n{done.stderr}")
        text = pathlib.Path(output.name).read_text()
    for entry in json.loads(text)["benchmarks"] if text else []:
        if entry.get("run_type") == "iteration" and entry["run_name"].endswith("/ours"):
            times.setdefault(entry["run_name"], []).append(
                entry["cpu_time"] * NANOSECONDS[entry["time_unit"]])


def format_range(times):
    return f"{statistics.median(times):,.0f} ns ({min(times):,.0f} to {max(times):,.0f})"


def report(name, old, new):
    """Prints a change; returns 1 for slower, -1 for faster, 0 if the ranges overlap."""
    if max(new) < min(old):
        change = -1
    elif min(new) > max(old):
        change = 1
    else:
        return 0
    ratio = statistics.median(new) / statistics.median(old)
    print(f"{'slower' if change > 0 else 'faster'}  {ratio:6.2f}  {name}: "
          f"{format_range(old)} -> {format_range(new)}")
    return change


def main():
    parser = argparse.ArgumentParser(description="compare the benchmarks of two builds")
    parser.add_argument("old")
    parser.add_argument("new")
    parser.add_argument("names", nargs="*", metavar="NAME")
    parser.add_argument("--rounds", type=int, default=7)
    parser.add_argument("--filter", default="/ours$")
    parser.add_argument("--min-time", default="0.05")
    arguments = parser.parse_intermixed_args()

    names = arguments.names or sorted(list_executables(arguments.old) &
                                      list_executables(arguments.new))
    if not names:
        sys.exit("bench_compare.py: the two builds have no executable in common")
    old, new = {}, {}
    for name in names:
        for _ in range(arguments.rounds):
            run_once(arguments.old, name, arguments, old)
            run_once(arguments.new, name, arguments, new)
    common = [name for name in old if name in new]
    changes = [report(name, old[name], new[name]) for name in common]
    print(f"{len(common)} cases, {changes.count(-1)} faster, {changes.count(1)} slower, "
          f"{changes.count(0)} without a difference beyond the spread of {arguments.rounds} runs")
    return 1 if 1 in changes else 0


if __name__ == "__main__":
    sys.exit(main())
