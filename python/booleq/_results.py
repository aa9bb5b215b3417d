"""Plain values that equations answer with, and the exception of a refused text."""
import typing
from dataclasses import dataclass
from typing import Dict, Optional, Tuple

from ._booleq import Equation

__all__ = ["Difference", "Equivalence", "Explanation", "Finding", "LintReport", "Minimum",
           "Node", "ParseError", "Reading"]


class ParseError(ValueError):
    """A text that is no equation: where it was refused, why, and what to write instead.

    >>> from booleq import Equation, ParseError
    >>> try:
    ...     Equation("A && B")
    ... except ParseError as error:
    ...     print(error.offset, error.length, error.code, error.hint, sep="; ")
    2; 1; no-right-operand; write '&' for '&&'
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


@dataclass(frozen=True)
class Equivalence:
    """Whether two equations are one function; true in a condition when they are."""

    equal: bool
    counterexample: Optional[Dict[str, int]]
    values: Optional[Tuple[int, int]]

    def __bool__(self) -> bool:
        return self.equal


@dataclass(frozen=True)
class Explanation:
    """What Equation.explain() finds out; None where there is no common name, or no expression."""

    inputs: Tuple[str, ...]
    hex: str
    binary: str
    without_effect: Tuple[str, ...]
    kind: Optional[str]
    function: Optional[str]
    expression: Optional[str]
    operands: Optional[int]
    minimal: bool


@dataclass(frozen=True)
class Minimum:
    """What Equation.minimize() finds; no sum has fewer terms than lower_bound."""

    inputs: Tuple[str, ...]
    expression: str
    cubes: Tuple[str, ...]
    terms: int
    literals: int
    lower_bound: int
    proved: bool


@dataclass(frozen=True)
class Difference:
    """The first assignment for which another notation reads another value."""

    assignment: Dict[str, int]
    here: int
    grouping: str
    reason: str
    write_there: str
    write_here: Optional[str]


@dataclass(frozen=True)
class Reading:
    """How another notation reads the text; refusal says why it does not."""

    notation: str
    reads: bool
    refusal: Optional[str]
    same: Optional[bool]
    compared_all: Optional[bool]
    hex: Optional[str]
    difference: Optional[Difference]


@dataclass(frozen=True)
class Finding:
    """Where the library itself does what the writer of the text may not expect."""

    code: str
    message: str
    details: Dict[str, str]


@dataclass(frozen=True)
class LintReport:
    """Who reads the text as another function, and what surprises here."""

    inputs: Tuple[str, ...]
    grouping: str
    readers: Tuple[Reading, ...]
    findings: Tuple[Finding, ...]
    is_clean: bool


def restore(text: str, inputs: Optional[typing.Iterable[str]], lsb_first: bool,
            ones: typing.Iterable[str]) -> Equation:
    """The equation that pickle was given."""
    equation = Equation(text, inputs, lsb_first)
    for name in ones:
        equation[name] = 1
    return equation
