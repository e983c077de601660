#!/usr/bin/env python3
"""coverage.py BUILD [--list]: the branch coverage of each folder, from the profile that scripts/coverage.sh has
made in a build folder. A condition that takes part in a decision counts twice: for being true and for being false.
What is compiled several times, for templates and test hooks, counts once."""
import collections
import json
import pathlib
import subprocess
import sys

ROOT = pathlib.Path(__file__).resolve().parent.parent
LIBRARY = ("core", "values", "lists", "tables", "reports")
FOLDERS = (*LIBRARY, "sql", "tools", "include")


def exported(build):
    programs = [p for p in [*build.glob("tests/*/*"), *build.glob("tools/*"), *build.glob("sql/*")]
                if p.is_file() and p.read_bytes()[:4] == b"\x7fELF" and (p.suffix == "" or p.suffix == ".so")]
    objects = [word for p in programs[1:] for word in ("-object", str(p))]
    done = subprocess.run(["llvm-cov", "export", str(programs[0]), *objects, f"-instr-profile={build}/all.profdata"],
                          capture_output=True, check=True)
    return json.loads(done.stdout)


def branches(data, build):
    """By file and place of the condition: how often it was true, and false. Caches of compilers make names of
    files relative to the build folder."""
    counts = collections.defaultdict(lambda: [0, 0])
    for function in data["data"][0]["functions"]:
        for line, column, end_line, end_column, true, false, file, *_ in function["branches"]:
            name = (build / function["filenames"][file]).resolve()
            if not name.is_relative_to(ROOT):
                continue
            place = (str(name.relative_to(ROOT)), line, column, end_line, end_column)
            counts[place][0] += true
            counts[place][1] += false
    return counts


def main():
    build = pathlib.Path(sys.argv[1]).resolve()
    counts = branches(exported(build), build)
    table = collections.defaultdict(lambda: [0, 0])
    for (name, *_), (true, false) in counts.items():
        folder = name.split("/")[0]
        groups = [folder, *(["library"] if folder in LIBRARY else [])]
        for group in groups:
            table[group][0] += (true > 0) + (false > 0)
            table[group][1] += 2
    print(f"{'':8} {'branches':>9} {'taken':>9}")
    for group in (*LIBRARY, "library", *FOLDERS[len(LIBRARY):]):
        taken, whole = table[group]
        print(f"{group:8} {whole:9} {100 * taken / max(whole, 1):7.1f} %")
    if "--list" not in sys.argv:
        return
    for (name, line, column, end_line, end_column), (true, false) in sorted(counts.items()):
        if name.split("/")[0] in FOLDERS and not (true and false):
            text = (ROOT / name).read_text(encoding="utf-8").splitlines()[line - 1]
            condition = text[column - 1:end_column - 1 if line == end_line else None]
            print(f"{name}:{line}: {'never' if not (true or false) else 'always' if true else 'never true,'} "
                  f"{condition}")


if __name__ == "__main__":
    main()
