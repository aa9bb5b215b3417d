"""Nothing unused is kept: memory of the process and reference counts over many cycles, arrays that
outlive their equation, callbacks that fail or re-enter.

tracemalloc does not see what C++ allocates, so the process itself is measured. Names are the same in
each cycle: the library keeps a name for the life of the process.
"""
import copy
import ctypes
import gc
import pathlib
import pickle
import resource
import subprocess
import sys
import weakref
from typing import Any, Callable, Iterator, List, Mapping, Tuple, cast

import booleq
import numpy as np
import pytest
from booleq import Equation, LutArray, ParseError

TEXT = "(a & b | c) ^ ~(d ~& 'e[0]') .NOR. (f & g)"
NAMES = ["a", "b", "c", "d", "'e[0]'", "f", "g"]
ROWS = np.zeros((200, 7), np.uint8)
# The smallest leak is a reference: an object of some 50 bytes for each cycle. A few pages are
# noise.
NUM_CYCLES = 8000
MAX_GROWTH = 32 * NUM_CYCLES
BLOCK_SIZE = 48  # the least that Python's allocator uses for an object with a reference


def resident_bytes() -> int:
    pages = pathlib.Path("/proc/self/statm").read_text(encoding="ascii").split()[1]
    return int(pages) * resource.getpagesize()


