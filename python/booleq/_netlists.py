"""Netlists: every look-up table of a design with its nets, compared, counted and checked."""
from __future__ import annotations

import errno
import os
import re
from dataclasses import dataclass
from typing import (IO, TYPE_CHECKING, Any, Iterator, List, Literal, Mapping, NamedTuple, Optional,
                    Tuple, Union, final)

import numpy as np
import numpy.typing as npt

from . import _booleq
from ._luts import MAX_INPUTS, LutArray
from ._results import Assignment, Report

if TYPE_CHECKING:
    import pandas as pd

__all__ = ["CellCount", "FunctionCount", "LoneTable", "Netlist", "NetlistDiff", "NetlistError",
           "NetlistFinding", "NetlistStats", "NetlistTable", "NetlistTables", "RenamedNet",
           "TableDifference", "read_netlist"]

Numbers = npt.NDArray[np.uint32]
Words = npt.NDArray[np.uint64]
Source = Union[str, "os.PathLike[str]", IO[str], IO[bytes]]
MAX_TABLE_INPUTS = 16  # a wider table is a finding and is not read


class NetlistError(ValueError):
    """A file that is not a netlist, or not a complete one.

    file is the name as given, None for a text; line is the line, None if it is not known; reason is
    what is wrong.

    >>> import io, booleq
    >>> try:
    ...     booleq.read_netlist(io.StringIO(".model m\\n.names a b y\\n111 1\\n.end\\n"))
    ... except booleq.NetlistError as error:
    ...     print(error.line, error.reason, sep="; ")
    3; a row of this table has 2 inputs and a value
    """

    def __init__(self, message: str, file: Optional[str], line: Optional[int],
                 reason: str) -> None:
        super().__init__(message, file, line, reason)
        self.file = file
        self.line = line
        self.reason = reason

    def __str__(self) -> str:
        return str(self.args[0])


class NetlistTable(NamedTuple):
    """A table: the path of its cell, its type, output net, input nets and init value.

    The first input is the most significant; a constant is "1'b0" or "1'b1". key is the value of the
    attribute that the netlist was read with, line the line in the file if the format has lines.
    """

    path: str
    type: str
    output: str
    inputs: Tuple[str, ...]
    init: str
    key: Optional[str]
    line: Optional[int]


@dataclass(frozen=True, eq=False)
class NetlistTables:
    """All tables of one width as arrays.

    places are places in the netlist; words has a row for each table, with 64 rows of the table to a
    word. outputs are numbers of nets, inputs rows of such numbers, the most significant pin first;
    types are places in Netlist.types; lines are lines of the file, 0 if the format has none.
    """

    num_inputs: int
    places: Numbers
    words: Words
    inputs: Numbers
    outputs: Numbers
    types: Numbers
    lines: Numbers

    def __len__(self) -> int:
        return len(self.places)

    @property
    def luts(self) -> LutArray:
        """The init values, 1 to 7 inputs."""
        if not 1 <= self.num_inputs <= MAX_INPUTS:
            raise ValueError(f"a LutArray has tables of 1 to {MAX_INPUTS} inputs, and these have "
                             f"{self.num_inputs}: take words")
        return LutArray(self.words if self.num_inputs == 7 else self.words[:, 0], self.num_inputs)


class CellCount(NamedTuple):
    """How many cells of a type there are, their role, and why they are not read if they are not."""

    type: str
    role: str
    cells: int
    note: Optional[str]


class FunctionCount(NamedTuple):
    """How many tables are the same function, given over inputs A, B, C and so on."""

    tables: int
    inputs: Tuple[str, ...]
    hex: str
    kind: Optional[str]
    function: Optional[str]
    expression: Optional[str]


@dataclass(frozen=True, repr=False)
class NetlistStats(Report):
    """What a netlist consists of, as 'booleq netlist stats --json' answers.

    by_pins has pairs of a width and the number of tables; by_inputs counts only inputs that matter.
    """

    format: str
    top: Optional[str]
    cells: int
    tables: int
    by_pins: Tuple[Tuple[int, int], ...]
    by_inputs: Tuple[Tuple[int, int], ...]
    functions: int
    classes: int
    wide_functions: int
    constants: int
    wires: int
    inverters: int
    idle_inputs: int
    not_read: int
    findings: Tuple[Tuple[str, int], ...]
    types: Tuple[CellCount, ...]
    commonest: Tuple[FunctionCount, ...]


class NetlistFinding(NamedTuple):
    """Something odd about a table: a word, "error", "warning" or "note", the place, a sentence."""

    code: str
    severity: str
    path: str
    line: Optional[int]
    message: str


