#!/usr/bin/env python3
"""The page of `tevpf report`, parsed: nothing from a file becomes markup, every text is shown, and the
figures of columns are those that Python finds.

    report_page.py TEVPF CORPUS     (a folder of damaged and strange files)
"""
import base64
import hashlib
import html.parser
import math
import os
import random
import re
import subprocess
import sys
import tempfile
import unicodedata

sys.path.insert(0, os.path.join(os.path.dirname(os.path.realpath(__file__)), "..", "outside"))
sys.dont_write_bytecode = True
from outside_check import DOUBLE, INT, SHORT, STRING, stored_list, stored_table  # noqa: E402

# Every tag and attribute that the page may have. What a file holds can add none.
ALLOWED = {tag: set(attributes.split()) for tag, attributes in {
    "html": "lang", "head": "", "meta": "charset name content http-equiv", "link": "rel href", "title": "", "style": "",
    "body": "", "header": "", "main": "", "footer": "", "nav": "aria-labelledby", "section": "id class aria-labelledby",
    "h1": "", "h2": "id", "p": "class hidden", "span": "class", "a": "href", "label": "", "input": "type autocomplete",
    "output": "", "div": "class role tabindex aria-labelledby", "table": "class", "caption": "id", "thead": "",
    "tbody": "", "tr": "", "th": "scope class", "td": "class title", "svg": "class role width height",
    "path": "class d", "circle": "class cx cy r", "script": ""}.items()}


class Page(html.parser.HTMLParser):
    """A tree of [tag, attributes, children]; texts are strings among the children."""

    def __init__(self, text):
        super().__init__()
        self.root = ["", {}, []]
        self.open = [self.root]
        self.feed(text)
        self.close()
        assert self.open == [self.root], f"left open: {[node[0] for node in self.open]}"

    def handle_starttag(self, tag, attributes):
        names = {name for name, _ in attributes}
        assert tag in ALLOWED and names <= ALLOWED[tag], f"<{tag} {names}>"
        node = [tag, dict(attributes), []]
        self.open[-1][2].append(node)
        if tag not in ("meta", "link", "input"):
            self.open.append(node)

    def handle_endtag(self, tag):
        assert self.open.pop()[0] == tag, f"</{tag}> closes another element"

    def handle_data(self, data):
        self.open[-1][2].append(data)

    def handle_comment(self, data):
        raise AssertionError(f"a comment: {data}")


def every(node, tag):
    for child in node[2]:
        if not isinstance(child, str):
            if child[0] == tag:
                yield child
            yield from every(child, tag)


def text_of(node):
    """As it is shown: without the titles of drawings."""
    return "".join(c if isinstance(c, str) else "" if c[0] == "svg" else text_of(c) for c in node[2])


def table(node):
    """Caption and rows of cells. Each row names itself, and has a cell for each heading."""
    head, *rows = every(node, "tr")
    assert all(th[1]["scope"] == "col" for th in head[2])
    for row in rows:
        assert [c[0] for c in row[2]] == ["th"] + ["td"] * (len(head[2]) - 1) and row[2][0][1]["scope"] == "row"
    return text_of(next(every(node, "caption"))), [row[2] for row in rows]


def check_page(data):
    """What holds for every page; gives its tree."""
    root = Page(data.decode("utf-8")).root
    nodes = {tag: list(every(root, tag)) for tag in ALLOWED}
    ids = [n[1]["id"] for tag in nodes for n in nodes[tag] if "id" in n[1]]
    assert len(ids) == len(set(ids)), "an id twice"
    named = [name for tag in nodes for n in nodes[tag] for name in n[1].get("aria-labelledby", "").split()]
    assert {*named, *(a[1]["href"].removeprefix("#") for a in nodes["a"])} <= set(ids), "a name without its element"
    policy = nodes["meta"][1][1]["content"]
    for tag in ("style", "script"):
        (node,) = nodes[tag]
        digest = base64.b64encode(hashlib.sha256(text_of(node).encode()).digest()).decode()
        assert f"{tag}-src 'sha256-{digest}'" in policy, f"the policy forbids the page's own {tag}"
    assert "default-src 'none'" in policy
    for node in nodes["table"]:
        table(node)
    return root


def report(tevpf, path, *options):
    run = subprocess.run([tevpf, "report", path, *options], capture_output=True, check=False)
    assert run.returncode in (0, 3) and bool(run.stderr) == (run.returncode == 3), run
    return check_page(run.stdout) if run.stdout else None


# ---- hostile texts --------------------------------------------------------------------------------


