#!/usr/bin/env python3
"""A second pair of eyes on the file format: this script knows the layout of a parameter file and the C
interface, but no line of the library's code. It writes a file of every kind of element byte by byte,
lets the library open it, compares every value through the public operations, saves it, and compares
every byte.

    outside_check.py LIBTEVPF.SO
"""
import ctypes as c
import os
import struct
import sys
import tempfile

NORMAL, NOMORE = 0x09608009, 0x0960801B
INT, REAL, STRING, DOUBLE, SHORT = 11, 12, 13, 14, 15
ALIGN = {INT: 4, REAL: 4, STRING: 1, DOUBLE: 8, SHORT: 2}
PACK = {INT: "i", REAL: "f", DOUBLE: "d", SHORT: "h"}
PARAM_NUMBERS = ("prec", "value", "max", "min")
COLUMN_NUMBERS = ("max", "min", "prec")


def text(value, size):
    raw = value.encode("latin-1")
    assert len(raw) < size
    return raw + bytes(size - len(raw))


# ---- the bytes, from the layout alone ------------------------------------------------------------


def numbers(fields, entry):
    """The numbers of a parameter or column, in this order both in the file and in the interface's records."""
    fields = [field for field in fields if field in entry]
    codes = ("i" if field == "prec" else PACK[entry["type"]] for field in fields)
    return struct.pack("<" + "".join(codes), *(entry[field] for field in fields))


def stored_param(p):
    kind, desc = p["type"], p.get("desc")
    if kind == STRING:
        raw = p["value"].encode("latin-1")
        part = struct.pack("<i", len(raw)) + raw + b"\0"
    else:
        part = numbers(PARAM_NUMBERS, p)
    size = 44 + len(part)
    loc = 0 if desc is None else 1 if kind == STRING else size - 8
    head = bytes(7) + struct.pack("<bi", loc, kind) + text(p["name"], 20) + text(p["units"], 8) + bytes(4)
    return head + part + (b"" if desc is None else desc.encode("latin-1") + b"\0")


def element(kind, name, desc, body, trailing):
    return struct.pack("<i", kind) + text(name, 20) + text(desc, 80) + struct.pack("<i", len(body)) + body + trailing


def stored_list(name, desc, reserved, params):
    body = struct.pack("<i", len(params)) + reserved + b"".join(map(stored_param, params))
    order = sorted(range(len(params)), key=lambda i: params[i]["name"].encode("latin-1"))
    return element(1, name, desc, body, struct.pack(f"<{len(order)}i", *order))


def value_size(col):
    return col["width"] + 1 if col["type"] == STRING else struct.calcsize(PACK[col["type"]])


def lay_out(cols):
    """Offsets and row width: each column at the first aligned byte, the row a multiple of the largest number."""
    offsets, end, unit = [], 0, 1
    for col in cols:
        align = ALIGN[col["type"]]
        start = (end + align - 1) // align * align
        offsets.append(start)
        end = start + value_size(col)
        unit = max(unit, align)
    return offsets, (end + unit - 1) // unit * unit


def stored_column(col, offset):
    kind, desc = col["type"], col.get("desc")
    part = b"" if kind == STRING else numbers(COLUMN_NUMBERS, col)
    flag = 0 if desc is None else 48 + len(part) - 41
    head = struct.pack("<i", offset) + col.get("reserved", bytes(4)) + struct.pack("<i", kind) + text(col["name"], 20) + text(col["units"], 8)
    head += struct.pack("<bbbbi", flag, col.get("spare", 0), col["idx"], col["unq"], col["width"])
    return head + part + (b"" if desc is None else desc.encode("latin-1") + b"\0")


def cell(col, value):
    return text(value, col["width"] + 1) if col["type"] == STRING else struct.pack("<" + PACK[col["type"]], value)


