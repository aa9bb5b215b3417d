#!/usr/bin/env python3
"""Times decisions against those of berkeley-abc's "cec", on the same pairs in the same run.

usage: bench_decide.py TOOL DECIDE_PAIRS [COUNT [FIRST]]

TOOL is booleq; DECIDE_PAIRS is the program of tests/decide, which writes COUNT random pairs (100)
as texts and as BLIF. Both programs decide each pair in turn, three times, and the fastest time
counts: once as whole processes that read the pair, once without their start. Without the start,
ours is what DECIDE_PAIRS measures, cec a process that reads and decides the pair five more times.
Then reorderings of 2,000 operands are decided. Exit status 1 if the answers differ, if our median
is longer, or if a reordering takes 50 ms.
"""
import pathlib
import random
import statistics
import subprocess
import sys
import tempfile
import time

TRIES = 3
REPEATED = 5
NUM_OPERANDS = 2000
MAX_REORDERING = 0.05
STATUSES = {0: "equal", 1: "different"}


def timed(command):
    """Seconds of the fastest of several tries, and how the last one ended."""
    seconds = []
    for _ in range(TRIES):
        start = time.perf_counter()
        done = subprocess.run(command, stdin=subprocess.DEVNULL, capture_output=True, check=False)
        seconds.append(time.perf_counter() - start)
    return min(seconds), done


def answer_of_cec(done):
    said = [line for line in done.stdout.splitlines() if line.startswith(b"Networks are ")]
    if not said:
        return "no answer"
    return "equal" if said[-1].startswith(b"Networks are equivalent") else "different"


def abc(commands):
    return timed(["berkeley-abc", "-c", commands])


def time_pair(tool, folder, number, decided):
    """Seconds: ours as a process, cec as a process, ours alone, cec alone; and the answers."""
    texts = [(folder / f"{number}{side}.txt").read_text() for side in "ab"]
    ours, done = timed([tool, "equal", "--", *texts])
    command = f"cec {folder}/{number}a.blif {folder}/{number}b.blif; "
    theirs, said = abc(command)
    again, _ = abc(command * (1 + REPEATED))
    answers = {STATUSES.get(done.returncode, "no answer"), answer_of_cec(said)}
    return (ours, theirs, decided, (again - theirs) / REPEATED), answers


def time_reorderings(tool):
    """Operators, and the seconds for a whole process that finds both sides equal."""
    rng = random.Random(1)
    names = [f"v{number}" for number in range(NUM_OPERANDS)]
    for operator in "&|^":
        other = rng.sample(names, len(names))
        seconds, done = timed([tool, "equal", f" {operator} ".join(names),
                               f" {operator} ".join(other)])
        yield operator, seconds, done.returncode == 0


def main():
    if not 3 <= len(sys.argv) <= 5:
        sys.exit(__doc__)
    tool, program = (str(pathlib.Path(path).resolve()) for path in sys.argv[1:3])
    count = int(sys.argv[3]) if len(sys.argv) > 3 else 100
    first = int(sys.argv[4]) if len(sys.argv) > 4 else 0
    faults = []
    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)
        lines = subprocess.run([program, folder, str(first), str(first + count - 1)], check=True,
                               text=True, stdout=subprocess.PIPE).stdout.splitlines()
        times = []
        for line in lines:
            number, verdict, _, _, microseconds = line.split()
            seconds, answers = time_pair(tool, folder, number, int(microseconds) / 1e6)
            times.append(seconds)
            if answers != {verdict}:
                faults.append(f"pair {number}: {verdict}, and {', '.join(sorted(answers))}")
    starts = [timed([tool, "equal", "A", "A"])[0], abc("quit")[0]]
    medians = [statistics.median(column) * 1e3 for column in zip(*times)]
    longest = [max(column) * 1e3 for column in zip(*times)]
    print("| what is timed | `booleq equal` | `cec` |")
    print("|---|---|---|")
    print(f"| a process that reads and decides a pair, median of {count} | {medians[0]:.1f} ms "
          f"| {medians[1]:.1f} ms |")
    print(f"| the longest | {longest[0]:.1f} ms | {longest[1]:.1f} ms |")
    print(f"| a process that has next to nothing to do | {starts[0] * 1e3:.1f} ms "
          f"| {starts[1] * 1e3:.1f} ms |")
    print(f"| within a process, median | {medians[2]:.2f} ms (decides) "
          f"| {medians[3]:.2f} ms (reads and decides) |")
    print(f"| the longest | {longest[2]:.2f} ms | {longest[3]:.2f} ms |")
    for operator, seconds, is_equal in time_reorderings(tool):
        print(f"| {NUM_OPERANDS} operands of `{operator}` in another order | {seconds * 1e3:.1f} ms | |")
        if not is_equal or seconds >= MAX_REORDERING:
            faults.append(f"the reordering of {operator}")
    faults += [f"the median {what}" for what, place in (("as a process", 0), ("alone", 2))
               if medians[place] > medians[place + 1]]
    for fault in faults:
        print(fault, file=sys.stderr)
    return 1 if faults else 0


if __name__ == "__main__":
    sys.exit(main())
