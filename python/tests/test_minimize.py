"""Smallest sums of products."""
import itertools

import pytest

import booleq
from booleq import Equation, Minimum


class TestEquation:
    def test_result_is_whole(self) -> None:
        minimum = Equation("a & b | (a & c)").minimize(exact=True)
        assert minimum == Minimum(
            inputs=("a", "b", "c"), expression=minimum.expression, cubes=minimum.cubes, terms=2,
            literals=4, lower_bound=2, proved=True)
        assert sorted(minimum.cubes) == ["1-1", "11-"]
        assert Equation(minimum.expression).equivalent(Equation("a & (b | c)"))

    def test_sum_is_the_same_function(self) -> None:
        for value in range(256):
            equation = Equation.from_init(f"0b{value:08b}", ["a", "b", "c"])
            minimum = equation.minimize(exact=True)
            assert minimum.proved and minimum.terms == minimum.lower_bound
            for bits in itertools.product((0, 1), repeat=3):
                expected = equation(dict(zip(("a", "b", "c"), bits)))
                covered = any(all(digit in ("-", str(bit)) for digit, bit in zip(cube, bits))
                              for cube in minimum.cubes)
                assert covered == bool(expected)

    def test_free_rows_are_used(self) -> None:
        minimum = Equation("a ^ b").minimize(dont_care=Equation("a & b"))
        assert (minimum.terms, minimum.literals) == (2, 2)

    def test_wrong_arguments(self) -> None:
        with pytest.raises(TypeError, match="dont_care must be an Equation, a text, 0, 1 or None"):
            Equation("a").minimize(dont_care=[])  # type: ignore[arg-type]
        with pytest.raises(ValueError, match="seconds must be above 0"):
            Equation("a").minimize(seconds=-1.0)


class TestPla:
    def test_file_in_file_out(self) -> None:
        text = ".i 2\n.o 2\n.ob f g\n01 10\n11 11\n.e\n"
        assert booleq.minimize_pla(text, exact=True).startswith(".i 2\n.o 2\n.ob f g\n.type f\n.p 2\n")

    def test_fault_names_its_line(self) -> None:
        with pytest.raises(ValueError, match="line 3: the row has 2 digits, not 3"):
            booleq.minimize_pla(".i 2\n.o 1\n11\n")
