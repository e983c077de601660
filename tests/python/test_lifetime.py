"""Objects that outlive what they are of, changes under an iteration, and threads."""

import gc
import os
import threading

import numpy as np
import pytest
import tevpf


def test_objects_outlive_their_file_and_their_element(lab):
    table, engine = lab.tables["elements"], lab.lists["Engine"]
    row, parameter, rows, melting = table[0], engine["Thrust"], iter(table), table["melting"]
    columns, records = table.columns, table.to_numpy()
    renamed = lab.tables["elements"]
    renamed.rename("metals")
    for call in [lambda: len(table), lambda: table["mass"], lambda: columns["mass"], lambda: next(rows)]:
        with pytest.raises(tevpf.MissingError, match="there is no table 'elements'"):
            call()
    del lab.tables["metals"], lab.lists["Engine"]
    lab.tables.create("elements", {"symbol": ["Xe"]})  # another one of its name
    assert list(table.columns) == ["symbol"]
    lab.close()
    for call in [lambda: len(table), lambda: list(renamed), lambda: engine["Thrust"], lambda: engine.clear(),
                 lambda: table.append({"symbol": ["Kr"]}), lab.save, lambda: lab.lists["Engine"], lab.__enter__]:
        with pytest.raises(tevpf.ClosedError, match="not open any more"):
            call()
    lab.close()
    assert "closed" in repr(lab) and "not open" in repr(table) and "not open" in repr(engine)
    assert row["symbol"] == "Fe" and parameter.value == 480 and melting[2] == -38.83
    assert records["symbol"].tolist() == [b"Fe", b"He", b"Hg"]


def test_a_table_keeps_its_file_open(lab):
    lab.save_copy("copy.pf")
    table = tevpf.open("copy.pf").tables["elements"]
    gc.collect()
    assert table.find(symbol="He")["number"] == 2
    del table
    gc.collect()
    tevpf.open("copy.pf").close()


def test_changes_under_an_iteration_are_noticed(lab):
    table = lab.tables["elements"]
    table.columns.add(tevpf.Column("seen", "int16"))
    for row in table:
        table.update(row.number, seen=1)
    assert table["seen"].tolist() == [1, 1, 1]
    with pytest.raises(RuntimeError, match="changed its size"):
        for row in table:
            del table[-1]
    rows = iter(table)
    next(rows)
    del table.columns["mass"]
    assert next(rows)["symbol"] == "He"  # read before

    class Closing:
        """An argument that closes the file while it is looked at."""

        def __index__(self):
            lab.close()
            return 1

    with pytest.raises(tevpf.ClosedError):
        table.insert(0, {"number": Closing()})


def test_texts_that_are_no_utf8_survive(lab):
    path, raw = lab.name, b"\xff\xc3("
    lab.lists["Engine"]["Fuel"] = raw.decode("utf-8", "surrogateescape")
    lab.tables["elements"].append({"number": [1], "symbol": [raw.decode("utf-8", "surrogateescape")],
                                   "mass": [1.0], "melting": [np.nan]})
    lab.save()
    lab.close()
    with open(path, "rb") as file:
        assert file.read().count(raw) == 2
    with tevpf.open(path) as file:
        assert os.fsencode(file.lists["Engine"]["Fuel"].value) == raw
        assert os.fsencode(file.tables["elements"][3]["symbol"]) == raw
        assert file.tables["elements"].to_numpy()["symbol"][3] == raw
        assert file.tables["elements"].to_pandas()["symbol"][3] == file.tables["elements"]["symbol"][3]


def test_notebooks_get_escaped_html(lab):
    lab.lists.create("<b>", {"a<b": "<script>"}, description="&")
    lab.tables.create("many", {"n": np.arange(1000)})
    shown = [lab, lab.lists, lab.lists["<b>"], lab.lists["Engine"]["Thrust"], lab.tables["many"],
             lab.tables["many"].columns, lab.tables["elements"]]
    pages = "".join(thing._repr_html_() for thing in shown)
    assert "<b>" not in pages and "<script>" not in pages and "and 990 more" in pages
    assert pages.count("<table>") == pages.count("</table>") == len(shown)


def test_threads_share_files(folder):
    files = [tevpf.open(f"{i}.pf", "x") for i in range(3)]
    tables = [file.tables.create("t", columns=[tevpf.Column("key", "int32", unique=True),
                                               tevpf.Column("text", "str", width=9)]) for file in files]
    failures = []

    def work(thread):
        try:
            for step in range(60):
                table = tables[(thread + step) % 3]
                key = thread * 1000 + step * 10
                table.append({"key": np.arange(key, key + 5), "text": [f"{thread}"] * 5})
                assert table.find(key=key + 3)["text"] == f"{thread}"
                table.update(table.find(key=key).number, text="first")
                records = files[(thread + step) % 3].tables["t"].to_numpy()
                assert {f"{thread}".encode(), b"first"} <= set(records["text"].tolist())
                keys = table.to_numpy("key")["key"]
                assert (np.diff(keys) > 0).all()
                if step % 10 == 0:
                    files[thread % 3].save()
                    gc.collect()
        except BaseException as failure:  # pylint: disable=broad-except
            failures.append(failure)

    threads = [threading.Thread(target=work, args=(i,)) for i in range(8)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert not failures
    assert sum(len(table) for table in tables) == 8 * 60 * 5
    for file, table in zip(files, tables):
        file.save()
        rows = table.to_pandas()
        file.close()
        with tevpf.open(file.name) as again:
            assert again.tables["t"].to_pandas().equals(rows)
