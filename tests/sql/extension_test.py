#!/usr/bin/python3
"""extension_test.py EXTENSION TOOL: the extension in SQLite's shell and in Python, beside the tool."""
import os
import pathlib
import sqlite3
import subprocess
import sys
import tempfile
import threading

HERE = pathlib.Path(__file__).resolve().parent
sys.path.insert(0, str(HERE.parent / "outside"))
sys.dont_write_bytecode = True
from outside_check import INT, stored_table  # noqa: E402

EXTENSION = str(pathlib.Path(sys.argv[1]).resolve().with_suffix(""))
TOOL = str(pathlib.Path(sys.argv[2]).resolve())
COLUMNS = [dict(type=INT, name="id", units="", idx=1, unq=1, width=6, max=50, min=0),
           dict(type=INT, name="n", units="", idx=0, unq=0, width=6, max=1000, min=0)]


def tool(*arguments, **options):
    return subprocess.run([TOOL, *arguments], check=True, capture_output=True, text=True, **options).stdout


def connect(timeout=0.0):
    connection = sqlite3.connect(":memory:", timeout=timeout, check_same_thread=False)
    connection.enable_load_extension(True)
    connection.load_extension(EXTENSION)
    connection.execute("create virtual table p using tevpf('lab.pf', 'parts')")
    return connection


def refused(kind, sentence, action, *arguments):
    try:
        action(*arguments)
    except kind as error:
        assert sentence in str(error), error
    else:
        raise AssertionError(f"not refused: {arguments}")


def values(connection, query="select n from p order by rowid"):
    return [row[0] for row in connection.execute(query)]


def on_disk():
    return tool("export", "lab.pf", "parts").split()[1:]


def shell():
    script = f""".load {EXTENSION}
create virtual table p using tevpf('lab.pf', parts);
select name, kind, rows from tevpf_elements('lab.pf');
select name, type, indexed from tevpf_columns('lab.pf');
explain query plan select * from p where id = 2;
update p set n = 7 where id = 2;
select * from p where id >= 2 order by id desc;
"""
    said = subprocess.run(["/usr/bin/sqlite3", "-batch", "-init", "/dev/null"], input=script,
                          capture_output=True, text=True, check=True)
    assert said.stdout.splitlines() == [
        "parts|table|3", "id|integer|1", "n|integer|0", "QUERY PLAN",
        "`--SCAN p VIRTUAL TABLE INDEX 0:", "3|0", "2|7"], said
    assert on_disk() == ["1,0", "2,7", "3,0"]


def transactions():
    c = connect()
    c.execute("update p set n = 1 where id = 1")
    assert on_disk()[0] == "1,0" and values(c) == [1, 7, 0]
    c.commit()
    assert on_disk()[0] == "1,1"
    before = pathlib.Path("lab.pf").read_bytes()
    c.execute("delete from p where id < 3")
    c.execute("insert into p values(4, 4)")
    c.execute("savepoint s")
    c.execute("update p set n = id * 10")
    assert values(c) == [30, 40]
    c.execute("rollback to s")
    assert values(c) == [0, 4] and values(c, "select rowid from p") == [3, 4]
    refused(sqlite3.IntegrityError, "row 4 of table 'parts': 'id': 90 is out of range",
            c.execute, "insert into p values(5, 5), (90, 1)")
    assert values(c) == [0, 4]
    c.rollback()
    assert values(c) == [1, 7, 0] and pathlib.Path("lab.pf").read_bytes() == before
    c.close()


def two_connections():
    a, b = connect(), connect()
    a.execute("update p set n = 2 where id = 1")
    refused(sqlite3.OperationalError, "in use by another connection", values, b)
    refused(sqlite3.OperationalError, "in use by another connection", b.execute, "delete from p")
    a.commit()
    b.rollback()
    assert values(b) == [2, 7, 0]
    half = b.execute("select n from p")
    half.fetchone()
    refused(sqlite3.OperationalError, "in use by another connection", a.execute, "delete from p")
    half.close()
    a.rollback()
    # A table that is made meanwhile ends no transaction of others.
    a.execute("update p set n = 3 where id = 1")
    late = connect()
    refused(sqlite3.OperationalError, "in use by another connection", values, late)
    late.close()
    a.rollback()
    assert values(b) == [2, 7, 0] and on_disk()[0] == "1,2"
    # One that is made in a transaction takes part in it, and is not dropped with what it has changed.
    for end, n in ("rollback", 2), ("commit", 5):
        b.execute("begin")
        b.execute("create virtual table again using tevpf('lab.pf', 'parts')")
        assert values(b, "select n from again where id = 1") == [2] and values(a) == [2, 7, 0]
        refused(sqlite3.OperationalError, "in use by another connection", a.execute, "update p set n = n")
        a.rollback()
        b.execute("update again set n = n + 3 where id = 1")
        refused(sqlite3.OperationalError, "in use by another connection", values, a)
        refused(sqlite3.OperationalError, "locked", b.execute, "drop table again")
        b.execute(end)
        assert values(a) == [n, 7, 0] and on_disk()[0] == f"1,{n}"
    b.execute("drop table again")
    tool("sql", "lab.pf", "update parts set n = 20 where id = 1")
    assert values(a) == [20, 7, 0] and values(b) == [20, 7, 0]
    tool("sql", "lab.pf", "delete from parts where id = 3")
    a.execute("update p set n = n + 1")
    a.commit()
    assert on_disk() == ["1,21", "2,8"]
    a.close()
    assert values(b) == [21, 8]
    b.close()


def threads():
    def count():
        c = connect(timeout=60)
        for _ in range(20):
            c.execute("update p set n = n + 1 where id = 2")
            values(c)
            c.commit()
        c.close()

    running = [threading.Thread(target=count) for _ in range(4)]
    for thread in running:
        thread.start()
    for thread in running:
        thread.join()
    assert on_disk()[1] == "2,88"


def mistakes():
    c = connect()
    for arguments, sentence in (("'none.pf', 'x'", "does not exist"), ("'lab.pf', 'x'", "no list or table 'x'"),
                                ("'lab.pf'", "write tevpf("), ("'lab.pf', 'parts', 'row'", "neither")):
        refused(sqlite3.OperationalError, sentence, c.execute,
                f"create virtual table x using tevpf({arguments})")
    c.execute("drop table p")
    c.close()
    assert on_disk() == ["1,21", "2,88"]
    broken = pathlib.Path("lab.pf").read_bytes()[:-4]
    pathlib.Path("broken.pf").write_bytes(broken)
    refused(sqlite3.OperationalError, "damaged", sqlite3_of_broken)
    assert pathlib.Path("broken.pf").read_bytes() == broken


def sqlite3_of_broken():
    connect().execute("select * from tevpf_elements('broken.pf')")


with tempfile.TemporaryDirectory() as folder:
    os.chdir(folder)
    rows = [(1, 0), (2, 0), (3, 0)]
    pathlib.Path("lab.pf").write_bytes(stored_table("parts", "", bytes(8), 0, COLUMNS, rows))
    for test in (shell, transactions, two_connections, threads, mistakes):
        test()
        print("passed:", test.__name__)
