"""The class LutArray: a million look-up tables of one width as one array of words."""
from __future__ import annotations

from dataclasses import dataclass
from operator import index
from typing import TYPE_CHECKING, Any, Iterable, List, Literal, Optional, Tuple, Union, final

import numpy as np
import numpy.typing as npt

from . import _booleq

if TYPE_CHECKING:
    from ._equation import Equation

__all__ = ["Canonical", "Distinct", "LutArray"]

MAX_INPUTS = 7
Words = npt.NDArray[np.unsignedinteger[Any]]
Places = npt.NDArray[np.uint64]
Flags = npt.NDArray[np.bool_]


def _word_type(num_inputs: int) -> Any:
    return np.uint16 if num_inputs <= 4 else np.uint32 if num_inputs == 5 else np.uint64


def _empty(size: int, num_inputs: int) -> Words:
    shape = (size, 2) if num_inputs == 7 else (size,)
    empty: Words = np.empty(shape, _word_type(num_inputs))
    return empty


def _from_two_words(words: Places, num_inputs: int) -> Words:
    """Rows of two words as tables of that width; below seven inputs, the second word must be 0."""
    if num_inputs == 7:
        return words
    limit = 1 << (1 << num_inputs)
    bad = np.flatnonzero((words[:, 1] != 0) | (words[:, 0] > np.uint64(limit - 1)))
    if len(bad):
        raise ValueError(f"values[{bad[0]}]: 0 <= value < 2**{1 << num_inputs}")
    return words[:, 0].astype(_word_type(num_inputs))


def _from_array(values: npt.NDArray[Any], num_inputs: int) -> Words:
    if values.dtype.kind not in "iu" and values.size:
        raise TypeError(f"values must be integers or texts, not {values.dtype}")
    if num_inputs == 7 and values.ndim == 2 and values.shape[1] == 2:
        return np.ascontiguousarray(values, dtype=np.uint64)
    if values.ndim != 1:
        raise ValueError("values must have one dimension" +
                         (", or a row of two words, rows 0 to 63 first, for each table"
                          if num_inputs == 7 else f", not {values.ndim}"))
    if values.dtype.kind == "i" and len(values) and values.min() < 0:
        raise ValueError(f"values[{int(values.argmin())}] is below 0")
    wide = values.astype(np.uint64, copy=False)
    if num_inputs == 7:
        return np.stack([wide, np.zeros_like(wide)], axis=1)
    if num_inputs < 6 and len(wide) and wide.max() >= 1 << (1 << num_inputs):
        raise ValueError(f"values[{int(wide.argmax())}]: 0 <= value < 2**{1 << num_inputs}")
    return np.ascontiguousarray(wide, dtype=_word_type(num_inputs))


