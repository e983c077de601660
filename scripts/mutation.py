#!/usr/bin/env python3
"""Plants the faults of scripts/mutations.txt one at a time in a copy of the source, runs the tests that
matter there, and says which faults they notice.

    mutation.py [--only TEXT]... [--again OUTCOME]... [--limit SECONDS] [--report]

--only TEXT        only faults whose file or text contains TEXT
--again OUTCOME    tries faults again that had this outcome: survived, noticed, unbuilt
--limit SECONDS    processor time of one test (default 60); a test that takes longer has noticed the fault
--report           prints the table of what is known, and plants nothing: survivors count as explained when
                   the list says why, the score is the share of those tried that were noticed

Outcomes are kept in build/mutation/outcomes.json, so that a run that was stopped goes on where it was. The
copy and its build lie beside it. A fault whose text is not found exactly once is an error.
"""
import argparse
import collections
import dataclasses
import hashlib
import json
import os
import pathlib
import resource
import shutil
import subprocess
import sys
import tempfile
import time

ROOT = pathlib.Path(__file__).resolve().parent.parent
LIST = ROOT / "scripts/mutations.txt"
WORK = ROOT / "build/mutation"
SOURCE, BUILD, OUTCOMES = WORK / "source", WORK / "source/build/dev", WORK / "outcomes.json"
MEMORY = 6 << 30  # bytes of address space for one test
WALL = 1200  # seconds: only where a test neither ends nor uses its processor time


@dataclasses.dataclass
class Fault:
    file: str
    old: str
    new: str
    reason: str = ""  # why it may survive
    tests: tuple = ()

    @property
    def key(self):
        return hashlib.sha256("\0".join((self.file, self.old, self.new)).encode()).hexdigest()[:16]

    def __str__(self):
        return f"{self.file}: {self.old.strip()}  ->  {self.new.strip() or '(nothing)'}"


def read_faults():
    """The list, in which "@ FOLDER TEST..." names the tests of what begins like that, "= FILE [TEST...]" the
    file of the faults behind it, and "- " and "+ " lines their old and new text. "! " says why a fault may
    survive; an empty line ends it."""
    tests_of, faults, file, tests, fault = {}, [], "", (), None
    for line in [*LIST.read_text(encoding="utf-8").splitlines(), ""]:
        mark, text = line[:1], line[2:]
        if mark == "@":
            folder, *names = text.split()
            tests_of[folder] = tuple(names)
        elif mark == "=":
            file, *names = text.split()
            default = max((f for f in tests_of if file.startswith(f)), key=len, default=None)
            tests = tuple(names) or tests_of[default]
        elif mark and mark in "-+!":
            fault = fault or Fault(file, "", "", "", tests)
            part = {"-": "old", "+": "new", "!": "reason"}[mark]
            before = getattr(fault, part)
            setattr(fault, part, f"{before}\n{text}" if before else text)
        elif not line and fault:
            faults.append(fault)
            fault = None
        elif line and mark != "#":
            sys.exit(f"mutation.py: what is this line? {line}")
    return faults


def plant(fault):
    """The text of the file with the fault in it."""
    text = (ROOT / fault.file).read_text(encoding="utf-8")
    if not fault.old or text.count(fault.old) != 1:
        sys.exit(f"mutation.py: found {text.count(fault.old)} times, not once: {fault}")
    return text.replace(fault.old, fault.new)


def write(name, text):
    """Into the copy, unless it is there already: what is not touched is not built again."""
    place = SOURCE / name
    data = text if isinstance(text, bytes) else text.encode()
    if not place.exists() or place.read_bytes() != data:
        place.parent.mkdir(parents=True, exist_ok=True)
        place.write_bytes(data)


def copy_source():
    names = subprocess.run(["git", "ls-files", "-co", "--exclude-standard"], cwd=ROOT, check=True, text=True,
                           capture_output=True).stdout.splitlines()
    for name in names:
        if (ROOT / name).is_file():
            write(name, (ROOT / name).read_bytes())
            shutil.copymode(ROOT / name, SOURCE / name)
    kept = set(names)
    for place in SOURCE.rglob("*"):
        name = str(place.relative_to(SOURCE))
        if place.is_file() and name not in kept and not name.startswith("build/"):
            place.unlink()
    if not (BUILD / "build.ninja").exists():
        subprocess.run(["cmake", "--preset", "dev", "-DTEVPF_STRICT=OFF"], cwd=SOURCE, check=True,
                       stdout=subprocess.DEVNULL)


def build(targets):
    done = subprocess.run(["ninja", "-C", BUILD, *targets], capture_output=True, text=True, check=False)
    return done.returncode == 0, done.stdout


# What a name in the list stands for: what it needs, and how it is run.
def targets_of(test):
    if test.startswith("tools"):
        return ["tevpf_tool", "engine"]
    if test.startswith("sql."):
        return ["tevpf_tool", "tevpf_sqlite", "sql_fuzz"]
    return [{"corpus": "file_fuzz", "operations_corpus": "operations_fuzz"}.get(test, test)]


