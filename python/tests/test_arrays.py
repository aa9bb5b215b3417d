"""Many rows at once."""
import gc
from pathlib import Path
from typing import Any, Callable, List

import numpy as np
import numpy.typing as npt
import pytest

from booleq import Equation

MUX = "S & A | (~S & B)"


def all_rows(num_inputs: int) -> npt.NDArray[np.uint8]:
    rows = np.arange(2 ** num_inputs)
    bits = [(rows >> bit & 1).astype(np.uint8) for bit in reversed(range(num_inputs))]
    return np.stack(bits, axis=1)


def chain(num_inputs: int) -> str:
    """An equation for which the order of inputs and the grouping matter."""
    return " ".join(f"x{k} {'&|^'[k % 3]}" for k in range(num_inputs - 1)) + f" ~x{num_inputs - 1}"


def chain_results(rows: npt.NDArray[Any]) -> npt.NDArray[np.bool_]:
    values = rows.astype(bool)
    last = values.shape[1] - 1
    result = values[:, 0].copy() if last > 0 else ~values[:, 0]
    for k in range(1, last + 1):
        operand = values[:, k] if k < last else ~values[:, k]
        kind = (k - 1) % 3
        result = result & operand if kind == 0 else result | operand if kind == 1 else \
            result ^ operand
    return result


