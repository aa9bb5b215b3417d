"""The class Equation: what users see; the compiled half does the work."""
from __future__ import annotations

from typing import (TYPE_CHECKING, Any, Dict, Iterable, List, Literal, Mapping, Optional,
                    SupportsIndex, Tuple, Union, final)

from . import _booleq
from ._columns import evaluate as _evaluate
from ._results import (Assignment, Conversion, Equivalence, Explanation, KarnaughMap, LintReport,
                       Match, Minimum, Node, Satisfiability)

if TYPE_CHECKING:
    import numpy as np
    import numpy.typing as npt
    import sympy

    from ._columns import Table

__all__ = ["Equation", "Operand", "Syntax", "Target", "equations", "minimize_pla"]

Syntax = Literal["primary", "alt1", "alt2", "alt3", "expression"]
Target = Literal["primary", "alt1", "alt2", "alt3", "paren", "verilog", "vhdl", "c", "python",
                 "liberty", "blif", "pla", "eqn"]
#: The other operand of an operator: an equation, a text, 0 or 1.
Operand = Union["Equation", str, SupportsIndex]
Bit = Union[SupportsIndex, "np.bool_"]

MAX_REPR = 200  # characters; repr() shortens a longer text
LINT_SECONDS = 10.0  # for each reader


def _seconds(seconds: Optional[float]) -> float:
    """The limit for the compiled half, where 0 means none."""
    if seconds is None:
        return 0.0
    if not isinstance(seconds, (int, float)):
        raise TypeError(f"seconds must be a number or None, not {type(seconds).__name__}")
    if not seconds > 0:
        raise ValueError("seconds must be above 0")
    return float(seconds)


