#!/usr/bin/env python3
"""Minimises a folder of PLA files and compares with a table of another program's results.

usage: bench_minimise.py TOOL FOLDER [--exact SECONDS] [--table CSV] [--check]

CSV (FOLDER/espresso.csv by default) has the columns file, terms, seconds, fewest_terms. Prints a
Markdown table. --check: exit status 1 if a file has more terms than in the table by more than 5 %
and more than one, if the total is more, or if a known minimum is undercut, or missed where ours is
proved.
"""
import argparse
import csv
import pathlib
import re
import resource
import subprocess
import sys

VERDICT = re.compile(
    r"# (\d+) terms?, (\d+) literals?; (?:(proved)|not proved(?:: .* than (\d+) terms)?)")


def minimise(tool, path, exact):
    command = [tool, "minimize", str(path)]
    if exact:
        command += ["--exact", "--seconds", str(exact)]
    before = resource.getrusage(resource.RUSAGE_CHILDREN)
    done = subprocess.run(command, capture_output=True, text=True, check=True)
    after = resource.getrusage(resource.RUSAGE_CHILDREN)
    match = VERDICT.match(done.stdout)
    if not match:
        raise ValueError(f"{path}: {done.stdout[:100]}")
    seconds = after.ru_utime + after.ru_stime - before.ru_utime - before.ru_stime
    terms = int(match[1])
    bound = terms if match[3] else int(match[4] or min(terms, 1))
    return terms, int(match[2]), bound, bool(match[3]), seconds


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("tool")
    parser.add_argument("folder", type=pathlib.Path)
    parser.add_argument("--exact", type=float)
    parser.add_argument("--table", type=pathlib.Path)
    parser.add_argument("--check", action="store_true")
    arguments = parser.parse_args()
    with open(arguments.table or arguments.folder / "espresso.csv", encoding="ascii") as stream:
        known = list(csv.DictReader(stream))

    faults = []
    totals = [0, 0, 0.0, 0.0]
    num_proved = 0
    print("| file | terms, classical | terms | at least | literals | s, classical | s |")
    print("|---|---|---|---|---|---|---|")
    for row in known:
        name, their_terms = row["file"], int(row["terms"])
        terms, literals, bound, proved, seconds = minimise(
            arguments.tool, arguments.folder / name, arguments.exact)
        num_proved += proved
        for place, value in enumerate([their_terms, terms, float(row["seconds"]), seconds]):
            totals[place] += value
        print(f"| {name[:-4]} | {their_terms} | {terms} | {bound} | {literals} "
              f"| {row['seconds']} | {seconds:.3f} |", flush=True)
        if terms > max(their_terms * 1.05, their_terms + 1):
            faults.append(f"{name}: {terms} terms, not {their_terms}")
        fewest = row["fewest_terms"]
        if fewest and (terms < int(fewest) or bound > int(fewest)):
            faults.append(f"{name}: {terms} terms, at least {bound}, but {fewest} is the minimum")
    print(f"| all | {totals[0]} | {totals[1]} | {num_proved} proved | | {totals[2]:.3f} "
          f"| {totals[3]:.3f} |")
    if totals[1] > totals[0]:
        faults.append(f"{totals[1]} terms in total, not {totals[0]}")
    for fault in faults:
        print(fault, file=sys.stderr)
    return 1 if faults and arguments.check else 0


if __name__ == "__main__":
    sys.exit(main())
