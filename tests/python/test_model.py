"""Long random sequences of changes, on the package and on plain Python objects."""

import random

import numpy as np
import pandas as pd
import tevpf

TEXTS = ["", "a", "Fe", "Fe*", "µ", "zwölf", "naïve ☃", "x" * 12]


class TableModel:
    """A table and the list of dicts that it must equal."""

    def __init__(self, table, seed):
        self.table, self.random, self.rows, self.next_key = table, random.Random(seed), [], 0

    def new_row(self):
        self.next_key += 1
        key = self.next_key * 7919 % 10007  # unique, in no order
        return {"key": key, "text": self.random.choice(TEXTS), "small": self.random.randrange(-9, 9),
                "value": self.random.choice([0.5, -1.25, 2.0 ** 40, float("nan")])}

    def place(self):
        return self.random.randrange(len(self.rows))

    def append(self):
        rows = [self.new_row() for _ in range(self.random.randrange(1, 40))]
        data = {name: [row[name] for row in rows] for name in rows[0]}
        frame = pd.DataFrame(data)[self.random.sample(list(data), len(data))]
        records = np.array([tuple({**row, "text": row["text"].encode()}.values()) for row in rows],
                           [("key", "i8"), ("text", "S12"), ("small", "i1"), ("value", "f4")])
        self.table.append(self.random.choice([data, frame, records]))
        self.rows += rows

    def insert(self):
        place, row = self.place(), self.new_row()
        self.table.insert(place, row)
        self.rows.insert(place, row)

    def update(self):
        place, row = self.place(), self.new_row()
        names = self.random.sample(list(row), 2)
        self.table[place - self.random.choice([0, len(self.rows)])] = {n: row[n] for n in names}
        self.rows[place].update({n: row[n] for n in names})

    def remove(self):
        part = slice(self.place(), self.place(), self.random.choice([1, 2, -1]))
        del self.table[part]
        del self.rows[part]

    def move(self):
        place, to = self.place(), self.place()
        self.table.move(place, to)
        self.rows.insert(to, self.rows.pop(place))

    def refused(self):
        rows = [self.new_row(), self.new_row(), dict(self.random.choice(self.rows))]
        try:
            self.table.append({name: [row[name] for row in rows] for name in rows[0]})
        except tevpf.DuplicateError as error:
            assert str(error) == f"row 2: value '{rows[2]['key']}' is already in column 'key'"
        else:
            raise AssertionError("a duplicate was taken")

    def step(self):
        actions = [self.append] if not self.rows else [
            self.append, self.insert, self.update, self.remove, self.move, self.refused]
        self.random.choice(actions)()

    def check(self):
        table, rows = self.table, self.rows
        assert len(table) == len(rows)
        assert table.columns["value"].units == "m" and list(table.columns) == list(table.dtype.names)
        frame = table.to_pandas()
        wanted = pd.DataFrame(rows, columns=list(table.columns)).astype(
            {"key": "int32", "small": "int16", "value": "float64"})
        pd.testing.assert_frame_equal(frame, wanted, check_exact=True)
        records = table.to_numpy()
        for name in table.columns:
            np.testing.assert_array_equal(table[name], wanted[name].to_numpy(table[name].dtype))
            texts = np.char.encode(table[name], "utf-8") if name == "text" else table[name]
            np.testing.assert_array_equal(records[name], texts)
        assert [repr(dict(row)) for row in table] == [repr({n: row[n] for n in table.columns}) for row in rows]
        order = [row["key"] for row in table.sorted_by("key")]
        assert order == sorted(row["key"] for row in rows) == table.to_numpy("key")["key"].tolist()
        values = [row["value"] for row in table.sorted_by("value", reverse=True)]
        finite = [value for value in values if value == value]
        assert finite == sorted(finite, reverse=True) == values[:len(finite)]
        for name, value in self.new_row().items():
            same = [i for i, row in enumerate(rows) if row[name] == value or row[name] != row[name] and value != value]
            found = table.find(**{name: value})
            assert (found and found.number) == (same[0] if same else None)
            assert [row.number for row in table.find_all(**{name: value})] == same