class LoneTable(NamedTuple):
    """A table that only one netlist has; wire says what it passes if it is only a wire."""

    path: str
    net: str
    wire: Optional[str]


class RenamedNet(NamedTuple):
    """A net that has another name in the other netlist, and the number of tables that use it."""

    left: str
    right: str
    tables: int


@dataclass(frozen=True, repr=False)
class TableDifference(Report):
    """A table that differs: the first difference, both equations, and possible causes.

    assignment and values are None for the same function on another output net. Each cause is a
    stable word and a sentence; should_be is the init value that would make the right table correct.
    """

    left: str
    right: str
    matched_by: Literal["path", "net", "key"]
    net: str
    assignment: Optional[Assignment]
    values: Optional[Tuple[int, int]]
    left_equation: Optional[str]
    right_equation: Optional[str]
    should_be: Optional[str]
    causes: Tuple[Tuple[str, str], ...]


@dataclass(frozen=True, repr=False)
class NetlistDiff(Report):
    """How two netlists differ, table by table; true in a condition when they do.

    same counts tables, same_but_for_names those whose nets have other names; different describes as
    many of the num_different as were asked for. names is "gone" if names of nets were ignored;
    matched_nets counts the nets known to be the same, compared_by_order the tables that are the
    same in some order of indistinguishable inputs.
    """

    is_same: bool
    same: int
    same_but_for_names: int
    num_different: int
    different: Tuple[TableDifference, ...]
    missing: Tuple[LoneTable, ...]
    added: Tuple[LoneTable, ...]
    renamed: Tuple[RenamedNet, ...]
    names: Literal["kept", "gone"]
    matched_nets: int
    compared_by_order: int
    keys_twice: int
    unused_renames: Tuple[Tuple[str, str], ...]

    def __bool__(self) -> bool:
        return not self.is_same


def _difference(left: str, right: str, matched_by: Any, net: str, assignment: Any,
                *rest: Any) -> TableDifference:
    row = None if assignment is None else Assignment(assignment)
    return TableDifference(left, right, matched_by, net, row, *rest)


