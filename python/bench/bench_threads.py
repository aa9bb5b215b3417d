#!/usr/bin/env python3
"""How much more work two threads do than one, for calls that release the interpreter's lock.

usage: ./dev python python/bench/bench_threads.py [SECONDS]

Each kind of call is repeated in one thread for SECONDS (1), then in two; the best of three rounds
counts. Calls that use all processors by themselves, such as eval_many, are left out. Prints the
table that docs/python.md shows.
"""
import random
import sys
import threading
import time
from typing import Any, Callable, Dict

import numpy as np
from booleq import Equation

NUM_ROUNDS = 3


def products(num_inputs: int, count: int) -> str:
    generator = random.Random(count)
    return " ^ ".join("(" + " & ".join(f"x{k}" for k in generator.sample(range(num_inputs), 6)) + ")"
                      for _ in range(count))


def calls() -> Dict[str, Callable[[], Any]]:
    """The calls of all threads share their equations; separate objects would do as well."""
    long_text = " & ".join(f"x{k % 1000}" for k in range(20_000))
    wide, many = Equation(products(20, 200)), Equation(products(40, 300))
    init = Equation.from_init(int.from_bytes(np.random.default_rng(1).bytes(8), "little"),
                              [f"x{k}" for k in range(6)])
    large = Equation.from_init(int.from_bytes(np.random.default_rng(1).bytes(128), "little"),
                               [f"x{k}" for k in range(10)])
    return {
        "`Equation(text)`, 40,000 tokens": lambda: Equation(long_text),
        "`hex_init()`, 20 inputs": wide.hex_init,
        "`satisfiable()`, 40 inputs": many.satisfiable,
        "`lint()`": many.lint,
        '`convert("verilog")`': lambda: many.convert("verilog"),
        "`explain()`, 6 inputs": init.explain,
        "`minimize()`, 10 inputs": large.minimize,
    }


def rate(call: Callable[[], Any], num_threads: int, seconds: float) -> float:
    """Calls per second, of all threads together."""
    begun = threading.Barrier(num_threads + 1)
    numbers = [0] * num_threads
    ends = [0.0] * num_threads

    def work(place: int) -> None:
        begun.wait()
        end = time.perf_counter() + seconds
        while time.perf_counter() < end:
            call()
            numbers[place] += 1
        ends[place] = time.perf_counter()

    threads = [threading.Thread(target=work, args=(place,)) for place in range(num_threads)]
    for thread in threads:
        thread.start()
    begun.wait()
    start = time.perf_counter()
    for thread in threads:
        thread.join()
    return sum(number / (end - start) for number, end in zip(numbers, ends))


def main() -> None:
    seconds = float(sys.argv[1]) if len(sys.argv) > 1 else 1.0
    print("| call | one thread | two threads | times |\n|---|---|---|---|")
    for what, call in calls().items():
        call()
        rates = [max(rate(call, number, seconds) for _ in range(NUM_ROUNDS)) for number in (1, 2)]
        print(f"| {what} | {rates[0]:,.0f} / s | {rates[1]:,.0f} / s | {rates[1] / rates[0]:.2f} |",
              flush=True)


if __name__ == "__main__":
    main()
