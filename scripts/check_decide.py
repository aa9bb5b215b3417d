#!/usr/bin/env python3
"""Checks decisions about random pairs of expressions against four other programs.

usage: check_decide.py DECIDE_PAIRS [COUNT [FIRST]]

DECIDE_PAIRS is the program of tests/decide. For each of COUNT pairs (10000) of 20 to 300 inputs its
verdict must be that of minisat, picosat and cryptominisat about the clauses that it writes, and
that of "cec" of berkeley-abc about both sides as BLIF. Half of the pairs are rewritten and must be
equal. Prints the counts and the processor time of both; exit status 1 when anything disagrees.
"""
import collections
import concurrent.futures
import os
import pathlib
import resource
import statistics
import subprocess
import sys
import tempfile

BATCH = 100
TIMEOUT = 300
SOLVERS = {"minisat": ["minisat", "-verb=0"], "picosat": ["picosat", "-n"],
           "cryptominisat": ["cryptominisat5", "--verb", "0"]}
SATISFIABLE, UNSATISFIABLE = 10, 20


def verdict_of_solver(command, clauses):
    done = subprocess.run([*command, clauses], capture_output=True, timeout=TIMEOUT)
    return {SATISFIABLE: "different", UNSATISFIABLE: "equal"}.get(done.returncode, "no answer")


def verdict_of_abc(left, right):
    done = subprocess.run(["berkeley-abc", "-c", f"cec {left} {right}"], capture_output=True,
                          text=True, timeout=TIMEOUT)
    if "Networks are equivalent" in done.stdout:
        return "equal"
    return "different" if "NOT EQUIVALENT" in done.stdout else "no answer"


def cross_check(folder, line):
    """What disagrees about the pair of a line; the line's fields."""
    number, verdict, proof, kind, microseconds = line.split()
    found = []
    if kind == "rewritten" and verdict != "equal":
        found.append("it was rewritten")
    for name, command in SOLVERS.items():
        if verdict_of_solver(command, folder / f"{number}.cnf") != verdict:
            found.append(name)
    if verdict_of_abc(folder / f"{number}a.blif", folder / f"{number}b.blif") != verdict:
        found.append("berkeley-abc")
    for path in folder.glob(f"{number}[.ab]*"):
        path.unlink()
    return number, verdict, proof, int(microseconds), found


def time_of_abc(folder, numbers):
    """Processor seconds of 'cec' for each pair, and of starting the program alone."""
    def spent(command):
        before = resource.getrusage(resource.RUSAGE_CHILDREN)
        subprocess.run(["berkeley-abc", "-c", command], capture_output=True, timeout=TIMEOUT)
        after = resource.getrusage(resource.RUSAGE_CHILDREN)
        return after.ru_utime + after.ru_stime - before.ru_utime - before.ru_stime

    start = statistics.median(spent("quit") for _ in range(20))
    return [spent(f"cec {folder}/{number}a.blif {folder}/{number}b.blif")
            for number in numbers], start


def run_pairs(program, folder, first, last):
    return subprocess.run([program, folder, str(first), str(last)], check=True, text=True,
                          stdout=subprocess.PIPE).stdout.splitlines()


def main():
    if not 2 <= len(sys.argv) <= 4:
        sys.exit(__doc__)
    program = os.path.abspath(sys.argv[1])
    count = int(sys.argv[2]) if len(sys.argv) > 2 else 10000
    first = int(sys.argv[3]) if len(sys.argv) > 3 else 0
    counts = collections.Counter()
    times, failures = [], 0
    with tempfile.TemporaryDirectory() as name, \
            concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
        folder = pathlib.Path(name)
        lines = run_pairs(program, folder, first, first + min(count, BATCH) - 1)
        abc, start = time_of_abc(folder, [line.split()[0] for line in lines])
        ours = [int(line.split()[4]) / 1e6 for line in lines]
        for begin in range(first, first + count, BATCH):
            lines = run_pairs(program, folder, begin, min(begin + BATCH, first + count) - 1)
            for number, verdict, proof, microseconds, found in pool.map(
                    lambda line: cross_check(folder, line), lines):
                counts[verdict] += 1
                counts[proof] += 1
                times.append(microseconds)
                if found or verdict == "undecided":
                    failures += 1
                    print(f"pair {number}: {verdict}, against {', '.join(found) or 'nobody'}")
    print(f"{count} pairs from {first} on: {counts['equal']} equal, {counts['different']} different; "
          f"decided by structure {counts['structure']}, rows {counts['rows']}, random rows "
          f"{counts['random']}, solver {counts['solver']}; {failures} disagreements")
    print(f"median {statistics.median(times) / 1e3:.2f} ms, longest {max(times) / 1e3:.1f} ms")
    print(f"of the first {len(ours)}: median {statistics.median(ours) * 1e3:.2f} ms; berkeley-abc cec "
          f"{statistics.median(abc) * 1e3:.1f} ms of processor time, "
          f"{(statistics.median(abc) - start) * 1e3:.1f} ms without its start")
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
