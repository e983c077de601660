"""One row of a table."""

from __future__ import annotations

from collections.abc import Iterator, Mapping
from typing import Union

from . import errors

__all__ = ["Row"]


class Row(Mapping[str, Union[int, float, str]]):
    """A row as a mapping of column names to values: a copy, good after the table has changed.

    number  the row's number in storage order when it was read
    """

    __slots__ = ("_positions", "_values", "number")

    def __init__(self, positions: dict[str, int], values: tuple[Union[int, float, str], ...],
                 number: int) -> None:
        self._positions, self._values, self.number = positions, values, number

    def __getitem__(self, column: str) -> Union[int, float, str]:
        try:
            return self._values[self._positions[column]]
        except KeyError:
            raise errors.MissingError(f"there is no column '{column}'", "PF_NOCOLUMN",
                                      str(column)) from None

    def __iter__(self) -> Iterator[str]:
        return iter(self._positions)

    def __len__(self) -> int:
        return len(self._values)

    def __repr__(self) -> str:
        return f"<row {self.number}: {dict(self)}>"

    def to_tuple(self) -> tuple[Union[int, float, str], ...]:
        """The values in column order."""
        return self._values
