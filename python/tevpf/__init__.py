"""Named technical parameters and tables in binary parameter files.

    import tevpf

    with tevpf.open("lab.pf", "r+") as f:
        f.lists["Engine"]["Thrust"]                  # a Parameter: value, units, min, max, ...
        f.lists["Engine"]["Thrust"] = 481.5          # RangeError when it is out of bounds
        t = f.tables["elements"]
        t["melting"]                                 # a numpy array, missing values as nan
        t.to_pandas(), t.to_numpy(), len(t), t.columns
        t.find(symbol="Fe"), list(t.sorted_by("melting"))
        f.tables.create("runs", dataframe, unique="id", units={"mass": "kg"})
        f.save()

Names   Exact; of at most 19 bytes in UTF-8, units 7, descriptions of lists and tables 79.
Texts   str; bytes of a file that are no UTF-8 become lone surrogates, and bytes again when they are
        written.
Files   Several can be open at once. Changes live in memory until they are saved.
Threads Every call holds the interpreter's lock, also while a file is read or written, so threads may
        share files, lists and tables: calls take turns. Several calls together are not one step.
"""

from ._core import VERSION as __version__
from .definitions import Column, Parameter
from .errors import *  # noqa: F401, F403
from .errors import __all__ as _errors
from .file import File, Lists, Tables, open
from .lists import List
from .rows import Row
from .tables import Columns, Table

__all__ = ["Column", "Columns", "File", "List", "Lists", "Parameter", "Row", "Table", "Tables",
           "__version__", "open", *_errors]
