"""Exceptions. Each derives from ``Error`` and from the built-in exception that Python programmers expect.

A refused operation has changed nothing.
"""

from __future__ import annotations

import errno
import os

__all__ = [
    "AccessError", "ArgumentError", "ClosedError", "DamagedError", "DuplicateError", "Error",
    "ExistingFileError", "FileError", "FolderError", "MissingError", "MissingFileError",
    "ModeError", "PositionError", "RangeError", "ValueTypeError",
]


class Error(Exception):
    """What every refused or failed operation raises; its text is the library's sentence.

    status  the name of the library's status, such as "PF_RANGE"
    item, value  the two texts of the failure: what failed, and where or which limit; often empty
    """

    def __init__(self, message: str = "", status: str = "", item: str = "", value: str = "") -> None:
        super().__init__(message)
        self.message, self.status, self.item, self.value = message, status, item, value

    def __str__(self) -> str:  # KeyError would quote it
        return self.message


class RangeError(Error, ValueError):
    """A value lies outside its bounds or the range of its type, or a text is too long."""


class DuplicateError(Error, ValueError):
    """A name is taken, or a unique column holds the value already."""


class ArgumentError(Error, ValueError):
    """A name, unit, width, precision or other argument that the library does not take."""


class ValueTypeError(Error, TypeError):
    """A value of another type than its parameter or column has, or a type that cannot change."""


class MissingError(Error, KeyError):
    """There is no list, table, parameter or column of that name."""


class PositionError(Error, IndexError):
    """There is no row or parameter at that position."""


class ClosedError(Error, ValueError):
    """The file is closed."""


class FileError(Error, OSError):
    """A file cannot be opened, created or written."""


class MissingFileError(FileError, FileNotFoundError):
    """There is no such file."""


class ExistingFileError(FileError, FileExistsError):
    """A file of that name exists, and mode "x" makes new ones only."""


class FolderError(FileError, IsADirectoryError):
    """It is a folder."""


class AccessError(FileError, PermissionError):
    """The system refuses access to the file."""


class DamagedError(FileError):
    """The file is damaged, or not a parameter file; see ``recover`` of ``tevpf.open``."""


class ModeError(FileError, ValueError):
    """A change to a file that was opened for reading only, mode "r"."""


_CLASSES: dict[str, type[Error]] = {
    "PF_RANGE": RangeError, "PF_BADRANGE": RangeError,
    "PF_DUPLICATE": DuplicateError, "PF_NOTUNIQUE": DuplicateError, "PF_BADUNIQUE": DuplicateError,
    "PF_BADTYPE": ValueTypeError, "PF_TYPECHG": ValueTypeError,
    "PF_NOELEM": MissingError, "PF_NOPARAM": MissingError, "PF_NOCOLUMN": MissingError,
    "PF_BADPOS": PositionError, "PF_NOFILE": ClosedError,
    "PF_OPENFAIL": FileError, "PF_FILEOPEN": FileError, "PF_NOPRIV": AccessError,
    "PF_BADFILE": DamagedError, "PF_BADFORMAT": DamagedError,
}


def from_status(status: str, item: str, value: str, sentence: str) -> Error:
    """The exception for a status of the library."""
    return _CLASSES.get(status, ArgumentError)(sentence, status, item, value)


def of_open(error: Error, path: str) -> Error:
    """The exception for a file that could not be opened: ``error``, or one that says why."""
    kind: type[FileError] = DamagedError
    number = errno.EINVAL
    if error.status == "PF_OPENFAIL":
        if not os.path.lexists(path):
            kind, number = MissingFileError, errno.ENOENT
        elif os.path.isdir(path):
            kind, number = FolderError, errno.EISDIR
        elif not os.access(path, os.R_OK):
            kind, number = AccessError, errno.EACCES
        else:
            kind, number = FileError, errno.EIO
    elif isinstance(error, FileError):
        kind = type(error)
    result = kind(error.message, error.status, error.item, error.value)
    result.errno, result.filename = number, path
    return result
