"""eval_many by name, for all forms of data: pandas, structured and masked arrays, mappings."""
from typing import Any

import numpy as np
import pandas as pd
import pytest
from booleq import Equation, LutArray

MUX = Equation("S & A | (~S & B)", ["S", "A", "B"])
GENERATOR = np.random.default_rng(1)
ROWS = GENERATOR.integers(0, 2, (5000, 3), dtype=np.uint8)
EXPECTED = np.where(ROWS[:, 0] == 1, ROWS[:, 1], ROWS[:, 2])


def frame(dtype: Any = None) -> pd.DataFrame:
    """A frame whose columns are in another order than the inputs."""
    table = pd.DataFrame(ROWS[:, ::-1], columns=["B", "A", "S"])
    return table if dtype is None else table.astype(dtype)


@pytest.mark.parametrize("dtype", [None, bool, "int8", "int64", "uint32", "float32", "float64",
                                   "Int64", "UInt8", "boolean", "object", "Float64", "category"])
def test_frames(dtype: Any) -> None:
    results = MUX.eval_many(frame(dtype))
    assert type(results) is np.ndarray and results.dtype == np.uint8
    assert np.array_equal(results, EXPECTED)
    mixed = frame().astype({"S": "boolean", "A": "float64"})
    assert np.array_equal(MUX.eval_many(mixed), EXPECTED)


def test_other_tables_with_names() -> None:
    columns = {"B": ROWS[:, 2], "S": ROWS[:, 0].astype(bool), "A": ROWS[:, 1].tolist()}
    assert np.array_equal(MUX.eval_many(columns), EXPECTED)
    record = np.zeros(len(ROWS), [("A", "u1"), ("B", ">i4"), ("S", "?")])
    record["S"], record["A"], record["B"] = ROWS.T
    assert np.array_equal(MUX.eval_many(record), EXPECTED)
    assert np.array_equal(MUX.eval_many({**columns, "S": 1}), ROWS[:, 1])


@pytest.mark.parametrize("table, message", [
    (frame().drop(columns="A"), "the DataFrame has no column for A"),
    (frame().assign(x=1), "has a column 'x', which is not an input; the inputs are S, A, B: write"),
    ({"S": [0], "A": [0]}, "the mapping has no column for B"),
    ({"S": [0], "A": [0, 1], "B": [0]}, "must be of one length, not 1, 2"),
    ({"S": 0, "A": 1, "B": 0}, "single values"),
    ({"S": [[0]], "A": [0], "B": [0]}, "column S must have one dimension"),
    ({"S": [0, 2], "A": [0, 1], "B": [0, 0]}, r"column S\[1\] must be 0 or 1, not 2"),
    ({"S": [0, 1], "A": [0, 0.5], "B": [0, 0]}, r"column A\[1\] must be 0 or 1, not 0.5"),
    ({"S": [0, 1], "A": [0, np.nan], "B": [0, 0]}, "column A"),
    (pd.concat([frame(), frame()[["A"]]], axis=1), "two columns of one name")])
def test_wrong_columns(table: Any, message: str) -> None:
    with pytest.raises(ValueError, match=message):
        MUX.eval_many(table)


@pytest.mark.parametrize("column", [["0", "1"], [1j, 0], pd.to_datetime(["2020", "2021"])])
def test_other_types(column: Any) -> None:
    with pytest.raises((TypeError, ValueError), match="S"):
        MUX.eval_many({"S": column, "A": [0, 0], "B": [0, 0]})


def test_missing_values_have_missing_answers() -> None:
    table = frame("Int64")
    table.loc[3, "S"] = pd.NA
    results = MUX.eval_many(table)
    assert isinstance(results, np.ma.MaskedArray)
    assert results.mask.tolist() == [row == 3 for row in range(len(ROWS))]
    assert np.array_equal(np.delete(results.data, 3), np.delete(EXPECTED, 3))
    array_type: Any = np.ma.MaskedArray
    masked = array_type(ROWS, ROWS == 2)
    masked[7, 1] = np.ma.masked
    assert MUX.eval_many(masked).mask.sum() == 1  # type: ignore[attr-defined]
    objects = ROWS.astype(object)
    objects[9, 0] = None
    assert MUX.eval_many(objects).mask.nonzero()[0].tolist() == [9]  # type: ignore[attr-defined]


