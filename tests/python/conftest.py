"""What the tests of the Python package share."""

import gc
import os

import pytest
import tevpf


@pytest.fixture
def folder(tmp_path, monkeypatch):
    """An empty working directory."""
    monkeypatch.chdir(tmp_path)
    yield tmp_path
    gc.collect()  # files that a failed test left open are closed before their folder goes


@pytest.fixture
def contents(folder):
    """Tells what an open file holds, as the bytes of a copy."""

    def read(file):
        file.save_copy("contents.copy")
        with open("contents.copy", "rb") as copy:
            return copy.read()

    return read


@pytest.fixture
def lab(folder):
    """A saved file with a list and a table, open for changing."""
    with tevpf.open("lab.pf", "x") as file:
        file.lists.create("Engine", [
            tevpf.Parameter("Thrust", 480.0, units="kN", min=0, max=800, precision=5),
            tevpf.Parameter("Stages", 2, "int16"), tevpf.Parameter("Fuel", "RP-1")])
        file.tables.create("elements", {
            "number": [26, 2, 80], "symbol": ["Fe", "He", "Hg"], "mass": [55.845, 4.0026, 200.59],
            "melting": [1538.0, None, -38.83]}, unique="number", index="symbol",
            bounds={"mass": (0, 300)}, units={"mass": "u"}, widths={"symbol": 3})
        file.save()
        yield file