def growth(cycle: Callable[[], object], num_cycles: int) -> int:
    """How much the process has grown over so many cycles, not counting the first ones. Python's own
    blocks may be in pages that the process had before, so their number counts as well."""
    trim = getattr(ctypes.CDLL(None), "malloc_trim", lambda _: 0)

    def measure() -> Tuple[int, int]:
        gc.collect()
        trim(0)
        return resident_bytes(), BLOCK_SIZE * sys.getallocatedblocks()

    for _ in range(num_cycles // 4):
        cycle()
    before = measure()
    for _ in range(num_cycles):
        cycle()
    return max(after - size for size, after in zip(before, measure()))


def refused(action: Callable[[], object], error: Any) -> None:
    try:
        action()
    except error:
        return
    raise AssertionError("not refused")


class Broken(Mapping[str, int]):
    """A mapping that fails when it is used."""

    def __getitem__(self, name: str) -> int:
        raise ZeroDivisionError(name)

    def __iter__(self) -> Iterator[str]:
        return iter(["a"])

    def __len__(self) -> int:
        return 1


def broken_names() -> Iterator[str]:
    yield "a"
    raise ZeroDivisionError


EQUATION = Equation(TEXT)
INIT = Equation.from_init(0x123456789abcdef, NAMES)
LUTS = LutArray(np.arange(100), 3)
CYCLES = {
    "construction": lambda: Equation(TEXT),
    "construction over inputs": lambda: Equation(TEXT, NAMES[::-1], True),
    "init value": lambda: Equation.from_init("0x123456789abcdef0123456789abcdef0", NAMES),
    "init value of an int": lambda: Equation.from_init(2 ** 128 - 5, NAMES, lsb_first=True),
    "tree of an init value": lambda: len(Equation.from_init("0x1234", NAMES[:4]).tree()),
    "refused text": lambda: refused(lambda: Equation(TEXT + " &"), ParseError),
    "refused structure": lambda: refused(lambda: Equation("(a && b) | c"), ParseError),
    "refused NUL": lambda: refused(lambda: Equation("a\0b"), ParseError),
    "refused surrogate": lambda: refused(lambda: Equation("\ud800"), UnicodeError),
    "refused name": lambda: refused(lambda: Equation(TEXT, ["a", "?"]), ValueError),
    "refused list": lambda: refused(lambda: Equation(TEXT, "abc"), TypeError),
    "refused int": lambda: refused(lambda: Equation.from_init(2 ** 128, NAMES), ValueError),
    "names that fail": lambda: refused(lambda: Equation(TEXT, broken_names()), ZeroDivisionError),
    "values that fail": lambda: refused(lambda: EQUATION(Broken()), ZeroDivisionError),
    "unknown name": lambda: refused(lambda: EQUATION(z=1), TypeError),
    "wrong value": lambda: refused(lambda: EQUATION(a=2), ValueError),
    "value": lambda: EQUATION({"'e[0]'": 1}, a=1, b=1, c=0, d=0, f=0, g=1),
    "missing value": lambda: refused(lambda: EQUATION(a=1), TypeError),
    "operators": lambda: (EQUATION & INIT | "h", ~EQUATION, 1 ^ INIT),
    "composition": lambda: (EQUATION.compose(a="x & y", b=0), EQUATION.cofactor(a=1),
                            INIT.cofactor(a=1), EQUATION.rename({"a": "z"})),
    "questions": lambda: (EQUATION.support, EQUATION.count_ones(), EQUATION.satisfiable()),
    "match": lambda: INIT.match(INIT),
    "conversion": lambda: (f"{EQUATION:verilog}", str(EQUATION)),
    "sorting": lambda: sorted([INIT, EQUATION]),
    "many": lambda: (booleq.equations([TEXT] * 3), Equation.from_inits([1, 2], ["a", "b"])),
    "refused among many": lambda: refused(lambda: booleq.equations([TEXT, "a &"]), ParseError),
    "by name": lambda: EQUATION.eval_many(dict.fromkeys(NAMES, ROWS[:, 0])),
    "tables": lambda: LUTS.permute([1, 0, 2]).canonical().forms.support(),
    "distinct tables": lambda: LUTS.unique(),
    "renderings": lambda: (EQUATION.primary, EQUATION.alt3, EQUATION.hex_init(), repr(EQUATION)),
    "eval_many": lambda: EQUATION.eval_many(ROWS),
    "eval_many of an init value": lambda: INIT.eval_many(ROWS[:3]),
    "eval_many of another order": lambda: EQUATION.eval_many(ROWS.T.astype(">i8").T),
    "wrong rows": lambda: refused(lambda: EQUATION.eval_many(ROWS + 2), ValueError),
    "wrong shape": lambda: refused(lambda: EQUATION.eval_many(ROWS[:, 1:]), ValueError),
    "wrong kind": lambda: refused(lambda: EQUATION.eval_many(ROWS * 1j), TypeError),
    "truth table": EQUATION.truth_table,
    "column": EQUATION.column,
    "packed column": lambda: Equation(TEXT).packed_column()[:1].copy(),
    "packed column, a view": lambda: Equation(TEXT).packed_column()[1:],
    "tree": EQUATION.tree,
    "picture as text": EQUATION.tree_dot,
    "equality": lambda: (EQUATION == INIT, EQUATION == 3, hash(Equation(TEXT)), EQUATION in {INIT}),
    "equivalence": lambda: EQUATION.equivalent(INIT),
    "order": lambda: INIT.permute(NAMES[::-1]),
    "copies": lambda: (copy.copy(EQUATION), copy.deepcopy(INIT)),
    "pickle": lambda: pickle.loads(pickle.dumps(EQUATION)),
    "table for people": EQUATION._repr_html_,
}
SLOW_CYCLES = {"lint": lambda: Equation("a | b & c").lint(),
               "explain": lambda: Equation("s & a | (~s & b)").explain()}


@pytest.mark.parametrize("name", CYCLES)
def test_no_cycle_leaves_anything(name: str) -> None:
    assert growth(CYCLES[name], NUM_CYCLES) < MAX_GROWTH


@pytest.mark.parametrize("name", SLOW_CYCLES)
def test_no_slow_cycle_leaves_anything(name: str) -> None:
    assert growth(SLOW_CYCLES[name], 400) < 2 ** 17  # a few pages


def test_a_leak_would_be_found() -> None:
    """One equation for each cycle, or a packed column of two words, is more than the bound."""
    kept: List[object] = []
    assert growth(lambda: kept.append(Equation(TEXT)), NUM_CYCLES) > MAX_GROWTH
    column: List[object] = []
    assert growth(lambda: column.append(EQUATION.packed_column()), NUM_CYCLES) > MAX_GROWTH


WIDE = [f"x{place}" for place in range(16)]
QUESTIONS: Mapping[str, Callable[[Equation], object]] = {
    "value": lambda eq: eq(dict.fromkeys(WIDE, 1)),
    "values of one row": lambda eq: eq.eval_many([[1] * 16]),
    "value by name": lambda eq: eq.eval_many(dict.fromkeys(WIDE, [0, 1])),
    "equality": lambda eq: (eq == EQUATION, hash(eq), eq < INIT),
    "support": lambda eq: (eq.support, eq.count_ones()),
    "decisions": lambda eq: (eq.satisfiable(), eq.is_tautology(), eq.equivalent(eq)),
    "init value": lambda eq: (eq.hex_init(), eq.sized_init(True), eq.primary, str(eq), repr(eq)),
    "others": lambda eq: (~eq, eq.cofactor(x3=1), eq.rename({"x1": "y"}), eq.permute(WIDE[::-1])),
    "columns": lambda eq: (eq.packed_column(), eq.column(), eq.truth_table()),
    "table for people": lambda eq: eq._repr_html_(),
}


@pytest.mark.parametrize("name", QUESTIONS)
def test_no_question_makes_the_tree_of_an_init_value(name: str) -> None:
    """For 16 inputs it has a million nodes, which stay as long as the equation."""
    value = int.from_bytes(np.random.default_rng(1).bytes(2 ** 13), "little")
    QUESTIONS[name](Equation.from_init(value ^ 1, WIDE))
    equation = Equation.from_init(value, WIDE)
    before = resident_bytes()
    QUESTIONS[name](equation)
    assert resident_bytes() - before < 8 << 20


def test_a_tree_would_be_found() -> None:
    value = int.from_bytes(np.random.default_rng(1).bytes(2 ** 13), "little")
    equation = Equation.from_init(value, WIDE)
    before = resident_bytes()
    equation.render("alt1")
    assert resident_bytes() - before > 32 << 20


def test_large_columns_go_with_their_arrays() -> None:
    """8 MB each, held by an array and a view of it, but not by an exception."""
    equation = Equation("^".join(f"n{place}" for place in range(26)))
    keep = equation.packed_column()
    before = resident_bytes()
    for _ in range(12):
        array = equation.packed_column()
        view = array[::2]
        del array
        assert int(view[1]) == int(keep[2])
        del view
    assert resident_bytes() - before < 6 * keep.nbytes  # a few pages of the twelve may stay


WITHOUT_A_THREAD = """
import resource
from booleq import Equation
equation = Equation("&".join(f"x{k}" for k in range(30)))
pages = int(open("/proc/self/statm").read().split()[0])
limit = pages * resource.getpagesize() + 2 ** 22  # less than the stack of a thread
resource.setrlimit(resource.RLIMIT_AS, (limit, resource.RLIM_INFINITY))
try:
    equation.packed_column()
except MemoryError:
    print("no memory")
"""


def test_a_thread_that_cannot_start_is_a_memory_error() -> None:
    """And the interpreter does not wait for it at its end."""
    done = subprocess.run([sys.executable, "-c", WITHOUT_A_THREAD], stdout=subprocess.PIPE, text=True,
                          timeout=60, check=True)
    assert done.stdout == "no memory\n"


def test_arrays_outlive_their_equation() -> None:
    equation = Equation.from_init(0xfedcba9876543210, NAMES[:6])
    packed, column, table = equation.packed_column(), equation.column(), equation.truth_table()
    results = equation.eval_many(table[:, :-1])
    alive = weakref.ref(equation)
    del equation
    assert alive() is None
    for _ in range(1000):  # freed memory is written to again
        Equation(TEXT).packed_column()
    assert packed.tolist() == [0xfedcba9876543210]
    bits = [0xfedcba9876543210 >> row & 1 for row in range(64)]
    assert column.tolist() == results.tolist() == table[:, -1].tolist() == bits


def test_reference_counts_stay() -> None:
    text, names = TEXT + " ", list(NAMES)
    array = ROWS.copy()
    watched: List[Any] = [text, names, *names, array, array.dtype, None, True, Equation, ParseError,
                          np.dtype("uint8"), np.dtype("uint64"), type(EQUATION.explain()), EQUATION,
                          type(INIT.equivalent(INIT)), 1, (), ""]
    gc.collect()  # reference cycles of earlier tests hold some of these
    before = [sys.getrefcount(item) for item in watched]
    num_cycles, no_bit = 500, cast(int, None)
    for _ in range(num_cycles):
        equation = Equation(text, names)
        equation(dict.fromkeys(names, 1))
        equation.eval_many(array)
        equation.equivalent(EQUATION).equal
        equation.inputs, equation & "z", equation.cofactor(a=1), sorted([equation, EQUATION])
        refused(lambda: equation.eval_many(array[:, 1:]), ValueError)
        refused(lambda: Equation(text + "&", names), ParseError)
        refused(lambda: Equation(text, names + names), ValueError)
        refused(lambda: equation(a=no_bit), TypeError)
        equation == text, equation != EQUATION, hash(equation)
        pickle.loads(pickle.dumps(equation)), copy.deepcopy(equation)
        equation.column(), equation.packed_column(), equation.tree()
    del equation
    gc.collect()
    changes = {repr(item)[:40]: sys.getrefcount(item) - count
               for item, count in zip(watched, before)}
    assert {name: change for name, change in changes.items()
            if abs(change) >= num_cycles / 4} == {}


def test_an_exception_holds_no_equation() -> None:
    equation = Equation(TEXT)
    alive = weakref.ref(equation)
    try:
        equation.eval_many(ROWS + 3)
    except ValueError as error:
        held = error.with_traceback(None)
    del equation
    assert alive() is None and "assignments[0, 0]" in str(held)


class ComesBack:
    """A value that uses the equation while the equation reads it."""

    def __init__(self, equation: Equation, value: int) -> None:
        self.equation, self.value = equation, value

    def __index__(self) -> int:
        self.equation(a=0, b=1)
        refused(lambda: Equation("x & &"), ParseError)
        return self.value


def test_values_that_come_back_in() -> None:
    for value in (0, 1):
        equation = Equation("a & b")
        assert equation({"b": 1}, a=ComesBack(equation, value)) == value
        refused(lambda: equation(a=ComesBack(equation, 2), b=1), ValueError)


def test_an_array_that_comes_back_in() -> None:
    equation = Equation("a ^ b")

    class Rows:
        def __array__(self, dtype: Any = None) -> Any:
            assert equation.eval_many([[1, 0]]).tolist() == [1]
            refused(lambda: Equation("x & &"), ParseError)
            return np.array([[1, 1], [0, 1]], np.int16)

    assert equation.eval_many(Rows()).tolist() == [0, 1]


def test_names_that_come_back_in() -> None:
    def names() -> Iterator[str]:
        for name in ("a", "b"):
            refused(lambda: Equation("x & &"), ParseError)
            yield name if Equation(name)({name: 0}) == 0 else ""

    assert Equation("b & a", names()).inputs == ("a", "b")
