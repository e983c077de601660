#!/usr/bin/env python3
"""A save never destroys the file it replaces: each system call of a run that opens, changes and saves a file is
disturbed once, in each of five ways, and what is on the disk afterwards is looked at.

    kill_sweep.py FOLDER [SUBJECT]     (of a build: save_once, short_call and tevpf are taken from it; needs strace)

Killed: the file is the complete old or the complete new one. Calls that fail or do half of what they were asked
for: likewise, no other file is left, and a run that reports success has written the new one.
"""
import collections
import concurrent.futures
import os
import re
import subprocess
import sys
import tempfile

sys.path.insert(0, os.path.join(os.path.dirname(os.path.realpath(__file__)), "..", "outside"))
sys.dont_write_bytecode = True
from outside_check import INT, stored_table  # noqa: E402

COLUMN = dict(type=INT, name="n", units="", idx=1, unq=0, width=8, max=120000, min=0)
MEGABYTE = stored_table("table", "many rows", bytes(8), 0, [COLUMN], [(n,) for n in range(120000)])
ROWS = "n\n" + "\n".join(map(str, range(9000))) + "\n"

ERRORS = ("EIO", "ENOSPC", "EINTR")
WAYS = ("killed", *ERRORS, "half")
NOT_INJECTED = {"execve", "exit_group"}  # before the program, and after it
NEVER_AN_ERROR = {"brk", "futex"}  # tells a failure by another result; never fails so, and the C runtime aborts
CAN_BE_SHORT = {"read", "write"}


class Subject:
    """A command that changes data.pf, the file as it is before and afterwards, and the commands's own name."""

    def __init__(self, name, command, old):
        self.name, self.command, self.old = name, command, old
        with tempfile.TemporaryDirectory() as work:
            self.prepare(work)
            log = os.path.join(work, "trace")
            assert self.run(work, "strace", "-f", "-o", log) == 0, f"{name}: the run that nothing disturbs"
            with open(log, encoding="utf-8") as file:
                made = collections.Counter(re.findall(r"^\d+ +(\w+)\(", file.read(), re.MULTILINE))
            self.new = self.content(work)
        assert self.new and self.new != old
        self.calls = [(call, n) for call in made if call not in NOT_INJECTED for n in range(1, made[call] + 1)]

    def prepare(self, work):
        with open(os.path.join(work, "rows.csv"), "w", encoding="utf-8") as out:
            out.write(ROWS)
        if self.old is not None:
            with open(os.path.join(work, "data.pf"), "wb") as out:
                out.write(self.old)

    @staticmethod
    def content(work):
        path = os.path.join(work, "data.pf")
        if not os.path.exists(path):
            return None
        with open(path, "rb") as file:
            return file.read()

    def run(self, work, *tracer):
        return subprocess.run([*tracer, *self.command], cwd=work, stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                              stderr=subprocess.DEVNULL, check=False).returncode

    def ways(self, call):
        return [way for way in WAYS if (way not in ERRORS or call not in NEVER_AN_ERROR)
                and (way != "half" or call in CAN_BE_SHORT)]

    def disturb(self, call, n, way, short_call):
        """One run with a fault in the n-th such call: the way, whether success was reported, and the state."""
        what = f"{self.name}: {call} number {n}, {way}: "
        fault = "signal=KILL" if way == "killed" else f"error={way}"
        tracer = (short_call, call, str(n)) if way == "half" else (
            "strace", "-f", "-o", os.devnull, "-e", f"trace={call}", "-e", f"inject={call}:{fault}:when={n}")
        with tempfile.TemporaryDirectory() as work:
            self.prepare(work)
            code = self.run(work, *tracer)
            now = self.content(work)
            assert now in (self.old, self.new), what + "the file is neither the old nor the new one"
            state = "new" if now == self.new else "old"
            if way != "killed":
                others = set(os.listdir(work)) - {"data.pf", "rows.csv"}
                assert not others, what + f"left {others}"
                assert code != 0 or state == "new", what + "success was reported, the file is the old one"
                assert way != "half" or code == 0, what + "a short call is no failure"
        return way, "killed" if way == "killed" else "done" if code == 0 else "failure", state


def main():
    folder = os.path.abspath(sys.argv[1])
    save_once, short_call = (os.path.join(folder, "tests/robustness", name) for name in ("save_once", "short_call"))
    tevpf = os.path.join(folder, "tools/tevpf")
    subjects = [
        ("library, a changed file", [save_once, "data.pf"], MEGABYTE),
        ("tool, a changed file", [tevpf, "mv", "data.pf", "table", "other"], MEGABYTE),
        ("tool, a new file", [tevpf, "import", "data.pf", "table", "rows.csv"], None),
    ]
    for subject in (Subject(*s) for s in subjects if " ".join(sys.argv[2:]) in s[0]):
        with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
            jobs = [pool.submit(subject.disturb, call, n, way, short_call) for call, n in subject.calls
                    for way in subject.ways(call)]
            outcomes = collections.Counter(job.result() for job in jobs)
        assert all(outcomes["killed", "killed", state] for state in ("old", "new")), "kills before and after the change"
        print(f"{subject.name}: {len(subject.calls)} system calls, {len(jobs)} disturbed runs")
        print(f"  {'':8}{'success, new':>14}{'failure, old':>14}{'failure, new':>14}")
        for way in WAYS:
            row = [outcomes[way, reported, state] for reported, state in
                   (("done", "new"), ("failure", "old"), ("failure", "new"))]
            if way == "killed":
                row = ["", outcomes[way, way, "old"], outcomes[way, way, "new"]]
            print(f"  {way:8}" + "".join(f"{count:>14}" for count in row))


if __name__ == "__main__":
    main()