def stored_table(name, desc, reserved, dsp_wid, cols, rows):
    offsets, width = lay_out(cols)
    body = struct.pack("<iiii", len(cols), len(rows), width, dsp_wid) + reserved
    body += b"".join(map(stored_column, cols, offsets))
    trailing = b""
    for i, col in enumerate(cols):
        if col["idx"]:
            key = (lambda r: rows[r][i].encode("latin-1")) if col["type"] == STRING else (lambda r: rows[r][i])
            trailing += struct.pack(f"<{len(rows)}i", *sorted(range(len(rows)), key=key))
    for row in rows:
        image = bytearray(width)
        for col, offset, value in zip(cols, offsets, row):
            raw = cell(col, value)
            image[offset : offset + len(raw)] = raw
        trailing += bytes(image)
    return element(2, name, desc, body, trailing)


# ---- the same through the C interface ------------------------------------------------------------


# Records as they lie in the caller's memory, packed to four bytes: what stands in front of the numbers.
PARAM_RECORD, PARAM_RECORD_SIZE = "<i20s8sQ", 68
COLUMN_RECORD, COLUMN_RECORD_SIZE = "<QIi20s8s4bi", 72
lib = None


def call(operation, *args, expect=NORMAL):
    function = getattr(lib, "TEV8R1_" + operation)
    function.restype = c.c_uint32
    got = function(*[a.encode("latin-1") if isinstance(a, str) else a for a in args])
    assert got == expect, f"{operation}{args}: 0x{got:08x}"


def same(got, want, what):
    assert got == want, f"{what}: got {got!r}, want {want!r}"


def check_list(name, params):
    call("PF_reset_param", name)
    for want in params:
        kind, vsize, dsize = c.c_int32(), c.c_int32(), c.c_int32()
        call("PF_inq_next_param_size", name, c.byref(kind), c.byref(vsize), c.byref(dsize))
        value, desc = c.create_string_buffer(vsize.value), c.create_string_buffer(dsize.value)
        record, part = c.create_string_buffer(PARAM_RECORD_SIZE), struct.calcsize(PARAM_RECORD)
        struct.pack_into("<Q", record, part - 8, c.addressof(desc))
        if kind.value == STRING:
            struct.pack_into("<Q", record, part + 4, c.addressof(value))
        call("PF_get_next_param_def", name, record)
        got = struct.unpack_from(PARAM_RECORD, record)
        same(got, (want["type"], text(want["name"], 20), text(want["units"], 8), c.addressof(desc)), name)
        same(desc.value, (want.get("desc") or "").encode("latin-1"), want["name"])
        expected = struct.pack("<i", len(want["value"])) if want["type"] == STRING else numbers(PARAM_NUMBERS, want)
        same(record.raw[part : part + len(expected)], expected, want["name"])
        if want["type"] == STRING:
            same(value.value, want["value"].encode("latin-1"), want["name"])
        call("inq_param_pos", name, want["name"], c.byref(kind))
        same(kind.value, params.index(want), want["name"])
    call("PF_get_next_param_def", name, c.create_string_buffer(PARAM_RECORD_SIZE), expect=NOMORE)


def check_table(name, cols, rows):
    info = [c.c_int32() for _ in range(5)]
    call("PF_inq_table_info", name, *map(c.byref, info))
    offsets, width = lay_out(cols)
    same([i.value for i in info[:3]], [len(cols), len(rows), width], name)
    for i, want in enumerate(cols):
        record, part = c.create_string_buffer(COLUMN_RECORD_SIZE), struct.calcsize(COLUMN_RECORD)
        call("PF_inq_col_def_by_pos", name, i, record)
        desc, _, *got = struct.unpack_from(COLUMN_RECORD, record)
        fields = [want["type"], text(want["name"], 20), text(want["units"], 8)]
        same(got, fields + [0, want.get("spare", 0), want["idx"], want["unq"], want["width"]], name)
        same(c.string_at(desc) if desc else None, want["desc"].encode() if "desc" in want else None, name)
        expected = b"" if want["type"] == STRING else numbers(COLUMN_NUMBERS, want)
        same(record.raw[part : part + len(expected)], expected, want["name"])
    buffer = c.create_string_buffer(width)
    for order in [None] + [col["name"] for col in cols if col["idx"]]:
        call("PF_define_table_search", name, order)
        call("PF_reset_table", name)
        expected = rows
        if order:
            place = [col["name"] for col in cols].index(order)
            expected = sorted(rows, key=lambda r: r[place].encode("latin-1") if isinstance(r[place], str) else r[place])
        for row in expected:
            call("PF_get_next_row", name, buffer)
            for col, offset, value in zip(cols, offsets, row):
                raw = cell(col, value)
                same(buffer.raw[offset : offset + len(raw)], raw, f"{name}.{col['name']}")
        call("PF_get_next_row", name, buffer, expect=NOMORE)


