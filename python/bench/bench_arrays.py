#!/usr/bin/env python3
"""Times eval_many, arrays of look-up tables and equations in bulk, next to NumPy, in one run.

usage: ./dev python python/bench/bench_arrays.py [REPEATS]

eval_many is compared with NumPy in its strongest form: the formula as Python code, without a
parser, on contiguous columns of uint8. Results are compared before they are timed. Times are the
minimum of REPEATS (5). Prints the tables that docs/python.md shows.
"""
import sys
import time
from typing import Any, Callable, List

import booleq
import numpy as np
from booleq import Equation, LutArray

NUM_ROWS = 1_000_000
NUM_LUTS = 1_000_000


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


def bench_eval_many(num_inputs: int, repeats: int) -> None:
    text = formula(num_inputs)
    names = [f"x{k}" for k in range(num_inputs)]
    equation = Equation(text, names)
    function = as_lambda(text, num_inputs)
    rows = np.random.default_rng(1).integers(0, 2, (NUM_ROWS, num_inputs), dtype=np.uint8)
    contiguous = [np.ascontiguousarray(column) for column in rows.T]
    columns = dict(zip(names, contiguous))
    by_columns = np.asfortranarray(rows)
    works: List[Callable[[], Any]] = [
        lambda: equation.eval_many(columns), lambda: equation.eval_many(by_columns),
        lambda: equation.eval_many(rows), lambda: function(*contiguous)]
    results = [work() for work in works]
    assert all(np.array_equal(results[-1], result) for result in results)
    times = [seconds(work, repeats) for work in works]
    print(f"| {num_inputs} | " + " | ".join(shown(duration) for duration in times) +
          f" | {times[-1] / times[0]:.1f} |")


def bench_luts(repeats: int) -> None:
    generator = np.random.default_rng(2)
    luts = LutArray(generator.integers(0, 2 ** 64, NUM_LUTS, dtype=np.uint64), 6)
    few = LutArray(generator.choice(luts.words[:1000], NUM_LUTS), 6)
    orders = np.argsort(generator.random((NUM_LUTS, 6)), axis=1).astype(np.uint8)
    names = list("abcdef")
    works: List[Any] = [
            ("`permute`, one order", lambda: luts.permute([3, 1, 5, 0, 2, 4])),
            ("`permute`, an order each", lambda: luts.permute(orders)),
            ("`support`", luts.support), ("`count_ones`", luts.count_ones),
            ("`unique`, all different", luts.unique),
            ("`canonical`, random tables", luts.canonical),
            ("`explain`, 1,000 distinct functions", lambda: few.explain(names)),
            ("`equations`", lambda: luts.equations(names))]
    for what, work in works:
        print(f"| {what} | {shown(seconds(work, repeats))} |")


def bench_equations(repeats: int) -> None:
    distinct = [f"(a{k % 60} & ~b{k // 60 % 60} | c{k // 3600}) ^ (d | e{k % 50})"
                for k in range(200_000)]
    repeated = [f"(a{k % 100} & ~b | c) ^ (d | e{k % 50})" for k in range(200_000)]
    generator = np.random.default_rng(3)
    inits = generator.integers(0, 2 ** 63, 200_000, dtype=np.uint64)
    names = list("abcdef")
    made = booleq.equations(distinct)
    works: List[Any] = [
        ("`booleq.equations`, a text of 14 tokens, all different",
         lambda: booleq.equations(distinct)),
        ("the same, 100 different ones", lambda: booleq.equations(repeated)),
        ("the first, and `hex_init()` of each",
         lambda: [equation.hex_init() for equation in booleq.equations(distinct)]),
        ("`hex_init()` alone", lambda: [equation.hex_init() for equation in made]),
        ("`Equation.from_inits`, six inputs, all different",
         lambda: Equation.from_inits(inits, names)),
        ("the same, 100 different ones", lambda: Equation.from_inits(inits[:100].repeat(2000), names)),
        ("`Equation`, the text of 14 tokens", lambda: [Equation(text) for text in distinct])]
    [equation.hex_init() for equation in made]
    for what, work in works:
        print(f"| {what} | {seconds(work, repeats) / len(distinct) * 1e6:.2f} us |")
    luts = [Equation.from_init(int(value), names) for value in inits[:200]]
    explain = seconds(lambda: [equation.explain() for equation in luts], repeats)
    print(f"| `explain` of a random six-input function | {explain / len(luts) * 1e3:.2f} ms |")


def main() -> None:
    repeats = int(sys.argv[1]) if len(sys.argv) > 1 else 5
    print("| inputs | columns by name | column-major | row-major | NumPy, contiguous columns | "
          "NumPy / by name |\n|---|---|---|---|---|---|")
    for num_inputs in (4, 8, 16, 40):
        bench_eval_many(num_inputs, repeats)
    print("\n| a million six-input tables | |\n|---|---|")
    bench_luts(max(1, repeats // 2))
    print("\n| one | |\n|---|---|")
    bench_equations(repeats)


if __name__ == "__main__":
    main()