@final
class Equation(_booleq.Core):
    """A Boolean equation, as text or as an init value over listed inputs: a value that never changes.

    text is an expression in any accepted syntax or, with inputs, an init value: "0x8", "0b1000" or
    "4'h8". inputs are names, the most significant first; names that occur only in the text follow
    them. With lsb_first the first input of an init value is bit 0 of the row number.

    >>> from booleq import Equation
    >>> eq = Equation("A & ~B")
    >>> eq.inputs
    ('A', 'B')
    >>> eq(A=1, B=0)
    1
    >>> eq | "C"
    Equation('(A & ~B) | C')
    >>> Equation("0x4", ["A", "B"]).expression
    '( A & ~ B )'

    A text that is refused raises ParseError, which has the place and often a hint. A name that is
    not legal, or is listed twice, raises ValueError.

    >>> Equation("A && B")
    Traceback (most recent call last):
        ...
    booleq.ParseError: refused at character 3: the operator '&' has no operand on its right; write '&' instead of '&&'

    Equations are equal when their texts are, however operators are spelled, over the same inputs in
    the same order; so equal ones have equal init values. equivalent() tells whether two are the
    same function. Equations can be sorted, and can be keys of a dictionary.

    >>> Equation("A & B") == Equation("A .AND. B"), Equation("A & B") == Equation("B & A")
    (True, False)

    A call takes a value for every input, by name or as a mapping.

    >>> Equation("A & 'B[0]'")({"'B[0]'": 1}, A=1)
    1
    >>> eq(A=1)
    Traceback (most recent call last):
        ...
    TypeError: missing 1 value: B; every input has one, and cofactor() fixes some of them
    """

    __slots__ = ()

    def __init_subclass__(cls) -> None:
        raise TypeError("Equation has no derived classes")

    # --- how equations are made ---------------------------------------------------------------

    @classmethod
    def from_init(cls, value: Union[str, SupportsIndex], inputs: Iterable[str],
                  lsb_first: bool = False) -> Equation:
        """The equation of an init value: "0x...", "0b...", a sized literal "8'hca", or an int.

        Bit k of the value is the result of row k. A text that is not an init value over so many
        inputs raises ParseError, an int that does not fit raises ValueError.

        >>> from booleq import Equation
        >>> Equation.from_init(0b0100, ["A", "B"]).alt1
        '( A & ~ B )'
        >>> Equation.from_init("0x2", ["A", "B"], lsb_first=True).hex_init()
        '0x4'
        """
        return _booleq.from_init(value, inputs, lsb_first)

    @classmethod
    def from_inits(cls, values: Any, inputs: Iterable[str],
                   lsb_first: bool = False) -> List[Equation]:
        """Many equations, from an array of integers or a list of ints and texts as for LutArray.

        >>> from booleq import Equation
        >>> Equation.from_inits([0x8, 0xe], ["A", "B"])
        [Equation('0x8', inputs=['A', 'B']), Equation('0xe', inputs=['A', 'B'])]
        """
        from ._luts import MAX_INPUTS, LutArray
        names = tuple(inputs)
        if len(names) > MAX_INPUTS:
            return [cls.from_init(value, names, lsb_first) for value in values]
        return LutArray(values, len(names), lsb_first=lsb_first).equations(names)

    @classmethod
    def from_verilog(cls, text: str, inputs: Optional[Iterable[str]] = None) -> Equation:
        """The equation of a Verilog expression, with Verilog's precedences and bits of vectors.

        Names that are not plain names here get quotes. A text that is not read raises ParseError.

        >>> from booleq import Equation
        >>> Equation.from_verilog(r"a | \\b[0] & ~c")
        Equation("a | ('b[0]' & ~c)")
        """
        return cls(_booleq.from_notation("verilog", text), inputs)

    @classmethod
    def from_vhdl(cls, text: str, inputs: Optional[Iterable[str]] = None) -> Equation:
        """The equation of a VHDL expression."""
        return cls(_booleq.from_notation("vhdl", text), inputs)

    @classmethod
    def from_python(cls, text: str, inputs: Optional[Iterable[str]] = None) -> Equation:
        """The equation of a Python expression, with True and False for 1 and 0."""
        return cls(_booleq.from_notation("python", text), inputs)

    @classmethod
    def from_liberty(cls, text: str, inputs: Optional[Iterable[str]] = None) -> Equation:
        """The equation of a function in a Liberty file, such as "A B + !C"."""
        return cls(_booleq.from_notation("liberty", text), inputs)

    @classmethod
    def from_sympy(cls, expression: sympy.Basic,
                   inputs: Optional[Iterable[str]] = None) -> Equation:
        """The equation of a Boolean SymPy expression, whose symbols are the inputs."""
        from ._sympy import to_text
        return cls(to_text(expression), inputs)

    # --- texts --------------------------------------------------------------------------------

    def render(self, syntax: Syntax = "primary", spaces: bool = True) -> str:
        """The equation as text: "primary", "alt1", "alt2", "alt3" or "expression".

        spaces=False leaves out the blanks between tokens; "~ |" may then become "~|", which is a
        different operator.

        >>> from booleq import Equation
        >>> Equation("A & ~B").render("alt3", spaces=False)
        'A.AND.~B'
        """
        return _booleq.render(self, syntax, spaces)

    @property
    def primary(self) -> str:
        """The equation with its operators as they were typed; an init value as it was given."""
        return _booleq.render(self, "primary", True)

    @property
    def alt1(self) -> str:
        """The equation written with & | ^ ~."""
        return _booleq.render(self, "alt1", True)

    @property
    def alt2(self) -> str:
        """The equation written with * + @ ~."""
        return _booleq.render(self, "alt2", True)

    @property
    def alt3(self) -> str:
        """The equation written with .AND. .OR. .XOR. ~."""
        return _booleq.render(self, "alt3", True)

    @property
    def expression(self) -> str:
        """primary, but alt1 for an init value: never "0x..."."""
        return _booleq.render(self, "expression", True)

    def convert(self, to: Target, *, name: Optional[str] = None, short: bool = False,
                seconds: Optional[float] = 10) -> Conversion:
        """The equation as text for another program, read back and compared before it is returned.

        name puts a module, an entity, a function or a cell of that name around it; short writes a
        short expression of the function instead of the one given.

        >>> from booleq import Equation
        >>> print(Equation("a | b & ~c").convert("verilog"))
        (a | b) & ~c
        """
        text, unit, output, names, is_proved, doubt = _booleq.convert(
            self, to, "" if name is None else name, short, _seconds(seconds))
        return Conversion(to, text.rstrip("\n"), unit or None, output or None, tuple(names),
                          is_proved, doubt or None)

    def hex_init(self, lsb_first: bool = False) -> str:
        """The results as one hexadecimal number, bit k being row k, leading zeros kept.

        With lsb_first the first input is bit 0 of k. ValueError without inputs or with over 30.

        >>> from booleq import Equation
        >>> Equation("A & ~B").hex_init(), Equation("A & ~B").hex_init(lsb_first=True)
        ('0x4', '0x2')
        """
        return _booleq.hex_init(self, lsb_first)

    def binary_init(self, lsb_first: bool = False) -> str:
        """The results as one binary number, the highest row first. ValueError as for hex_init.

        >>> from booleq import Equation
        >>> Equation("A & ~B").binary_init()
        '0b0100'
        """
        return _booleq.binary_init(self, lsb_first)

    def sized_init(self, lsb_first: bool = False) -> str:
        """The init value as a sized literal, as hardware languages write it.

        >>> from booleq import Equation
        >>> Equation("S & A | (~S & B)").sized_init()
        "8'hca"
        """
        return _booleq.sized_init(self, lsb_first)

    def __str__(self) -> str:
        """A text that reads back as the same function over the same inputs."""
        return _booleq.readable(self)

    def __repr__(self) -> str:
        text = self.text
        if len(text) > MAX_REPR:
            inputs = "1 input" if len(self.inputs) == 1 else f"{len(self.inputs):,} inputs"
            return (f"<Equation of {len(text):,} characters over {inputs}: "
                    f"{text[:60]!r}...>")
        words = [repr(text)]
        if self.given_inputs is not None:
            if len(self.given_inputs) > MAX_REPR // 4:
                return f"<Equation {text!r} over {len(self.inputs):,} inputs>"
            words.append(f"inputs={list(self.given_inputs)!r}")
        if self.lsb_first:
            words.append("lsb_first=True")
        return f"Equation({', '.join(words)})"

    def __format__(self, spec: str) -> str:
        """The equation in a syntax, for a target of convert(), or as "hex", "binary" or "sized".

        >>> from booleq import Equation
        >>> f"{Equation('a | b & ~c'):vhdl}"
        '(a or b) and not c'
        """
        if not spec:
            return str(self)
        digits = {"hex": self.hex_init, "binary": self.binary_init, "sized": self.sized_init}
        if spec in digits:
            return digits[spec]()
        if spec not in _booleq.conversion_targets():
            known = ", ".join([*_booleq.conversion_targets(), *digits])
            raise ValueError(f"there is no syntax {spec!r}; there are {known}")
        conversion = self.convert(spec)  # type: ignore[arg-type]
        return conversion.text

    # --- equations made from equations --------------------------------------------------------

    def __and__(self, other: Operand) -> Equation:
        """The AND of both. The inputs are those of the left one, then the others of the right one.

        >>> from booleq import Equation
        >>> Equation("a | b") & "c | d"
        Equation('(a | b) & (c | d)')
        """
        return _booleq.join(self, "&", other)

    def __rand__(self, other: Operand) -> Equation:
        return _booleq.join(other, "&", self)

    def __or__(self, other: Operand) -> Equation:
        """The OR of both."""
        return _booleq.join(self, "|", other)

    def __ror__(self, other: Operand) -> Equation:
        return _booleq.join(other, "|", self)

    def __xor__(self, other: Operand) -> Equation:
        """The exclusive-or of both."""
        return _booleq.join(self, "^", other)

    def __rxor__(self, other: Operand) -> Equation:
        return _booleq.join(other, "^", self)

    def __invert__(self) -> Equation:
        """The inversion; the inversion of an inversion is the equation itself."""
        return _booleq.invert(self)

    def compose(self, values: Optional[Mapping[str, Operand]] = None, /,
                **named: Operand) -> Equation:
        """The equation with inputs replaced by other equations, all at once.

        >>> from booleq import Equation
        >>> Equation("a & b").compose(a="x | y", b="a")
        Equation('(x | y) & a')
        """
        return _booleq.compose(self, _together(values, named))

    def cofactor(self, values: Optional[Mapping[str, Bit]] = None, /, **named: Bit) -> Equation:
        """The equation with some inputs fixed, over the others.

        >>> from booleq import Equation
        >>> Equation("S & A | (~S & B)", ["S", "A", "B"]).cofactor(S=0)
        Equation('B', inputs=['A', 'B'])
        """
        return _booleq.cofactor(self, _together(values, named))

    def rename(self, names: Mapping[str, str]) -> Equation:
        """The equation over other names. ValueError if two inputs would get the same name.

        >>> from booleq import Equation
        >>> Equation("A & B").rename({"A": "'bus[0]'"})
        Equation("'bus[0]' & B")
        """
        return _booleq.rename(self, dict(names))

    def permute(self, inputs: Iterable[str]) -> Equation:
        """The same function over another order of its inputs, as an init value.

        Names that are not inputs become further inputs. At most 24 inputs.

        >>> from booleq import Equation
        >>> Equation("0xca", ["S", "A", "B"]).permute(["A", "B", "S"])
        Equation('0xe4', inputs=['A', 'B', 'S'])
        """
        return _booleq.permute(self, inputs)

    # --- questions ----------------------------------------------------------------------------

    @property
    def support(self) -> Tuple[str, ...]:
        """The inputs that have an effect.

        >>> from booleq import Equation
        >>> Equation("a & (b | ~b)").support
        ('a',)
        """
        return _booleq.support(self)

    def count_ones(self) -> int:
        """For how many assignments of the inputs the result is 1. At most 30 inputs in the text.

        >>> from booleq import Equation
        >>> Equation("a | b").count_ones()
        3
        """
        num_ones, num_idle = _booleq.count_ones(self)
        return num_ones << num_idle

    def satisfiable(self, seconds: Optional[float] = None) -> Satisfiability:
        """Whether some assignment makes it 1, and one that does, for any number of inputs.

        TimeoutError when that takes longer than seconds.

        >>> from booleq import Equation
        >>> Equation("a & ~b").satisfiable()
        Satisfiability(satisfiable=True, assignment=Assignment({'a': 1, 'b': 0}))
        >>> bool(Equation("a & ~a").satisfiable())
        False
        """
        found = _booleq.find_other(self, False, _seconds(seconds))
        return Satisfiability(found is not None,
                              None if found is None else Assignment(found[0]))

    def is_tautology(self, seconds: Optional[float] = None) -> bool:
        """Whether every assignment makes it 1. TimeoutError as for satisfiable().

        >>> from booleq import Equation
        >>> Equation("a | ~a").is_tautology()
        True
        """
        return _booleq.find_other(self, True, _seconds(seconds)) is None

    def equivalent(self, other: Operand, seconds: Optional[float] = None) -> Equivalence:
        """Whether both are the same function of their inputs, by name; if not, where they differ.

        The answer is proved, for any number of inputs. Up to 30 inputs together, the counterexample
        is the first row that differs. TimeoutError if that takes longer than seconds.

        >>> from booleq import Equation
        >>> Equation("a | b & c").equivalent("a | (b & c)")
        Equivalence(equal=False, counterexample=Assignment({'a': 1, 'b': 0, 'c': 0}), values=(0, 1))
        """
        found = _booleq.find_difference(self, other, _seconds(seconds))
        if found is None:
            return Equivalence(True, None, None)
        return Equivalence(False, Assignment(found[0]), (found[1], found[2]))

    def match(self, other: Operand, *, order_only: bool = False,
              seconds: Optional[float] = None) -> Match:
        """Whether both are the same except for the order of inputs, or also inversions.

        Inputs without effect have no counterpart. At most 16 inputs with an effect.

        >>> from booleq import Equation
        >>> match = Equation("a & b").match("x ~| y")
        >>> match.level, match.mapping, match.output_inverted
        ('inversions', (('a', 'x', True), ('b', 'y', True)), False)
        """
        found = _booleq.match(self, other, order_only, _seconds(seconds))
        if found is None:
            return Match(None, (), False)
        return Match("inversions" if found[0] else "order", found[1], found[2])

    def explain(self) -> Explanation:
        """What the function is: its name, the inputs without effect, a short expression.

        ValueError for more than 16 inputs.

        >>> from booleq import Equation
        >>> Equation("0xca", ["S", "A", "B"]).explain().function
        'multiplexer, select S: A for S=1; B for S=0'
        """
        return _booleq.explain(self)

    def lint(self, seconds: Optional[float] = LINT_SECONDS) -> LintReport:
        """Which notations read the text as another function, and what may surprise here.

        seconds limits each comparison.

        >>> from booleq import Equation
        >>> report = Equation("a | b & c").lint()
        >>> report.is_clean, [reader.notation for reader in report.readers if reader.same is False]
        (False, ['Verilog', 'C', 'Liberty', 'Python'])
        """
        return _booleq.lint(self, _seconds(seconds))

    def minimize(self, *, dont_care: Optional[Operand] = None, exact: bool = False,
                 seconds: Optional[float] = None) -> Minimum:
        """A smallest sum of products, proved to be the same function before it is returned.

        In rows where dont_care is 1, the sum may be 0 or 1. exact searches until nothing smaller is
        possible, or for so many seconds.

        >>> from booleq import Equation
        >>> Equation("a ^ b").minimize(dont_care="a & b").expression
        'b | a'
        """
        return _booleq.minimize(self, dont_care, exact, _seconds(seconds))

    def kmap(self) -> KarnaughMap:
        """The Karnaugh map of up to six inputs; rows and columns are in Gray code order.

        >>> from booleq import Equation
        >>> print(Equation("A & B | C").kmap())
           B C
        A  00  01  11  10
        0   0   1   1   0
        1   0   1   1   1
        """
        return _booleq.kmap(self)

    def tree(self) -> List[Node]:
        """The nodes of the expression tree in pre-order. The list is flat: texts decide the depth.

        >>> from booleq import Equation
        >>> for node in Equation("a | b").tree():
        ...     print(node)
        Node(id=0, type='OR', token='|', parent=None, left=1, right=2)
        Node(id=1, type='ID', token='a', parent=0, left=None, right=None)
        Node(id=2, type='ID', token='b', parent=0, left=None, right=None)
        """
        return _booleq.tree(self)

    def tree_dot(self) -> str:
        """The tree as a graph for Graphviz."""
        return _booleq.tree_dot(self)

    def tree_svg(self) -> Optional[str]:
        """The tree as a picture, made by Graphviz's dot; None without it."""
        from ._display import svg
        return svg(self.tree_dot())

    def to_sympy(self) -> sympy.Basic:
        """The equation as a Boolean SymPy expression, with a symbol for each input."""
        from ._sympy import from_equation
        return from_equation(self)

    # --- many rows ----------------------------------------------------------------------------

    def eval_many(self, assignments: Table) -> npt.NDArray[np.uint8]:
        """The results for many assignments at once, as a uint8 array.

        By name: a DataFrame, a mapping of names to arrays, or a structured array, with a column for
        every input and no other. By position: anything that is an array of two dimensions, with a
        row for each assignment and a column for each input. Values are 0 and 1: bool, integers,
        floats, objects, pandas' nullable types. If a value is missing or masked, the answer is
        masked. Any number of inputs is allowed. ValueError for other values and columns, TypeError
        for other types.

        >>> from booleq import Equation
        >>> Equation("A & ~B").eval_many({"B": [0, 1], "A": [1, 1]})
        array([1, 0], dtype=uint8)
        >>> Equation("A & ~B").eval_many([[1, 0], [1, 1]])
        array([1, 0], dtype=uint8)
        """
        return _evaluate(self, assignments)

    def truth_table(self) -> npt.NDArray[np.uint8]:
        """All rows as a uint8 array: the values of the inputs, then the result.

        ValueError with more than 30 inputs, MemoryError for a table that does not fit.

        >>> from booleq import Equation
        >>> Equation("A & ~B").truth_table()
        array([[0, 0, 0],
               [0, 1, 0],
               [1, 0, 1],
               [1, 1, 0]], dtype=uint8)
        """
        return _booleq.truth_table(self)

    def column(self) -> npt.NDArray[np.uint8]:
        """The results of all rows as a uint8 array. ValueError with more than 30 inputs.

        >>> from booleq import Equation
        >>> Equation("A & ~B").column()
        array([0, 0, 1, 0], dtype=uint8)
        """
        return _booleq.column(self)

    def packed_column(self) -> npt.NDArray[np.uint64]:
        """The results of all rows, packed: row k is bit k % 64 of word k // 64 of a uint64 array.

        ValueError with more than 30 inputs. The array shows the library's memory, without a copy.

        >>> from booleq import Equation
        >>> Equation("A & ~B").packed_column()
        array([4], dtype=uint64)
        """
        return _booleq.packed_column(self)

    # --- copies and notebooks -----------------------------------------------------------------

    def __copy__(self) -> Equation:
        return self

    def __deepcopy__(self, memo: Dict[int, Any]) -> Equation:
        return self

    def __reduce__(self) -> Tuple[Any, ...]:
        return (Equation, (self.text, self.given_inputs, self.lsb_first))

    def _repr_html_(self) -> str:
        from ._display import equation_html
        return equation_html(self)


