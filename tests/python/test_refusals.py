"""What is refused: the exception, its sentence, and that nothing has changed."""

import numpy as np
import pandas as pd
import pytest
import tevpf
from tevpf import Column, Parameter

ROW = {"number": 8, "symbol": "O", "mass": 15.999, "melting": -218.79}

REFUSALS = {
    "out of bounds": (lambda f: f.lists["Engine"].update(Thrust=900), ValueError,
                      "'Thrust': 900 is out of range"),
    "beyond the type": (lambda f: f.lists["Engine"].update(Stages=40000), tevpf.RangeError,
                        "'Stages': 40000 is out of range"),
    "fraction": (lambda f: f.lists["Engine"].update(Stages=1.5), TypeError,
                 "parameter 'Stages' is of type short"),
    "no value": (lambda f: f.lists["Engine"].update(Stages=None), TypeError, "not NoneType"),
    "huge": (lambda f: f.lists["Engine"].update(Thrust=10 ** 400), OverflowError, "too large"),
    "no parameter": (lambda f: f.lists["Engine"].update(Thrus=1), KeyError,
                     "there is no parameter 'Thrus'"),
    "pattern": (lambda f: f.lists["Engine"]["Thr*"], KeyError, "there is no parameter 'Thr*'"),
    "no name": (lambda f: f.lists["Engine"][3], KeyError, "names are str"),
    "other name": (lambda f: f.lists["Engine"].update(a=Parameter("b", 1)), ValueError, "named 'b'"),
    "second parameter": (lambda f: f.lists["Engine"].add(Parameter("Fuel", 1)), tevpf.DuplicateError,
                         "parameter 'Fuel' is already in list 'Engine'"),
    "bounds of texts": (lambda f: f.lists["Engine"].add(Parameter("a", "b", min=1)), TypeError, ""),
    "bounds upside down": (lambda f: f.lists["Engine"].add(Parameter("a", 1, min=2, max=0)),
                           tevpf.RangeError, "the maximum is below the minimum"),
    "no type": (lambda f: f.lists["Engine"].add(Parameter("a", 1, "int8")), ValueError, "no type 'int8'"),
    "half of a list": (lambda f: f.lists.create("New", {"a": 1, "x" * 20: 2}), ValueError,
                       "at most 19 are possible"),
    "no list": (lambda f: f.lists["engine"], KeyError, "there is no list 'engine'"),
    "element by assignment": (lambda f: f.tables.update(new=1), TypeError, "create()"),
    "second table": (lambda f: f.tables.create("elements"), tevpf.DuplicateError, "already in the file"),
    "no column": (lambda f: f.tables["elements"]["colour"], KeyError, "there is no column 'colour'"),
    "no row": (lambda f: f.tables["elements"][3], IndexError, "there is no row 3; the table has 3"),
    "no such row": (lambda f: f.tables["elements"].__delitem__(-4), IndexError, "there is no row -4"),
    "row by a list": (lambda f: f.tables["elements"][[1]], TypeError, "not list"),
    "key of another type": (lambda f: f.tables["elements"].find(mass="Fe"), TypeError, "of type double"),
    "value of a row": (lambda f: f.tables["elements"].update(0, mass=301), tevpf.RangeError,
                       "'mass': 301 is out of range"),
    "unique value": (lambda f: f.tables["elements"].update(0, number=2), ValueError,
                     "value '2' is already in column 'number'"),
    "rows, the last": (lambda f: f.tables["elements"].append(pd.DataFrame([ROW, {**ROW, "number": 80}])),
                       tevpf.DuplicateError, "row 1: value '80' is already in column 'number'"),
    "rows, bounds": (lambda f: f.tables["elements"].append({**ROW, "mass": [-1.0]}), tevpf.RangeError,
                     "row 0: 'mass': -1 is out of range"),
    "rows, wide text": (lambda f: f.tables["elements"].append({**ROW, "symbol": "☃☃"}), tevpf.RangeError,
                        "row 0: 'symbol': '☃☃' has 6 characters; at most 3 are possible"),
    "rows, wide bytes": (lambda f: f.tables["elements"].append(
        {**ROW, "symbol": np.array(["Oxygen"], "S9")}), tevpf.RangeError, "'Oxygen' has 6 characters"),
    "rows, NUL": (lambda f: f.tables["elements"].append({**ROW, "symbol": "a\0b"}), ValueError, "NUL"),
    "rows, NUL in bytes": (lambda f: f.tables["elements"].append(
        {**ROW, "symbol": np.array([b"a\0b"])}), ValueError, "row 0: 'symbol': a text cannot contain"),
    "rows, big integers": (lambda f: f.tables["elements"].append({**ROW, "number": [2 ** 31]}),
                           tevpf.RangeError, "row 0: 'number': 2147483648 is out of range"),
    "rows, missing integer": (lambda f: f.tables["elements"].append({**ROW, "number": [None]}), TypeError,
                              "column 'number' is of type int32"),
    "rows, no text": (lambda f: f.tables["elements"].append({**ROW, "symbol": 5}), TypeError,
                      "row 0: column 'symbol' is of type string"),
    "rows, numbers among texts": (lambda f: f.tables.create("new", {"a": ["x", 5]}), TypeError,
                                  "row 1: column 'a' is of type string"),
    "rows, one column less": (lambda f: f.tables["elements"].append({"number": [1]}), KeyError,
                              "there are no values for column 'symbol'"),
    "rows, one more": (lambda f: f.tables["elements"].append({**ROW, "x": 1}), KeyError, "column 'x'"),
    "rows, lengths": (lambda f: f.tables["elements"].append({**ROW, "number": [1, 2]}), ValueError,
                      "'number' has 2"),
    "rows, a list": (lambda f: f.tables["elements"].append([1, 2]), TypeError, "not as list"),
    "table with duplicates": (lambda f: f.tables.create("new", {"a": [1, 2, 1]}, unique="a"),
                              tevpf.DuplicateError, "row 2: value '1' is already in column 'a'"),
    "index over nan": (lambda f: f.tables.create("new", {"a": [1.0, None]}, index="a"), ValueError,
                       "row 1: 'a': nan is out of range"),
    "table of dates": (lambda f: f.tables.create("new", {"a": np.zeros(1, "M8[s]")}), TypeError,
                       "datetime64"),
    "units of no column": (lambda f: f.tables.create("new", {"a": [1]}, units={"b": "m"}), KeyError, "'b'"),
    "type with rows": (lambda f: f.tables["elements"].columns.update(mass=Column("mass", "int32")),
                       tevpf.ValueTypeError, "the type of a column cannot change"),
    "unique with rows": (lambda f: f.tables["elements"].columns.add(Column("k", "int32", unique=True)),
                         tevpf.DuplicateError, "has rows"),
    "listing in no order": (lambda f: f.tables["elements"].print("listing", sorted_by="mass"), ValueError,
                            "column 'mass' has no index"),
    "numpy in no order": (lambda f: f.tables["elements"].to_numpy("mass"), ValueError, "has no index"),
    "open twice": (lambda f: tevpf.open("./lab.pf"), OSError, "already open"),
    "save to nowhere": (lambda f: f.save_copy("no/folder"), OSError, "cannot be opened or written"),
}


