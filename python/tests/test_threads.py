"""Threads that work side by side, processes, interpreters, and calls ended by an interrupt."""
import multiprocessing
import os
import signal
import subprocess
import sys
import threading
import time
from typing import Any, Callable, List

import booleq
import numpy as np
import pytest
from booleq import Equation, LutArray

SECONDS_AFTER = 0.5  # for a busy machine; usually it is a few hundredths
HARD = "".join(f"(x{k} & x{(k * 7 + 3) % 20} | x{(k * 5 + 1) % 20}) ^ " for k in range(20)) + "x0"


def test_the_lock_is_given_up(longest_pause: Callable[[Callable[[], object]], float]) -> None:
    """While a column is made, this thread keeps running."""
    equation = Equation(" ^ ".join(f"(x{k} & x{(k * 11 + 5) % 29} & x{(k * 3 + 1) % 29})"
                                   for k in range(29)))

    def work() -> None:
        equation.packed_column()
        equation.binary_init()

    assert longest_pause(work) < 0.5


def test_answers_of_threads_are_those_of_one() -> None:
    equations = [Equation(HARD.replace("x0", f"x{k}")) for k in range(1, 9)]
    rows = np.random.default_rng(1).integers(0, 2, (70_000, 20), dtype=np.uint8)

    def answers(equation: Equation) -> List[Any]:
        columns = rows[:, :len(equation.inputs)]
        return [equation.packed_column().tobytes(), equation.hex_init(), hash(equation),
                equation.eval_many(columns).tobytes(), equation.support, str(~equation),
                equation.satisfiable(), LutArray([7, 9], 4).canonical().forms]

    expected = [answers(Equation(equation.text)) for equation in equations]
    faults: List[str] = []

    def work(first: int) -> None:
        for step in range(len(equations)):
            place = (first + step) % len(equations)
            if answers(equations[place]) != expected[place]:
                faults.append(equations[place].text)
            with pytest.raises(ValueError):
                Equation("a && b")

    threads = [threading.Thread(target=work, args=(first,)) for first in range(4)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert faults == []


def hexadecimal(equation: Equation) -> str:
    return equation.hex_init()


@pytest.mark.parametrize("method", ["fork", "spawn"])
def test_processes(method: str) -> None:
    equations = [Equation("A & ~B"), Equation("0xca", ["S", "A", "B"])]
    booleq.equations(["a & b"] * 5000)  # starts threads that a forked child does not have
    with multiprocessing.get_context(method).Pool(2) as pool:
        assert pool.map(hexadecimal, equations) == ["0x4", "0xca"]
        assert pool.map(len, [booleq.equations(["a"] * 5000)]) == [5000]


@pytest.mark.parametrize("first", ["", "import booleq"])
def test_a_subinterpreter_is_refused(first: str) -> None:
    script = f"""
import _xxsubinterpreters as interpreters
{first}
one = interpreters.create()
try:
    interpreters.run_string(one, "import booleq._booleq")
except interpreters.RunFailedError as error:
    print(error)
"""
    done = subprocess.run([sys.executable, "-c", script], stdout=subprocess.PIPE, text=True,
                          timeout=60, check=False)
    assert "booleq works in the main interpreter only" in done.stdout


def ended(call: Callable[[], Any], before: float) -> float:
    """How long the call takes to end after a SIGINT from another thread."""
    sent: List[float] = []

    def send() -> None:
        time.sleep(before)
        sent.append(time.monotonic())
        os.kill(os.getpid(), signal.SIGINT)

    thread = threading.Thread(target=send)
    thread.start()
    with pytest.raises(KeyboardInterrupt):
        call()
        time.sleep(60)  # if the call has ended by itself, the signal comes here
    after = time.monotonic() - sent[0]
    thread.join()
    return after


def test_interrupts_end_what_cannot_be_ended_inside() -> None:
    """Reading, writing and refusing millions of characters goes on to the end on another thread."""
    text = " & ".join(f"x{k % 1000}" for k in range(3_000_000))
    assert ended(lambda: Equation(text), 0.1) < SECONDS_AFTER
    assert ended(lambda: Equation(text + " &&"), 0.1) < SECONDS_AFTER


@pytest.mark.parametrize("question", ["lint", "satisfiable", "convert", "__str__"])
def test_interrupts_of_questions_about_long_texts(question: str) -> None:
    equation = Equation(" ".join(f"x{k % 1000} {'&|^'[k % 3]}" for k in range(400_000)) + " y")
    ask: Any = getattr(equation, question)
    assert ended((lambda: ask("verilog")) if question == "convert" else ask, 0.1) < SECONDS_AFTER


def test_interrupts_of_init_values() -> None:
    equation = Equation("&".join(f"x{k}" for k in range(30)))
    assert ended(equation.binary_init, 0.3) < SECONDS_AFTER


def test_interrupts_of_arrays() -> None:
    luts = LutArray(np.random.default_rng(1).integers(0, 2 ** 63, 3_000_000, dtype=np.uint64), 6)
    assert ended(luts.canonical, 0.2) < SECONDS_AFTER


def test_the_interpreter_waits_for_what_goes_on_beside() -> None:
    script = """
import os, signal, threading
from booleq import Equation
text = " & ".join(f"x{k % 1000}" for k in range(2_000_000))
threading.Timer(0.05, os.kill, (os.getpid(), signal.SIGINT)).start()
try:
    while True:
        Equation(text)
except KeyboardInterrupt:
    print("ended")
"""
    done = subprocess.run([sys.executable, "-c", script], stdout=subprocess.PIPE, text=True,
                          timeout=120, check=False)
    assert (done.stdout, done.returncode) == ("ended\n", 0)
