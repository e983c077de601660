#!/usr/bin/env python3
"""python_tables.py [ROWS] [ROUNDS]: tables from Python, beside h5py, PyTables and sqlite3 with pandas.

All workloads run in one process, in turn, ROUNDS times (5); the table shows medians of the processor
time of the process, kernel included. A row has 48 bytes: an int32 id, a text of 15 characters, a double,
an int16, an int32 and a double. Tables of tevpf are in memory; files of the peers are in the cache. Peers
write as fast as they sensibly can: no compression, no journal, no index, no waiting for the disk.
"""

import os
import sqlite3
import statistics
import sys
import tempfile
import time

import h5py
import numpy as np
import pandas as pd
import tables
import tevpf

ROWS = int(sys.argv[1]) if len(sys.argv) > 1 else 1_000_000
ROUNDS = int(sys.argv[2]) if len(sys.argv) > 2 else 5


def make_frame():
    random = np.random.default_rng(1)
    return pd.DataFrame({
        "id": np.arange(ROWS, dtype="i4"), "text": [f"part {i % 5000:05}" for i in range(ROWS)],
        "value": random.random(ROWS), "kind": random.integers(0, 100, ROWS).astype("i2"),
        "group": random.integers(0, 1000, ROWS).astype("i4"), "mass": random.random(ROWS)})


class Ours:
    def __init__(self):
        self.file = tevpf.open("bench.pf", "w")

    def close(self):
        self.file.close()

    def create(self, frame, name="t", **options):
        if name in self.file.tables:
            del self.file.tables[name]
        return self.file.tables.create(name, frame, widths={"text": 15}, **options)

    def save(self):
        self.file.save()

    def open(self):
        tevpf.open("copy.pf").close()


def workloads(frame):
    """(workload, who, function that is timed)"""
    ours = Ours()
    table = ours.create(frame)
    for name in ("copy.pf", "found.pf"):
        ours.file.save_copy(name)
    records = table.to_numpy()
    assert records.dtype.itemsize == 48, records.dtype
    shuffled = frame.sample(frac=1, random_state=1)
    plain = np.frombuffer(records.tobytes(), np.uint8)
    packed = records.astype([(n, records.dtype[n]) for n in records.dtype.names])

    h5 = h5py.File("bench.h5", "w")
    h5.create_dataset("t", data=packed)
    pt = tables.open_file("bench.pt", "w")
    pt_table = pt.create_table("/", "t", packed)
    pt_table.flush()
    db = sqlite3.connect("bench.db")
    db.execute("PRAGMA journal_mode=OFF")
    db.execute("PRAGMA synchronous=OFF")
    frame.to_sql("t", db, index=False)
    db.execute("CREATE INDEX t_id ON t (id)")

    def again_h5():
        del h5["t"]
        h5.create_dataset("t", data=to_records(frame))
        h5.flush()

    def again_pt():
        pt.remove_node("/", "t")
        pt.create_table("/", "t", to_records(frame))
        pt.flush()

    def again_db():
        frame.to_sql("s", db, index=False, if_exists="replace", chunksize=100_000)

    def to_records(data):
        result = np.empty(len(data), packed.dtype)
        for name in packed.dtype.names:
            result[name] = np.array(data[name].tolist(), "S15") if name == "text" else data[name]
        return result

    def frame_of(array):
        return pd.DataFrame({n: array[n].astype("U15").astype(object) if n == "text" else array[n]
                             for n in array.dtype.names})

    some = np.random.default_rng(2).integers(0, ROWS, 1000).tolist()
    found = tevpf.open("found.pf", "r+")
    indexed = found.tables["t"]
    indexed.columns["id"] = tevpf.Column("id", "int32", unique=True)

    yield "rows to numpy", "memcpy", lambda: plain.copy()
    yield "rows to numpy", "tevpf", table.to_numpy
    yield "rows to numpy", "h5py", lambda: h5["t"][()]
    yield "rows to numpy", "PyTables", lambda: pt.root.t.read()
    yield "column to numpy", "tevpf", lambda: table["value"]
    yield "column to numpy", "h5py", lambda: h5["t"].fields("value")[()]
    yield "column to numpy", "PyTables", lambda: pt.root.t.col("value")
    yield "column to numpy", "sqlite3, pandas", lambda: pd.read_sql("SELECT value FROM t", db)
    yield "to DataFrame", "tevpf", table.to_pandas
    yield "to DataFrame", "h5py", lambda: frame_of(h5["t"][()])
    yield "to DataFrame", "PyTables", lambda: frame_of(pt.root.t.read())
    yield "to DataFrame", "sqlite3, pandas", lambda: pd.read_sql("SELECT * FROM t", db)
    yield "from DataFrame", "tevpf", lambda: ours.create(frame)
    yield "from DataFrame", "tevpf, unique id", lambda: ours.create(frame, "u", unique="id")
    yield "from DataFrame", "tevpf, unique id at random", lambda: ours.create(shuffled, "r", unique="id")
    yield "from DataFrame", "h5py", again_h5
    yield "from DataFrame", "PyTables", again_pt
    yield "from DataFrame", "sqlite3, pandas", again_db
    yield "find 1000 by id", "tevpf", lambda: [indexed.find(id=i) for i in some]
    yield "find 1000 by id", "sqlite3", lambda: [
        db.execute("SELECT * FROM t WHERE id = ?", (i,)).fetchone() for i in some]
    yield "open", "tevpf", ours.open
    yield "save", "tevpf", ours.save


def main():
    with tempfile.TemporaryDirectory() as folder:
        os.chdir(folder)
        times = {}
        steps = list(workloads(make_frame()))
        for _ in range(ROUNDS):
            for what, who, step in steps:
                start = time.process_time()
                result = step()
                times.setdefault((what, who), []).append(time.process_time() - start)
                del result
    print(f"{ROWS} rows of 48 bytes, medians of {ROUNDS}: tevpf {tevpf.__version__}, h5py "
          f"{h5py.__version__}, PyTables {tables.__version__}, pandas {pd.__version__}\n")
    print("| workload | with | ms | times tevpf |\n|---|---|---|---|")
    for (what, who), all_times in times.items():
        median = statistics.median(all_times)
        base = statistics.median(times[what, "tevpf"])
        print(f"| {what} | {who} | {median * 1000:.1f} | {median / base:.2f} |")


main()