def command_of(test):
    program = lambda name: str(next(BUILD.glob(f"tests/*/{name}")))  # noqa: E731
    if test.startswith(("tools", "sql.")):
        folder = test.split(".")[0]
        return ["ctest", "--test-dir", str(BUILD / "tests" / folder), "-R", f"^{test}(\\.|$)", "-j2",
                "--stop-on-failure", "--output-on-failure", "--no-tests=error", "--timeout", str(WALL)]
    if test == "corpus":
        return [program("file_fuzz"), str(SOURCE / "tests/fuzz/corpus/file"), "20"]
    if test.endswith("_corpus"):
        name = test.removesuffix("_corpus")
        return [program(f"{name}_fuzz"), str(SOURCE / f"tests/fuzz/corpus/{name}")]
    return [program(test), "--gtest_brief=1", "--gtest_fail_fast"]


def passes(test, seconds):
    def limit():
        resource.setrlimit(resource.RLIMIT_CPU, (seconds, seconds + 5))
        resource.setrlimit(resource.RLIMIT_AS, (MEMORY, MEMORY))
        resource.setrlimit(resource.RLIMIT_CORE, (0, 0))

    with tempfile.TemporaryDirectory() as folder, open(WORK / "last.log", "w", encoding="utf-8") as log:
        try:
            return subprocess.run(command_of(test), cwd=folder, stdout=log, stderr=log, stdin=subprocess.DEVNULL,
                                  preexec_fn=limit, timeout=WALL, check=False).returncode == 0
        except subprocess.TimeoutExpired:
            return False


def try_fault(fault, seconds):
    """The outcome, and the test that noticed the fault."""
    original = (ROOT / fault.file).read_bytes()
    try:
        write(fault.file, plant(fault))
        for test in fault.tests:
            built, _ = build(targets_of(test))
            if not built:
                return "unbuilt", ""
            if not passes(test, seconds):
                return "noticed", test
        return "survived", ""
    finally:
        write(fault.file, original)


def check_undisturbed(faults, seconds):
    for test in dict.fromkeys(test for fault in faults for test in fault.tests):
        built, output = build(targets_of(test))
        if not built:
            sys.exit(f"mutation.py: {test} cannot be built:\n{output}")
        if not passes(test, seconds):
            sys.exit(f"mutation.py: {test} fails without a fault; see {WORK / 'last.log'}")


def report(faults, outcomes):
    table = collections.defaultdict(collections.Counter)
    survivors = []
    for fault in faults:
        outcome = outcomes.get(fault.key, {}).get("outcome", "untried")
        for row in (fault.file.split("/")[0], "all"):
            table[row]["planted"] += 1
            table[row][outcome] += 1
            table[row]["explained"] += outcome == "survived" and bool(fault.reason)
        if outcome == "survived":
            survivors.append(fault)
    columns = ["planted", "noticed", "survived", "explained", "unbuilt", "untried"]
    print(f"{'':8}" + "".join(f"{c:>10}" for c in columns) + "   score")
    for row, counts in sorted(table.items(), key=lambda item: item[0] == "all"):
        tried = counts["noticed"] + counts["survived"]
        score = f"{100 * counts['noticed'] / tried:6.1f} %" if tried else ""
        print(f"{row:8}" + "".join(f"{counts[c]:10}" for c in columns) + f"  {score}")
    for fault in survivors:
        print(f"\nsurvived: {fault}\n    {fault.reason or 'NO REASON GIVEN'}")


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--only", action="append", default=[])
    parser.add_argument("--again", action="append", default=[])
    parser.add_argument("--limit", type=int, default=60)
    parser.add_argument("--report", action="store_true")
    options = parser.parse_args()

    faults = read_faults()
    outcomes = json.loads(OUTCOMES.read_text(encoding="utf-8")) if OUTCOMES.exists() else {}
    chosen = [f for f in faults if not options.only or any(text in str(f) for text in options.only)]
    for fault in chosen:
        plant(fault)
    due = [f for f in chosen if outcomes.get(f.key, {}).get("outcome") in (None, *options.again)]
    if options.report or not due:
        return report(chosen, outcomes)

    copy_source()
    check_undisturbed(due, options.limit)
    for number, fault in enumerate(due, 1):
        start = time.monotonic()
        outcome, test = try_fault(fault, options.limit)
        outcomes[fault.key] = {"fault": str(fault), "outcome": outcome, "by": test}
        OUTCOMES.write_text(json.dumps(outcomes, indent=1), encoding="utf-8")
        print(f"{number}/{len(due)} {outcome:8} {time.monotonic() - start:4.0f} s  {test:18} {fault}", flush=True)
    report(chosen, outcomes)


if __name__ == "__main__":
    main()
