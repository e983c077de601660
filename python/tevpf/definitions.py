"""What a parameter and a column are: plain values without connection to a file."""

from __future__ import annotations

import dataclasses
from typing import Any, Optional, TypeVar, Union

import numpy as np

from . import errors, notebook

__all__ = ["Column", "Parameter"]

Value = Union[int, float, str]

# The smallest and the greatest value of each type of numbers; both bounds are inclusive.
RANGES: dict[str, tuple[Value, Value]] = {
    **{name: (int(np.iinfo(name).min), int(np.iinfo(name).max)) for name in ("int16", "int32")},
    **{name: (float(np.finfo(name).min), float(np.finfo(name).max)) for name in ("float32", "float64")},
}


_WIDTHS = {"int16": 6, "int32": 11, "float32": 13, "float64": 23, "str": 1}


def _defaults(kind: str) -> dict[str, Any]:
    """What a new definition of a type has where nothing else is said."""
    low, high = RANGES.get(kind, (None, None))
    return {"min": low, "max": high, "precision": 6 if kind.startswith("float") else None,
            "width": _WIDTHS.get(kind)}


def type_of(value: Any) -> str:
    """The type that a value has by itself: numpy's scalars their own, int int32, float float64."""
    if isinstance(value, str):
        return "str"
    if isinstance(value, np.generic):
        return column_type(value.dtype, "the value")
    if isinstance(value, int):
        return "int32"
    if isinstance(value, float):
        return "float64"
    raise TypeError(f"a value is a number or a str, not {type(value).__name__}")


_TYPE_OF_DTYPE = {
    "bool": "int16", "int8": "int16", "uint8": "int16", "int16": "int16", "uint16": "int32",
    "int32": "int32", "uint32": "int32", "int64": "int32", "uint64": "int32",
    "float16": "float32", "float32": "float32", "float64": "float64",
}


def column_type(dtype: np.dtype[Any], what: str) -> str:
    """The type that holds what a dtype does; 64-bit integers become int32 and must fit."""
    if dtype.kind in "USO":
        return "str"
    try:
        return _TYPE_OF_DTYPE[dtype.name]
    except KeyError:
        raise errors.ValueTypeError(f"{what} has dtype {dtype}, which no type holds") from None


_T = TypeVar("_T", bound="_Definition")


@dataclasses.dataclass(frozen=True, repr=False)
class _Definition:
    def _is_default(self, field: dataclasses.Field[Any]) -> bool:
        defaults = _defaults(getattr(self, "type"))
        return bool(getattr(self, field.name) == defaults.get(field.name, field.default))

    def _complete(self) -> None:
        for name, value in _defaults(getattr(self, "type")).items():
            if getattr(self, name, value) is None:
                object.__setattr__(self, name, value)

    def __repr__(self) -> str:
        first, second, *rest = dataclasses.fields(self)
        parts = [repr(getattr(self, first.name)), repr(getattr(self, second.name))]
        parts += [f"{field.name}={getattr(self, field.name)!r}" for field in rest
                  if not self._is_default(field)]
        return f"{type(self).__name__}({', '.join(parts)})"

    def _fields(self) -> tuple[Any, ...]:
        """The fields as the extension module takes them."""
        return tuple(getattr(self, field.name) for field in dataclasses.fields(self))

    @classmethod
    def _from(cls: type[_T], fields: tuple[Any, ...]) -> _T:
        """From the fields as the extension module gives them, of which nothing is left to check."""
        result = object.__new__(cls)
        result.__dict__.update(zip(cls.__dataclass_fields__, fields))
        return result


@dataclasses.dataclass(frozen=True, repr=False)
class Parameter(_Definition):
    """A parameter: a named value with bounds, units, precision and a description.

    name         at most 19 bytes
    value        int, float or str
    type         "int16", "int32", "float32", "float64" or "str"; by default that of the value
    units        at most 7 bytes
    min, max     inclusive bounds of a number; by default the range of its type
    precision    significant digits shown, of floats; 6 by default
    description  a text of any length

    It is a copy of what the file holds: ``dataclasses.replace`` makes a changed one, and assigning it
    to the list stores it. ``float(p)`` and ``int(p)`` are its value.
    """

    name: str
    value: Value
    type: str = ""
    units: str = dataclasses.field(default="", kw_only=True)
    min: Optional[Value] = dataclasses.field(default=None, kw_only=True)
    max: Optional[Value] = dataclasses.field(default=None, kw_only=True)
    precision: Optional[int] = dataclasses.field(default=None, kw_only=True)
    description: str = dataclasses.field(default="", kw_only=True)

    def __post_init__(self) -> None:
        if not self.type:
            object.__setattr__(self, "type", type_of(self.value))
        if isinstance(self.value, np.generic):
            object.__setattr__(self, "value", self.value.item())
        self._complete()

    def _is_default(self, field: dataclasses.Field[Any]) -> bool:
        if field.name == "type":
            return self.type == type_of(self.value)
        return super()._is_default(field)

    def __float__(self) -> float:
        return float(self.value)

    def __int__(self) -> int:
        return int(self.value)

    def __str__(self) -> str:
        return f"{notebook.text_of(self.value, self.precision)} {self.units}".rstrip()

    def _repr_html_(self) -> str:
        return notebook.parameters_html("", [self])


@dataclasses.dataclass(frozen=True, repr=False)
class Column(_Definition):
    """A column of a table: the name and type of a value in each row.

    name         at most 19 bytes
    type         "int16", "int32", "float32", "float64" or "str"
    units        at most 7 bytes
    min, max     inclusive bounds of numbers; by default the range of the type
    precision    significant digits shown, of floats, 6 by default. Floats of the column are equal
                 when they differ by at most 10 ** -(precision + 1)
    width        characters shown; of texts also the largest length in bytes, 1 by default
    indexed      an index serves searches and orders rows
    unique       no two rows hold the same value; the column is indexed, too
    description  a text of any length
    """

    name: str
    type: str
    units: str = dataclasses.field(default="", kw_only=True)
    min: Optional[Value] = dataclasses.field(default=None, kw_only=True)
    max: Optional[Value] = dataclasses.field(default=None, kw_only=True)
    precision: Optional[int] = dataclasses.field(default=None, kw_only=True)
    width: Optional[int] = dataclasses.field(default=None, kw_only=True)
    indexed: bool = dataclasses.field(default=False, kw_only=True)
    unique: bool = dataclasses.field(default=False, kw_only=True)
    description: str = dataclasses.field(default="", kw_only=True)

    def __post_init__(self) -> None:
        if self.unique:
            object.__setattr__(self, "indexed", True)
        self._complete()

    @property
    def dtype(self) -> np.dtype[Any]:
        """The dtype of the column's values in numpy; texts are bytes in UTF-8."""
        return np.dtype(f"S{self.width}" if self.type == "str" else self.type)