class TestEvalMany:
    @pytest.mark.parametrize("num_inputs", [1, 2, 5, 6, 7, 8, 9, 12])
    def test_all_rows(self, num_inputs: int) -> None:
        rows = all_rows(num_inputs)
        equation = Equation(chain(num_inputs))
        results = equation.eval_many(rows)
        assert results.dtype == np.uint8 and results.shape == (len(rows),)
        assert np.array_equal(results, chain_results(rows))
        assert np.array_equal(results, equation.column())

    # Few rows go through the expression, many through the column.
    @pytest.mark.parametrize("num_inputs", [3, 8, 11, 16, 17, 30, 31, 40, 100, 1000])
    @pytest.mark.parametrize("num_rows", [0, 1, 7, 8, 63, 64, 65, 130, 5000])
    def test_some_rows(self, num_inputs: int, num_rows: int) -> None:
        rows = np.random.default_rng(num_rows).integers(0, 2, (num_rows, num_inputs))
        results = Equation(chain(num_inputs)).eval_many(rows)
        assert results.shape == (num_rows,)
        assert np.array_equal(results, chain_results(rows))

    @pytest.mark.parametrize("num_inputs", [1, 4, 7, 12, 16])
    @pytest.mark.parametrize("num_rows", [1, 65, 3000])
    def test_init_values(self, num_inputs: int, num_rows: int) -> None:
        generator = np.random.default_rng(num_inputs)
        bits = generator.integers(0, 2, 2 ** num_inputs, dtype=np.uint8)
        value = int("".join(str(bit) for bit in reversed(bits)), 2)
        equation = Equation.from_init(value, [f"x{k}" for k in range(num_inputs)])
        rows = generator.integers(0, 2, (num_rows, num_inputs))
        numbers = rows @ (1 << np.arange(num_inputs)[::-1])
        assert np.array_equal(equation.eval_many(rows), bits[numbers])

    @pytest.mark.parametrize("dtype", ["?", "i1", "u1", "i2", "u2", "i4", "u4", "i8", "u8",
                                       ">i2", "<u4", ">i8", ">u8"])
    @pytest.mark.parametrize("num_inputs", [3, 9, 31])
    def test_kinds_of_numbers(self, dtype: str, num_inputs: int) -> None:
        rows = np.random.default_rng(3).integers(0, 2, (200, num_inputs))
        assert np.array_equal(Equation(chain(num_inputs)).eval_many(rows.astype(dtype)),
                              chain_results(rows))

    @pytest.mark.parametrize("num_inputs", [3, 9, 31])
    @pytest.mark.parametrize("dtype", [np.uint8, np.int32])
    def test_layouts(self, num_inputs: int, dtype: Any) -> None:
        rows = np.random.default_rng(4).integers(0, 2, (150, num_inputs)).astype(dtype)
        equation = Equation(chain(num_inputs))
        expected = chain_results(rows)
        doubled = np.repeat(np.repeat(rows, 2, axis=0), 2, axis=1)
        padded = np.full((150, num_inputs + 3), 9, dtype=dtype)
        padded[:, 1:num_inputs + 1] = rows
        for same in [np.asfortranarray(rows), doubled[::2, ::2], padded[:, 1:num_inputs + 1],
                     rows[::-1][::-1], rows[:, ::-1].copy()[:, ::-1]]:
            assert np.array_equal(equation.eval_many(same), expected)
        assert np.array_equal(equation.eval_many(rows[::-1]), expected[::-1])
        one_row = np.broadcast_to(rows[0], rows.shape)
        assert np.array_equal(equation.eval_many(one_row), np.full(150, expected[0]))

    def test_unaligned_and_read_only(self) -> None:
        rows = np.random.default_rng(5).integers(0, 2, (50, 3)).astype(np.int32)
        memory = np.frombuffer(b"\0" + rows.tobytes(), dtype=np.uint8)
        unaligned = memory[1:].view(np.int32).reshape(50, 3)
        assert not unaligned.flags.writeable
        assert np.array_equal(Equation(chain(3)).eval_many(unaligned), chain_results(rows))

    def test_lists(self) -> None:
        assert Equation(MUX).eval_many([[1, 1, 0], [0, True, 0]]).tolist() == [1, 0]

    def test_without_inputs(self) -> None:
        rows = np.empty((70, 0), dtype=bool)
        assert Equation("1").eval_many(rows).tolist() == 70 * [1]
        assert Equation("0").eval_many(rows).tolist() == 70 * [0]
        assert Equation("1").eval_many(np.empty((0, 0), dtype=bool)).tolist() == []

    @pytest.mark.parametrize("shape", [(), (3,), (2, 2), (2, 4), (1, 2, 3), (0,)])
    def test_other_shapes(self, shape: Any) -> None:
        with pytest.raises(ValueError, match=r"must have the shape \(rows, 3\)"):
            Equation(MUX).eval_many(np.zeros(shape, dtype=np.uint8))

    @pytest.mark.parametrize("dtype", ["c8", "U1", "S1", "M8[s]"])
    def test_other_kinds(self, dtype: str) -> None:
        with pytest.raises(TypeError, match="^assignments must be bool, integers, or floats and objects that are 0 or 1, not "):
            Equation(MUX).eval_many(np.zeros((2, 3), dtype=dtype))
        with pytest.raises(TypeError):
            Equation(MUX).eval_many(None)

    @pytest.mark.parametrize("num_inputs", [3, 8, 9, 40])
    @pytest.mark.parametrize("value, dtype", [(2, "u1"), (255, "u1"), (-1, "i1"), (256, "i2"),
                                              (-1, "i8"), (2 ** 32, "u8"), (2 ** 63, "u8")])
    def test_other_values(self, num_inputs: int, value: int, dtype: str) -> None:
        rows = np.ones((100, num_inputs), dtype=dtype)
        rows[77, num_inputs - 1] = value
        with pytest.raises(ValueError) as caught:
            Equation(chain(num_inputs)).eval_many(rows)
        assert str(caught.value) == \
            f"assignments[77, {num_inputs - 1}] must be 0 or 1, not {value}"

    def test_the_argument_is_not_changed(self) -> None:
        rows = all_rows(3)
        Equation(MUX).eval_many(rows)
        assert np.array_equal(rows, all_rows(3))


