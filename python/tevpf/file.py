"""Parameter files, and the lists and tables that they hold."""

from __future__ import annotations

import dataclasses
import os
from collections.abc import Iterable, Iterator, Mapping, MutableMapping
from typing import Any, Optional, TypeVar, Union

from . import _core, errors, notebook
from .definitions import Column, Parameter, Value
from .lists import List, parameters_from
from .records import columns_of, definitions_of
from .tables import Table

__all__ = ["File", "Lists", "Tables", "open"]

Names = Union[str, Iterable[str]]


def open(path: "str | os.PathLike[str]", mode: str = "r", *, recover: bool = False) -> "File":
    """Opens a parameter file; O(file size).

    mode  "r"   an existing file, for reading
          "r+"  an existing file, for changing
          "w"   a file without content; what a parameter file of that name held is gone with save()
          "x"   a new file
          "a"   like "r+" if there is a file, else like "x"
    recover  opens a damaged file as far as it can be read; File.damage says what is wrong. It can be
             saved as a copy only

    MissingFileError (FileNotFoundError), ExistingFileError (FileExistsError), AccessError
    (PermissionError), DamagedError (OSError); FileError if the process has it open already.
    """
    if mode not in ("r", "r+", "w", "x", "a"):
        raise ValueError(f"mode '{mode}' is none of r, r+, w, x and a")
    name = _whole_path(path)
    new = mode == "x" or (mode in "wa" and not os.path.lexists(name))
    start = _core.File.create if new else _core.File.recover if recover else _core.File.open
    try:
        core = start(name)
    except errors.Error as error:
        if new and os.path.lexists(name):
            raise errors.ExistingFileError(error.message, error.status, error.item) from None
        raise errors.of_open(error, name) from None
    if mode != "r" and core.is_read_only:
        raise errors.AccessError(f"'{core.name}' may not be written", "PF_NOPRIV", core.name)
    file = File(core, mode)
    if mode == "w":
        file.lists.clear()
        file.tables.clear()
    return file


def _whole_path(path: "str | os.PathLike[str]") -> str:
    """With its folder, so that another working directory later changes nothing; unless that makes it
    longer than the library takes."""
    name = os.fspath(path)
    if not isinstance(name, str):
        raise TypeError("a path is a str or an os.PathLike of one")
    if "\0" in name:
        raise ValueError("a path cannot contain a NUL character")
    whole = os.path.abspath(name)
    return whole if len(os.fsencode(whole)) <= 257 else name


class File:
    """An open parameter file, from ``tevpf.open``: ``lists`` and ``tables`` by name.

    Changes live in memory until save(). Closing drops what was not saved, and so does leaving a with
    statement. Lists and tables keep their file open as long as they are in use.
    """

    def __init__(self, core: _core.File, mode: str) -> None:
        self._core, self.mode = core, mode

    @property
    def name(self) -> str:
        """The whole path."""
        return self._core.name

    @property
    def closed(self) -> bool:
        return not self._core.is_open

    @property
    def damage(self) -> Optional[str]:
        """What is wrong with a file that was opened with recover; None if nothing is."""
        return self._core.damage

    @property
    def lists(self) -> "Lists":
        return Lists(self)

    @property
    def tables(self) -> "Tables":
        return Tables(self)

    def save(self) -> None:
        """Writes everything; O(file size). On the disk the old file gives way to the new one in one step.

        AccessError: it may not be written; FileError: not everything could be written, and all is
        still in memory; DamagedError: it is damaged, and the rest would be lost
        """
        self._require_writing()
        self._core.save()

    def save_copy(self, path: "str | os.PathLike[str]") -> None:
        """Writes everything to another file; this one stays as it was. For files of every mode."""
        self._core.save_copy(path)

    def dump(self, path: "str | os.PathLike[str]") -> None:
        """Writes a text file for people to read."""
        self._core.dump(path)

    def close(self) -> None:
        """Closes the file without saving. Nothing happens if it is closed already."""
        self._core.close()

    def __enter__(self) -> "File":
        if self.closed:
            raise errors.ClosedError(f"'{self.name}' is not open any more", "PF_NOFILE")
        return self

    def __exit__(self, *_: object) -> None:
        self.close()

    def __repr__(self) -> str:
        if self.closed:
            return f"<closed tevpf.File '{self.name}'>"
        return (f"<tevpf.File '{self.name}' mode '{self.mode}': {len(self.lists)} lists, "
                f"{len(self.tables)} tables>")

    def _repr_html_(self) -> str:
        if self.closed:
            return notebook.table_html(repr(self)[1:-1], (), ())
        rows = [("list", name, f"{len(self.lists[name])} parameters", text)
                for name, text in self._core.lists()]
        rows += [("table", name, f"{len(self.tables[name])} rows", text)
                 for name, text in self._core.tables()]
        return notebook.table_html(self.name, ("kind", "name", "size", "description"), rows)

    def _require_writing(self) -> None:
        if self.mode == "r":
            raise errors.ModeError(f"'{self.name}' is open for reading only; open it with mode 'r+'")


