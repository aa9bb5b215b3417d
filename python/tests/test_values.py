"""Values of inputs and the result for them; and that an equation never changes."""
import collections.abc
from typing import Any, Dict

import numpy as np
import pytest
from booleq import Equation


@pytest.fixture
def equation() -> Equation:
    return Equation("A & ~B | 'C[0]'")


class TestCall:
    def test_every_row(self, equation: Equation) -> None:
        for row in range(8):
            a, b, c = row >> 2, row >> 1 & 1, row & 1
            assert equation({"'C[0]'": c}, A=a, B=b) == (a & (1 - b) | c)
            assert equation({"'C[0]'": c, "A": a, "B": b}) == (a & (1 - b) | c)

    @pytest.mark.parametrize("value, result", [
        (0, 0), (1, 1), (False, 0), (True, 1), (np.uint8(1), 1), (np.int64(0), 0),
        (np.bool_(True), 1), (np.bool_(False), 0), (np.array(1), 1)])
    def test_kinds_of_values(self, value: Any, result: int) -> None:
        assert Equation("A")(A=value) == result

    @pytest.mark.parametrize("value", [2, -1, 2 ** 70, np.int8(-1), -2 ** 70])
    def test_other_numbers(self, equation: Equation, value: Any) -> None:
        with pytest.raises(ValueError, match="^the value of A must be 0 or 1, not "):
            equation({"'C[0]'": 0}, A=value, B=0)

    @pytest.mark.parametrize("value", [1.0, "1", None, [1], np.float64(1), np.array([1, 0])])
    def test_other_types(self, value: Any) -> None:
        with pytest.raises(TypeError, match="^the value of A must be 0 or 1, not |integer"):
            Equation("A")(A=value)

    def test_messages(self, equation: Equation) -> None:
        for values, named, message in [
                ({"A": 1}, {"A": 1}, "the value of A is given twice"),
                ([1], {}, "values must be a mapping of names to 0 and 1, not list"),
                ({}, {"D": 1}, "there is no input D; the inputs are A, B, 'C[0]'"),
                ({1: 1}, {}, "there is no input 1; "),
                ({}, {"A": 1}, "missing 2 values: B, 'C[0]'; every input has one"),
                ({}, {"A": "1"}, "the value of A must be 0 or 1, not '1'"),
                ({}, {"\u00e9": 1}, "there is no input \u00e9; ")]:
            with pytest.raises(TypeError) as caught:
                equation(values, **named)  # type: ignore[arg-type]
            assert str(caught.value).startswith(message)

    def test_many_inputs_are_not_all_listed(self) -> None:
        many = Equation("|".join(f"x{k}" for k in range(25)))
        with pytest.raises(TypeError, match="x18, x19 and 5 more; every input has one"):
            many()
        names = [f"x{k}" for k in range(20000)]
        assert Equation(" ^ ".join(names))(dict.fromkeys(names, 1)) == 0

    def test_values_and_self_may_be_inputs(self) -> None:
        equation = Equation("values & self & name")
        assert equation(values=1, self=1, name=1) == 1
        assert equation(values=1, self=0, name=1) == 0

    def test_constants_and_init_values(self) -> None:
        assert Equation("1")() == 1 and Equation("0")() == 0 and Equation("()")() == 0
        lut = Equation("0xca", ["S", "A", "B"])
        assert lut(S=1, A=1, B=0) == 1 and lut(S=0, A=1, B=0) == 0

    def test_a_call_changes_nothing(self, equation: Equation) -> None:
        values: Dict[str, int] = {"A": 1, "B": 0, "'C[0]'": 0}
        assert equation(values) == 1
        assert values == {"A": 1, "B": 0, "'C[0]'": 0}
        with pytest.raises(TypeError, match="missing"):
            equation(B=1)
        assert equation(dict.fromkeys(equation.inputs, 0)) == 0

    def test_any_mapping_will_do(self) -> None:
        class Odd(collections.abc.Mapping):  # type: ignore[type-arg]
            def __getitem__(self, name: str) -> int:
                return 1

            def __iter__(self) -> Any:
                return iter(["A", "B"])

            def __len__(self) -> int:
                return 2

        assert Equation("A & B")(Odd()) == 1

    def test_an_exception_of_a_value_keeps_its_type(self) -> None:
        class Raises:
            def __index__(self) -> int:
                raise ZeroDivisionError("mine")

        with pytest.raises(ZeroDivisionError, match="^mine$"):
            Equation("A")(A=Raises())
        with pytest.raises(ZeroDivisionError, match="^mine$"):
            Equation.from_init(Raises(), ["A"])
        with pytest.raises(ZeroDivisionError, match="^mine$"):
            Equation("A") & Raises()


class TestIsNoContainer:
    """What NumPy and pandas check before they take an object apart."""

    def test_no_mapping_and_no_sequence(self, equation: Equation) -> None:
        for kind in (collections.abc.Mapping, collections.abc.Iterable, collections.abc.Sized,
                     collections.abc.Container):
            assert not isinstance(equation, kind)
        for question in (len, iter, reversed, list, dict, lambda e: e["A"], lambda e: "A" in e):
            with pytest.raises(TypeError):
                question(equation)  # type: ignore[operator]

    def test_arrays_hold_it_whole(self) -> None:
        array = np.array([Equation("A&B"), Equation("C&D")], dtype=object)
        assert array.shape == (2,)
        assert [str(both) for both in array & Equation("E")] == ["(A & B) & E", "(C & D) & E"] or \
            [str(both) for both in array & Equation("E")] == ["A & B & E", "C & D & E"]

    def test_neither_true_nor_false(self, equation: Equation) -> None:
        with pytest.raises(TypeError, match="neither true nor false"):
            bool(equation)
        with pytest.raises(TypeError, match="satisfiable"):
            equation and equation

    def test_nothing_can_be_set(self, equation: Equation) -> None:
        for name in ("text", "inputs", "given_inputs", "lsb_first", "new"):
            with pytest.raises(AttributeError):
                setattr(equation, name, 1)
        with pytest.raises(TypeError):
            equation["A"] = 1  # type: ignore[index]