class TestTables:
    @pytest.mark.parametrize("num_inputs", [1, 2, 5, 6, 7, 10])
    def test_table_and_columns(self, num_inputs: int) -> None:
        equation = Equation(chain(num_inputs))
        rows = all_rows(num_inputs)
        results = chain_results(rows)
        table = equation.truth_table()
        assert table.dtype == np.uint8 and table.shape == (2 ** num_inputs, num_inputs + 1)
        assert np.array_equal(table, np.column_stack([rows, results]))
        assert equation.column().dtype == np.uint8
        assert np.array_equal(equation.column(), results)
        packed = equation.packed_column()
        assert packed.dtype == np.uint64 and packed.shape == (max(1, 2 ** num_inputs // 64),)
        bits = [int(packed[row // 64]) >> row % 64 & 1 for row in range(2 ** num_inputs)]
        assert bits == results.tolist()

    def test_rows_after_the_last_are_0(self) -> None:
        assert Equation("A | ~A").packed_column().tolist() == [3]

    def test_without_inputs_there_is_one_row(self) -> None:
        assert Equation("1").truth_table().tolist() == [[1]]
        assert Equation("0").column().tolist() == [0]
        assert Equation("1").packed_column().tolist() == [1]

    def test_of_init_values(self) -> None:
        equation = Equation("0xca", ["S", "A", "B"])
        assert equation.column().tolist() == [0, 1, 0, 1, 0, 0, 1, 1]
        assert equation.packed_column().tolist() == [0xca]

    def test_thirty_inputs(self) -> None:
        equation = Equation("&".join(f"x{k}" for k in range(30)))
        packed = equation.packed_column()
        assert packed.shape == (2 ** 24,)
        assert int(packed[-1]) == 2 ** 63 and not packed[:-1].any()

    @pytest.mark.parametrize("name", ["truth_table", "column", "packed_column"])
    def test_above_thirty(self, name: str) -> None:
        equation = Equation("&".join(f"x{k}" for k in range(31)))
        with pytest.raises(ValueError, match="^31 inputs: at most 30 have a truth table$"):
            getattr(equation, name)()
        assert equation.eval_many(np.ones((3, 31), dtype=bool)).tolist() == [1, 1, 1]

    def test_results_can_be_written_and_are_apart(self) -> None:
        equation = Equation(MUX)
        for name in ["packed_column", "column", "truth_table"]:
            make: Callable[[], npt.NDArray[Any]] = getattr(equation, name)
            first, second = make(), make()
            first[...] = 0
            assert second.any() and np.array_equal(second, make())

    def test_a_column_outlives_its_equation(self) -> None:
        columns: List[npt.NDArray[np.uint64]] = []
        for _ in range(3):
            equation = Equation(chain(16))
            columns.append(equation.packed_column()[8:24:2])
            del equation
        gc.collect()
        assert np.array_equal(columns[0], columns[2])
        assert np.array_equal(columns[0], Equation(chain(16)).packed_column()[8:24:2])


class TestMemory:
    def test_what_does_not_fit_is_a_memory_error(self) -> None:
        import resource

        equation = Equation("&".join(f"x{k}" for k in range(30)))
        old = resource.getrlimit(resource.RLIMIT_AS)
        size = int(Path("/proc/self/statm").read_text(encoding="ascii").split()[0])
        limit = size * resource.getpagesize() + 2 ** 26  # 64 MiB: half of a packed column
        resource.setrlimit(resource.RLIMIT_AS, (limit, old[1]))
        try:
            for name in ["packed_column", "column", "truth_table", "hex_init"]:
                with pytest.raises(MemoryError):
                    getattr(equation, name)()
        finally:
            resource.setrlimit(resource.RLIMIT_AS, old)
        assert equation.eval_many(np.ones((2, 30), dtype=bool)).tolist() == [1, 1]


@pytest.mark.parametrize("gap", [0, 1, 3])
@pytest.mark.parametrize("num_inputs", [1, 2, 3, 4, 5, 7, 8, 9, 15, 16, 17, 24, 25, 33])
def test_rows_of_bytes(num_inputs: int, gap: int) -> None:
    """Rows with and without gaps, in whole words and a few more, up to the end of the memory."""
    generator = np.random.default_rng(num_inputs)
    names = [f"x{k}" for k in range(num_inputs)]
    equation = Equation(" ^ ".join(f"({name} & {names[(7 * k + 1) % num_inputs]})"
                                   for k, name in enumerate(names)) + " ^ x0", names)
    for num_rows in (1, 15, 16, 63, 64, 65, 127, 128, 200, 70_001):
        wide = generator.integers(0, 2, (num_rows, num_inputs + gap), dtype=np.uint8)
        wide[:, num_inputs:] = 7  # gaps, which must not be read
        rows = wide[:, :num_inputs]
        products = rows & rows[:, (7 * np.arange(num_inputs) + 1) % num_inputs]
        expected = np.bitwise_xor.reduce(products, axis=1) ^ rows[:, 0]
        assert np.array_equal(equation.eval_many(rows), expected)
        row, column = generator.integers(num_rows), generator.integers(num_inputs)
        rows[row, column] = 2
        with pytest.raises(ValueError, match=rf"\[{row}, {column}\] must be 0 or 1, not 2"):
            equation.eval_many(rows)
