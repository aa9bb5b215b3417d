"""Fixtures that the tests share."""
import concurrent.futures
import random
import time
from typing import Callable, Iterator

import pytest


@pytest.fixture
def nothing_printed(capfd: pytest.CaptureFixture[str]) -> Iterator[None]:
    """Neither the library nor the module writes anything."""
    yield
    assert capfd.readouterr() == ("", "")


@pytest.fixture
def parity_of_products() -> Callable[[int, int], str]:
    """A text over so many inputs with so many products: no part of it is ever constant."""
    generator = random.Random(1)

    def product(num_inputs: int) -> str:
        chosen = generator.sample(range(num_inputs), 8)
        return "(" + " & ".join(generator.choice(["", "~"]) + f"x{k}" for k in chosen) + ")"

    return lambda num_inputs, count: " ^ ".join(product(num_inputs) for _ in range(count))


@pytest.fixture
def longest_pause() -> Callable[[Callable[[], object]], float]:
    """The longest time in seconds that this thread was blocked while another one did the work."""

    def measure(work: Callable[[], object]) -> float:
        with concurrent.futures.ThreadPoolExecutor(1) as other:
            done = other.submit(work)
            longest, last = 0.0, time.monotonic()
            while not done.done():
                now = time.monotonic()
                longest, last = max(longest, now - last), now
                time.sleep(0.001)
            done.result()
            return longest

    return measure