def test_equations_in_frames() -> None:
    table = pd.DataFrame({"eq": [Equation("A & B"), Equation("A | B")]})
    assert "A & B" in str(table) and table["eq"][0] == Equation("A & B")
    assert table["eq"].nunique() == 2 and len(table.sort_values("eq")) == 2
    assert table.groupby("eq").size().tolist() == [1, 1]
    assert table["eq"].map(lambda eq: eq.count_ones()).tolist() == [1, 3]
    frame()["y"] = MUX.eval_many(frame())


@pytest.mark.parametrize("num_rows", [4095, 4096, 4097, 65536, 65537, 200001])
@pytest.mark.parametrize("num_inputs", [1, 4, 9, 17])
def test_blocks_and_parts(num_rows: int, num_inputs: int) -> None:
    names = [f"x{k}" for k in range(num_inputs)]
    equation = Equation(" ^ ".join(names) + " ^ 1")
    rows = np.random.default_rng(num_rows).integers(0, 2, (num_rows, num_inputs), dtype=np.uint8)
    expected = 1 - rows.sum(axis=1) % 2
    for table in (rows, np.asfortranarray(rows), dict(zip(names, rows.T)),
                  dict(zip(names, np.ascontiguousarray(rows.T))), rows.astype(np.float64)):
        assert np.array_equal(equation.eval_many(table), expected)


def test_right_deep_and_large_equations() -> None:
    depth = 3000
    text = "(x0 & x1 | " * depth + "x2" + ")" * depth
    rows = np.random.default_rng(2).integers(0, 2, (500, 3))
    assert np.array_equal(Equation(text).eval_many(rows), rows[:, 0] & rows[:, 1] | rows[:, 2])


