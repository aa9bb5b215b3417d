"""Equations by the thousand: booleq.equations and from_inits, against equations made one by one."""
import gc
import random
import threading
from typing import Any, Callable, List

import booleq
import numpy as np
import pytest
from booleq import Equation, LutArray, ParseError
from test_memory import resident_bytes

NAMES = ["a", "b", "c", "d", "e", "f", "g"]


def random_texts(number: int, seed: int) -> List[str]:
    generator = random.Random(seed)
    return [" ".join(f"{generator.choice(['', '~'])}{generator.choice(NAMES)} "
                     f"{generator.choice(['&', '|', '^', '~&', '.NOR.'])}"
                     for _ in range(generator.randrange(6))) + " x" for _ in range(number)]


@pytest.mark.parametrize("inputs", [None, NAMES[::-1]])
def test_they_are_what_each_is_alone(inputs: Any) -> None:
    texts = random_texts(5000, 1) + ["a" * 3000 + " & '\u00e9'", "x & 1", "A  &  B", "A&B"]
    for eq, text in zip(booleq.equations(iter(texts), inputs), texts):
        alone = Equation(text, inputs)
        assert (eq.text, eq.inputs, eq.given_inputs) == (text, alone.inputs, alone.given_inputs)
        assert eq == alone and hash(eq) == hash(alone) and eq.hex_init() == alone.hex_init()


def test_equal_texts_are_one_object() -> None:
    texts = [f"a & b{k % 100}" for k in range(10_000)]
    equations = booleq.equations(texts)
    assert len({id(eq) for eq in equations}) <= 100 * 8  # threads may read one at the same time
    assert all(eq.text == text for eq, text in zip(equations, texts))
    assert len({id(eq) for eq in booleq.equations(texts[:2000])}) == 100
    inits = Equation.from_inits(np.arange(1000) % 16, ["a", "b"])
    assert len({id(eq) for eq in inits}) == 16


def test_texts_are_read_without_the_inputs_of_others() -> None:
    """Over the inputs of the text before it, this text would be an init value."""
    with pytest.raises(ParseError) as caught:
        booleq.equations(["A & B", "0x8"])
    with pytest.raises(ParseError) as alone:
        Equation("0x8")
    assert str(caught.value) == str(alone.value)
    assert caught.value.__notes__ == ["it is texts[1]"]


@pytest.mark.parametrize("size", [3, 100, 10_000])
def test_the_first_that_is_refused(size: int) -> None:
    texts = ["a & b"] * size + ["a &&"] * size + ["c"] * size
    with pytest.raises(ParseError) as caught:
        booleq.equations(texts)
    assert caught.value.__notes__ == [f"it is texts[{size}]"]


def test_what_texts_may_be() -> None:
    assert booleq.equations(np.array(["a", "b & c"])) == [Equation("a"), Equation("b & c")]
    assert booleq.equations(()) == [] and booleq.equations({"a": 1}) == [Equation("a")]
    for wrong in ("a & b", 3, None, [b"a"], ["a", None], [Equation("a")]):
        with pytest.raises(TypeError):
            booleq.equations(wrong)  # type: ignore[arg-type]
    with pytest.raises(ParseError):
        booleq.equations(["a\0b"])
    with pytest.raises(UnicodeEncodeError):
        booleq.equations(["\ud800"])


def test_a_list_that_changes_meanwhile() -> None:
    """The texts at the time of the call are read, whatever another thread does to the list."""
    texts = [f"a{k} & b" for k in range(50_000)]
    expected = list(texts)
    done = threading.Event()

    def change() -> None:
        while not done.is_set():
            texts[:] = ["z" * 50] * 50_000
            texts[:] = expected

    thread = threading.Thread(target=change)
    thread.start()
    try:
        for _ in range(5):
            read = {eq.text for eq in booleq.equations(texts)}
            assert read <= set(expected) | {"z" * 50}
    finally:
        done.set()
        thread.join()


@pytest.mark.parametrize("num_inputs", range(1, 8))
def test_init_values(num_inputs: int) -> None:
    generator = random.Random(num_inputs)
    values = [generator.getrandbits(1 << num_inputs) for _ in range(300)]
    names = NAMES[:num_inputs]
    for eq, value in zip(Equation.from_inits(values, names), values):
        alone = Equation.from_init(value, names)
        assert eq == alone and eq.hex_init() == alone.hex_init() and eq.inputs == alone.inputs


def test_init_values_of_more_inputs_than_arrays_have() -> None:
    names = [f"x{k}" for k in range(9)]
    made = Equation.from_inits([5, "0x" + "1" * 128, 2 ** 512 - 1], names)
    assert [eq.count_ones() for eq in made] == [2, 128, 512]
    assert made[0] == Equation.from_init(5, names)


def test_init_values_over_names_that_are_not_one_token() -> None:
    """Such a name is read as an expression, so each value is one, too."""
    names = ["'a'+b", "c"]
    for eq, value in zip(LutArray([1, 6, 9], 2).equations(names), (1, 6, 9)):
        assert eq.hex_init() == Equation.from_init(value, names).hex_init()
        assert eq.inputs == Equation.from_init(value, names).inputs


def bytes_each(make: Callable[[], List[Equation]]) -> float:
    make()  # so that the names exist already
    gc.collect()
    before = resident_bytes()
    made = make()
    return (resident_bytes() - before) / len(made)


def test_they_hold_texts_and_no_trees() -> None:
    """A hundred thousand trees would fill a hundred megabytes."""
    texts = [f"(a{k % 60} & ~b{k // 60 % 60} | c{k // 3600}) ^ (d | e{k % 50})"
             for k in range(100_000)]
    values = np.arange(1, 100_001, dtype=np.uint64) << np.uint64(40)
    assert bytes_each(lambda: booleq.equations(texts)) < 250
    assert bytes_each(lambda: Equation.from_inits(values, NAMES[:6])) < 400


def test_the_garbage_collector_leaves_them_alone() -> None:
    assert not gc.is_tracked(Equation("a & b"))
    assert not any(gc.is_tracked(eq) for eq in booleq.equations(["a", "b"]))
