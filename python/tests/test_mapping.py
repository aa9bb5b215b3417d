"""Values of inputs, and the result for them."""
import collections.abc
from typing import Any, List

import numpy as np
import pytest

from booleq import Equation


@pytest.fixture
def equation() -> Equation:
    return Equation("A & ~B | 'C[0]'")


class TestMapping:
    def test_is_a_mapping(self, equation: Equation) -> None:
        assert isinstance(equation, collections.abc.Mapping)
        assert not isinstance(equation, collections.abc.MutableMapping)

    def test_values_start_at_0(self, equation: Equation) -> None:
        assert dict(equation) == {"A": 0, "B": 0, "'C[0]'": 0}
        assert equation.get("A") == 0 and type(equation["A"]) is int

    @pytest.mark.parametrize("value, result", [
        (0, 0), (1, 1), (False, 0), (True, 1), (np.uint8(1), 1), (np.int64(0), 0),
        (np.bool_(True), 1), (np.bool_(False), 0), (np.array(1), 1)])
    def test_set(self, equation: Equation, value: Any, result: int) -> None:
        equation["A"] = 1 - result
        equation["A"] = value
        assert equation["A"] == result

    @pytest.mark.parametrize("value", [2, -1, 2 ** 70, np.int8(-1)])
    def test_other_numbers(self, equation: Equation, value: Any) -> None:
        equation["A"] = 1
        with pytest.raises(ValueError, match="^the value of A must be 0 or 1, not "):
            equation["A"] = value
        assert equation["A"] == 1

    @pytest.mark.parametrize("value", [1.0, "1", None, [1], np.float64(1), np.array([1, 0])])
    def test_other_kinds(self, equation: Equation, value: Any) -> None:
        with pytest.raises(TypeError, match="^the value of A must be 0 or 1, not "):
            equation["A"] = value

    def test_unknown_names(self, equation: Equation) -> None:
        with pytest.raises(KeyError) as caught:
            equation["D"]
        assert caught.value.args == ("there is no input D; the inputs are A, B, 'C[0]'",)
        with pytest.raises(KeyError):
            equation["D"] = 1
        with pytest.raises(KeyError):
            equation[1]  # type: ignore[index]
        with pytest.raises(KeyError, match="there is no input A; there are none"):
            Equation("1")["A"]

    def test_names_in_messages(self, equation: Equation) -> None:
        for name, shown in [("\ud800", r"\ud800"), ("\u00fc\n", r"\xc3\xbc\x0a"),
                            (100 * "x", 60 * "x" + "... (100 bytes)"), (b"A", "b'A'")]:
            with pytest.raises(KeyError) as caught:
                equation[name]  # type: ignore[index]
            assert caught.value.args[0].startswith(f"there is no input {shown}; ")
        with pytest.raises(ValueError, match="^the value of 'C.0.' must be 0 or 1, not 2$"):
            equation["'C[0]'"] = 2

    def test_many_inputs_are_not_all_listed(self) -> None:
        many = Equation("|".join(f"x{k}" for k in range(25)))
        with pytest.raises(KeyError, match="x18, x19 and 5 more"):
            many["D"]

    def test_inputs_are_fixed(self, equation: Equation) -> None:
        with pytest.raises(AttributeError):
            del equation["A"]  # type: ignore[attr-defined]

    def test_contains_and_iterates(self, equation: Equation) -> None:
        assert "A" in equation and "'C[0]'" in equation
        others: List[object] = ["D", 1, None, b"A", ("A",)]
        assert not any(other in equation for other in others)
        assert list(equation) == list(equation.inputs) == ["A", "B", "'C[0]'"]
        assert len(equation) == 3

    def test_is_true_without_inputs(self) -> None:
        constant = Equation("0")
        assert len(constant) == 0 and bool(constant) and list(constant) == []

    def test_views(self, equation: Equation) -> None:
        keys, values, items = equation.keys(), equation.values(), equation.items()
        equation["B"] = 1
        assert list(keys) == ["A", "B", "'C[0]'"]
        assert list(values) == [0, 1, 0]
        assert list(items) == [("A", 0), ("B", 1), ("'C[0]'", 0)]
        assert "A" in keys and ("B", 1) in items and len(values) == 3
        assert keys & {"A", "X"} == {"A"}

    def test_get(self, equation: Equation) -> None:
        equation["A"] = 1
        assert equation.get("A") == 1 and equation.get("A", 7) == 1
        assert equation.get("D") is None and equation.get("D", 7) == 7

    def test_many_inputs(self) -> None:
        names = [f"x{k}" for k in range(20000)]
        equation = Equation(" ^ ".join(names))
        for name in names:
            equation[name] = 1
        assert sum(equation.values()) == 20000 and equation() == 0
        equation["x19999"] = 0
        assert equation() == 1


