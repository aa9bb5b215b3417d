"""Random equations as trees: their meaning is known from the tree, never from reading the text.

The same tree is written as a text in this library's syntax and built as a function of SymPy.
Hypothesis draws the trees; its profile is fixed, so that a run can be repeated:
BOOLEQ_EXAMPLES=N draws N times as many, and different ones in each run.
"""
import importlib
import os
from typing import Any, Dict, List, NamedTuple, Sequence, Tuple, Union

import numpy as np
import numpy.typing as npt
from hypothesis import HealthCheck, settings
from hypothesis import strategies as st

FACTOR = int(os.environ.get("BOOLEQ_EXAMPLES", "1"))
NAMES = ("A", "b", "_c", "d_1", "and", "lambda", "S", "'A[0]'", "'a b'", "''", "'\u00e4\u20ac'",
         "'\U0001f600'", "'\udcff'")
SPELLINGS: Dict[str, Sequence[str]] = {
    "AND": ("&", "*", ".AND."), "OR": ("|", "+", ".OR."), "XOR": ("^", "@", ".XOR."),
    "NAND": ("~&", "~*", "!&", "!*", ".NAND."), "NOR": ("~|", "~+", "!|", "!+", ".NOR."),
    "NXOR": ("~^", "~@", "!^", "!@", ".NXOR."), "NOT": ("~", "!", ".NOT.")}
OPERATORS = tuple(name for name in SPELLINGS if name != "NOT")


def examples(count: int) -> settings:
    """So many examples, the same in every run; more and different ones with BOOLEQ_EXAMPLES."""
    return settings(max_examples=count * FACTOR, derandomize=FACTOR == 1, deadline=None,
                    database=None, suppress_health_check=list(HealthCheck))


class Name(NamedTuple):
    name: str


class Constant(NamedTuple):
    value: int


class Not(NamedTuple):
    operand: Any


class Binary(NamedTuple):
    operator: str
    left: Any
    right: Any


class Behind(NamedTuple):
    """X ~ op Y op2 Z, with a blank after the negation: the negation of ((X op Y) op2 Z)."""

    first: Name
    rest: Tuple[Tuple[str, Any], ...]


Tree = Union[Name, Constant, Not, Binary, Behind]


@st.composite
def trees(draw: st.DrawFn, names: Sequence[str] = NAMES, max_inputs: int = 6,
          with_behind: bool = True) -> Tree:
    own = draw(st.lists(st.sampled_from(names), min_size=min(3, max_inputs), max_size=max_inputs, unique=True))
    leaf: st.SearchStrategy[Tree] = st.builds(Name, st.sampled_from(own))
    constant: st.SearchStrategy[Tree] = st.builds(Constant, st.integers(0, 1))

    def grow(depth: int) -> Tree:
        kind = draw(kinds) if depth else draw(leaves)
        if kind == "name":
            return draw(leaf)
        if kind == "constant":
            return draw(constant)
        if kind == "not":
            return Not(grow(depth - 1))
        if kind == "behind":
            count = draw(st.integers(1, 2))
            return Behind(Name(draw(st.sampled_from(own))),
                          tuple((draw(st.sampled_from(OPERATORS)), grow(depth - 1))
                                for _ in range(count)))
        return Binary(draw(st.sampled_from(OPERATORS)), grow(depth - 1), grow(depth - 1))

    leaves = st.sampled_from(("name",) * 9 + ("constant",))
    kinds = st.sampled_from(("name", "not", "not") + ("binary",) * 6 +
                            (("behind",) if with_behind else ()))
    return grow(draw(st.sampled_from((0, 1, 2, 3, 3, 4, 4, 4))))


def names_of(tree: Tree) -> List[str]:
    """The names in the order of the text, each once."""
    if isinstance(tree, Name):
        return [tree.name]
    if isinstance(tree, Constant):
        return []
    if isinstance(tree, Not):
        parts: Sequence[Tree] = [tree.operand]
    elif isinstance(tree, Binary):
        parts = [tree.left, tree.right]
    else:
        parts = [tree.first, *(operand for _, operand in tree.rest)]
    return list(dict.fromkeys(name for part in parts for name in names_of(part)))


@st.composite
def texts(draw: st.DrawFn, tree: Tree, blanks: bool = True) -> str:
    """One way to write the tree: any spelling, any blanks; a group where a tree needs it."""

    def blank() -> str:
        return draw(st.sampled_from(("", " ", "  ", "\t", "\n"))) if blanks else ""

    def spelled(operator: str) -> str:
        return draw(st.sampled_from(SPELLINGS[operator]))

    def grouped(part: Tree) -> str:
        text = write(part)
        if isinstance(part, (Binary, Behind)):
            return "(" + blank() + text + blank() + ")"
        return text

    def write(part: Tree) -> str:
        if isinstance(part, Name):
            return part.name
        if isinstance(part, Constant):
            return str(part.value)
        if isinstance(part, Not):
            return spelled("NOT") + blank() + grouped(part.operand)
        if isinstance(part, Behind):
            found = write(part.first)
            for place, (operator, operand) in enumerate(part.rest):
                # The negation needs blanks, or it would be part of the operator.
                found += f" {spelled('NOT')} " if place == 0 else blank()
                found += spelled(operator) + blank() + grouped(operand)
            return found
        # Operators group from the left, so the left operand needs no group.
        is_bare = isinstance(part.left, Binary) and draw(st.booleans())
        left = write(part.left) if is_bare else grouped(part.left)
        return left + blank() + spelled(part.operator) + blank() + grouped(part.right)

    return write(tree)


# SymPy has no type hints, and mypy would take long to read all of it.
sympy: Any = importlib.import_module("sympy")
boolalg: Any = importlib.import_module("sympy.logic.boolalg")
symbol, sum_of_products, truth_table = sympy.Symbol, sympy.SOPform, boolalg.truth_table
SYMPY = {"AND": boolalg.And, "OR": boolalg.Or, "XOR": boolalg.Xor, "NAND": boolalg.Nand,
         "NOR": boolalg.Nor, "NXOR": boolalg.Xnor}


def to_sympy(tree: Tree) -> Any:
    if isinstance(tree, Name):
        return symbol(tree.name)
    if isinstance(tree, Constant):
        return boolalg.true if tree.value else boolalg.false
    if isinstance(tree, Not):
        return boolalg.Not(to_sympy(tree.operand))
    if isinstance(tree, Binary):
        return SYMPY[tree.operator](to_sympy(tree.left), to_sympy(tree.right))
    found = to_sympy(tree.first)
    for operator, operand in tree.rest:
        found = SYMPY[operator](found, to_sympy(operand))
    return boolalg.Not(found)


def all_rows(num_inputs: int) -> npt.NDArray[np.uint8]:
    """Every assignment; row k is the binary number k."""
    numbers = np.arange(2 ** num_inputs, dtype=np.uint32)[:, None]
    places = np.arange(num_inputs - 1, -1, -1, dtype=np.uint32)[None, :]
    return (numbers >> places & 1).astype(np.uint8)


def sympy_column(function: Any, names: Sequence[str]) -> npt.NDArray[np.uint8]:
    """SymPy's truth table of the function over the names, the first the most significant."""
    rows = truth_table(function, [symbol(name) for name in names])
    return np.array([bool(value) for _, value in rows], dtype=np.uint8)