def visible(raw):
    """Bytes as the tool shows them."""
    shown = ""
    for char in raw.encode("latin-1").decode("utf-8", "surrogateescape"):
        if unicodedata.category(char) in ("Cc", "Cs"):
            short = {"\n": "\\n", "\r": "\\r", "\t": "\\t"}
            shown += short.get(char) or "".join(f"\\x{b:02x}" for b in char.encode("utf-8", "surrogateescape"))
        else:
            shown += char
    return shown


FRAGMENTS = ["<script>", "</script>", "</td>", "</title>", "<!--", "-->", "&amp;", "&#39", '"', "'", "=", "<b a='", "onload=x ",
             "\x1b[1m", "\xff", "\xc2\x9b", "\xc3\xa9", "\xe2\x82", "  ", "]]>", "\r\n", "\t", "\x7f", "x", "*", "@", "\\"]


def hostile(size, rng=random.Random(7)):
    return "".join(rng.choice(FRAGMENTS) for _ in range(12))[:rng.randint(1, size)].lstrip() or "<"


def check_texts(tevpf, folder):
    params = [dict(type=STRING, name=hostile(19), units=hostile(7), value=hostile(60), desc=hostile(60)) for _ in range(40)]
    cols = [dict(type=STRING, name=hostile(19), units=hostile(7), idx=0, unq=0, width=40, desc=hostile(60)) for _ in range(9)]
    rows = [tuple(hostile(40) for _ in cols) for _ in range(20)]
    names = [hostile(19) for _ in range(4)]
    name = "&'.pf" if "WINDOWS" in os.environ else "<b>&\"'\x1b.pf"  # as hostile as a file's name can be
    path = os.path.join(folder, name)
    with open(path, "wb") as out:
        out.write(stored_list(names[0], names[1], bytes(8), params) + stored_table(names[2], names[3], bytes(8), 0, cols, rows))
    root = report(tevpf, path)
    assert {text_of(next(every(root, tag))) for tag in ("title", "h1")} == {visible(name)}
    contents, of_list, of_columns, of_rows = (table(t)[1] for t in every(root, "table"))
    shown = [[text_of(cell) for cell in row] for row in contents]
    names = [visible(name) for name in names]
    assert [(row[0], row[3]) for row in shown] == [tuple(names[:2]), tuple(names[2:])], shown
    assert [text_of(h2) for h2 in every(root, "h2")] == ["Contents", "List " + names[0], "Table " + names[2]]
    for row, p in zip(of_list, params, strict=True):
        assert [text_of(row[i]) for i in (0, 1, 2, 6)] == [visible(p[k]) for k in ("name", "value", "units", "desc")], p
    for row, c in zip(of_columns, cols, strict=True):
        assert [text_of(row[i]) for i in (0, 2, 10)] == [visible(c[k]) for k in ("name", "units", "desc")], c
    for row, values in zip(of_rows, rows, strict=True):
        assert [text_of(cell) for cell in row[1:]] == list(map(visible, values))


# ---- figures --------------------------------------------------------------------------------------


def is_figure(shown, x, digits):
    """A number with so many digits, or with fewer that say which one it is."""
    count = len(re.sub(r"e.*|\D", "", shown).strip("0"))
    return shown == "%.*g" % (digits, x) or (count <= digits and float(shown) == x)


def check_number(cell, value, digits):
    shown = text_of(cell)
    assert is_figure(shown, value, digits), (shown, value)
    assert "n" in cell[1]["class"].split() and (math.isnan(value) or float(cell[1].get("title", shown)) == value), cell


def bins_of(finite, count):
    bins = [0] * count
    low, half = min(finite), max(finite) / 2 - min(finite) / 2
    for x in finite:
        part = (x / 2 - low / 2) / half if half else 0
        bins[min(int(part * count), count - 1)] += 1
    return bins


def check_figures(row, values, digits, bins):
    """A column's row against its values."""
    finite = [v for v in values if math.isfinite(v)]
    numbers = [v for v in values if not math.isnan(v)]
    shown = [text_of(cell) for cell in row[4:9]]
    assert shown[:2] == [str(len(numbers)), str(len(values) - len(numbers))], shown
    assert is_figure(shown[2], min(numbers), digits) and is_figure(shown[3], max(numbers), digits), shown
    mean = math.fsum(finite) / len(finite)
    assert is_figure(shown[4], mean, digits) if finite == numbers else shown[4] == "", shown
    (path, *_) = every(row[9], "path")
    drawn = [0.0] * bins
    for x, height in re.findall(r"M([\d.]+) 27v-([\d.]+)", path[1]["d"]):
        drawn[round(float(x) / 120 * bins)] = float(height)
    want = bins_of(finite, bins)
    for got, n in zip(drawn, want, strict=True):
        assert abs(got - (n and max(26 * n / max(want), 1))) < 0.11, (drawn, want)
    assert f"at most {max(want)} value" in "".join(next(every(row[9], "title"))[2])


