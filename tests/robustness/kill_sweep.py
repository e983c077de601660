#!/usr/bin/env python3
"""A save never destroys the file it replaces: kills the process at every system call of a run that opens,
changes and saves a file, makes every one of them fail, and looks at what is on the disk afterwards.

    kill_sweep.py SAVE_ONCE     (the program beside this script; needs strace)

Killed: the file is the complete old or the complete new one. Failing: likewise, no temporary file is
left, and a run that reports success has written the new one.
"""
import collections
import concurrent.futures
import filecmp
import os
import re
import shutil
import subprocess
import sys
import tempfile

sys.path.insert(0, os.path.join(os.path.dirname(os.path.realpath(__file__)), "..", "outside"))
sys.dont_write_bytecode = True
from outside_check import INT, stored_table  # noqa: E402

COLUMN = dict(type=INT, name="n", units="", idx=1, unq=0, width=8, max=120000, min=0)
MEGABYTE = stored_table("table", "many rows", bytes(8), 0, [COLUMN], [(n,) for n in range(120000)])

FAULTS = ("signal=KILL", "error=EIO", "error=ENOSPC")
NOT_INJECTED = {"execve", "exit_group"}  # before the program, and after it
NEVER_AN_ERROR = {"brk"}  # which tells a failure by another result


def run(program, path, *options):
    command = ["strace", "-f", *options, program, path]
    return subprocess.run(command, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, check=False).returncode


def calls_made(program, path):
    """How often a whole run makes each system call."""
    log = path + ".trace"
    assert run(program, path, "-o", log) == 0, "the run that nothing disturbs"
    with open(log, encoding="utf-8") as file:
        calls = collections.Counter(re.findall(r"^\d+ +(\w+)\(", file.read(), re.MULTILINE))
    return [(call, n) for call in calls if call not in NOT_INJECTED for n in range(1, calls[call] + 1)]


def disturb(program, old, new, call, n, fault):
    """One run with a fault in the n-th such call; the state of the file afterwards."""
    what = f"{call} number {n}, {fault}: "
    with tempfile.TemporaryDirectory(dir=os.path.dirname(old)) as work:
        path = os.path.join(work, "data.pf")
        shutil.copy(old, path)
        code = run(program, path, "-o", os.devnull, "-e", f"trace={call}", "-e", f"inject={call}:{fault}:when={n}")
        state = next((s for s, f in (("old", old), ("new", new)) if filecmp.cmp(f, path, shallow=False)), None)
        assert state, what + "the file is neither the old nor the new one"
        if fault.startswith("error"):
            assert os.listdir(work) == ["data.pf"], what + f"left {os.listdir(work)}"
            assert code != 0 or state == "new", what + "success was reported, the file is the old one"
    return fault, state


def main():
    program = os.path.abspath(sys.argv[1])
    with tempfile.TemporaryDirectory() as folder, concurrent.futures.ThreadPoolExecutor() as pool:
        old, new = (os.path.join(folder, name) for name in ("old.pf", "new.pf"))
        with open(old, "wb") as out:
            out.write(MEGABYTE)
        shutil.copy(old, new)
        calls = calls_made(program, new)
        assert not filecmp.cmp(old, new, shallow=False)
        jobs = [pool.submit(disturb, program, old, new, call, n, fault) for call, n in calls for fault in FAULTS
                if fault == FAULTS[0] or call not in NEVER_AN_ERROR]
        outcomes = collections.Counter(job.result() for job in jobs)
    assert all(outcomes["signal=KILL", state] for state in ("old", "new")), "kills before and after the change"
    print(f"{len(jobs)} disturbed saves, faults at {len(calls)} system calls")
    for (fault, state), count in sorted(outcomes.items()):
        print(f"{fault:13} the complete {state} file: {count}")


if __name__ == "__main__":
    main()
