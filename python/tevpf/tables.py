"""Tables: rows of typed columns."""

from __future__ import annotations

import dataclasses
import os
from collections.abc import Iterable, Iterator, Mapping, MutableMapping
from typing import Any, Optional, Union, overload

import numpy as np

from . import _core, errors, notebook
from .definitions import Column, Value
from .element import Element
from .records import Array, Layout, columns_of, refuse_row
from .rows import Row

__all__ = ["Columns", "Table"]

_BLOCK = 256  # rows read at once while iterating


class Table(Element[_core.Table]):
    """A table: a sequence of rows, and a mapping of column names to arrays.

    ``t[3]`` is a Row, ``t["melting"]`` an array of the column's values, ``len(t)`` the number of rows;
    iterating gives the rows in storage order. The table is meant by its name: once it is deleted
    or renamed through another object, operations raise MissingError, and ClosedError once the file
    is closed. Arrays and rows are copies and stay good.
    """

    @property
    def columns(self) -> "Columns":
        """The columns by name: ``t.columns["mass"].units``."""
        return Columns(self)

    @property
    def dtype(self) -> np.dtype[Any]:
        """The structured dtype of the rows; texts are UTF-8 in fields of dtype S."""
        return self._layout().dtype

    def __len__(self) -> int:
        return self._core.size

    def __contains__(self, column: object) -> bool:
        return isinstance(column, str) and self._core.has_column(column)

    # ---- Reading ----

    @overload
    def __getitem__(self, key: str) -> Array: ...
    @overload
    def __getitem__(self, key: int) -> Row: ...
    @overload
    def __getitem__(self, key: slice) -> list[Row]: ...

    def __getitem__(self, key: Union[str, int, slice]) -> Any:
        """A column's values (shape (rows,)), a row by its number, or rows by a slice.

        Integers and floats have the column's own dtype, missing floats are nan; texts are str, dtype U.
        MissingError: no such column; PositionError: no such row
        """
        if isinstance(key, str):
            return self._column(key)
        if isinstance(key, slice):
            return [self[number] for number in range(*key.indices(len(self)))]
        number = self._number(key)
        return Row(self._positions(), self._core.row(number), number)

    def __iter__(self) -> Iterator[Row]:
        return self._walk("")

    def sorted_by(self, column: str, reverse: bool = False) -> Iterator[Row]:
        """The rows in the order of a column's values, nan last: through its index if it has one."""
        definition = self.columns[column]
        if definition.indexed and not reverse:
            return self._walk(column)
        return self._pick(self._order(column, reverse))

    def find(self, /, **values: Value) -> Optional[Row]:
        """The first row that holds these values: ``t.find(symbol="Fe")``; None if there is none.

        One indexed column is searched in O(log n), all others in O(n). Floats are equal within the
        column's tolerance, nan finds nan.
        """
        if len(values) == 1:
            ((column, value),) = values.items()
            definition = self.columns[column]
            if definition.indexed or not definition.type.startswith("float"):
                found = self._core.find(column, value)
                return None if found is None else self._row(*found)
        numbers = self._matching(values)
        return self[int(numbers[0])] if len(numbers) else None

    def find_all(self, /, **values: Value) -> list[Row]:
        """All rows that hold these values, in storage order. O(n)."""
        return list(self._pick(self._matching(values)))

    def find_prefix(self, column: str, prefix: str) -> Optional[Row]:
        """The first row whose text starts so, in the column's own order if it is indexed."""
        found = self._core.find_prefix(column, prefix)
        return None if found is None else self._row(*found)

    def to_numpy(self, sorted_by: Optional[str] = None) -> Array:
        """All rows as a structured array of shape (rows,), made with one copy.

        sorted_by: an indexed column, whose order the rows get.
        """
        layout = self._layout()
        result = np.empty(len(self), layout.dtype)
        read = self._core.read_rows(layout.core, 0, result, sorted_by or "")
        # Making the array may have run a finalizer that changed the table.
        return result if read == len(self) else self.to_numpy(sorted_by)

    def to_pandas(self) -> Any:
        """A DataFrame in storage order; texts are str, the units are in ``attrs["units"]``."""
        import pandas

        columns = self.columns
        data = {c.name: np.array(self._core.read_texts(c.name), object) if c.type == "str"
                else self[c.name] for c in columns.values()}
        frame = pandas.DataFrame(data, columns=list(columns), copy=False)
        frame.attrs["units"] = {c.name: c.units for c in columns.values() if c.units}
        return frame

    def __array__(self, dtype: Any = None) -> Array:
        rows = self.to_numpy()
        return rows if dtype is None else rows.astype(dtype)

    # ---- Changing rows ----
    # Refused are values outside their bounds (RangeError) and values that a unique column holds
    # already (DuplicateError).

    def append(self, data: Any) -> None:
        """Appends rows: a DataFrame, a structured array, or a mapping of all column names to values.

        All rows or none. None is the empty text and, in a float column, nan, which an indexed column
        refuses.
        """
        self._file._require_writing()
        self._append(data, self.columns.values())

    def _append(self, data: Any, definitions: Iterable[Column]) -> None:
        """The same for columns that have, or are to get, these definitions."""
        layout = self._layout()
        records = layout.records(columns_of(data))
        for column in definitions:
            if column.indexed and column.type.startswith("float"):
                missing = np.isnan(records[column.name])
                if missing.any():  # it equals everything, and would spoil the order of the index
                    refuse_row(column.name, records[column.name], missing)
        self._core.append_rows(layout.core, records)

    def _build(self, definitions: Iterable[Column], data: Any) -> None:
        """Fills a new table. Indexes are made behind the rows, all at once."""
        definitions = list(definitions)
        for column in definitions:
            self._core.add_column(dataclasses.replace(column, indexed=False, unique=False)._fields())
        if data is not None:
            self._append(data, definitions)
        for column in definitions:
            if column.indexed:
                self._index(column)

    def _index(self, column: Column) -> None:
        try:
            self._core.redefine(column.name, column._fields())
        except errors.DuplicateError:
            values = self[column.name]
            repeated = np.ones(len(values), bool)
            repeated[np.unique(values, return_index=True)[1]] = False
            if not repeated.any():  # equal within the tolerance
                raise
            row = int(repeated.argmax())
            raise errors.DuplicateError(
                f"row {row}: value '{values[row]}' is already in column '{column.name}'",
                "PF_DUPLICATE", f"value {values[row]}", f"column {column.name}") from None

    def insert(self, number: int, values: Mapping[str, Value]) -> None:
        """Adds a row in front of another one; columns that are left out get their default."""
        self._file._require_writing()
        self._core.insert(number + len(self) if number < 0 else number, dict(values))

    def update(self, number: int, /, **values: Value) -> None:
        """Changes values of a row: ``t.update(5, melting=1538.0)``."""
        self[number] = values

    def __setitem__(self, number: int, values: Mapping[str, Value]) -> None:
        """Changes the values of a row that are named."""
        self._file._require_writing()
        if not isinstance(values, Mapping):
            raise TypeError("a row is set from a mapping of column names to values")
        self._core.replace(self._number(number), dict(values))

    def __delitem__(self, key: Union[int, slice]) -> None:
        """Removes a row, or those of a slice."""
        self._file._require_writing()
        if not isinstance(key, slice):
            return self._core.remove(self._number(key))
        for number in sorted(range(*key.indices(len(self))), reverse=True):
            self._core.remove(number)

    def move(self, number: int, to: int) -> None:
        """Moves a row so that it gets the number ``to``."""
        self._file._require_writing()
        self._core.move(self._number(number), self._number(to))

    # ---- The table as a whole ----

    def rename(self, new_name: str) -> None:
        """This object follows; others find no table of the old name."""
        self._file._require_writing()
        self._core.rename_table(new_name)

    def print(self, path: "str | os.PathLike[str]", columns: Iterable[str] = (),
              sorted_by: str = "", definitions: bool = False) -> None:
        """Writes a formatted listing to a text file; sorted_by names an indexed column."""
        self._core.print(path, list(columns), sorted_by, definitions)

    def __repr__(self) -> str:
        try:
            return f"<tevpf.Table '{self.name}': {len(self)} rows of {', '.join(self.columns)}>"
        except errors.Error as gone:
            return f"<tevpf.Table '{self.name}': {gone}>"

    def _repr_html_(self) -> str:
        columns = list(self.columns.values())
        layout = self._core.row_layout()
        shown = [values for _, values in
                 self._core.read_tuples(layout, 0, notebook.SHOWN_ROWS, "")]
        title = f"{self.name}: {len(self)} rows"
        return notebook.rows_html(title, columns, shown, len(self) - len(shown))

    # ---- Inside ----

    def _layout(self) -> Layout:
        return Layout(self._core.row_layout())

    def _positions(self) -> dict[str, int]:
        return {name: i for i, (name, *_) in enumerate(self._core.row_layout().fields())}

    def _row(self, number: int, values: tuple[Value, ...]) -> Row:
        return Row(self._positions(), values, number)

    def _number(self, number: int) -> int:
        """A row's number, of which negative ones count from the end."""
        try:
            given = number.__index__()
        except AttributeError:
            raise TypeError(f"rows are numbered, not {type(number).__name__}") from None
        rows = len(self)
        if not -rows <= given < rows:
            raise errors.PositionError(f"there is no row {given}; the table has {rows}", "PF_BADPOS",
                                       str(given), str(rows))
        return given % rows

    def _column(self, name: str) -> Array:
        kind = self.columns[name].type
        if kind == "str":
            texts = self._core.read_texts(name)
            return np.array(texts) if texts else np.empty(0, "U1")
        result = np.empty(len(self), kind)
        return result[: self._core.read_column(name, result)]

    def _walk(self, order: str) -> Iterator[Row]:
        layout = self._core.row_layout()
        positions = self._positions()
        size = len(self)
        for first in range(0, size, _BLOCK):
            for number, values in self._core.read_tuples(layout, first, _BLOCK, order):
                yield Row(positions, values, number)
                if len(self) != size:
                    raise RuntimeError("the table changed its size during iteration")

    def _pick(self, numbers: Array) -> Iterator[Row]:
        positions = self._positions()
        for number in numbers.tolist():
            yield Row(positions, self._core.row(number), number)

    def _order(self, column: str, reverse: bool) -> Array:
        values = self[column]
        order = np.argsort(values, kind="stable")
        if not reverse:
            return order
        numbers = len(values) - int(np.isnan(values).sum()) if values.dtype.kind == "f" else len(values)
        return np.concatenate([order[:numbers][::-1], order[numbers:]])

    def _matching(self, values: Mapping[str, Value]) -> Array:
        """The numbers of the rows that hold these values."""
        matches = np.ones(len(self), bool)
        for column, value in values.items():
            definition = self.columns[column]
            if self._core.find(column, value) is None:  # also refuses values of other types
                return np.empty(0, int)
            held = self[column]
            if held.dtype.kind != "f":
                matches &= held == value
            elif value != value:
                matches &= np.isnan(held)
            else:
                tolerance = 10.0 ** -((definition.precision or 6) + 1)
                matches &= np.abs(held.astype("float64") - float(value)) <= tolerance
        return np.flatnonzero(matches)