E = TypeVar("E", List, Table)


class _Elements(MutableMapping[str, E]):
    """What the lists of a file and its tables have in common. `kind` is "list" or "table"."""

    kind: str

    def __init__(self, file: File) -> None:
        self._file = file

    def _all(self) -> list[tuple[str, str]]:
        elements: list[tuple[str, str]] = getattr(self._file._core, f"{self.kind}s")()
        return elements

    def _wrap(self, core: Any) -> E:
        raise NotImplementedError

    def __getitem__(self, name: str) -> E:
        if not isinstance(name, str):
            raise errors.MissingError(f"there is no {self.kind} {name!r}: names are str", "PF_NOELEM")
        return self._wrap(getattr(self._file._core, self.kind)(name))

    def __setitem__(self, name: str, value: E) -> None:
        raise TypeError(f"a {self.kind} is made with create()")

    def __delitem__(self, name: str) -> None:
        """Removes it with everything it holds."""
        self._file._require_writing()
        getattr(self._file._core, f"remove_{self.kind}")(name)

    def __iter__(self) -> Iterator[str]:
        return iter([name for name, _ in self._all()])

    def __len__(self) -> int:
        return len(self._all())

    def __eq__(self, other: object) -> bool:
        return self is other

    def copy(self, name: str, new_name: str) -> E:
        """A copy behind the others. DuplicateError: the new name is taken."""
        self._file._require_writing()
        return self._wrap(getattr(self._file._core, f"copy_{self.kind}")(name, new_name))

    def __repr__(self) -> str:
        return f"<{self.kind}s {', '.join(self)}>"

    def _repr_html_(self) -> str:
        return notebook.table_html(f"{self.kind}s", ("name", "description"), self._all())


class Lists(_Elements[List]):
    """The lists of a file by name, in the order in which they were made."""

    kind = "list"

    def _wrap(self, core: _core.List) -> List:
        return List(self._file, core)

    def create(self, name: str,
               parameters: Union[Mapping[str, Union[Value, Parameter]], Iterable[Parameter]] = (),
               description: str = "") -> List:
        """A new list with these parameters: ``create("Engine", {"Thrust": 480.0})``.

        DuplicateError: a list has that name; ArgumentError: a name is too long
        """
        self._file._require_writing()
        given = parameters_from(parameters)
        result = self._wrap(self._file._core.create_list(name, description))
        try:
            for parameter in given:
                result.add(parameter)
        except BaseException:
            del self[name]
            raise
        return result


class Tables(_Elements[Table]):
    """The tables of a file by name, in the order in which they were made."""

    kind = "table"

    def _wrap(self, core: _core.Table) -> Table:
        return Table(self._file, core)

    def create(self, name: str, data: Any = None, *, columns: Optional[Iterable[Column]] = None,
               unique: Names = (), index: Names = (), units: Optional[Mapping[str, str]] = None,
               bounds: Optional[Mapping[str, tuple[Value, Value]]] = None,
               precision: Optional[Mapping[str, int]] = None,
               widths: Optional[Mapping[str, int]] = None,
               descriptions: Optional[Mapping[str, str]] = None, description: str = "") -> Table:
        """A new table, from data or from columns, or from both.

        data     a DataFrame, a structured array, or a mapping of names to arrays of shape (rows,)
        columns  by default those of the data: bool, int8, uint8 and int16 become int16, other
                 integers int32, which they must fit, float16 and float32 float32; texts get the
                 width of the longest one. Integers with missing values become float64
        unique, index  names of columns: one, or several
        units, bounds, precision, widths, descriptions  by the name of the column; bounds are pairs

        Nothing is left of a table whose data are refused. DuplicateError: a table has that name, or a
        unique column gets a value twice; RangeError; ValueTypeError: a dtype that no type holds.
        """
        self._file._require_writing()
        given = None if data is None else columns_of(data)
        definitions = definitions_of(given or {}) if columns is None else list(columns)
        low = {name: pair[0] for name, pair in (bounds or {}).items()}
        high = {name: pair[1] for name, pair in (bounds or {}).items()}
        definitions = _with_options(definitions, {
            "unique": dict.fromkeys(_names(unique), True),
            "indexed": dict.fromkeys(_names(index), True), "units": units or {}, "min": low,
            "max": high, "precision": precision or {}, "width": widths or {},
            "description": descriptions or {}})
        result = self._wrap(self._file._core.create_table(name, description))
        try:
            result._build(definitions, given)
        except BaseException:
            del self[name]
            raise
        return result


def _names(names: Names) -> list[str]:
    return [names] if isinstance(names, str) else list(names)


def _with_options(columns: list[Column], options: Mapping[str, Mapping[str, Any]]) -> list[Column]:
    """The columns with fields that options name: field, then column, then value."""
    result = {column.name: column for column in columns}
    for field, values in options.items():
        for name, value in values.items():
            if name not in result:
                raise errors.MissingError(f"there is no column '{name}'", "PF_NOCOLUMN", name)
            result[name] = dataclasses.replace(result[name], **{field: value})
    return list(result.values())