class TestLuts:
    @pytest.mark.parametrize("num_inputs", range(1, 8))
    def test_against_equations(self, num_inputs: int) -> None:
        generator = np.random.default_rng(num_inputs)
        values = [int.from_bytes(generator.bytes(16), "little") % 2 ** 2 ** num_inputs
                  for _ in range(40)]
        names = [f"x{k}" for k in range(num_inputs)]
        luts = LutArray(values, num_inputs)
        equations = [Equation.from_init(value, names) for value in values]
        assert luts.equations(names) == equations == Equation.from_inits(values, names)
        assert [luts[place] for place in range(40)] == [eq.hex_init() for eq in equations]
        assert LutArray([eq.hex_init() for eq in equations], num_inputs) == luts
        assert LutArray([eq.sized_init() for eq in equations], num_inputs) == luts
        assert LutArray(luts.words, num_inputs) == luts
        assert LutArray([eq.hex_init(lsb_first=True) for eq in equations], num_inputs,
                        lsb_first=True) == luts
        assert luts.count_ones().tolist() == [eq.count_ones() for eq in equations]
        assert [tuple(np.array(names)[row]) for row in luts.support()] == \
            [eq.support for eq in equations]
        assert np.array_equal(luts.idle(), ~luts.support())
        assert (~luts).equations(names) == [~eq for eq in equations]
        order = generator.permutation(num_inputs)
        new_names = [names[place] for place in order]
        assert luts.permute(order).equations(new_names) == [eq.permute(new_names) for eq in equations]
        orders = np.array([generator.permutation(num_inputs) for _ in range(40)])
        each = luts.permute(orders)
        assert [each[place] for place in range(40)] == \
            [eq.permute([names[k] for k in row]).hex_init() for eq, row in zip(equations, orders)]
        rows = generator.integers(0, 2, (40, num_inputs))
        assert luts.evaluate(rows).tolist() == \
            [int(eq.eval_many(row[None])[0]) for eq, row in zip(equations, rows)]
        assert luts.evaluate(rows[0]).tolist() == [int(eq.eval_many(rows[:1])[0]) for eq in equations]
        if num_inputs > 1:
            place = int(generator.integers(num_inputs))
            fixed = luts.cofactor(place, 1)
            rest = names[:place] + names[place + 1:]
            assert fixed.equations(rest) == [eq.cofactor({names[place]: 1}) for eq in equations]

    @pytest.mark.parametrize("num_inputs", range(1, 7))
    def test_canonical_forms(self, num_inputs: int) -> None:
        generator = np.random.default_rng(num_inputs)
        values = generator.integers(0, 2 ** 63, 200, dtype=np.uint64) % np.uint64(
            2 ** 2 ** num_inputs - 1)
        luts = LutArray(values, num_inputs)
        found = luts.canonical()
        # The arrays are enough to undo it, using only the kernels of LutArray.
        turned = luts.permute(found.orders)
        rows = generator.integers(0, 2, (200, num_inputs))
        assert np.array_equal(found.forms.evaluate(rows),
                              turned.evaluate(rows ^ found.inverted) ^ found.output_inverted)
        changed = ~luts.permute(generator.permutation(num_inputs))
        assert changed.canonical().forms == found.forms
        assert luts.permute(list(range(num_inputs))[::-1]).canonical("order").forms == \
            luts.canonical("order").forms

    def test_distinct_and_described(self) -> None:
        values = np.random.default_rng(3).integers(0, 256, 5000)
        luts = LutArray(values, 3)
        distinct = luts.unique()
        words, first, inverse, counts = np.unique(values, True, True, True)
        assert np.array_equal(distinct.luts.words, words)
        assert np.array_equal(distinct.first, first) and np.array_equal(distinct.counts, counts)
        assert np.array_equal(distinct.inverse, inverse)
        described = luts.explain(["a", "b", "c"])
        for word, text in zip(words, described.expressions):
            assert text is not None
            assert Equation(text).equivalent(Equation.from_init(int(word), ["a", "b", "c"]))

    def test_faults(self) -> None:
        for values, num_inputs, message in [
                ([16], 2, r"values\[0\]: 0 <= value < 2\*\*4"), (np.array([3, 16]), 2, r"values\[1\]"),
                ([-1], 2, r"values\[0\]"), (np.array([-1]), 2, "below 0"), ([1], 0, "1 to 7"),
                ([1], 8, "1 to 7"), (["0xcaca"], 3, "16 rows, and 3 inputs have 8"),
                (["0xg0"], 3, "not a digit"), (["ca"], 3, "begins with 0x or 0b"),
                (["4'h1"], 3, "size"), (np.zeros((2, 2), int), 3, "one dimension")]:
            with pytest.raises(ValueError, match=message):
                LutArray(values, num_inputs)
        for values in (np.zeros(2), [1.5], [None], "0xca"):
            with pytest.raises(TypeError):
                LutArray(values, 3)
        luts = LutArray([1, 2], 2)
        orders: Any = ([0], [0, 0], [0, 2], [[0, 1]], [0.0, 1.0])
        for order in orders:
            with pytest.raises(ValueError, match="order"):
                luts.permute(order)
        with pytest.raises(ValueError, match="the order of table 1"):
            luts.permute([[0, 1], [1, 1]])
        assignments: Any = ([0], [0, 2], [[0, 1]])
        for assignment in assignments:
            with pytest.raises(ValueError, match="assignment"):
                luts.evaluate(assignment)
        with pytest.raises(ValueError, match="six inputs"):
            LutArray([1], 7).canonical()
        with pytest.raises(TypeError):
            iter(luts)

    def test_values_never_change(self) -> None:
        words = np.array([1, 2], np.uint16)
        luts = LutArray(words, 2)
        words[0] = 7
        assert luts[0] == "0x1" and hash(luts) == hash(LutArray([1, 2], 2))
        with pytest.raises(ValueError):
            luts.words[0] = 3
        with pytest.raises(AttributeError):
            luts.words = words  # type: ignore[misc]
        assert len(LutArray([], 3)) == 0 and LutArray([], 3).unique().counts.tolist() == []