@final
class Netlist:
    """Every look-up table of a netlist file with its nets: a value that never changes.

    read_netlist makes it. len() is the number of tables. netlist[place] is one of them,
    netlist.tables(width) all of a width, and netlist.frame() all of them as a DataFrame.

    >>> import io, booleq
    >>> netlist = booleq.read_netlist(io.StringIO(
    ...     ".model m\\n.inputs s a b\\n.outputs y\\n.names s a b y\\n11- 1\\n0-1 1\\n.end\\n"))
    >>> netlist
    <Netlist of 1 table, BLIF>
    >>> netlist[0]
    NetlistTable(path='y', type='.names', output='y', inputs=('b', 'a', 's'), init='0xd8', key=None, line=4)
    >>> netlist.tables(3).luts
    LutArray(['0xd8'], num_inputs=3)
    """

    __slots__ = ("_core", "_file", "_key", "_nets", "_paths")
    _core: _booleq.NetlistCore
    _file: Optional[str]
    _key: Optional[str]
    _nets: Optional[Tuple[str, ...]]
    _paths: Optional[Tuple[str, ...]]

    def __init__(self) -> None:
        raise TypeError("a Netlist is what read_netlist(path) gives")

    @classmethod
    def _of(cls, core: _booleq.NetlistCore, file: Optional[str], key: Optional[str]) -> Netlist:
        made = cls.__new__(cls)
        for name, value in (("_core", core), ("_file", file), ("_key", key), ("_nets", None),
                            ("_paths", None)):
            object.__setattr__(made, name, value)
        return made

    def __setattr__(self, name: str, value: object) -> None:
        raise AttributeError("a Netlist never changes")

    @property
    def file(self) -> Optional[str]:
        """The file's name as given, None for a text."""
        return self._file

    @property
    def format(self) -> str:
        """"Yosys JSON", "BLIF", "EDIF" or "Verilog"."""
        return self._core.format()

    @property
    def top(self) -> Optional[str]:
        """The top module, None if it has no name."""
        return self._core.top()

    @property
    def key(self) -> Optional[str]:
        """The attribute that the netlist was read with."""
        return self._key

    def __len__(self) -> int:
        return len(self._core)

    def __getitem__(self, place: int) -> NetlistTable:
        """One table; tables(width) and frame() are for many."""
        index = place.__index__()
        if not -len(self) <= index < len(self):
            raise IndexError(f"there is no table {index} of {len(self)}")
        return NetlistTable(*self._core.at(index % len(self)))

    def __iter__(self) -> Iterator[NetlistTable]:
        return (self[place] for place in range(len(self)))

    def __repr__(self) -> str:
        name = "" if self._file is None else f" {self._file!r}"
        tables = "1 table" if len(self) == 1 else f"{len(self):,} tables"
        return f"<Netlist{name} of {tables}, {self.format}>"

    def __copy__(self) -> Netlist:
        return self

    def __deepcopy__(self, memo: Any) -> Netlist:
        return self

    # --- columns ------------------------------------------------------------------------------

    @property
    def widths(self) -> Tuple[int, ...]:
        """The numbers of pins that tables have, ascending, 0 to 16."""
        return self._core.widths()

    @property
    def types(self) -> Tuple[str, ...]:
        """The types of cells in the file, including those that are not tables."""
        return self._core.types()

    @property
    def nets(self) -> Tuple[str, ...]:
        """Names of nets by number; the first four are "1'b0", "1'b1", "1'bx" and "(open)"."""
        if self._nets is None:
            object.__setattr__(self, "_nets", tuple(self._core.nets()))
        assert self._nets is not None
        return self._nets

    @property
    def paths(self) -> Tuple[str, ...]:
        """The path of each table; of a cell with several outputs, also the pin: "u1 (O5)"."""
        if self._paths is None:
            object.__setattr__(self, "_paths", tuple(self._core.paths()))
        assert self._paths is not None
        return self._paths

    def tables(self, width: int) -> NetlistTables:
        """All tables of so many pins.

        >>> import io, booleq
        >>> netlist = booleq.read_netlist(io.StringIO(
        ...     ".model m\\n.names a b x\\n11 1\\n.names x c y\\n1- 1\\n-1 1\\n.end\\n"))
        >>> pairs = netlist.tables(2)
        >>> pairs.luts.words, [netlist.nets[net] for net in pairs.outputs]
        (array([ 8, 14], dtype=uint16), ['x', 'y'])
        """
        if not 0 <= width <= MAX_TABLE_INPUTS:
            raise ValueError(f"tables have 0 to {MAX_TABLE_INPUTS} inputs, not {width}")
        places, words, inputs, outputs, types, lines = self._core.arrays(width)
        count = len(places)
        return NetlistTables(width, places, words.reshape(count, max(1, (1 << width) // 64)),
                             inputs.reshape(count, width), outputs, types, lines)

    def frame(self) -> pd.DataFrame:
        """A DataFrame with a row for each table: path, type, output, inputs (tuples of nets, the
        most significant pin first), width, init; also key if the netlist has one, and line if the
        file has lines.
        """
        import pandas as pd
        size = len(self)
        nets: npt.NDArray[Any] = np.array(self.nets, dtype=object)
        types, outputs, lines = (np.zeros(size, np.uint32) for _ in range(3))
        widths = np.zeros(size, np.uint8)
        inputs, inits = np.empty(size, object), np.empty(size, object)
        for width in self.widths:  # at most 17
            group = self.tables(width)
            places, texts, names = self._core.columns(width, self.nets)
            types[places], outputs[places] = group.types, group.outputs
            lines[places], widths[places] = group.lines, width
            inputs[places], inits[places] = _objects(names), _objects(texts)
        columns = {"path": list(self.paths),
                   "type": pd.Categorical.from_codes(
                       np.searchsorted(np.unique(types), types), [
                           self.types[number] for number in np.unique(types)]),
                   "output": nets[outputs], "inputs": inputs, "width": widths, "init": inits}
        if self._key is not None:
            columns["key"] = self._core.keys()
        if lines.any():
            columns["line"] = lines
        return pd.DataFrame(columns)

    # --- answers ------------------------------------------------------------------------------

    def stats(self) -> NetlistStats:
        """What it consists of: tables by width and type, distinct and commonest functions."""
        answer = self._core.stats()
        answer["types"] = tuple(map(CellCount._make, answer["types"]))
        answer["commonest"] = tuple(map(FunctionCount._make, answer["commonest"]))
        return NetlistStats(**answer)

    def check(self) -> Tuple[NetlistFinding, ...]:
        """What is odd about its tables, empty if nothing is; pandas.DataFrame accepts the answer.

        >>> import io, booleq
        >>> netlist = booleq.read_netlist(io.StringIO(".model m\\n.names a b y\\n1- 1\\n.end\\n"))
        >>> netlist.check()[0].code
        'idle-input'
        """
        return tuple(map(NetlistFinding._make, self._core.check()))

    def diff(self, other: Netlist, *, renames: Optional[Mapping[str, str]] = None,
             names: Literal["auto", "kept", "gone"] = "auto",
             open_inputs: Optional[Literal[0, 1]] = None, allow_wires: bool = False,
             max_described: Optional[int] = None) -> NetlistDiff:
        """Whether each table is the same function in the other netlist, and why not.

        Tables are matched by path, else by output net, else by the key that both were read with.
        renames maps nets of this netlist to the other's names for them. names says whether nets
        with the same name are the same: "gone" matches by key only, "auto" decides by the pairs
        found. open_inputs is the value of an input that is not connected. allow_wires allows tables
        that only pass a net or a constant to be in one netlist only. max_described limits how many
        differences are described.

        >>> import io, booleq
        >>> text = ".model m\\n.inputs a b\\n.outputs y\\n.names a b y\\n10 1\\n.end\\n"
        >>> mapped, routed = (booleq.read_netlist(io.StringIO(text.replace("10", row)))
        ...                   for row in ["10", "01"])
        >>> for table in mapped.diff(routed).different:
        ...     print(table.net, table.causes[0][0], table.should_be)
        y pins-swapped 0x2
        """
        if not isinstance(other, Netlist):
            raise TypeError(f"other must be a Netlist, not {type(other).__name__}")
        if names not in ("auto", "kept", "gone"):
            raise ValueError(f"names must be 'auto', 'kept' or 'gone', not {names!r}")
        if names == "gone" and (self._key is None or other._key is None):
            raise ValueError("names='gone' leaves nothing to match tables by: read both netlists "
                             "with key=")
        if open_inputs not in (None, 0, 1):
            raise ValueError(f"open_inputs must be 0, 1 or None, not {open_inputs!r}")
        if max_described is not None and max_described < 0:
            raise ValueError("max_described must be 0 or more")
        answer = self._core.compare(other._core, list((renames or {}).items()), names,
                                    bool(allow_wires), -1 if open_inputs is None else open_inputs,
                                    max_described)
        answer["different"] = tuple(_difference(*parts) for parts in answer["different"])
        answer["missing"] = tuple(map(LoneTable._make, answer["missing"]))
        answer["added"] = tuple(map(LoneTable._make, answer["added"]))
        answer["renamed"] = tuple(map(RenamedNet._make, answer["renamed"]))
        return NetlistDiff(**answer)


def _objects(values: List[Any]) -> npt.NDArray[Any]:
    """An array of the objects themselves, even if they are tuples."""
    array = np.empty(len(values), object)
    array[:] = values
    return array


def _refuse(fault: str, file: Optional[str], spoken: str) -> NetlistError:
    start = f"{spoken}: "
    rest = fault[len(start):] if fault.startswith(start) else fault
    line = re.match(r"line (\d+): ", rest) if rest is not fault else None
    return NetlistError(fault, file, int(line[1]) if line else None,
                        rest[line.end():] if line else rest)


def _find(path: str) -> None:
    """Raises Python's exceptions for an unreadable file without opening it: it may be a pipe."""
    os.stat(path)
    if os.path.isdir(path):
        raise IsADirectoryError(errno.EISDIR, os.strerror(errno.EISDIR), path)
    if not os.access(path, os.R_OK):
        raise PermissionError(errno.EACCES, os.strerror(errno.EACCES), path)


def read_netlist(source: Source, *, key: Optional[str] = None,
                 cells: Union[None, str, os.PathLike[str]] = None,
                 top: Optional[str] = None) -> Netlist:
    r"""The netlist of a file: Yosys JSON, BLIF, EDIF 2.0.0 or structural Verilog, also compressed
    by gzip; the content decides the format.

    source is a path, "-" for standard input, or a file object that is read to its end. Verilog is
    read by the program yosys. key is an attribute of cells by which diff() can match tables, cells
    a file with more types of cells, top the top module if the file does not mark one.

    Raises OSError for a file that cannot be opened, NetlistError for one that is not a netlist.

    >>> import io, booleq
    >>> text = ".model m\n.inputs a b\n.outputs y\n.names a b y\n11 1\n.end\n"
    >>> [table.init for table in booleq.read_netlist(io.StringIO(text))]
    ['0x8']
    """
    core = _booleq.NetlistCore()
    cell_bytes = b"" if cells is None else os.fsencode(cells)
    if cells is not None:
        _find(os.fspath(cells))
    options = (key or "", cell_bytes, top or "")
    if hasattr(source, "read"):
        content = source.read()
        data = content.encode("utf-8", "surrogateescape") if isinstance(content, str) else content
        fault = core.read_text(bytes(data), *options)
        file, spoken = None, "text"
    else:
        file = os.fspath(source)
        if isinstance(file, bytes):
            file = os.fsdecode(file)
        if file != "-":
            _find(file)
        fault = core.read(os.fsencode(file), *options)
        spoken = "standard input" if file == "-" else file
    if fault is not None:
        raise _refuse(fault, file, spoken)
    return Netlist._of(core, file, key)
