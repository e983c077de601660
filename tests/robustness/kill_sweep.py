#!/usr/bin/env python3
"""A save never destroys the file it replaces: kills the process at every system call of a save, and
makes every one of them fail, and looks at what is on the disk afterwards.

    kill_sweep.py SAVE_ONCE     (the program beside this script; needs strace)

Killed: the file is the complete old or the complete new one. Failing: likewise, no temporary file is
left, and a save that reports success has written the new one.
"""
import filecmp
import os
import shutil
import subprocess
import sys
import tempfile

CALLS = ["openat", "write", "writev", "fsync", "fdatasync", "rename", "renameat", "renameat2", "close", "lseek",
         "ftruncate", "fchmod", "fchown", "unlink", "newfstatat", "fcntl"]


def run(program, path, inject):
    command = ["strace", "-f", "-o", os.devnull, "-e", "trace=all"]
    return subprocess.run(command + ["-e", f"inject={inject}", program, "change", path], stdout=subprocess.DEVNULL,
                          stderr=subprocess.DEVNULL, check=False).returncode


def calls_made(program, path, call):
    """How often a whole run makes this call."""
    log = path + ".trace"
    subprocess.run(["strace", "-f", "-o", log, "-e", f"trace={call}", program, "change", path], check=True)
    with open(log, encoding="utf-8") as file:
        count = sum(f" {call}(" in line for line in file)
    os.remove(log)
    return count


def main():
    program = os.path.abspath(sys.argv[1])
    outcomes = {"old": 0, "new": 0}
    with tempfile.TemporaryDirectory() as folder:
        old, new, work = (os.path.join(folder, name) for name in ("old.pf", "new.pf", "work"))
        subprocess.run([program, "make", old], check=True)
        shutil.copy(old, new)
        subprocess.run([program, "change", new], check=True)
        assert not filecmp.cmp(old, new, shallow=False)
        for call in CALLS:
            shutil.copy(old, os.path.join(folder, "count.pf"))
            for n in range(1, calls_made(program, os.path.join(folder, "count.pf"), call) + 1):
                for how in ("signal=KILL", "error=EIO"):
                    os.mkdir(work)
                    path = os.path.join(work, "data.pf")
                    shutil.copy(old, path)
                    code = run(program, path, f"{call}:{how}:when={n}")
                    state = next((s for s, f in (("old", old), ("new", new)) if filecmp.cmp(f, path, shallow=False)), None)
                    what = f"{call} number {n}, {how}: "
                    assert state, what + "the file is neither the old nor the new one"
                    if how.startswith("error"):
                        assert os.listdir(work) == ["data.pf"], what + f"left {os.listdir(work)}"
                        assert code != 0 or state == "new", what + "success was reported, the file is the old one"
                    outcomes[state] += 1
                    shutil.rmtree(work)
        print(f"{sum(outcomes.values())} interrupted saves: {outcomes['old']} left the complete old file, "
              f"{outcomes['new']} the complete new one")


if __name__ == "__main__":
    main()
