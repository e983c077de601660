#!/usr/bin/env python3
"""check_layers.py [--draw]: holds the includes against the layers of docs/design.md.

An include points at its own layer or at one below it, and no two files include each other,
directly or around a corner. A header and the source of its name count as one file. --draw prints
who includes whom.
"""

import fnmatch
import pathlib
import re
import sys

# From the bottom up; the first pattern that fits a file, without its ending, decides.
LAYERS = [
    ("interface", "include/*"),
    ("core, lower half", "core/status core/error_context core/heap core/library core/element "
                         "core/text_field core/text_word core/short_copy core/fetch core/number_text "
                         "core/leading_digits"),
    ("values", "values/*"),
    ("records", "lists/list lists/text_block lists/*_record lists/name_* lists/param_check "
                "lists/default_table tables/table tables/*_record tables/layout tables/row_store "
                "tables/row_order tables/search_keys tables/column_index tables/default_row "
                "tables/templates reports/formats"),
    ("core, upper half", "core/*"),
    ("operations", "lists/* tables/*"),
    ("reports", "reports/*"),
    ("tool", "tools/*"),
]
# The tool is a customer of the interface, and asks for the two texts of a failure.
TOOL_MAY_INCLUDE = {"include/tevpf", "core/error_context"}

ROOT = pathlib.Path(__file__).resolve().parent.parent
FOLDERS = ["include", "core", "values", "lists", "tables", "reports", "tools"]


def rank(unit):
    for number, (_, patterns) in enumerate(LAYERS):
        if any(fnmatch.fnmatchcase(unit, pattern) for pattern in patterns.split()):
            return number
    raise SystemExit(f"check_layers.py: {unit} belongs to no layer")


def unit_of(path):
    return path.relative_to(ROOT).with_suffix("").as_posix()


def included(name, source):
    for folder in (ROOT, source.parent, ROOT / "include"):
        if (folder / name).is_file():
            return unit_of(folder / name)
    raise SystemExit(f"check_layers.py: {source} includes {name}, which is not there")


def read_graph():
    """Every unit with the units that it includes."""
    graph = {}
    for folder in FOLDERS:
        for source in sorted((ROOT / folder).glob("*.*")):
            if source.suffix not in (".h", ".cpp", ".c"):
                continue
            unit = unit_of(source)
            names = re.findall(r'^#include "([^"]+)"', source.read_text(), re.MULTILINE)
            graph.setdefault(unit, set()).update(included(name, source) for name in names)
            graph[unit].discard(unit)
    return graph


def cycles(graph):
    """One line for each way around that a depth-first walk closes."""
    found, done = [], set()

    def walk(unit, path):
        if unit in path:
            found.append(" -> ".join([*path[path.index(unit):], unit]))
        elif unit not in done:
            for target in sorted(graph[unit]):
                walk(target, [*path, unit])
            done.add(unit)

    for unit in graph:
        walk(unit, [])
    return found


def draw(graph):
    arrows = {}
    for unit, targets in graph.items():
        for target in targets:
            arrows.setdefault(rank(unit), {}).setdefault(rank(target), set()).add((unit, target))
    for number in reversed(range(len(LAYERS))):
        units = sum(rank(unit) == number for unit in graph)
        below = [f"{LAYERS[to][0]} {len(pairs)}"
                 for to, pairs in sorted(arrows.get(number, {}).items(), reverse=True)]
        print(f"{LAYERS[number][0]:<17}{units:3} files  ->  {', '.join(below) or 'nothing'}")


def main():
    graph = read_graph()
    if "--draw" in sys.argv[1:]:
        draw(graph)
    faults = []
    for unit, targets in graph.items():
        for target in sorted(targets):
            tool = unit.startswith("tools/") and not target.startswith("tools/")
            if rank(target) > rank(unit) or (tool and target not in TOOL_MAY_INCLUDE):
                faults.append(f"{unit} ({LAYERS[rank(unit)][0]}) includes {target} "
                              f"({LAYERS[rank(target)][0]})")
    faults += [f"a circle: {way}" for way in cycles(graph)]
    print("\n".join(faults) or f"check_layers.py: {len(graph)} files, every include points down")
    sys.exit(bool(faults))


main()
