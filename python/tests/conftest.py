"""What the tests share."""
import random
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