PARAMS = [
    dict(type=INT, name="zeta", units="rpm", value=-7, max=2147483647, min=-2147483648, desc="an integer"),
    dict(type=REAL, name="alpha", units="", prec=3, value=0.5, max=2.25, min=-1.5),
    dict(type=STRING, name="Mu", units="text", value="h\xe9llo\t\\ world"),
    dict(type=STRING, name="empty", units="", value="", desc=""),
    dict(type=DOUBLE, name="\xff-last", units="m/s", prec=9, value=2.998e8, max=3e8, min=0.0, desc="a double " * 20),
    dict(type=SHORT, name="beta", units="unit_7c", value=32767, max=32767, min=-32768),
    dict(type=STRING, name="long", units="", value="x" * 5000, desc="larger than the read buffer"),
]
COLS = [
    dict(type=SHORT, name="s", units="", idx=1, unq=1, width=6, max=9, min=-9, desc="short"),
    dict(type=STRING, name="name", units="-", idx=1, unq=0, width=5, reserved=b"col!", spare=3),
    dict(type=DOUBLE, name="d", units="K", idx=0, unq=0, width=23, prec=6, max=1e9, min=-1e9, desc=""),
    dict(type=REAL, name="r", units="", idx=1, unq=0, width=13, prec=2, max=50.0, min=-50.0),
    dict(type=INT, name="i", units="mm", idx=0, unq=0, width=11, max=100, min=0, desc="last"),
]
ROWS = [(3, "abc", 1.5, 10.0, 7), (-9, "", -2.25, -50.0, 0), (9, "zzzzz", 0.0, 0.25, 100), (0, "ab", 1e9, 49.5, 1), (1, "B", 3.0, 7.0, 2)]

LISTS = [("TEVPF_FILE_HEADER", "header", bytes(8), []), ("numbers", "every type", b"carried!", PARAMS), ("numbers2", "", bytes(8), PARAMS[:1])]
TABLES = [("numbers", "a table may have a list's name", b"reserved", 77, COLS, ROWS), ("no rows", "", bytes(8), 0, COLS[:3], []), ("nothing", "", bytes(8), 0, [], [])]


def main():
    global lib
    lib = c.CDLL(os.path.abspath(sys.argv[1]))
    lists = [stored_list(*entry) for entry in LISTS]
    tables = [stored_table(*entry) for entry in TABLES]
    with tempfile.TemporaryDirectory() as folder:
        path, copy = os.path.join(folder, "mixed.pf"), os.path.join(folder, "copy.pf")
        with open(path, "wb") as out:  # tables and lists in any order are read
            out.write(tables[0] + lists[0] + lists[1] + tables[1] + tables[2] + lists[2])
        call("PF_init")
        call("PF_open", path)
        for name, _, _, params in LISTS:
            check_list(name, params)
        for name, _, _, _, cols, rows in TABLES:
            check_table(name, cols, rows)
        call("PF_save", copy)
        call("PF_close", 1)
        want = b"".join(lists + tables)  # lists first, then tables, is how files are written
        for written in (path, copy):
            with open(written, "rb") as saved:
                got = saved.read()
            first = next((i for i, (a, b) in enumerate(zip(got, want)) if a != b), min(len(got), len(want)))
            assert got == want, f"{written}: differs at byte {first} of {len(want)} ({len(got)} written)"
    print(f"{len(want)} bytes read, compared and written back: equal")


if __name__ == "__main__":
    main()