def check_numbers(tevpf, folder):
    rng = random.Random(11)
    most, count = sys.float_info.max, 300
    wild = [rng.choice([rng.gauss(0, 1), rng.gauss(0, 1) * 10.0 ** rng.randint(-9, 9), math.nan]) for _ in range(count)]
    columns = [  # values, digits, bins
        (wild, 9, 20), ([*wild[1:], math.inf], 3, 20), ([most * rng.uniform(-1, 1) / count for _ in wild[1:]] + [most], 17, 20),
        ([*range(5)] * 60, 2, 5), ([0, 997, *(rng.randrange(997) for _ in wild[2:])], 5, 20), ([7] * count, 3, 1)]
    cols = []
    for i, (values, digits, _) in enumerate(columns):
        bounds = dict(prec=digits, max=most, min=-most) if i < 3 else dict(max=9999, min=-9999)
        cols.append(dict(type=DOUBLE if i < 3 else INT if i < 5 else SHORT, name=f"c{i}", units="", idx=0, unq=0, width=9, **bounds))
    placed = [(3, 1, 9), (-2.5, -8, 8), (9.5, 1, 8), (0.5, 1, 8), (math.nan, 0, 1), (5, 5, 5), (3, -most, 5), (most / 3, -most / 2, most / 2)]
    params = [dict(type=DOUBLE, name=f"p{i}", units="", prec=3, value=v, min=lo, max=hi) for i, (v, lo, hi) in enumerate(placed)]
    path = os.path.join(folder, "numbers.pf")
    with open(path, "wb") as out:
        out.write(stored_list("list", "", bytes(8), params) + stored_table("table", "", bytes(8), 0, cols, list(zip(*(c[0] for c in columns)))))
    for options, caption, shown in ((), "300 rows", 300), (("--rows", "7"), "The first 7 of 300 rows", 7):
        _, of_list, of_columns, of_rows = map(table, every(report(tevpf, path, *options), "table"))
        for row, (values, digits, bins) in zip(of_columns[1], columns, strict=True):
            check_figures(row, values, digits, bins)
        assert of_rows[0] == caption and len(of_rows[1]) == shown
        for number, row in enumerate(of_rows[1]):
            for cell, (values, digits, _), col in zip(row[1:], columns, cols, strict=True):
                check_number(cell, values[number], digits if col["type"] == DOUBLE else 9)
    wanted = ["25 %", "34 %", "above the maximum", "below the minimum", "", "", "", "83 %"]
    for row, (value, *_), want in zip(of_list[1], placed, wanted):
        check_number(row[1], value, 3)
        bar = next(every(row[4], "title"), None)
        assert want in (bar[2][0] if bar else text_of(row[4])) and bool(bar) == want.endswith("%"), (want, row[4])
        if bar:
            assert abs((float(next(every(row[4], "circle"))[1]["cx"]) - 4) / 112 * 100 - int(want[:2])) < 0.6
    assert [table(t)[0] for t in every(report(tevpf, path, "--rows", "0"), "table")][1:] == ["6 columns"]


def check_corpus(tevpf, folder, corpus):
    """The fuzz target's files, behind what the target reads first, each as it is and with a few fields changed."""
    rng = random.Random(13)
    path, pages = os.path.join(folder, "damaged.pf"), 0
    for name in sorted(os.listdir(corpus)):
        with open(os.path.join(corpus, name), "rb") as file:
            raw = file.read()
        data = bytearray(raw[1 + raw[0]:] if raw else b"")
        for _ in range(6):
            with open(path, "wb") as out:
                out.write(data)
            pages += report(tevpf, path) is not None
            at = rng.randrange(max(len(data) - 4, 1))
            data[at : at + 4] = rng.choice([bytes(4), b"\xff" * 4, b"\xff\xff\xff\x7f", b"<&>\"", rng.randbytes(4)])
    assert pages > 40, pages


def main():
    tevpf, corpus = sys.argv[1:]
    with tempfile.TemporaryDirectory() as folder:
        check_texts(tevpf, folder)
        check_numbers(tevpf, folder)
        check_corpus(tevpf, folder, corpus)


main()
