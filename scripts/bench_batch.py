#!/usr/bin/env python3
"""Times 'booleq batch' over tables of random functions of 4 to 6 inputs, by one thread and by two.

usage: bench_batch.py TOOL [--rows N] [--kinds KIND,...] [--tries N]

Kinds of rows: 'equations' lack the init value, 'both' have both to compare, 'values' lack the
equation, 'chains' without groups, with each input once, lack the init value. Each table has N rows
(1,000,000) and a fixed seed. The fastest of several tries (3) counts, by wall-clock time. The
output goes through a pipe, and must be the same for all numbers of threads. Prints a Markdown
table.
"""
import argparse
import hashlib
import os
import pathlib
import random
import subprocess
import sys
import tempfile
import time

KINDS = ["equations", "both", "values", "chains"]
OPERATORS = ["&", "|", "^", "~&", "~|"]
NAMES = ["sel", "a", "b", "en", "d0", "d1"]


def random_equation(rng, names):
    """Each input once, some twice, in groups, as in a netlist's cells; with its value."""
    count = len(names)
    columns = {}
    for place, name in enumerate(names):
        weight = count - 1 - place
        columns[name] = sum(1 << row for row in range(1 << count) if row >> weight & 1)
    full = (1 << (1 << count)) - 1
    terms = [(name, columns[name]) for name in names]
    terms += [(name, columns[name]) for name in rng.sample(names, rng.randrange(3))]
    rng.shuffle(terms)
    while len(terms) > 1:
        (left, x), (right, y) = terms.pop(), terms.pop(rng.randrange(len(terms)))
        operator = rng.choice(OPERATORS)
        if rng.random() < 0.2:
            right, y = f"~{right}", ~y & full
        if operator == "^":
            value = x ^ y
        else:
            value = x & y if "&" in operator else x | y
        if operator.startswith("~"):
            value = ~value & full
        terms.append((f"({left} {operator} {right})", value))
    return terms[0][0][1:-1], terms[0][1]


def random_chain(rng, names):
    """'a & ~b | c', grouped from the left; the tool computes its value."""
    return " {} ".join(("~" if rng.random() < 0.2 else "") + name for name in names) \
        .format(*(rng.choice(OPERATORS[:3]) for _ in names[1:]))


def write_table(path, kind, rows):
    rng = random.Random(1)
    with open(path, "w", encoding="ascii") as file:
        file.write("name,inputs,equation,init\n")
        for number in range(rows):
            count = rng.randrange(4, 7)
            names = NAMES[:count]
            equation, value = (random_chain(rng, names), 0) if kind == "chains" else \
                random_equation(rng, names)
            digits = f"0x{value:0{(1 << count) // 4}x}"
            file.write(f'c{number},"{",".join(names)}",{"" if kind == "values" else equation},'
                       f'{digits if kind in ("both", "values") else ""}\n')


def run(tool, path, jobs):
    """Seconds, and a digest of all output."""
    digest = hashlib.sha256()
    start = time.perf_counter()
    with subprocess.Popen([tool, "batch", "--jobs", str(jobs), path], stdout=subprocess.PIPE,
                          stderr=subprocess.PIPE) as process:
        while piece := os.read(process.stdout.fileno(), 1 << 20):
            digest.update(piece)
        said = process.stderr.read().decode()
    seconds = time.perf_counter() - start
    if process.returncode != 0:
        sys.exit(f"bench_batch: status {process.returncode}: {said[-200:]}")
    return seconds, digest.hexdigest()


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("tool")
    parser.add_argument("--rows", type=int, default=1000000)
    parser.add_argument("--kinds", default=",".join(KINDS))
    parser.add_argument("--tries", type=int, default=3)
    parser.add_argument("--folder", type=pathlib.Path, help="keeps the tables there")
    options = parser.parse_args()
    with tempfile.TemporaryDirectory() as name:
        folder = options.folder or pathlib.Path(name)
        print(f"| {options.rows} rows | one thread | two threads |")
        print("|---|---|---|")
        for kind in options.kinds.split(","):
            path = folder / f"{kind}.csv"
            if not path.exists():
                write_table(path, kind, options.rows)
            digests, figures = set(), []
            for jobs in (1, 2):
                times = []
                for _ in range(options.tries):
                    seconds, digest = run(options.tool, path, jobs)
                    times.append(seconds)
                    digests.add(digest)
                figures.append(min(times))
            if len(digests) != 1:
                sys.exit(f"bench_batch: {kind}: the threads change what is written")
            print(f"| {kind} | {figures[0]:.2f} s | {figures[1]:.2f} s |", flush=True)


if __name__ == "__main__":
    main()
