"""Lists of parameters."""

from __future__ import annotations

from collections.abc import Iterable, Iterator, Mapping, MutableMapping
from typing import Any, Optional, Union

from . import _core, errors, notebook
from .definitions import Parameter, Value
from .element import Element

__all__ = ["List"]


class List(Element[_core.List], MutableMapping[str, Parameter]):
    """The parameters of a list by name, in the list's order.

    ``engine["Thrust"]`` is a Parameter; a value that is assigned changes its value, within its bounds;
    a Parameter that is assigned replaces it, or is added. The list is meant by its name: once it is
    deleted or renamed through another object, operations raise MissingError, and ClosedError once
    the file is closed.
    """

    def __getitem__(self, name: str) -> Parameter:
        return Parameter._from(self._core.parameter(_checked(name)))

    def __setitem__(self, name: str, value: Union[Value, Parameter]) -> None:
        """Changes a value, or stores a parameter.

        MissingError: a value for a parameter that is not there
        RangeError: outside the bounds; ValueTypeError: a fraction for an integer, a text for a number
        """
        self._file._require_writing()
        if not isinstance(value, Parameter):
            self._core.set(_checked(name), value)
        elif value.name != name:
            raise errors.ArgumentError(f"'{name}' cannot hold a parameter named '{value.name}'")
        elif name in self:
            self._core.redefine(value._fields())
        else:
            self._core.add(value._fields(), None)

    def __delitem__(self, name: str) -> None:
        self._file._require_writing()
        self._core.remove(_checked(name))

    def __iter__(self) -> Iterator[str]:
        return iter([name for name, *_ in self._core.parameters()])

    def __len__(self) -> int:
        return self._core.size

    def __contains__(self, name: object) -> bool:
        return isinstance(name, str) and self._core.position(name) is not None

    def values(self) -> list[Parameter]:  # type: ignore[override]
        """The parameters, read in one go."""
        return [Parameter._from(fields) for fields in self._core.parameters()]

    def items(self) -> list[tuple[str, Parameter]]:  # type: ignore[override]
        return [(parameter.name, parameter) for parameter in self.values()]

    def add(self, parameter: Parameter, position: Optional[int] = None) -> None:
        """Adds a parameter at the end, or in front of the one at a position, counted from 0.

        DuplicateError: the name is taken; RangeError: the value lies outside the bounds
        """
        self._file._require_writing()
        self._core.add(parameter._fields(), position)

    def update(self, other: Any = (), /, **more: Any) -> None:
        """Assigns values or parameters one after the other; those before a refused one stay."""
        for name, value in dict(other, **more).items():
            self[name] = value

    def rename(self, name: str, new_name: str) -> None:
        self._file._require_writing()
        self._core.rename(_checked(name), new_name)

    def move(self, name: str, position: int) -> None:
        """Moves a parameter so that it stands at the position."""
        self._file._require_writing()
        self._core.move(_checked(name), position)

    def position(self, name: str) -> int:
        """Where a parameter stands, counted from 0."""
        position = self._core.position(name)
        if position is None:
            raise errors.MissingError(f"there is no parameter '{name}'", "PF_NOPARAM", name)
        return position

    def find_prefix(self, prefix: str) -> Optional[Parameter]:
        """The first parameter, in name order, whose name starts so."""
        fields = self._core.find_prefix(prefix)
        return None if fields is None else Parameter._from(fields)

    def rename_list(self, new_name: str) -> None:
        """This object follows; others find no list of the old name."""
        self._file._require_writing()
        self._core.rename_list(new_name)

    def to_pandas(self) -> Any:
        """A DataFrame with a row for each parameter, its name the index."""
        import pandas

        columns = ["value", "type", "units", "min", "max", "precision", "description"]
        rows = [(p.value, p.type, p.units, p.min, p.max, p.precision, p.description)
                for p in self.values()]
        index = pandas.Index(list(self), name="name", dtype=object)
        return pandas.DataFrame(rows, columns=columns, index=index, dtype=object)

    def __eq__(self, other: object) -> bool:
        return self is other

    __hash__ = object.__hash__

    def __repr__(self) -> str:
        try:
            count = len(self)
        except errors.Error as gone:
            return f"<tevpf.List '{self.name}': {gone}>"
        return f"<tevpf.List '{self.name}': {count} parameter{'' if count == 1 else 's'}>"

    def _repr_html_(self) -> str:
        return notebook.parameters_html(repr(self)[1:-1], self.values())


def parameters_from(given: Union[Mapping[str, Any], Iterable[Parameter]]) -> list[Parameter]:
    """Parameters, or values by name, whose types are their own."""
    if not isinstance(given, Mapping):
        return list(given)
    return [value if isinstance(value, Parameter) else Parameter(name, value)
            for name, value in given.items()]


def _checked(name: str) -> str:
    if not isinstance(name, str):
        raise errors.MissingError(f"there is no parameter {name!r}: names are str", "PF_NOPARAM")
    return name
