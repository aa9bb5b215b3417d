"""Random equations: every answer of an Equation against SymPy's functions of the same trees, and
against its own other answers, which must agree."""
import copy
import itertools
import pickle
import threading
from typing import Any, Callable, List, Optional, Sequence

import numpy as np
import numpy.typing as npt
import pytest
import trees
from booleq import Equation
from hypothesis import given
from hypothesis import strategies as st
from trees import (all_rows, examples, names_of, sum_of_products, symbol, sympy_column,
                   to_sympy)

EXTRA_NAMES = ("x", "'x[1]'", "zz")
masked_array: Any = np.ma.masked_array
INTEGERS = ("bool", "int8", "uint8", "int16", "uint16", "int32", "uint32", "int64", "uint64",
            ">i2", ">u4", ">i8", "<u2", "<i4")


def number_of(column: npt.NDArray[np.uint8]) -> int:
    """The number whose bit k is row k."""
    return sum(int(value) << row for row, value in enumerate(column))


def as_listed(text: str) -> str:
    """The text for listed inputs: one that begins with 0 would be taken for an init value."""
    return "(" + text + ")" if text.startswith("0") else text


def same(left: npt.NDArray[Any], right: npt.NDArray[Any]) -> bool:
    return left.dtype == right.dtype and bool(np.array_equal(left, right))


def evaluate(equation: Equation, row: Sequence[int]) -> int:
    return equation(dict(zip(equation.inputs, (int(value) for value in row))))