def test_tables_equal_their_models_whatever_happens(folder):
    columns = [tevpf.Column("key", "int32", unique=True), tevpf.Column("text", "str", width=16),
               tevpf.Column("small", "int16", min=-9, max=9), tevpf.Column("value", "float64", units="m")]
    files = [tevpf.open(name, "w") for name in ("first.pf", "second.pf")]
    models = [TableModel(file.tables.create("t", columns=columns), seed) for seed, file in enumerate(files)]
    for step in range(400):
        models[step % 2].step()
        if step % 10 == 0:
            models[step // 10 % 2].check()
        if step % 100 == 99:  # another order of columns, and back from the disk
            which = step // 100 % 2
            models[which].table.columns.move("text", models[which].random.choice(["key", None]))
            files[which].save()
            files[which].close()
            files[which] = tevpf.open(files[which].name, "r+")
            models[which].table = files[which].tables["t"]
            models[which].check()
    assert min(len(model.rows) for model in models) > 20


def test_lists_equal_their_models_whatever_happens(folder):
    chance = random.Random(5)
    file = tevpf.open("lists.pf", "w")
    engine, model = file.lists.create("Engine"), {}
    for step in range(600):
        name = chance.choice("abcdefgh") + chance.choice(["", "*b", "ß"])
        value = chance.choice([1, -7, 2.5, "text", "☃", np.int16(3), np.float32(0.1)])
        parameter = tevpf.Parameter(name, value, units="kN", description=chance.choice(TEXTS))
        action = chance.randrange(6)
        if action < 2:
            engine[name] = model[name] = parameter
        elif name not in model:
            assert engine.get(name) is None and name not in engine
        elif action == 2:
            del engine[name], model[name]
        elif action == 3 and type(value) is type(model[name].value):
            engine[name] = value
            model[name] = tevpf.Parameter(name, np.dtype(model[name].type).type(value).item(),
                                          model[name].type, units="kN", description=model[name].description)
        elif action == 4 and "new" not in model:
            engine.rename(name, "new")
            names = ["new" if old == name else old for old in model]
            model["new"] = tevpf.Parameter("new", model[name].value, model[name].type, units="kN",
                                           description=model[name].description)
            model = {new: model[new] for new in names}
        elif action == 5:
            place = chance.randrange(len(model))
            engine.move(name, place)
            names = [old for old in model if old != name]
            model = {old: model[old] for old in [*names[:place], name, *names[place:]]}
        if step % 200 == 199:
            file.save()
            file.close()
            file = tevpf.open("lists.pf", "r+")
            engine = file.lists["Engine"]
        assert list(engine) == list(model)
        assert engine.values() == list(model.values())
        assert all(engine.position(key) == place for place, key in enumerate(model))
        if model:
            assert eval(repr(engine.values()[-1]), vars(tevpf)) == engine.values()[-1]


def test_columns_get_the_types_of_their_data(folder):
    frame = pd.DataFrame({
        "flag": [True, False], "byte": np.array([255, 0], "u1"), "short": np.array([-5, 5], "i2"),
        "word": np.array([65535, 0], "u2"), "long": [2 ** 31 - 1, -2 ** 31],
        "half": np.array([0.5, np.nan], "f2"), "single": np.array([0.1, -0.0], "f4"),
        "double": [0.1, np.nan], "text": ["zwölf", None], "category": pd.Categorical(["b", "a"]),
        "Int": pd.array([1, 2], "Int16"), "Missing": pd.array([1, None], "Int64"),
        "string": pd.array(["x", None], "string"), "Float": pd.array([1.5, None], "Float32")})
    types = ["int16", "int16", "int16", "int32", "int32", "float32", "float32", "float64", "str", "str",
             "int16", "float64", "str", "float64"]
    nan = float("nan")
    rows = [(1, 255, -5, 65535, 2 ** 31 - 1, 0.5, float(np.float32(0.1)), 0.1, "zwölf", "b", 1, 1.0, "x", 1.5),
            (0, 0, 5, 0, -2 ** 31, nan, -0.0, nan, "", "a", 2, nan, "", nan)]
    with tevpf.open("types.pf", "x") as file:
        table = file.tables.create("t", frame)
        assert [column.type for column in table.columns.values()] == types
        assert table.dtype["text"] == "S6"
        assert table.columns["text"].width == 6 and table.columns["category"].width == 1
        assert [repr(row.to_tuple()) for row in table] == [repr(row) for row in rows]
        table.append(table.to_numpy())
        table.append(table.to_pandas()[:0])
        assert [repr(row.to_tuple()) for row in table] == [repr(row) for row in rows * 2]
        file.tables.create("indexed", frame.set_index("long")[["short"]])
        assert list(file.tables["indexed"].columns) == ["long", "short"]
        assert len(file.tables.create("empty", frame[:0])) == 0
