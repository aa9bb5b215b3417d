#!/usr/bin/env python3
"""Checks decisions about random pairs of expressions against four other programs.

usage: check_decide.py DECIDE_PAIRS [COUNT [FIRST]]

DECIDE_PAIRS is the program of tests/decide. For each of COUNT pairs (10000) of 20 to 300 inputs,
its verdict must agree with minisat, picosat and cryptominisat on the clauses that it writes, and
with "cec" of berkeley-abc on both sides as BLIF. Half of the pairs are rewritten and must be equal.
Prints the counts and the times of our decisions; exit status 1 if anything disagrees.
"""
import collections
import concurrent.futures
import os
import pathlib
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


def verdicts_of_abc(folder, numbers):
    """The verdicts on all pairs by one process, because starting takes longer than answering."""
    script = folder / "script"
    script.write_text("".join(f"cec {folder}/{number}a.blif {folder}/{number}b.blif\n"
                              for number in numbers))
    done = subprocess.run(["berkeley-abc", "-f", script], capture_output=True, text=True,
                          timeout=TIMEOUT)
    said = [line for line in done.stdout.splitlines() if line.startswith("Networks are ")]
    if len(said) != len(numbers): # one failed, but it is not known which
        if len(numbers) == 1:
            return ["no answer"]
        return [verdicts_of_abc(folder, [number])[0] for number in numbers]
    words = {"Networks are equivalent": "equal", "Networks are NOT EQUIVALENT": "different"}
    return [next((word for text, word in words.items() if line.startswith(text)), "no answer")
            for line in said]


def cross_check(folder, line, abc):
    """What disagrees about the pair of a line, and the line's fields."""
    number, verdict, proof, kind, microseconds = line.split()
    found = []
    if kind == "rewritten" and verdict != "equal":
        found.append("it was rewritten")
    for name, command in SOLVERS.items():
        if verdict_of_solver(command, folder / f"{number}.cnf") != verdict:
            found.append(name)
    if abc != verdict:
        found.append("berkeley-abc")
    for path in folder.glob(f"{number}[.ab]*"):
        path.unlink()
    return number, verdict, proof, int(microseconds), found


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
            concurrent.futures.ThreadPoolExecutor(len(os.sched_getaffinity(0))) as pool:
        folder = pathlib.Path(name)
        for begin in range(first, first + count, BATCH):
            lines = run_pairs(program, folder, begin, min(begin + BATCH, first + count) - 1)
            abc = pool.submit(verdicts_of_abc, folder, [line.split()[0] for line in lines])
            for number, verdict, proof, microseconds, found in pool.map(
                    lambda line, of_abc: cross_check(folder, line, of_abc), lines, abc.result()):
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
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
