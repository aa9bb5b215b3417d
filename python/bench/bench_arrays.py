#!/usr/bin/env python3
"""What eval_many and truth_table take, beside plain Python and NumPy, in one run.

usage: ./dev python python/bench/bench_arrays.py [REPEATS]

All three compute the same and are compared before they are timed. "Python" calls a compiled lambda
for each row, "NumPy" the same lambda once, on whole columns. The lambda is the formula as Python
writes it, without a parser; the module reads its own text. Times are the least of REPEATS (5).
Prints the table that docs/python.md shows.
"""
import itertools
import sys
import time
from typing import Any, Callable, List

import numpy as np
import numpy.typing as npt

from booleq import Equation

NUM_ROWS = 1_000_000
Rows = npt.NDArray[np.uint8]


def formula(num_inputs: int) -> str:
    """A text that Python and the library read alike: every operation has parentheses."""
    text = "x0"
    for k in range(1, num_inputs):
        text = f"({text} {'&|^'[k % 3]} (x{k} {'|^&'[k % 3]} x{(k * 5 + 1) % num_inputs}))"
    return text


def as_lambda(text: str, num_inputs: int) -> Callable[..., Any]:
    names = ", ".join(f"x{k}" for k in range(num_inputs))
    made: Callable[..., Any] = eval(f"lambda {names}: {text}")
    return made


def seconds(work: Callable[[], Any], repeats: int) -> float:
    times: List[float] = []
    for _ in range(repeats):
        start = time.perf_counter()
        work()
        times.append(time.perf_counter() - start)
    return min(times)


def shown(duration: float) -> str:
    return f"{duration:.2f} s" if duration >= 1 else f"{duration * 1e3:.3g} ms"


def row(what: str, works: List[Callable[[], Any]], repeats: int) -> None:
    results = [np.asarray(work(), dtype=np.uint8) for work in works]
    assert all(np.array_equal(results[0], result) for result in results[1:]), what
    times = [seconds(work, repeats) for work in works]
    print(f"| {what} | " + " | ".join(shown(duration) for duration in times) +
          f" | {times[2] / times[0]:.1f} |")


def bench_eval_many(num_inputs: int, repeats: int) -> None:
    text = formula(num_inputs)
    equation = Equation(text, [f"x{k}" for k in range(num_inputs)])
    function = as_lambda(text, num_inputs)
    rows = np.random.default_rng(1).integers(0, 2, (NUM_ROWS, num_inputs), dtype=np.uint8)
    lists = rows.tolist()  # indexing an array row by row would take Python longer
    row(f"`eval_many`, {num_inputs} inputs, a million rows",
        [lambda: equation.eval_many(rows),
         lambda: [function(*values) for values in lists],
         lambda: function(*rows.T)], repeats)


def numpy_table(function: Callable[..., Any], num_inputs: int) -> Rows:
    numbers = np.arange(2 ** num_inputs, dtype=np.uint32)
    table = np.empty((2 ** num_inputs, num_inputs + 1), dtype=np.uint8)
    for k in range(num_inputs):
        table[:, k] = numbers >> (num_inputs - 1 - k) & 1
    table[:, -1] = function(*table.T[:-1])
    return table


def bench_truth_table(num_inputs: int, repeats: int) -> None:
    text = formula(num_inputs)
    equation = Equation(text, [f"x{k}" for k in range(num_inputs)])
    function = as_lambda(text, num_inputs)
    row(f"`truth_table`, {num_inputs} inputs, {2 ** num_inputs:,} rows",
        [lambda: equation.truth_table(),
         lambda: [(*values, function(*values))
                  for values in itertools.product((0, 1), repeat=num_inputs)],
         lambda: numpy_table(function, num_inputs)], repeats)


def main() -> None:
    repeats = int(sys.argv[1]) if len(sys.argv) > 1 else 5
    print("| what | booleq | Python | NumPy | NumPy / booleq |")
    print("|---|---|---|---|---|")
    for num_inputs in (4, 8, 16, 40):
        bench_eval_many(num_inputs, repeats)
    for num_inputs in (12, 20):
        bench_truth_table(num_inputs, repeats)


if __name__ == "__main__":
    main()
