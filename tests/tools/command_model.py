#!/usr/bin/env python3
"""command_model.py TEVPF [STEPS [SEED...]]: random commands change two files and a model of them. After each
one the exit status is as the model says, `export --json` holds what the model holds, and a refused command has
left the very bytes of its file; now and then every other way of reading is compared, too."""
import copy
import json
import math
import os
import random
import subprocess
import sys
import tempfile

TOOL = os.path.realpath(sys.argv[1])
TYPES = ("integer", "short", "real", "double", "string")
LOWEST = {"integer": -(2**31), "short": -(2**15), "real": -3.4028235e38, "double": -sys.float_info.max}
WIDTH = {"integer": 11, "short": 6, "real": 13, "double": 23}
NAMES = ("alpha", "Beta", "g", "delta two", "nineteen-bytes-long", "é")
BAD_NAMES = ("", " blank in front", "twenty-bytes-of-name")
TEXTS = ("", "ab", "x y", "é", '"q"', "long text")


class Refused(Exception):
    """What the model says of a command that must change nothing."""


def refuse_if(condition):
    if condition:
        raise Refused


def is_floating(kind):
    return kind in ("real", "double")


def text_of(value):
    if isinstance(value, float):
        if math.isnan(value):
            return "nan"
        return str(int(value)) if value.is_integer() and abs(value) < 1e9 else repr(value)
    return str(value)


def parsed(kind, text):
    if kind == "string":
        return text
    try:
        value = float(text) if is_floating(kind) else int(text)
    except ValueError:
        raise Refused from None
    refuse_if(not is_floating(kind) and not LOWEST[kind] <= value < -LOWEST[kind])
    return value


def find(items, name):
    return next((item for item in items if item["name"] == name), None)


def required(items, name):
    refuse_if(find(items, name) is None)
    return find(items, name)


def check_name(name):
    refuse_if(not name or name[0] == " " or len(name.encode()) > 19)


def within(definition, value):
    refuse_if("min" in definition and value < definition["min"])
    refuse_if("max" in definition and value > definition["max"])
    return value


# ---- Definitions --------------------------------------------------------------------------------

def defined(before, kind, options):
    """A definition with the options applied; one of another type keeps only name, texts and index."""
    kept = ("name", "units", "description", "indexed", "unique")
    now = dict(before) if before.get("type") == kind else {k: before[k] for k in kept if k in before}
    now["type"] = kind
    for key in ("units", "description"):
        if key in options:
            now[key] = options[key]
    refuse_if(len(options.get("units", "").encode()) > 7)
    refuse_if("precision" in options and not is_floating(kind))
    if "precision" in options:
        now["precision"] = options["precision"]
    for key in ("min", "max"):
        if key in options:
            refuse_if(kind == "string")
            now.pop(key, None)
            if options[key] != "none":
                now[key] = parsed(kind, options[key])
    refuse_if("min" in now and "max" in now and now["max"] < now["min"])
    return now


def missing_last(value):
    return value is None, 0 if value is None else value


def as_json(definition):
    usual = {"units": "", "description": "", "precision": 6, "indexed": False, "unique": False}
    usual["width"] = WIDTH.get(definition["type"])
    shown = {k: v for k, v in definition.items() if k not in usual or usual[k] != v}
    if shown.get("unique"):
        shown.pop("indexed", None)
    return shown


def place(items, item, where):
    """Moves an item of a list to where the options of a place say."""
    if not where:
        return
    (option, value), = where.items()
    others = [other for other in items if other is not item]
    if option == "position":
        refuse_if(value > len(items))
        at = value - 1
    else:
        at = others.index(required(others, value)) + (option == "after")
    items[:] = [*others[:at], item, *others[at:]]


