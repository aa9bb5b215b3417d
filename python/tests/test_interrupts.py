"""An interrupt ends long calls, and what they worked on stays usable."""
import signal
import subprocess
import sys
import time
from types import FrameType
from typing import Any, Callable, Mapping, Optional

import numpy as np
import pytest

from booleq import Equation, LutArray

SECONDS_BEFORE = 0.2
SECONDS_AFTER = 0.5  # for a loaded machine; usually it is a few hundredths

Products = Callable[[int, int], str]


def interrupted(call: Callable[[], Any], before: float = SECONDS_BEFORE) -> None:
    """Sends a real SIGINT into 'call', which would take far longer."""
    sent = 0.0

    def send(number: int, frame: Optional[FrameType]) -> None:
        nonlocal sent
        sent = time.monotonic()
        signal.raise_signal(signal.SIGINT)

    old = signal.signal(signal.SIGALRM, send)
    try:
        signal.setitimer(signal.ITIMER_REAL, before)
        with pytest.raises(KeyboardInterrupt):
            call()
        assert time.monotonic() - sent < SECONDS_AFTER
    finally:
        signal.setitimer(signal.ITIMER_REAL, 0)
        signal.signal(signal.SIGALRM, old)


def check_usable(equation: Equation) -> None:
    ones = {name: 1 for name in equation.inputs}
    rows = np.ones((3, len(equation.inputs)), dtype=np.uint8)
    assert equation(ones) == equation.eval_many(rows)[0]


@pytest.mark.parametrize("num_inputs", [28, 30])
def test_columns(parity_of_products: Products, num_inputs: int) -> None:
    equation = Equation(parity_of_products(num_inputs, 20000))
    interrupted(equation.packed_column)
    interrupted(equation.column)
    interrupted(lambda: equation.hex_init())
    interrupted(lambda: equation.binary_init())
    check_usable(equation)


def test_truth_table(parity_of_products: Products) -> None:
    equation = Equation(parity_of_products(24, 20000))
    interrupted(equation.truth_table)
    check_usable(equation)


def test_eval_many(parity_of_products: Products) -> None:
    equation = Equation(parity_of_products(31, 20000))
    rows = np.ones((1_000_000, 31), dtype=np.uint8)
    interrupted(lambda: equation.eval_many(rows))
    check_usable(equation)


def test_eval_many_by_the_column(parity_of_products: Products) -> None:
    equation = Equation(parity_of_products(22, 20000))
    rows = np.ones((2 ** 22, 22), dtype=np.uint8)
    interrupted(lambda: equation.eval_many(rows))
    check_usable(equation)


def test_equivalent() -> None:
    # Thirteen pigeons do not fit into twelve holes, one in each: solvers take hours to prove it.
    pigeons, holes = range(13), range(12)
    everyone = " & ".join("(" + " | ".join(f"p{p}_{h}" for h in holes) + ")" for p in pigeons)
    alone = " & ".join(f"~(p{p}_{h} & p{q}_{h})" for h in holes for p in pigeons for q in range(p))
    first = Equation(f"{everyone} & {alone}")
    second = Equation("p0_0 & ~p0_0")
    interrupted(lambda: second.equivalent(first))
    check_usable(first)
    assert second.equivalent(Equation("p0_0 & 0"))


def test_explain() -> None:
    bits = np.random.default_rng(1).integers(0, 2, 2 ** 16)
    equation = Equation.from_init(int("".join(map(str, bits)), 2), [f"x{k}" for k in range(16)])
    interrupted(equation.explain, before=0.01)  # of about 0.2 s: no function takes longer
    check_usable(equation)
    assert Equation("A & B").explain().kind == "AND"


def test_lint(parity_of_products: Products) -> None:
    equation = Equation(parity_of_products(28, 3000))
    interrupted(equation.lint)
    check_usable(equation)
    assert Equation("A & B").lint().is_clean


def test_tree() -> None:
    equation = Equation(2_000_000 * "~" + "A")
    interrupted(lambda: [equation.tree() for _ in range(10)])
    check_usable(equation)


def test_an_interrupt_from_outside() -> None:
    """As from a terminal: another process sends the signal."""
    script = """
import random, sys
from booleq import Equation, LutArray
generator = random.Random(1)
terms = ["(" + " & ".join(f"x{k}" for k in generator.sample(range(30), 8)) + ")"
         for _ in range(20000)]
equation = Equation(" ^ ".join(terms))
print("ready", flush=True)
try:
    equation.packed_column()
except KeyboardInterrupt:
    print(equation({name: 1 for name in equation.inputs}))
"""
    with subprocess.Popen([sys.executable, "-c", script], stdout=subprocess.PIPE,
                          text=True) as process:
        assert process.stdout is not None
        assert process.stdout.readline() == "ready\n"
        time.sleep(SECONDS_BEFORE)
        process.send_signal(signal.SIGINT)
        sent = time.monotonic()
        assert process.stdout.read() == "0\n"
        assert time.monotonic() - sent < SECONDS_AFTER
        assert process.wait(10) == 0


def test_a_handler_that_does_not_raise_and_uses_the_equation(parity_of_products: Products) -> None:
    equation = Equation(parity_of_products(22, 300))
    expected = equation.packed_column()
    seen = []

    def use(number: int, frame: Optional[FrameType]) -> None:
        seen.append((equation(dict.fromkeys(equation.inputs, 0)), Equation("A & B").hex_init()))

    old = signal.signal(signal.SIGALRM, use)
    try:
        signal.setitimer(signal.ITIMER_REAL, 0.001, 0.001)
        columns = [equation.packed_column() for _ in range(20)]
    finally:
        signal.setitimer(signal.ITIMER_REAL, 0)
        signal.signal(signal.SIGALRM, old)
    assert seen and all(hexadecimal == "0x8" for _, hexadecimal in seen)
    assert all(np.array_equal(column, expected) for column in columns)


WIDE = [f"x{k}" for k in range(30)]
INIT = Equation.from_init(int.from_bytes(np.random.default_rng(1).bytes(2 ** 13), "little"),
                          WIDE[:16])
WORDS = np.random.default_rng(1).integers(0, 2 ** 63, 1_000_000, dtype=np.uint64)
SORTED = [Equation(f"a{k * 7 % 999} & b{k % 98}") for k in range(20_000)]
LONG_STEPS: Mapping[str, Callable[[], object]] = {
    "support": lambda: Equation("&".join(WIDE)).support,
    "join": lambda: INIT & "x0",
    "compose": lambda: INIT.compose(x0="x1 & y"),
    "convert": lambda: INIT.convert("verilog"),
    "unique": LutArray(WORDS, 6).unique,
    "canonical": LutArray(WORDS, 6).canonical,
    "sorting": lambda: sorted(SORTED),
    "from_inits": lambda: Equation.from_inits(WORDS, WIDE[:6]),
}


@pytest.mark.parametrize("name", LONG_STEPS)
def test_checks_are_not_far_apart(name: str) -> None:
    """Between two checks this thread never works so long that a user would notice."""
    longest = last = 0.0

    def check(number: int, frame: Optional[FrameType]) -> None:
        nonlocal longest, last
        now = time.thread_time()  # processor time, so that a busy machine does not matter
        longest, last = max(longest, now - last), now

    old = signal.signal(signal.SIGALRM, check)
    try:
        last = time.thread_time()
        signal.setitimer(signal.ITIMER_REAL, 0.002, 0.002)
        LONG_STEPS[name]()
        check(0, None)
    finally:
        signal.setitimer(signal.ITIMER_REAL, 0)
        signal.signal(signal.SIGALRM, old)
    assert longest < 0.1
