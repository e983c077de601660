"""Rows from what programs have: data frames, structured arrays, mappings of arrays."""

from __future__ import annotations

import sys
from collections.abc import Mapping
from typing import Any, Sequence

import numpy as np
import numpy.typing

from . import _core, errors
from .definitions import Column, column_type

Array = numpy.typing.NDArray[Any]


def columns_of(data: Any) -> dict[str, Array]:
    """The columns of some data by name, as arrays of one dimension and equal length.

    A data frame's index is a column if it has a name. Columns of pandas' own dtypes become numpy's:
    integers with missing values floats, missing texts None. Scalars count as columns of one row.
    """
    pandas = sys.modules.get("pandas")
    if pandas is not None and isinstance(data, pandas.DataFrame):
        if any(name is not None for name in data.index.names):
            data = data.reset_index()
        columns = {name: _array_of_series(data[name]) for name in data.columns}
    elif isinstance(data, np.ndarray) and (names := data.dtype.names) is not None:
        columns = {name: np.atleast_1d(data)[name] for name in names}
    elif isinstance(data, Mapping):
        columns = {name: _array_of_series(values) if _is_series(values) else _array(values)
                   for name, values in data.items()}
    else:
        raise TypeError("rows come as a DataFrame, a structured array or a mapping of column names to "
                        f"values, not as {type(data).__name__}")
    lengths = {name: array.shape for name, array in columns.items()}
    if any(len(shape) != 1 for shape in lengths.values()) or len(set(lengths.values())) > 1:
        raise errors.ArgumentError("the columns differ in their lengths: " + ", ".join(
            f"'{name}' has {'x'.join(map(str, shape))}" for name, shape in lengths.items()))
    return columns


def _is_series(values: Any) -> bool:
    pandas = sys.modules.get("pandas")
    return pandas is not None and isinstance(values, pandas.Series)


def _array_of_series(series: Any) -> Array:
    if isinstance(series.dtype, np.dtype):
        return _array(np.asarray(series))
    if getattr(series.dtype, "kind", "O") not in "biuf":  # texts, categories
        return _array(np.asarray(series, dtype=object))
    if series.dtype.kind == "f" or series.isna().any():
        return np.asarray(series.to_numpy("float64", na_value=np.nan))
    return np.asarray(series.to_numpy(series.dtype.numpy_dtype))


def _array(values: Any) -> Array:
    """An array; one of objects becomes an array of numbers when all of them are, None being nan."""
    array = np.atleast_1d(np.asarray(values))
    if array.dtype.kind in "US" and not isinstance(values, (np.ndarray, np.generic)):
        return np.atleast_1d(np.asarray(values, object))  # numbers among texts are numbers
    if array.dtype != object or any(isinstance(value, str) for value in array.flat):
        return array
    try:
        numbers = np.asarray([np.nan if value is None else value for value in array.tolist()])
    except (TypeError, ValueError):
        return array
    return numbers if numbers.dtype.kind in "biuf" else array


def definitions_of(columns: Mapping[str, Array]) -> list[Column]:
    """Columns that hold the data: of its types, texts as wide as the longest one."""
    result = []
    for name, array in columns.items():
        kind = column_type(array.dtype, f"column '{name}'")
        width = _widest(array) if kind == "str" else None
        result.append(Column(name, kind, width=width))
    return result


def _widest(texts: Array) -> int:
    if texts.dtype.kind == "S":
        return max(texts.dtype.itemsize, 1)
    return _core.widest(texts.tolist())


# ---- Rows of a table ----------------------------------------------------------------------------


class Layout:
    """How the rows of a table lie in memory, and their structured dtype."""

    def __init__(self, core: _core.RowLayout) -> None:
        self.core = core
        self.fields = core.fields()
        self.names = [name for name, *_ in self.fields]
        # One byte less than a field of texts has: the last one always holds the terminator.
        self.dtype = np.dtype({
            "names": self.names,
            "formats": [f"S{size - 1}" if kind == "str" else kind for _, kind, _, size in self.fields],
            "offsets": [offset for *_, offset, _ in self.fields],
            "itemsize": core.row_size})

    def records(self, columns: Mapping[str, Array]) -> Array:
        """The data as rows, one array of this dtype.

        MissingError: a column that the table has not, or one that is missing
        RangeError, ValueTypeError: a value that the column's type does not hold
        """
        for name in columns:
            if name not in self.names:
                raise errors.MissingError(f"there is no column '{name}'", "PF_NOCOLUMN", str(name))
        for name in self.names:
            if name not in columns:
                raise errors.MissingError(f"there are no values for column '{name}'",
                                          "PF_NOCOLUMN", name)
        count = len(next(iter(columns.values()), ()))
        result = np.zeros(count, self.dtype)
        for position, (name, kind, _, size) in enumerate(self.fields):
            if kind != "str":
                result[name] = numbers(name, kind, columns[name])
            elif fits_bytes(columns[name], size - 1):
                result[name] = columns[name]
                refuse_inner_zeros(name, columns[name])
            else:
                self.core.store_texts(position, result, texts(columns[name]))
        return result


def fits_bytes(array: Array, width: int) -> bool:
    return array.dtype.kind == "S" and array.dtype.itemsize <= width


def refuse_inner_zeros(name: str, array: Array) -> None:
    characters = np.ascontiguousarray(array).view(np.uint8).reshape(len(array), -1)
    wrong = ((characters[:, :-1] == 0) & (characters[:, 1:] != 0)).any(axis=1)
    if wrong.any():
        raise errors.ArgumentError(f"row {int(wrong.argmax())}: '{name}': a text cannot contain a NUL "
                                   "character", "PF_BADARG", "", name)


def texts(array: Array) -> Sequence[Any]:
    """As str; what is no text is left to be refused."""
    if array.dtype.kind != "S":
        return array.tolist()
    return [text.decode(errors="surrogateescape") for text in array.tolist()]


def numbers(name: str, kind: str, array: Array) -> Array:
    """Numbers of a type that holds them: integers exactly, fractions as the nearest float."""
    target = np.dtype(kind)
    given = array.dtype
    if given.kind not in "biuf" or (given.kind == "f" and target.kind != "f"):
        raise errors.ValueTypeError(
            f"column '{name}' is of type {kind}, and its values of dtype {given}", "PF_BADTYPE",
            f"column {name}", kind)
    if np.can_cast(given, target) or not len(array):
        return array
    if target.kind == "i":
        wrong = (array < np.iinfo(target).min) | (array > np.iinfo(target).max)
    else:
        with np.errstate(over="ignore"):
            wrong = np.isinf(array.astype(target)) & ~np.isinf(array)
    if wrong.any():
        refuse_row(name, array, wrong)
    return array


def refuse_row(name: str, array: Array, wrong: Array) -> None:
    row = int(wrong.argmax())
    raise errors.RangeError(f"row {row}: '{name}': {array[row]} is out of range", "PF_RANGE",
                            str(array[row]), name)