class Element:
    """A list, whose members are parameters, or a table, whose members are columns."""

    def __init__(self, kind, name):
        self.kind, self.name, self.description, self.members, self.rows = kind, name, "", [], []

    def json(self):
        whole = {self.kind: self.name, "description": self.description}
        if self.kind == "list":
            return {**whole, "parameters": [as_json(p) for p in self.members]}
        names = [c["name"] for c in self.members]
        rows = [{n: None if r[n] != r[n] else r[n] for n in names} for r in self.rows]
        return {**whole, "columns": [as_json(c) for c in self.members], "rows": rows}

    # ---- Parameters ----

    def change_parameter(self, name, value, options, where, is_new):
        before = find(self.members, name)
        if is_new:
            check_name(name)
            refuse_if(before)
            before = {"name": name}
        else:
            before = required(self.members, name)
        text = text_of(before["value"]) if value is None else value
        kind = options.get("type", before.get("type"))
        now = defined(before, kind, options)
        now["value"] = within(now, parsed(kind, text))
        if is_new:
            self.members.append(now)
        else:
            self.members[self.members.index(before)] = now
        place(self.members, now, where)

    # ---- Columns ----

    def fits(self, column, value, row_is_new=True):
        """A value of a row, or a refusal."""
        if column["type"] == "string":
            refuse_if(len(value.encode()) > column["width"])
        elif value != value:
            refuse_if(column["indexed"])
        else:
            within(column, value)
        if row_is_new and column["unique"]:
            refuse_if(any(row[column["name"]] == value for row in self.rows))
        return value

    def nearest_to_zero(self, column):
        if column["type"] == "string":
            return ""
        if is_floating(column["type"]) and not column["indexed"]:
            return math.nan
        return max(column.get("min", 0), min(column.get("max", 0), 0))

    def define(self, name, options, where):
        before = find(self.members, name)
        start = {"indexed": False, "unique": False, **(before or {"name": name})}
        refuse_if(before and "default" in options)
        kind = options.get("type", start.get("type"))
        refuse_if(kind is None or (kind == "string" and start.get("type") != kind and "width" not in options))
        now = defined(start, kind, options)
        now["width"] = options.get("width", now.get("width", WIDTH.get(kind)))
        refuse_if(options.get("index") is False and options.get("unique"))
        if "index" in options:
            now["indexed"] = options["index"]
            now["unique"] = now["unique"] and options["index"]
        if "unique" in options:
            now["unique"] = options["unique"]
            now["indexed"] = now["indexed"] or options["unique"]
        if before is None:
            check_name(name)
            refuse_if(now["unique"] and len(self.rows) > 1)
            value = self.nearest_to_zero(now)
            if "default" in options and self.rows:
                value = within(now, parsed(kind, options["default"]))
                refuse_if(kind == "string" and len(value.encode()) > now["width"])
            for row in self.rows:
                row[name] = value
            self.members.append(now)
        else:
            values = [row[name] for row in self.rows]
            if before["type"] != kind:
                values = [parsed(kind, text_of(value)) for value in values]
            for value in values:
                self.fits(now, value, row_is_new=False)
            refuse_if(now["unique"] and len(set(values)) < len(values))
            for row, value in zip(self.rows, values):
                row[name] = value
            self.members[self.members.index(before)] = now
        place(self.members, now, where)

    def insert(self, cells, at):
        row = {}
        for column in self.members:
            lowest = column.get("min", LOWEST.get(column["type"], ""))
            row[column["name"]] = math.nan if is_floating(column["type"]) and not column["indexed"] else lowest
        for name, text in cells:
            column = required(self.members, name)
            is_missing = is_floating(column["type"]) and not column["indexed"] and text == ""
            row[name] = math.nan if is_missing else parsed(column["type"], text)
            self.fits(column, row[name], row_is_new=False)
        for column in self.members:
            self.fits(column, row[column["name"]])
        refuse_if(at > len(self.rows) + 1)
        self.rows.insert(at - 1 if at else len(self.rows), row)

    def update(self, name, value, chosen):
        column = required(self.members, name)
        for row in chosen:
            row[name] = math.nan
        for row in chosen:
            row[name] = self.fits(column, value)

    def remove_member(self, name):
        self.members.remove(required(self.members, name))
        for row in self.rows:
            del row[name]
        if not self.members:
            self.rows = []


class File:
    def __init__(self):
        self.elements = []

    def json(self):
        return {"elements": [e.json() for e in sorted(self.elements, key=lambda e: e.kind == "table")]}

    def get(self, kind, name):
        found = [e for e in self.elements if (e.kind, e.name) == (kind, name)]
        return found[0] if found else None

    def needed(self, kind, name):
        refuse_if(self.get(kind, name) is None)
        return self.get(kind, name)

    def made(self, kind, name):
        check_name(name)
        if self.get(kind, name) is None:
            self.elements.append(Element(kind, name))
        return self.get(kind, name)

    def take(self, source, name, conflict):
        """A copy of an element, under the name that the conflict leaves it."""
        check_name(name)
        if self.get(source.kind, name):
            refuse_if(conflict == "refuse")
            if conflict == "skip":
                return
            if conflict == "replace":
                self.elements.remove(self.get(source.kind, name))
            number = 2
            base = name
            while self.get(source.kind, name):
                name = base.encode()[: 19 - len(f"-{number}")].decode() + f"-{number}"
                number += 1
        taken = copy.deepcopy(source)
        taken.name = name
        self.elements.append(taken)


# ---- Random commands ----------------------------------------------------------------------------