@final
class LutArray:
    """Look-up tables of 1 to 7 inputs, which never change: one word each, two words for 7 inputs.

    values is an array of integers, or a list of ints and texts: "0xca", "0b11001010", "8'hca". Bit
    k is the result of row k. The first input is the most significant bit of the row number, or with
    lsb_first the least.

    >>> from booleq import LutArray
    >>> luts = LutArray([0xca, "0xe4", "8'h96"], 3)
    >>> luts
    LutArray(['0xca', '0xe4', '0x96'], num_inputs=3)
    >>> luts.count_ones()
    array([4, 4, 4], dtype=uint8)
    >>> luts.permute([1, 2, 0])[0]
    '0xe4'
    >>> luts.unique().luts
    LutArray(['0x96', '0xca', '0xe4'], num_inputs=3)
    """

    __slots__ = ("_words", "_num_inputs")
    _words: Words
    _num_inputs: int

    def __init__(self, values: Any, num_inputs: int, *, lsb_first: bool = False) -> None:
        num_inputs = index(num_inputs)
        if not 1 <= num_inputs <= MAX_INPUTS:
            raise ValueError(f"num_inputs must be 1 to {MAX_INPUTS}, not {num_inputs}")
        if isinstance(values, LutArray):
            values = values.words
        if isinstance(values, (str, bytes)):
            raise TypeError("values must be an array or a list, not a single text")
        if isinstance(values, np.ndarray) and values.dtype.kind not in "OUS":
            words = _from_array(values, num_inputs)
        else:
            listed = values.tolist() if isinstance(values, np.ndarray) else list(values)
            two = np.empty((len(listed), 2), np.uint64)
            _booleq.lut_read(listed, num_inputs, two)
            words = _from_two_words(two, num_inputs)
        if lsb_first:
            order = np.arange(num_inputs, dtype=np.uint8)[::-1].copy()
            turned = np.empty_like(words)
            _booleq.lut_permute(words, num_inputs, order, turned)
            words = turned
        elif words is values:
            words = words.copy()
        self._set(words, num_inputs)

    def _set(self, words: Words, num_inputs: int) -> None:
        words.flags.writeable = False
        object.__setattr__(self, "_words", words)
        object.__setattr__(self, "_num_inputs", num_inputs)

    @classmethod
    def _of(cls, words: Words, num_inputs: int) -> LutArray:
        made = cls.__new__(cls)
        made._set(words, num_inputs)
        return made

    def __setattr__(self, name: str, value: object) -> None:
        raise AttributeError("a LutArray never changes")

    @property
    def num_inputs(self) -> int:
        """How many inputs each table has."""
        return self._num_inputs

    @property
    def words(self) -> Words:
        """The tables: uint16 up to 4 inputs, uint32, uint64; for 7 inputs, rows of two words."""
        return self._words

    def __array__(self, dtype: Any = None) -> npt.NDArray[Any]:
        return self._words if dtype is None else self._words.astype(dtype)

    def __len__(self) -> int:
        return len(self._words)

    def __getitem__(self, key: Any) -> Any:
        """One table as an init value; with a slice, or an array of places or bools, a LutArray."""
        if isinstance(key, (int, np.integer)):
            return self._hex(self._words[key])
        return LutArray._of(np.ascontiguousarray(self._words[key]), self._num_inputs)

    __iter__ = None  # it would loop over a million tables: use arrays, or equations()

    def _hex(self, word: Any) -> str:
        value = int(word) if self._num_inputs < 7 else int(word[0]) | int(word[1]) << 64
        return f"0x{value:0{max(1, (1 << self._num_inputs) // 4)}x}"

    def __eq__(self, other: object) -> bool:
        """Whether all tables are the same. To see which ones are: luts.words == others.words."""
        return (isinstance(other, LutArray) and self._num_inputs == other._num_inputs and
                np.array_equal(self._words, other._words))

    def __hash__(self) -> int:
        return hash((self._num_inputs, self._words.tobytes()))

    def __repr__(self) -> str:
        shown = [self._hex(word) for word in self._words[:6]]
        if len(self) > 6:
            return f"<LutArray of {len(self):,} tables of {self._num_inputs} inputs: " \
                   f"{', '.join(shown)}, ...>"
        return f"LutArray({shown!r}, num_inputs={self._num_inputs})"

    def __reduce__(self) -> Tuple[Any, ...]:
        return (LutArray, (np.array(self._words), self._num_inputs))

    def __copy__(self) -> LutArray:
        return self

    def __deepcopy__(self, memo: Any) -> LutArray:
        return self

    # --- values -------------------------------------------------------------------------------

    def evaluate(self, assignment: npt.ArrayLike) -> npt.NDArray[np.uint8]:
        """The value of every table, for one assignment of the inputs or for one each.

        assignment has a 0 or 1 for each input, or such a row for each table.

        >>> from booleq import LutArray
        >>> LutArray([0x8, 0xe], 2).evaluate([1, 0])
        array([0, 1], dtype=uint8)
        """
        bits: npt.NDArray[Any] = np.asarray(assignment)
        if bits.dtype.kind not in "biu" or (bits.size and not 0 <= bits.min() <= bits.max() <= 1):
            raise ValueError("an assignment has a 0 or 1 for each input")
        if bits.shape not in ((self._num_inputs,), (len(self), self._num_inputs)):
            raise ValueError(f"an assignment has {self._num_inputs} values, in one row or in "
                             f"{len(self)}, not the shape {bits.shape}")
        rows = np.zeros(bits.shape[:-1], np.uint8)
        for place in range(self._num_inputs):  # at most seven, whole columns at a time
            rows = (rows << 1 | bits[..., place].astype(np.uint8)).astype(np.uint8)
        results = np.empty(len(self), np.uint8)
        _booleq.lut_evaluate(self._words, self._num_inputs, np.array(rows), results)
        return results

    def count_ones(self) -> npt.NDArray[np.uint8]:
        """In how many rows each table is 1."""
        results = np.empty(len(self), np.uint8)
        _booleq.lut_count_ones(self._words, self._num_inputs, results)
        return results

    def support(self) -> Flags:
        """Which inputs matter, with a row for each table and a column for each input.

        >>> from booleq import LutArray
        >>> LutArray([0xc, 0x6], 2).support()
        array([[ True, False],
               [ True,  True]])
        """
        results = np.empty((len(self), self._num_inputs), np.bool_)
        _booleq.lut_supports(self._words, self._num_inputs, results.view(np.uint8))
        return results

    def idle(self) -> Flags:
        """Which inputs have no effect: the opposite of support()."""
        return ~self.support()

    # --- other tables -------------------------------------------------------------------------

    def permute(self, order: npt.ArrayLike) -> LutArray:
        """The tables over another order of the inputs, or over one each.

        order has the old place of each new input, the most significant first: 0 is the input that
        was the most significant. It may have such a row for each table.
        """
        places: npt.NDArray[Any] = np.asarray(order)
        if places.shape not in ((self._num_inputs,), (len(self), self._num_inputs)):
            raise ValueError(f"an order has {self._num_inputs} places, in one row or in "
                             f"{len(self)}, not the shape {places.shape}")
        if places.dtype.kind not in "iu" or (places.size and not 0 <= places.min() <=
                                             places.max() < self._num_inputs):
            raise ValueError(f"an order has the places 0 to {self._num_inputs - 1}, each once")
        results = np.empty_like(self._words)
        bad = _booleq.lut_permute(self._words, self._num_inputs,
                                  np.ascontiguousarray(places, dtype=np.uint8), results)
        if bad is not None:
            where = f"the order of table {bad}" if places.ndim > 1 else "the order"
            raise ValueError(f"{where} must have the places 0 to {self._num_inputs - 1}, each once")
        return LutArray._of(results, self._num_inputs)

    def invert(self) -> LutArray:
        """Every table inverted; also ~luts."""
        results = np.empty_like(self._words)
        _booleq.lut_invert(self._words, self._num_inputs, results)
        return LutArray._of(results, self._num_inputs)

    __invert__ = invert

    def cofactor(self, place: int, value: int) -> LutArray:
        """The tables with this input fixed, over the other inputs; at least two inputs.

        >>> from booleq import LutArray
        >>> LutArray([0xca], 3).cofactor(0, 1)
        LutArray(['0xc'], num_inputs=2)
        """
        if not 0 <= place < self._num_inputs or self._num_inputs < 2:
            raise ValueError(f"there is no input {place} to fix of {self._num_inputs}")
        if value not in (0, 1):
            raise ValueError(f"the value must be 0 or 1, not {value}")
        results = _empty(len(self), self._num_inputs - 1)
        _booleq.lut_fix(self._words, self._num_inputs, place, bool(value), results)
        return LutArray._of(results, self._num_inputs - 1)

    def unique(self) -> Distinct:
        """The distinct tables, each once."""
        return self._distinct(*_booleq.lut_distinct(self._words, self._num_inputs))

    def _distinct(self, words: Places, first: Places, counts: Places, inverse: Places) -> Distinct:
        shaped = words.reshape(-1, 2) if self._num_inputs == 7 else words
        luts = LutArray._of(np.ascontiguousarray(shaped, dtype=_word_type(self._num_inputs)),
                            self._num_inputs)
        return Distinct(luts, first.astype(np.intp), counts.astype(np.intp), inverse.astype(np.intp))

    def canonical(self, scope: Literal["npn", "order"] = "npn") -> Canonical:
        """One form for all tables that are the same function up to the order of inputs and
        inversions ("npn"), or up to the order alone. Exact, up to six inputs.

        >>> from booleq import LutArray
        >>> LutArray([0x8, 0xe, 0x1], 2).canonical().forms
        LutArray(['0x1', '0x1', '0x1'], num_inputs=2)
        """
        if scope not in ("npn", "order"):
            raise ValueError(f"scope must be 'npn' or 'order', not {scope!r}")
        if self._num_inputs > 6:
            raise ValueError("canonical forms are for up to six inputs")
        size, width = len(self), self._num_inputs
        forms = np.empty_like(self._words)
        orders = np.empty((size, width), np.uint8)
        inverted = np.empty((size, width), np.bool_)
        outputs = np.empty(size, np.bool_)
        _booleq.lut_canonical(self._words, width, scope == "npn", forms, orders,
                              inverted.view(np.uint8), outputs.view(np.uint8))
        return Canonical(LutArray._of(forms, width), orders, inverted, outputs)

    # --- words for people ---------------------------------------------------------------------

    def explain(self, inputs: Iterable[str]) -> Described:
        """The name and a short expression of each distinct function over these inputs.

        >>> from booleq import LutArray
        >>> found = LutArray([0xca, 0xca, 0x96], 3).explain(["S", "A", "B"])
        >>> found.kinds, found.expressions
        (('XOR', 'multiplexer'), ('S ^ A ^ B', '(S & A) | (~S & B)'))
        >>> found.distinct.counts, found.distinct.inverse
        (array([1, 2]), array([1, 1, 0]))
        """
        words, first, counts, inverse, texts = _booleq.lut_describe(
            self._words, self._num_inputs, inputs)
        distinct = self._distinct(words, first, counts, inverse)
        kinds, functions, expressions, operands, minimal = zip(*texts) if texts else ((),) * 5
        return Described(distinct, kinds, functions, expressions, operands, minimal)

    def equations(self, inputs: Iterable[str]) -> List[Equation]:
        """Every table as an equation over these inputs, the most significant first."""
        names = tuple(inputs)
        if len(names) != self._num_inputs:
            raise ValueError(f"inputs must be {self._num_inputs} names, not {len(names)}")
        wide = self._words.astype(np.uint64).reshape(len(self), -1)
        return _booleq.from_words(np.ascontiguousarray(wide), names)

    def _repr_html_(self) -> str:
        from ._display import luts_html
        return luts_html(self)