class Columns(MutableMapping[str, Column]):
    """The columns of a table by name, in their order. Assigning a Column adds or redefines one."""

    def __init__(self, table: Table) -> None:
        self._table, self._core = table, table._core

    def __getitem__(self, name: str) -> Column:
        if not isinstance(name, str):
            raise errors.MissingError(f"there is no column {name!r}: names are str", "PF_NOCOLUMN")
        return Column._from(self._core.column(name))

    def __setitem__(self, name: str, column: Column) -> None:
        """Adds a column behind the others, or replaces a definition; its new name may be another.

        Existing rows get the lower bound or the empty text in a new column.
        DuplicateError: unique, but there are rows or equal values; ValueTypeError: another type, and
        there are rows; RangeError: a row holds a value outside the new bounds
        """
        self._table._file._require_writing()
        if name in self:
            self._core.redefine(name, column._fields())
        elif name != column.name:
            raise errors.ArgumentError(f"a new column '{name}' cannot be named '{column.name}'")
        else:
            self._core.add_column(column._fields())

    def __delitem__(self, name: str) -> None:
        """Removes a column; with the last one all rows go."""
        self._table._file._require_writing()
        self._core.remove_column(name)

    def __iter__(self) -> Iterator[str]:
        return iter([fields[0] for fields in self._core.columns()])

    def __len__(self) -> int:
        return len(self._core.columns())

    def __contains__(self, name: object) -> bool:
        return name in self._table

    def values(self) -> list[Column]:  # type: ignore[override]
        """The columns, read in one go."""
        return [Column._from(fields) for fields in self._core.columns()]

    def items(self) -> list[tuple[str, Column]]:  # type: ignore[override]
        return [(column.name, column) for column in self.values()]

    def add(self, column: Column) -> None:
        """Adds a column behind the others. DuplicateError: the name is taken."""
        self._table._file._require_writing()
        self._core.add_column(column._fields())

    def move(self, name: str, before: Optional[str] = None) -> None:
        """Moves a column in front of another one, or to the end."""
        self._table._file._require_writing()
        self._core.move_column(name, before)

    def __eq__(self, other: object) -> bool:
        if isinstance(other, Columns):
            return self.values() == other.values()
        return NotImplemented

    def __repr__(self) -> str:
        return f"<columns {', '.join(self)}>"

    def _repr_html_(self) -> str:
        rows = [(c.name, c.type, c.units, notebook.bounds_text(c),
                 "unique" if c.unique else "yes" if c.indexed else "", c.description)
                for c in self.values()]
        return notebook.table_html("", ("name", "type", "units", "bounds", "index", "description"), rows)