class Session:
    def __init__(self, seed, folder):
        self.dice = random.Random(seed)
        self.paths = [os.path.join(folder, f"{seed}-{i}.pf") for i in range(2)]
        self.files = [File(), File()]
        for path in self.paths:
            self.run("new", path)
        self.refused = 0

    def run(self, *args, given=None):
        return subprocess.run([TOOL, *args], input=given, capture_output=True, text=True, check=False)

    def one(self, items, otherwise):
        """One of them; seldom, or where there is none, what is not there."""
        return self.dice.choice(items) if items and self.dice.random() < 0.93 else otherwise

    def new_name(self):
        return self.dice.choice(NAMES if self.dice.random() < 0.95 else BAD_NAMES)

    def element(self, kind):
        """Its name, how it is told from one of the other kind, and the element."""
        name = self.one([e.name for e in self.file.elements if e.kind == kind], "nobody")
        return name, ["--" + kind], self.file.get(kind, name)

    def member(self, element):
        return self.one([m["name"] for m in element.members] if element else [], "nothing")

    def value(self, kind):
        if kind == "string":
            return self.dice.choice(TEXTS)
        if self.dice.random() < 0.05:
            return self.dice.choice(("word", "1.5", "99999", "1e3"))
        return text_of(self.dice.randrange(-40, 160) / (4 if is_floating(kind) else 1) * 1.0)

    def place(self, element):
        if self.dice.random() < 0.7:
            return {}
        names = [m["name"] for m in element.members] if element else []
        option = self.dice.choice(("before", "after", "position"))
        if option == "position":
            return {option: self.dice.randrange(1, len(names) + 3)}
        return {option: self.one(names, "nowhere")}

    def options(self, kind, is_column):
        dice, options = self.dice, {}
        for key, some in (("units", ("kg", "", "m/s", "kilogram")), ("description", ("what it is", "", "é")),
                          ("precision", (3, 6, 9))):
            if dice.random() < 0.15:
                options[key] = dice.choice(some)
        for key in ("min", "max"):
            if dice.random() < 0.25:
                low = dice.randrange(-60, 40)
                options[key] = dice.choice(("none", str(low if key == "min" else low + dice.choice((130, 130, -20)))))
        if is_column:
            if kind == "string" or dice.random() < 0.1:
                options["width"] = dice.randrange(1, 12)
            for key in ("index", "unique"):
                if dice.random() < 0.25:
                    options[key] = dice.random() < 0.7
            if dice.random() < 0.1:
                options["default"] = self.value(kind)
        return options

    def written(self, options):
        flags = {("index", False): ["--no-index"], ("index", True): ["--index"],
                 ("unique", False): ["--no-unique"], ("unique", True): ["--unique"]}
        forms = ((lambda k, v: [f"--{k}", str(v)]), (lambda k, v: [f"--{k}={v}"]))
        return [word for k, v in options.items()
                for word in (flags.get((k, v)) if isinstance(v, bool) else self.dice.choice(forms)(k, v))]

    # Each chooses a command line and changes the model likewise.

    def add(self):
        name, _, found = self.element("list")
        name = name if found and self.dice.random() < 0.9 else self.new_name()
        kind = self.dice.choice(TYPES)
        options = {"type": kind, **self.options(kind, False)}
        value, member = self.value(kind), self.new_name()
        where = self.place(self.file.get("list", name))
        yield ["add", self.path, name, *self.written({**options, **where}), "--", member, value]
        self.file.made("list", name).change_parameter(member, value, options, where, True)

    def set(self):
        name, flag, found = self.element("list")
        member = self.member(found)
        kind = (find(found.members, member) or {}).get("type", "integer") if found else "integer"
        options = self.options(kind, False)
        if self.dice.random() < 0.1:
            options["type"] = kind = self.dice.choice(TYPES)
        where = self.place(found)
        value = self.value(kind) if self.dice.random() < 0.6 or not (options or where) else None
        yield ["set", self.path, name, *flag, *self.written({**options, **where}), "--", member,
               *([] if value is None else [value])]
        self.file.needed("list", name).change_parameter(member, value, options, where, False)

    def describe(self):
        name, flag, _ = self.element(self.dice.choice(("list", "table")))
        text = self.dice.choice(("about it", "", "é" * 3))
        yield ["set", self.path, name, *flag, "--description", text]
        self.file.needed(flag[0][2:], name).description = text

    def define(self):
        name, _, found = self.element("table")
        name = name if found and self.dice.random() < 0.9 else self.new_name()
        found = self.file.get("table", name)
        member = self.member(found) if self.dice.random() < 0.4 else self.new_name()
        before = find(found.members, member) if found else None
        kind = before["type"] if before and self.dice.random() < 0.7 else self.dice.choice(TYPES)
        options = self.options(kind, True)
        if before is None or kind != before["type"]:
            options["type"] = kind
        where = self.place(found)
        yield ["define", self.path, name, *self.written({**options, **where}), "--", member]
        self.file.made("table", name).define(member, options, where)

    def insert(self):
        name, _, found = self.element("table")
        cells = [(c["name"], self.value(c["type"])) for c in (found.members if found else [])
                 if self.dice.random() < 0.9]
        cells = cells if self.dice.random() < 0.97 and cells else [("nothing", "1")]
        at = self.dice.randrange(len(found.rows) + 3) if found and self.dice.random() < 0.3 else 0
        yield ["insert", self.path, name, *([f"--position={at}"] if at else []), "--",
               *(f"{c}={v}" for c, v in cells)]
        self.file.needed("table", name).insert(cells, at)

    def rows(self, found):
        """Some rows, and how they are chosen."""
        rows = found.rows if found else []
        numbers = [c for c in (found.members if found else []) if c["type"] in ("integer", "short")]
        way = self.dice.randrange(3)
        if way == 0 and numbers:
            column, bound = self.dice.choice(numbers)["name"], self.dice.randrange(-40, 160)
            return [r for r in rows if r[column] < bound], [f'--where="{column}" < {bound}']
        if way == 1:
            return list(rows), ["--all"]
        first = self.dice.randrange(1, len(rows) + 2)
        last = self.dice.randrange(first, first + 3)
        return rows[first - 1:last], [f"--from={first}", f"--to={last}"]

    def update(self):
        name, _, found = self.element("table")
        member = self.member(found)
        kind = (find(found.members, member) or {}).get("type", "integer") if found else "integer"
        chosen, words = self.rows(found)
        text = self.value(kind)
        try:
            value = parsed(kind, text)
        except Refused:
            value = float(text) if text[0].isdigit() else None
        literal = "'" + text + "'" if isinstance(value, str) or value is None else text
        yield ["update", self.path, name, f'"{member}" = {literal}', *words]
        table = self.file.needed("table", name)
        required(table.members, member)
        if chosen:
            table.update(member, parsed(kind, text), chosen)

    def delete(self):
        name, _, found = self.element("table")
        chosen, words = self.rows(found) if self.dice.random() < 0.4 else ([], ["--from=1", "--to=1"])
        yield ["delete", self.path, name, *words]
        table = self.file.needed("table", name)
        chosen = chosen if words[0] != "--from=1" else table.rows[:int(words[1][5:])]
        table.rows = [r for r in table.rows if not any(r is c for c in chosen)]

    def mv(self):
        kind = self.dice.choice(("list", "table"))
        name, flag, found = self.element(kind)
        new = self.new_name()
        if self.dice.random() < 0.4:
            yield ["mv", self.path, name, *flag, "--", new]
            check_name(new)
            element = self.file.needed(kind, name)
            refuse_if(new != name and self.file.get(kind, new))
            element.name = new
            return
        member, where = self.member(found), self.place(found)
        yield ["mv", self.path, name, *flag, *self.written(where), "--", member, new]
        check_name(new)
        element = self.file.needed(kind, name)
        item = required(element.members, member)
        refuse_if(new != member and find(element.members, new))
        item["name"] = new
        for row in element.rows:
            row[new] = row.pop(member)
        place(element.members, item, where)

    def rm(self):
        kind = self.dice.choice(("list", "table"))
        name, flag, found = self.element(kind)
        is_member = self.dice.random() < 0.7
        member = self.member(found)
        yield ["rm", self.path, name, *([member] if is_member else []), *flag]
        element = self.file.needed(kind, name)
        element.remove_member(member) if is_member else self.file.elements.remove(element)

    def cp(self):
        kind = self.dice.choice(("list", "table"))
        name, flag, _ = self.element(kind)
        new = self.new_name()
        yield ["cp", self.path, name, *flag, "--", new]
        check_name(new)
        self.file.take(self.file.needed(kind, name), new, "refuse")

    def cp_here(self):
        """From the other file: by cp, through JSON, or all of them by merge."""
        source = self.files[1 - self.which]
        conflict = self.dice.choice(("refuse", "rename", "replace", "skip"))
        chosen = [self.dice.choice(source.elements)] if source.elements else []
        if chosen and self.dice.random() < 0.4:
            element = chosen[0]
            yield ["cp", self.paths[1 - self.which], element.name, f"--{element.kind}", f"--to={self.path}",
                   f"--on-conflict={conflict}"]
        elif chosen and self.dice.random() < 0.6:
            element = chosen[0]
            self.given = self.run("export", self.paths[1 - self.which], element.name, f"--{element.kind}",
                                  "--json").stdout
            yield ["import", self.path, "-", f"--on-conflict={conflict}"]
        else:
            chosen = sorted(source.elements, key=lambda e: e.kind == "table")
            yield ["merge", self.path, self.paths[1 - self.which], f"--on-conflict={conflict}"]
        for element in chosen:
            self.file.take(element, element.name, conflict)

    def import_rows(self):
        name, _, found = self.element("table")
        columns = list(found.members) if found else []
        if not columns:
            return
        self.dice.shuffle(columns)
        rows = [[(c["name"], self.value(c["type"])) for c in columns] for _ in range(self.dice.randrange(1, 5))]
        lines = [[c["name"] for c in columns], *([v for _, v in row] for row in rows)]
        self.given = "".join(",".join('"' + v.replace('"', '""') + '"' for v in line) + "\n" for line in lines)
        yield ["import", self.path, name, "-", "--table", "--delimiter=comma"]
        for row in rows:
            self.file.needed("table", name).insert(row, 0)

    # ---- Comparisons ----

    def step(self):
        self.which = self.dice.randrange(2)
        self.path, self.file, self.given = self.paths[self.which], self.files[self.which], None
        kinds = dict(add=4, set=5, describe=1, define=4, insert=9, update=4, delete=2, mv=2, rm=1, cp=1, cp_here=1,
                     import_rows=3)
        command = getattr(self, self.dice.choices(list(kinds), list(kinds.values()))[0])()
        words = next(command, None)
        if words is None:
            return
        before = copy.deepcopy(self.file.elements)
        with open(self.path, "rb") as file:
            bytes_before = file.read()
        done = self.run(*words, given=self.given)
        what = (words, self.given, done.stderr)
        try:
            next(command, None)
            assert done.returncode == 0, what
        except Refused:
            self.file.elements = before
            assert done.returncode == 1 and done.stderr.startswith("tevpf: ") and not done.stdout, what
            with open(self.path, "rb") as file:
                assert file.read() == bytes_before, (*what, "refused, but changed")
            self.refused += 1
        shown = json.loads(self.run("export", self.path, "--json").stdout)
        for element in shown["elements"]:
            for detail in ("index_order", "display_width"):  # the history of a table, which the model does not keep
                element.pop(detail, None)
        assert shown == self.file.json(), (*what, shown, self.file.json())

    def look(self):
        """What else reads the file says the same; made again from its JSON, it has the same bytes."""
        lists = [e for e in self.file.elements if e.kind == "list"]
        tables = [e for e in self.file.elements if e.kind == "table"]
        done = self.run("check", self.path)
        assert f"in order, {len(lists)} list" in done.stdout and f" {len(tables)} table" in done.stdout, done
        for element in lists:
            for p in element.members:
                assert self.run("get", self.path, element.name, p["name"]).stdout == text_of(p["value"]) + "\n", p
        for element in tables:
            table = ("show", self.path, element.name, "--table")
            for c in element.members:
                if element.rows and c["indexed"] and c["type"] != "string":
                    value = self.dice.choice(element.rows)[c["name"]]
                    words = (*table, "--count", "--where", f'"{c["name"]}" = {value!r}')
                    count = sum(row[c["name"]] == value for row in element.rows)
                    assert self.run(*words).stdout == f"{count}\n" or c["type"] == "real", (words, count)
                words = (*table, "--json", "--sort", c["name"])
                rows = json.loads(self.run(*words).stdout)["rows"]
                now = sorted(element.json()["rows"], key=lambda r: missing_last(r[c["name"]]))
                assert rows == now, (words, rows, now)
        whole = self.run("export", self.path, "--json").stdout
        again = self.path + ".again"
        done = self.run("import", again, "-", given=whole)
        assert done.returncode == 0, (whole, done.stderr)
        with open(again, "rb") as new, open(self.path, "rb") as old:
            assert new.read() == old.read(), whole
        os.remove(again)


def main():
    steps = int(sys.argv[2]) if len(sys.argv) > 2 else 130
    with tempfile.TemporaryDirectory() as folder:
        for seed in map(int, sys.argv[3:] or range(3)):
            session = Session(seed, folder)
            for number in range(1, steps + 1):
                try:
                    session.step()
                    if number % 40 == 0:
                        session.look()
                except AssertionError as error:
                    sys.exit(f"seed {seed}, step {number}: {error}")
            assert session.refused > steps / 20, "hardly any refusals"


main()
