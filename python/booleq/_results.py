"""The plain values that equations answer with, and the exception for a refused text.

All are immutable and can be keys of a dictionary. Each has a form for notebooks, and a repr that
stays short when equations are long.
"""
from __future__ import annotations

import reprlib
import typing
from dataclasses import dataclass, fields
from typing import Dict, Iterator, Literal, Mapping, Optional, Tuple

__all__ = ["Assignment", "Conversion", "Difference", "Equivalence", "Explanation", "Finding",
           "KarnaughMap", "LintReport", "Match", "Minimum", "Node", "ParseError", "Reading",
           "Satisfiability"]

_short = reprlib.Repr()
_short.maxstring = _short.maxother = 200
_short.maxtuple = 20
_short.maxdict = 20


class Report:
    """How all reports are shown."""

    __slots__ = ()

    def __repr__(self) -> str:
        shown = (f"{field.name}={_short.repr(getattr(self, field.name))}"
                 for field in fields(self))  # type: ignore[arg-type]
        return f"{type(self).__name__}({', '.join(shown)})"

    def _repr_html_(self) -> str:
        from ._display import report_html
        return report_html(self)


class Assignment(Mapping[str, int]):
    """A value, 0 or 1, for each input: a mapping that never changes.

    >>> from booleq import Assignment
    >>> assignment = Assignment({"a": 1, "b": 0})
    >>> assignment["a"], dict(assignment)
    (1, {'a': 1, 'b': 0})
    """

    __slots__ = ("_values",)
    _values: Dict[str, int]

    def __init__(self, values: Mapping[str, int]) -> None:
        object.__setattr__(self, "_values", dict(values))

    def __setattr__(self, name: str, value: object) -> typing.NoReturn:
        raise AttributeError("an Assignment never changes")

    def __getitem__(self, name: str) -> int:
        return self._values[name]

    def __iter__(self) -> Iterator[str]:
        return iter(self._values)

    def __len__(self) -> int:
        return len(self._values)

    def __eq__(self, other: object) -> bool:
        return super().__eq__(other)

    def __hash__(self) -> int:
        return hash(frozenset(self._values.items()))

    def __reduce__(self) -> Tuple[typing.Any, ...]:
        return (Assignment, (self._values,))

    def __repr__(self) -> str:
        if len(self._values) > 40:
            ones = sum(self._values.values())
            return f"<Assignment of {len(self._values)} inputs, {ones} of them 1>"
        return f"Assignment({self._values!r})"


class ParseError(ValueError):
    """A text that is not an equation: where it was refused, why, and what to write instead.

    >>> from booleq import Equation, ParseError
    >>> try:
    ...     Equation("A && B")
    ... except ParseError as error:
    ...     print(error.offset, error.length, error.code, error.hint, sep="; ")
    2; 1; no-right-operand; write '&' instead of '&&'
    """

    def __init__(self, message: str, text: str, offset: int, length: int, code: str, reason: str,
                 hint: str) -> None:
        super().__init__(message, text, offset, length, code, reason, hint)
        self.text = text
        self.offset = offset
        self.length = length
        self.code = code
        self.reason = reason
        self.hint = hint

    def __str__(self) -> str:
        return str(self.args[0])


class Node(typing.NamedTuple):
    """A node of Equation.tree(); parent, left and right are ids."""

    id: int
    type: str
    token: str
    parent: Optional[int]
    left: Optional[int]
    right: Optional[int]


@dataclass(frozen=True, repr=False)
class Equivalence(Report):
    """Whether two equations are the same function; true in a condition when they are.

    If not, counterexample is an assignment where they differ, and values are their values there.
    """

    equal: bool
    counterexample: Optional[Assignment]
    values: Optional[Tuple[int, int]]

    def __bool__(self) -> bool:
        return self.equal


@dataclass(frozen=True, repr=False)
class Satisfiability(Report):
    """Whether an equation is ever 1, and for which assignment; true in a condition when it is."""

    satisfiable: bool
    assignment: Optional[Assignment]

    def __bool__(self) -> bool:
        return self.satisfiable


@dataclass(frozen=True, repr=False)
class Match(Report):
    """How one equation becomes the other; true in a condition when it does.

    mapping has, for each input of the first, the input of the second that takes its place and
    whether it is inverted; output_inverted is about the result.
    """

    level: Optional[Literal["order", "inversions"]]
    mapping: Tuple[Tuple[str, str, bool], ...]
    output_inverted: bool

    def __bool__(self) -> bool:
        return self.level is not None


@dataclass(frozen=True, repr=False)
class Conversion(Report):
    """An equation as text of another program; str() is that text.

    names has pairs of an input and its name in the text. proved says that the text, read back, is
    the same function; otherwise doubt says why that is not known.
    """

    target: str
    text: str
    unit: Optional[str]
    output: Optional[str]
    names: Tuple[Tuple[str, str], ...]
    proved: bool
    doubt: Optional[str]

    def __str__(self) -> str:
        return self.text


@dataclass(frozen=True, repr=False)
class KarnaughMap(Report):
    """A Karnaugh map: cells has a tuple for each row; str() draws it with characters."""

    row_inputs: Tuple[str, ...]
    column_inputs: Tuple[str, ...]
    row_labels: Tuple[str, ...]
    column_labels: Tuple[str, ...]
    cells: Tuple[Tuple[int, ...], ...]

    def __str__(self) -> str:
        row_names = " ".join(self.row_inputs)
        width = max(len(row_names), len(self.row_inputs))
        cell = len(self.column_inputs)
        lines = [" " * width + "  " + " ".join(self.column_inputs),
                 "  ".join([row_names.ljust(width), *self.column_labels])]
        for label, values in zip(self.row_labels, self.cells):
            lines.append("  ".join([label.ljust(width), *(str(v).rjust(cell) for v in values)]))
        return "\n".join(lines)

    def _repr_html_(self) -> str:
        from ._display import map_html
        return map_html(self)


@dataclass(frozen=True, repr=False)
class Explanation(Report):
    """What Equation.explain() finds; None if there is no common name, or no expression."""

    inputs: Tuple[str, ...]
    hex: str
    binary: str
    without_effect: Tuple[str, ...]
    kind: Optional[str]
    function: Optional[str]
    expression: Optional[str]
    operands: Optional[int]
    minimal: bool


@dataclass(frozen=True, repr=False)
class Minimum(Report):
    """What Equation.minimize() finds; no sum has fewer terms than lower_bound."""

    inputs: Tuple[str, ...]
    expression: str
    cubes: Tuple[str, ...]
    terms: int
    literals: int
    lower_bound: int
    proved: bool


@dataclass(frozen=True, repr=False)
class Difference(Report):
    """The first assignment for which another notation gives another value."""

    assignment: Assignment
    here: int
    grouping: str
    reason: str
    write_there: str
    write_here: Optional[str]


@dataclass(frozen=True, repr=False)
class Reading(Report):
    """How another notation reads the text; refusal says why it cannot."""

    notation: str
    reads: bool
    refusal: Optional[str]
    same: Optional[bool]
    compared_all: Optional[bool]
    hex: Optional[str]
    difference: Optional[Difference]


@dataclass(frozen=True, repr=False)
class Finding(Report):
    """Something the library itself does that the writer of the text may not expect."""

    code: str
    message: str
    details: Tuple[Tuple[str, str], ...]


@dataclass(frozen=True, repr=False)
class LintReport(Report):
    """Which notations read the text as another function, and what may surprise here."""

    inputs: Tuple[str, ...]
    grouping: str
    readers: Tuple[Reading, ...]
    findings: Tuple[Finding, ...]
    is_clean: bool
