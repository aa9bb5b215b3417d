"""Turns what eval_many takes into columns that the compiled half reads."""
from __future__ import annotations

from typing import TYPE_CHECKING, Any, List, Mapping, Optional, Sequence, Tuple, Union

import numpy as np
import numpy.typing as npt

from . import _booleq

if TYPE_CHECKING:
    import pandas as pd

    from ._equation import Equation

    Table = Union[npt.ArrayLike, Mapping[str, Any], pd.DataFrame]

Column = npt.NDArray[Any]
Mask = npt.NDArray[np.bool_]


def is_frame(table: Any) -> bool:
    """Whether it is a DataFrame, known by its attributes: pandas need not be installed."""
    return hasattr(table, "columns") and hasattr(table, "iloc")


def _without_mask(values: Any) -> Tuple[Any, Optional[Mask]]:
    """The values with a harmless one for each that is missing, and a mask of the missing ones."""
    if isinstance(values, np.ma.MaskedArray):
        mask = np.ma.getmaskarray(values)
        return values.filled(0) if mask.any() else values.data, mask
    extension = getattr(values, "array", values)
    if hasattr(extension, "isna") and not isinstance(extension, np.ndarray):
        mask = np.asarray(extension.isna())
        kind = getattr(extension.dtype, "kind", "O")
        if mask.any() and kind not in "fO":  # nullable types; in other types NaN is a fault
            return extension.to_numpy(dtype=extension.dtype.numpy_dtype, na_value=0), mask
        if kind in "biu":
            return extension.to_numpy(dtype=getattr(extension.dtype, "numpy_dtype", None)), None
    return values, None


def _readable(values: Any, where: str) -> Tuple[Column, Optional[Mask]]:
    """An array of a type that the compiled half knows, in native byte order, and its mask."""
    plain, mask = _without_mask(values)
    array: Column = np.asarray(plain)
    kind = array.dtype.kind
    if kind == "O":
        flat = array.reshape(-1)
        narrowed = _booleq.narrow_objects(flat, missing_value()).reshape(array.shape)
        missing = narrowed == 3
        if missing.any():
            narrowed[missing] = 0
            mask = missing if mask is None else mask | missing
        bad = np.argwhere(narrowed == 2)
        if len(bad):
            place = tuple(bad[0])
            shown = ", ".join(map(str, place))
            raise ValueError(f"{where}[{shown}] must be 0 or 1, not {array[place]!r}")
        return narrowed, mask
    if kind == "f" and array.dtype.itemsize not in (4, 8):
        array = array.astype(np.float64)
    elif kind not in "biuf":
        raise TypeError(f"{where} must be bool, integers, or floats and objects that are 0 or 1, "
                        f"not {array.dtype}")
    if not array.dtype.isnative:
        array = array.astype(array.dtype.newbyteorder("="))
    return array, mask


def missing_value() -> Any:
    """pandas' NA if pandas has been imported, else None."""
    import sys
    pandas = sys.modules.get("pandas")
    return getattr(pandas, "NA", None)


def _check_names(equation: Equation, names: Sequence[Any], what: str) -> None:
    inputs = equation.inputs
    missing = [name for name in inputs if name not in names]
    if missing:
        raise ValueError(f"{what} has no column for {', '.join(missing[:20])}")
    others = [name for name in names if name not in inputs]
    if others:
        raise ValueError(f"{what} has a column {others[0]!r}, which is not an input; the inputs are "
                         f"{', '.join(inputs[:20])}: write table[list(eq.inputs)]")
    if len(names) != len(inputs):
        raise ValueError(f"{what} has two columns of one name")


def _raise_fault(where: str, row: int, value: Any) -> None:
    raise ValueError(f"{where}[{row}] must be 0 or 1, not {value}")


def _masked(results: npt.NDArray[np.uint8], mask: Optional[Mask]) -> npt.NDArray[np.uint8]:
    if mask is None:
        return results
    masked: npt.NDArray[np.uint8] = np.ma.MaskedArray(results, mask)
    return masked


def _by_name(equation: Equation, table: Any, what: str) -> npt.NDArray[np.uint8]:
    columns: List[Column] = []
    mask: Optional[Mask] = None
    for name in equation.inputs:
        column, its_mask = _readable(table[name], f"column {name}")
        if column.ndim > 1:
            raise ValueError(f"column {name} must have one dimension, not {column.ndim}")
        columns.append(column)
        if its_mask is not None:
            mask = its_mask if mask is None else mask | its_mask
    lengths = {len(column) for column in columns if column.ndim == 1}
    if len(lengths) != 1:
        raise ValueError(f"the columns of {what} must be of one length, not "
                         f"{', '.join(map(str, sorted(lengths))) or 'single values'}")
    num_rows, = lengths
    columns = [column if column.ndim == 1 else np.broadcast_to(column, (num_rows,))
               for column in columns]
    found = _booleq.eval_columns(equation, columns, num_rows)
    if isinstance(found, tuple):
        row, place = found
        _raise_fault(f"column {equation.inputs[place]}", row, columns[place][row])
    if mask is not None and mask.ndim == 0:
        mask = np.broadcast_to(mask, (num_rows,))
    return _masked(found, mask)


def _by_position(equation: Equation, table: Any) -> npt.NDArray[np.uint8]:
    if table is None or isinstance(table, (str, bytes)):
        raise TypeError(f"assignments must be a table, not {type(table).__name__}")
    if not isinstance(table, np.ndarray):
        table = np.asarray(table)
    num_inputs = len(equation.inputs)
    if table.ndim != 2 or table.shape[1] != num_inputs:
        raise ValueError(f"assignments must have the shape (rows, {num_inputs}), a column for each "
                         f"input, not {table.shape}")
    array, mask = _readable(table, "assignments")
    found = _booleq.eval_table(equation, array)
    if isinstance(found, tuple):
        row, place = found
        raise ValueError(f"assignments[{row}, {place}] must be 0 or 1, not {array[row, place]}")
    return _masked(found, None if mask is None else mask.any(axis=1))


def evaluate(equation: Equation, table: Table) -> npt.NDArray[np.uint8]:
    """Does the work of Equation.eval_many."""
    if type(table) is np.ndarray and table.dtype.names is None:
        return _by_position(equation, table)
    if is_frame(table):
        _check_names(equation, list(table.columns), "the DataFrame")  # type: ignore[union-attr]
        return _by_name(equation, table, "the DataFrame")
    names = getattr(getattr(table, "dtype", None), "names", None)
    if names is not None:
        _check_names(equation, names, "the array")
        return _by_name(equation, table, "the array")
    if hasattr(table, "keys"):
        _check_names(equation, list(table.keys()), "the mapping")
        return _by_name(equation, table, "the mapping")
    return _by_position(equation, table)