_booleq.set_equation_class(Equation)


def _together(values: Optional[Mapping[str, Any]], named: Dict[str, Any]) -> Dict[str, Any]:
    """The items of a mapping and named arguments, as one dict."""
    if values is None:
        return named
    if isinstance(values, str) or not hasattr(values, "keys"):
        raise TypeError(f"values must be a mapping of names, not {type(values).__name__}")
    together = dict(values)
    for name, value in named.items():
        if name in together:
            raise TypeError(f"the value of {name} is given twice")
        together[name] = value
    return together


def equations(texts: Iterable[str], inputs: Optional[Iterable[str]] = None,
              lsb_first: bool = False) -> List[Equation]:
    """The equations of many texts, read on all processors; inputs apply to all of them.

    The first text that is refused raises ParseError.

    >>> import booleq
    >>> booleq.equations(["A & B", "A | B"])
    [Equation('A & B'), Equation('A | B')]
    """
    return _booleq.equations(texts, inputs, lsb_first)


def minimize_pla(text: str, *, exact: bool = False, seconds: Optional[float] = None) -> str:
    r"""A PLA file's text, minimised, as a text of type f. ValueError for a fault, with its line.

    >>> import booleq
    >>> print(booleq.minimize_pla(".i 2\n.o 1\n01 1\n11 1\n"), end="")
    .i 2
    .o 1
    .type f
    .p 1
    -1 1
    .e
    """
    return _booleq.minimize_pla(text, exact, _seconds(seconds))
