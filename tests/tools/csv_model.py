#!/usr/bin/env python3
"""csv_model.py TEVPF: random CSV in and out of the tool, against Python's csv module and, byte for byte,
against files written from the layout alone. Texts are long enough to cross the reader's blocks."""
import csv
import io
import os
import random
import subprocess
import sys
import tempfile

sys.path.insert(0, os.path.join(os.path.dirname(os.path.realpath(__file__)), "..", "outside"))
sys.dont_write_bytecode = True
from outside_check import DOUBLE, INT, STRING, stored_table  # noqa: E402

TOOL = os.path.realpath(sys.argv[1])
MOST = sys.float_info.max


def run(*args, given=b"", status=0):
    done = subprocess.run([TOOL, *args], input=given, capture_output=True, check=False)
    assert done.returncode == status, (args, done.returncode, done.stderr)
    return done.stdout if status == 0 else done.stderr.decode()


def written(header, rows, delimiter=",", end="\n", quoting=csv.QUOTE_MINIMAL):
    out = io.StringIO()
    csv.writer(out, delimiter=delimiter, lineterminator=end, quoting=quoting).writerows([header, *rows])
    return out.getvalue().encode()


def random_field(dice, kind):
    if kind == "integer":
        return str(dice.choice([0, -1, 2**31 - 1, -(2**31), dice.randrange(10**dice.randrange(1, 10))]))
    if kind == "double":
        return repr(dice.choice([dice.random(), -dice.random() * 10.0 ** dice.randrange(-300, 300), 0.5, 1e22]))
    size = dice.choice([0, 1, 5, 30]) if dice.random() < 0.99 else dice.randrange(700)
    return "".join(dice.choice("ab ,;\t|\"\n\ré€") for _ in range(size))


def same(kind, got, want):
    return float(got) == float(want) if kind == "double" else got == want


def check_round(seed, folder):
    dice = random.Random(seed)
    kinds = [dice.choice(["integer", "double", "string"]) for _ in range(dice.randrange(1, 6))]
    header = [f"{kind}{i}" for i, kind in enumerate(kinds)]
    rows = [[random_field(dice, kind) for kind in kinds] for _ in range(dice.randrange(1, 9000))]
    ways = [(d, e, q) for d in ",;\t|" for e in ("\n", "\r\n", "\r") for q in (csv.QUOTE_MINIMAL, csv.QUOTE_ALL)]
    delimiter, end, quoting = dice.choice(ways)
    text = written(header, rows, delimiter, end, quoting)
    file, source = os.path.join(folder, f"{seed}.pf"), os.path.join(folder, "in.csv")
    with open(source, "wb") as out:
        out.write(text)
    types = ",".join(map("=".join, zip(header, kinds)))
    is_pipe = dice.random() < 0.5
    run("import", file, "t", "-" if is_pipe else source, "--types", types, "--delimiter", delimiter, "--force",
        given=text if is_pipe else b"")
    delimiter = dice.choice(",;\t|")
    output = run("export", file, "t", "--delimiter", delimiter).decode()
    got = list(csv.reader(io.StringIO(output, newline=""), delimiter=delimiter))
    assert got[0] == header and len(got) == len(rows) + 1, (seed, len(got), len(rows))
    for number, (row, want) in enumerate(zip(got[1:], rows)):
        assert all(map(same, kinds, row, want)), (seed, number, row, want)
    run("import", file, "again", "-", "--types", types, "--delimiter", delimiter, "--force", given=output.encode())
    assert run("export", file, "again", "--delimiter", delimiter).decode() == output, seed


COLS = [
    dict(type=INT, name="id", units="", idx=1, unq=1, width=11, max=10**9, min=0),
    dict(type=DOUBLE, name="level", units="", idx=1, unq=0, width=13, prec=6, max=MOST, min=-MOST),
    dict(type=STRING, name="note", units="", idx=1, unq=0, width=6),
]


def check_indexes(seed, folder):
    """Rows before and behind the point from which on indexes are built at once; a value that is there
    already is refused with its line, and the file stays as it was."""
    dice = random.Random(seed)
    file = os.path.join(folder, "index.pf")
    before = dice.choice([0, 12000])
    ids = dice.sample(range(10**6), before + 4000)
    rows = [(i, dice.randrange(900) / 4, dice.choice("abc") * dice.randrange(6)) for i in ids]

    def stored(some):
        return stored_table("t", "", bytes(8), 0, COLS, some)

    with open(file, "wb") as out:
        out.write(stored(rows[:before]))
    names = [col["name"] for col in COLS]
    added = rows[before:]
    twin = dice.randrange(1, len(added))
    twice = [*added[:twin], (dice.choice(rows[: before + twin])[0], 1.5, ""), *added[twin:]]
    for given, source in ((written(names, twice), "-"), (b"", os.path.join(folder, "twice.csv"))):
        if source != "-":
            with open(source, "wb") as out:
                out.write(written(names, twice))
        error = run("import", file, "t", source, given=given, status=1)
        assert f"line {twin + 2}: value '{twice[twin][0]}' is already in column 'id'" in error, error
        with open(file, "rb") as now:
            assert now.read() == stored(rows[:before])
    run("import", file, "t", "-", given=written(names, added))
    with open(file, "rb") as now:
        assert now.read() == stored(rows), "not as the layout says"


def main():
    with tempfile.TemporaryDirectory() as folder:
        for seed in range(14):
            check_round(seed, folder)
        for seed in range(4):
            check_indexes(seed, folder)


main()