@pytest.mark.parametrize("name", REFUSALS)
def test_refusals_say_what_is_wrong_and_change_nothing(lab, contents, name):
    call, kind, sentence = REFUSALS[name]
    before = contents(lab)
    with pytest.raises(kind) as refusal:
        call(lab)
    assert sentence in str(refusal.value)
    assert contents(lab) == before


def test_modes_are_those_of_open(folder):
    with open("foreign", "wb") as foreign:
        foreign.write(b"no parameter file, but some text")
    for path, mode, kind in [("lab.pf", "r", FileNotFoundError), ("lab.pf", "r+", FileNotFoundError),
                             ("foreign", "x", FileExistsError), ("foreign", "r", tevpf.DamagedError),
                             ("foreign", "w", tevpf.DamagedError), (".", "r", IsADirectoryError),
                             ("no/lab.pf", "w", OSError), ("lab.pf", "rb", ValueError), ("a\0", "r", ValueError),
                             (b"lab.pf", "r", TypeError)]:
        with pytest.raises(kind):
            tevpf.open(path, mode)
    assert sorted(path.name for path in folder.iterdir()) == ["foreign"]

    with tevpf.open("lab.pf", "a") as file:
        file.lists.create("a", {"x": 1})
        file.save()
    with tevpf.open("lab.pf", "w") as file:  # dropped: it was not saved
        assert not file.lists
    with tevpf.open("lab.pf") as file:
        for change in [lambda: file.lists["a"].update(x=2), lambda: file.lists.clear(), file.save,
                       lambda: file.tables.create("t"), lambda: file.lists["a"].move("x", 0)]:
            with pytest.raises(tevpf.ModeError):
                change()
        assert file.lists["a"]["x"].value == 1
    size = (folder / "lab.pf").stat().st_size
    with open("lab.pf", "r+b") as file:
        file.truncate(size - 3)
    with pytest.raises(tevpf.DamagedError):
        tevpf.open("lab.pf", "r+")
    with tevpf.open("lab.pf", "r+", recover=True) as file:
        assert "damaged" in file.damage
        with pytest.raises(tevpf.DamagedError):
            file.save()