class TestCall:
    def test_every_row(self, equation: Equation) -> None:
        for row in range(8):
            a, b, c = row >> 2, row >> 1 & 1, row & 1
            assert equation({"'C[0]'": c}, A=a, B=b) == (a & (1 - b) | c)

    def test_takes_what_is_set_and_sets_nothing(self, equation: Equation) -> None:
        equation["A"] = 1
        assert equation() == 1
        assert equation(B=1) == 0
        assert equation({"B": True, "A": np.bool_(False)}) == 0
        assert dict(equation) == {"A": 1, "B": 0, "'C[0]'": 0}

    def test_faults_set_nothing(self, equation: Equation) -> None:
        equation["A"] = 1
        for values, named, error in [({"A": 0, "D": 1}, {}, KeyError),
                                     ({}, {"A": 0, "D": 1}, KeyError),
                                     ({"A": 0}, {"A": 0}, TypeError),
                                     ({"A": 2}, {}, ValueError),
                                     ({}, {"A": 0, "B": "1"}, TypeError),
                                     ("AB", {}, TypeError), ([("A", 0)], {}, TypeError)]:
            with pytest.raises(error):
                equation(values, **named)  # type: ignore[arg-type]
            assert dict(equation) == {"A": 1, "B": 0, "'C[0]'": 0}

    def test_messages(self, equation: Equation) -> None:
        with pytest.raises(TypeError, match="^the value of A is given twice$"):
            equation({"A": 1}, A=1)
        with pytest.raises(TypeError, match="^values must be a mapping of names to 0 and 1, not "):
            equation([1])  # type: ignore[arg-type]
        with pytest.raises(KeyError, match="there is no input D; the inputs are A, B"):
            equation(D=1)

    def test_values_and_self_may_be_inputs(self) -> None:
        equation = Equation("values & self & name")
        assert equation(values=1, self=1, name=1) == 1
        assert equation(values=1, self=0, name=1) == 0

    def test_another_equation_is_a_mapping(self, equation: Equation) -> None:
        other = Equation("A | B")
        other["A"] = 1
        assert equation(other) == 1

    def test_one_positional_argument(self, equation: Equation) -> None:
        with pytest.raises(TypeError):
            equation({}, {})  # type: ignore[call-arg]

    @pytest.mark.parametrize("items", [[1], ["AB"], [("A",)], [("A", 1, 2)], [["A", 1]], 7])
    def test_items_that_are_no_pairs(self, equation: Equation, items: Any) -> None:
        class Odd(dict):  # type: ignore[type-arg]
            def items(self) -> Any:
                return items

        with pytest.raises(TypeError):
            equation(Odd())

    def test_constants(self) -> None:
        assert Equation("1")() == 1 and Equation("0")() == 0 and Equation("()")() == 0

    def test_of_an_init_value(self) -> None:
        equation = Equation("0xca", ["S", "A", "B"])
        assert equation(S=1, A=1) == 1 and equation(S=0, A=1) == 0 and equation(B=1) == 1

    def test_a_mapping_that_uses_the_equation(self, equation: Equation) -> None:
        class Odd(dict):  # type: ignore[type-arg]
            def items(self) -> Any:
                equation["A"] = 1
                return [("B", 0)]

        assert equation(Odd(B=1)) == 1
        assert equation["A"] == 1