@examples(150)
@given(st.data())
def test_values_are_those_of_sympy(data: st.DataObject) -> None:
    tree = data.draw(trees.trees())
    text = data.draw(trees.texts(tree))
    equation = Equation(text)
    names = names_of(tree)
    assert equation.text == text
    assert equation.inputs == tuple(names)
    expected = sympy_column(to_sympy(tree), names)
    rows = all_rows(len(names))

    assert same(equation.column(), expected)
    table = equation.truth_table()
    assert same(table[:, :-1], rows) and same(table[:, -1], expected)
    packed = equation.packed_column()
    assert packed.dtype == np.uint64 and packed.shape == ((len(expected) + 63) // 64,)
    assert number_of(expected) == sum(int(word) << 64 * place for place, word in enumerate(packed))
    assert same(equation.eval_many(rows), expected)
    assert [evaluate(equation, row) for row in rows] == expected.tolist()

    if not names:
        for name in ("hex_init", "binary_init"):
            with pytest.raises(ValueError):
                getattr(equation, name)()
        return
    digits = max(1, len(expected) // 4)
    assert equation.hex_init() == f"0x{number_of(expected):0{digits}x}"
    assert equation.binary_init() == f"0b{number_of(expected):0{len(expected)}b}"


@examples(100)
@given(st.data())
def test_listed_inputs_fix_the_order(data: st.DataObject) -> None:
    tree = data.draw(trees.trees(max_inputs=4))
    text = as_listed(data.draw(trees.texts(tree)))
    names = names_of(tree)
    listed = data.draw(st.permutations(names + data.draw(st.lists(st.sampled_from(EXTRA_NAMES),
                                                                  unique=True))))
    listed = listed[:data.draw(st.integers(0, len(listed)))]
    order = listed + [name for name in names if name not in listed]
    expected = sympy_column(to_sympy(tree), order)
    for lsb_first in (False, True):
        equation = Equation(text, inputs=iter(listed), lsb_first=lsb_first)
        assert equation.inputs == tuple(order)
        assert equation.given_inputs == tuple(listed) and equation.lsb_first is lsb_first
        assert same(equation.column(), expected)
        assert (equation == Equation(text)) == (order == names)
        assert equation.equivalent(text)


@examples(100)
@given(st.data())
def test_init_values_are_those_of_sympy(data: st.DataObject) -> None:
    num_inputs = data.draw(st.integers(1, 6))
    names = data.draw(st.permutations(trees.NAMES))[:num_inputs]
    num_rows = 2 ** num_inputs
    value = data.draw(st.integers(0, 2 ** num_rows - 1))
    lsb_first = data.draw(st.booleans())
    # The minterms of the value as SymPy numbers them: the first symbol is the most significant.
    order = names[::-1] if lsb_first else names
    minterms = [row for row in range(num_rows) if value >> row & 1]
    function = sum_of_products([symbol(name) for name in order], minterms)
    expected = sympy_column(function, names)

    forms: List[Any] = [value, f"0b{value:0{num_rows}b}", f"0B{value:0{num_rows}b}"]
    if num_inputs > 1:
        forms += [f"0x{value:0{num_rows // 4}x}", f"0x{value:0{num_rows // 4}X}"]
    for form in forms:
        equation = Equation.from_init(form, names, lsb_first=lsb_first)
        assert equation.inputs == equation.given_inputs == tuple(names)
        assert same(equation.column(), expected)
        assert same(equation.truth_table()[:, -1], expected)
        assert same(equation.eval_many(all_rows(num_inputs)), expected)
        again = Equation(as_listed(equation.expression), inputs=names)
        assert same(again.column(), expected)
        if isinstance(form, str):
            assert equation == Equation(form, names, lsb_first) and equation.primary == form
    again = Equation.from_init(Equation.from_init(value, names).binary_init(), names)
    assert number_of(again.column()) == value


@examples(100)
@given(st.data())
def test_renderings_read_back(data: st.DataObject) -> None:
    tree = data.draw(trees.trees(with_behind=False))
    equation = Equation(data.draw(trees.texts(tree)))
    expected = equation.column()
    syntax: Any
    for syntax in ("primary", "alt1", "alt2", "alt3", "expression"):
        assert equation.render(syntax) == getattr(equation, syntax)
        for spaces in (True, False):
            again = Equation(equation.render(syntax, spaces=spaces))
            assert again == equation and hash(again) == hash(equation)
            assert again.inputs == equation.inputs
            assert same(again.column(), expected)
    assert Equation(str(equation), equation.inputs).equivalent(equation)


@examples(100)
@given(st.data())
def test_copies_pickles_and_repr(data: st.DataObject) -> None:
    tree = data.draw(trees.trees())
    text = as_listed(data.draw(trees.texts(tree)))
    names = names_of(tree)
    inputs: Optional[List[str]] = data.draw(st.one_of(st.none(), st.permutations(names + ["x"])))
    equation = Equation(text, inputs, data.draw(st.booleans()))
    copies = [copy.copy(equation), copy.deepcopy(equation)]
    copies += [pickle.loads(pickle.dumps(equation, protocol))
               for protocol in range(pickle.HIGHEST_PROTOCOL + 1)]
    for other in copies:
        assert other == equation and other.inputs == equation.inputs
        assert (other.text, other.given_inputs, other.lsb_first) == \
            (text, equation.given_inputs, equation.lsb_first)
        assert same(other.column(), equation.column())
    again = eval(repr(equation), {"Equation": Equation})
    assert again == equation and again.inputs == equation.inputs
    assert repr(again) == repr(equation)


@examples(150)
@given(st.data())
def test_equal_equations_have_equal_hashes(data: st.DataObject) -> None:
    """Equations are equal exactly when their trees are, in types, names and groups."""
    first, second = (data.draw(trees.trees(names=("A", "b", "'A'"), max_inputs=2))
                     for _ in range(2))
    equations = [Equation(data.draw(trees.texts(tree)))
                 for tree in (first, first, second, trees.Not(first))]
    for value in data.draw(st.tuples(st.integers(0, 15), st.integers(0, 15))):
        form: Any = data.draw(st.sampled_from((value, f"0x{value:x}", f"0X{value:X}", f"0b{value:04b}")))
        equations.append(Equation.from_init(form, ["A", "b"]))

    def shape(equation: Equation) -> Any:
        if equation.text.startswith("0") and len(equation.text) > 2:
            return equation.inputs, equation.column().tolist()
        return equation.inputs, [(node.type, node.token if node.type in ("ID", "TRUTH_TABLE") else "", node.left,
                 node.right) for node in equation.tree()]

    for left, right in itertools.product(equations, repeat=2):
        assert (left == right) == (shape(left) == shape(right))
        assert (left != right) == (not left == right)
        if left == right:
            assert hash(left) == hash(right)
    assert len(set(equations)) == sum(all(one != other for other in equations[:place])
                                      for place, one in enumerate(equations))


@examples(100)
@given(st.data())
def test_equivalence_is_that_of_sympy(data: st.DataObject) -> None:
    first, second = (data.draw(trees.trees(names=trees.NAMES[:4])) for _ in range(2))
    names = list(dict.fromkeys(names_of(first) + names_of(second)))
    columns = [sympy_column(to_sympy(tree), names) for tree in (first, second)]
    found = Equation(data.draw(trees.texts(first))).equivalent(
        Equation(data.draw(trees.texts(second))))
    differing = np.flatnonzero(columns[0] != columns[1])
    assert bool(found) is found.equal is (len(differing) == 0)
    if found.equal:
        assert found.counterexample is None and found.values is None
    else:
        row = int(differing[0])
        assert found.counterexample == dict(zip(names, all_rows(len(names))[row].tolist()))
        assert found.values == (columns[0][row], columns[1][row])


@examples(80)
@given(st.data())
def test_permute_and_explain(data: st.DataObject) -> None:
    tree = data.draw(trees.trees(max_inputs=4))
    names = names_of(tree)
    equation = Equation(data.draw(trees.texts(tree)))
    order = data.draw(st.permutations(names + data.draw(st.lists(st.sampled_from(EXTRA_NAMES),
                                                                 unique=True))))
    function = to_sympy(tree)
    permuted = equation.permute(order)
    assert permuted.inputs == tuple(order)
    assert same(permuted.column(), sympy_column(function, order))
    assert equation.equivalent(permuted)

    explained = equation.explain()
    column = sympy_column(function, names)
    assert explained.inputs == tuple(names)
    if names:
        assert (explained.hex, explained.binary) == (equation.hex_init(), equation.binary_init())
    rows = column.reshape((2,) * len(names))
    assert explained.without_effect == tuple(
        name for axis, name in enumerate(names)
        if np.array_equal(np.take(rows, 0, axis), np.take(rows, 1, axis)))
    assert explained.expression is not None
    assert equation.equivalent(Equation(explained.expression))


def arrays_of(rows: npt.NDArray[np.uint8], kind: str) -> List[npt.NDArray[Any]]:
    """The rows as arrays of one kind of integer, in every byte order and kind of stride."""
    array = rows.astype(kind)
    num_rows, num_columns = array.shape
    wide = np.full((2 * num_rows, 2 * num_columns + 1), 1, dtype=kind)
    wide[::2, 1::2] = array
    backwards = np.ascontiguousarray(array[::-1, ::-1])[::-1, ::-1]
    item = array.dtype.itemsize
    shifted: npt.NDArray[Any] = np.ndarray(array.shape, kind, bytearray(array.nbytes + item + 1), offset=1)
    shifted[...] = array  # at an unaligned address
    frozen = array.copy()
    frozen.flags.writeable = False
    record = np.zeros(num_rows, dtype=[("a", "u1"), ("row", kind, (num_columns,))])
    record["row"] = array
    return [array, np.asfortranarray(array), wide[::2, 1::2], backwards, shifted, frozen,
            record["row"], array.view(np.matrix) if num_columns else array,
            masked_array(array)]


@pytest.mark.parametrize("kind", INTEGERS)
@pytest.mark.parametrize("num_inputs", [0, 1, 3, 7, 8, 9, 16, 17, 33, 70])
def test_eval_many_takes_every_array(kind: str, num_inputs: int) -> None:
    rng = np.random.default_rng(num_inputs)
    names = [f"n{place}" for place in range(num_inputs)]
    operators = rng.choice(["&", "|", "^", "~&", "~|", "~^"], max(0, num_inputs - 1))
    text = "".join(f"{name} {operator} " for name, operator in zip(names, operators)) + \
        (names[-1] if names else "1")
    equations = [Equation(text)]
    if 2 <= num_inputs <= 16:
        equations.append(Equation.from_init(equations[0].hex_init(), names))
    for equation in equations:
        for num_rows in (0, 1, 63, 64, 65, 300):
            rows = rng.integers(0, 2, (num_rows, num_inputs), dtype=np.uint8)
            # Evaluating an init value of 16 inputs once takes milliseconds.
            some = rows[:70] if equation is equations[0] else rows[:2]
            expected = np.array([evaluate(equation, row) for row in some], dtype=np.uint8)
            whole = equation.eval_many(rows)
            assert whole.shape == (num_rows,) and same(whole[:len(some)], expected)
            for array in arrays_of(rows, kind):
                assert same(equation.eval_many(array), whole)
            broadcast = np.broadcast_to(rows[:1].astype(kind), (5, num_inputs)) if num_rows else rows
            assert same(equation.eval_many(broadcast), np.repeat(whole[:1], 5)[:len(broadcast)])


@examples(60)
@given(st.data())
def test_eval_many_names_the_value_that_is_wrong(data: st.DataObject) -> None:
    num_inputs = data.draw(st.integers(1, 12))
    num_rows = data.draw(st.integers(1, 200))
    kind = data.draw(st.sampled_from(INTEGERS[1:]))
    equation = Equation("^".join(f"n{place}" for place in range(num_inputs)))
    array = np.zeros((num_rows, num_inputs), dtype=kind)
    row, column = data.draw(st.integers(0, num_rows - 1)), data.draw(st.integers(0, num_inputs - 1))
    limits = np.iinfo(array.dtype)
    value = data.draw(st.sampled_from((2, 127, limits.max, limits.min or 255, 128 if limits.max > 127
                                       else 3)))
    array[row, column] = value
    order: Any = data.draw(st.sampled_from("CF"))
    with pytest.raises(ValueError) as caught:
        equation.eval_many(array.copy(order=order))
    assert str(caught.value) == f"assignments[{row}, {column}] must be 0 or 1, not {value}"


@pytest.mark.parametrize("assignments", [
    [["0", "1"]], np.zeros((2, 2), complex), np.zeros((2, 2), "M8[s]"),
    np.zeros((2, 2), "m8[s]"), "01", None])
def test_eval_many_refuses_other_kinds(assignments: Any) -> None:
    with pytest.raises(TypeError):
        Equation("A & B").eval_many(assignments)


@pytest.mark.parametrize("shape", [(), (2,), (2, 1), (2, 3), (1, 2, 2), (0, 3), (2, 0)])
def test_eval_many_refuses_other_shapes(shape: Sequence[int]) -> None:
    with pytest.raises(ValueError, match="shape"):
        Equation("A & B").eval_many(np.zeros(shape, np.uint8))


def test_what_is_too_large_is_refused_before_it_is_made() -> None:
    many = Equation("^".join(f"n{place}" for place in range(31)))
    questions: List[Callable[[], Any]] = [
        many.column, many.packed_column, many.truth_table, many.explain, lambda: many.hex_init(),
        lambda: many.binary_init(), lambda: many.permute(many.inputs)]
    for question in questions:
        with pytest.raises(ValueError, match="30|24"):
            question()
    assert many.equivalent(many)  # this is decided without rows


def test_no_equation_without_a_text() -> None:
    with pytest.raises(TypeError, match="missing required argument 'text'"):
        Equation.__new__(Equation)  # type: ignore[call-arg]
    with pytest.raises(TypeError, match="missing required argument 'text'"):
        Equation()  # type: ignore[call-arg]
    with pytest.raises(TypeError):
        type(Equation("A")).__mro__[1]("A")


def test_threads() -> None:
    """Several threads make, query, refuse, pickle and drop equations, including shared ones."""
    shared = [Equation.from_init(number * 40503 % 65536, ["A", "B", "C", "D"])
              for number in range(16)]
    columns = [equation.column() for equation in shared]
    rows = all_rows(4)
    faults: List[str] = []
    barrier = threading.Barrier(6)

    def work(worker: int) -> None:
        try:
            barrier.wait(timeout=30)
            for step in range(150):
                place = (worker * 7 + step) % len(shared)
                equation = shared[place]
                expected = columns[place]
                text = f"t{worker}_{step} ^ ({equation.expression})"
                own = Equation(text, inputs=[f"t{worker}_{step}", "A", "B", "C", "D"])
                if not np.array_equal(own.column(), np.concatenate([expected, 1 - expected])):
                    faults.append(f"column of {text}")
                if not np.array_equal(equation.eval_many(rows), expected):
                    faults.append(f"eval_many of {equation!r}")
                row = step % 16
                if evaluate(equation, rows[row]) != expected[row]:
                    faults.append(f"value of {equation!r} in row {row}")
                if pickle.loads(pickle.dumps(own)) != own:
                    faults.append(f"pickle of {text}")
                with pytest.raises(ValueError):
                    Equation(f"t{worker}_{step} & &")
        except Exception as error:  # reported by the thread that started this one
            faults.append(repr(error))

    threads = [threading.Thread(target=work, args=(worker,)) for worker in range(6)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join(timeout=120)
    assert not any(thread.is_alive() for thread in threads)
    assert faults == []