@dataclass(frozen=True, eq=False)
class Distinct:
    """The distinct tables of an array, in ascending order.

    first has the first place of each in the array, counts how often it occurs, and inverse has, for
    each table of the array, its place among the distinct ones.
    """

    luts: LutArray
    first: npt.NDArray[np.intp]
    counts: npt.NDArray[np.intp]
    inverse: npt.NDArray[np.intp]


@dataclass(frozen=True, eq=False)
class Canonical:
    """Canonical forms, and how each table becomes its form.

    Input k of the form is input orders[:, k] of the table, inverted if inverted[:, k] is set; the
    result is inverted if output_inverted is set.
    """

    forms: LutArray
    orders: npt.NDArray[np.uint8]
    inverted: Flags
    output_inverted: Flags


@dataclass(frozen=True, eq=False)
class Described:
    """What the distinct tables of an array are; None for one without a name or an expression.

    kinds are common names, functions add the inputs, expressions are texts for Equation, operands
    count the inputs in these, and minimal tells whether no shorter one exists.
    """

    distinct: Distinct
    kinds: Tuple[Optional[str], ...]
    functions: Tuple[Optional[str], ...]
    expressions: Tuple[Optional[str], ...]
    operands: Tuple[int, ...]
    minimal: Tuple[bool, ...]
