"""Completes a table of functions, as the tool's command 'batch' does with a file."""
from __future__ import annotations

from typing import TYPE_CHECKING, Any, Dict, List, Mapping, Sequence, overload

from . import _booleq
from ._columns import is_frame, missing_value

if TYPE_CHECKING:
    import pandas as pd

__all__ = ["batch"]

COLUMNS = ("inputs", "equation", "init")


def _listed(column: Any, name: str) -> List[Any]:
    """The cells as a new list, which is written to."""
    if isinstance(column, (str, bytes)) or not hasattr(column, "__iter__"):
        raise TypeError(f"column {name} must be a sequence, not {type(column).__name__}")
    cells = column.tolist() if hasattr(column, "tolist") else column
    return list(cells)


@overload
def batch(table: pd.DataFrame) -> pd.DataFrame: ...
@overload
def batch(table: Mapping[str, Sequence[Any]]) -> Dict[str, List[Any]]: ...


def batch(table: Any) -> Any:
    """Completes a table of functions: fills in missing cells, and compares given ones.

    The table, a DataFrame or a mapping of names to sequences, has some of the columns "inputs",
    "equation" and "init", a function in each row: inputs are a text with commas or a list of names,
    init values a text or, if inputs are listed, an int. None, NaN and "" are missing. The answer is
    such a table with all three columns, the other columns, "result" and "message". The result is
    "ok" if all was given and agrees, else "filled", "differs", "incomplete" or "refused" with the
    reason. All processors are used.

    >>> import booleq
    >>> done = booleq.batch({"inputs": ["A,B", "A,B"], "equation": ["A & B", "A | B"],
    ...                      "init": [None, "0x8"]})
    >>> done["init"], done["result"]
    (['0x8', '0x8'], ['filled', 'differs'])
    >>> done["message"][1]
    "the equation is 1 at row 1 (A=0 B=1), the init value 0; the equation's is 0xe"
    """
    if not is_frame(table) and not hasattr(table, "keys"):
        raise TypeError("table must be a DataFrame or a mapping of names to sequences, not "
                        f"{type(table).__name__}")
    names = list(table.columns) if is_frame(table) else list(table.keys())
    given = [name for name in COLUMNS if name in names]
    for name in given:
        if names.count(name) > 1:
            raise ValueError(f"the table has two columns {name!r}")
    if not given:
        raise ValueError("the table has none of the columns inputs, equation, init")
    cells = {name: _listed(table[name], name) for name in given}
    lengths = {len(column) for column in cells.values()}
    if len(lengths) != 1:
        raise ValueError("the columns must be of one length, not "
                         f"{', '.join(map(str, sorted(lengths)))}")
    num_rows, = lengths
    filled = [cells.get(name, [None] * num_rows) for name in COLUMNS]
    result, message = _booleq.batch(*filled, missing_value())
    columns = {**dict(zip(COLUMNS, filled)), "result": result, "message": message}
    if is_frame(table):
        return table.assign(**columns)
    others = {name: list(table[name]) for name in names if name not in columns}
    return {**others, **columns}
