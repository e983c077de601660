"""What lists and tables share as elements of a file."""

from __future__ import annotations

import os
from typing import TYPE_CHECKING, Generic, TypeVar

from . import _core

if TYPE_CHECKING:
    from .file import File

Core = TypeVar("Core", _core.List, _core.Table)


class Element(Generic[Core]):
    _file: "File"
    _core: Core

    def __init__(self, file: "File", core: Core) -> None:
        self._file = file
        self._core = core

    @property
    def name(self) -> str:
        return self._core.name

    @property
    def description(self) -> str:
        """At most 79 bytes; it can be assigned."""
        return self._core.description

    @description.setter
    def description(self, text: str) -> None:
        self._file._require_writing()
        self._core.describe(text)

    def dump(self, path: "str | os.PathLike[str]") -> None:
        """Writes everything to a text file for people to read."""
        self._core.dump(path)
