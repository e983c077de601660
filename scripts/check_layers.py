#!/usr/bin/env python3
"""check_layers.py [--draw]: holds the includes against the layers of docs/design.md.

The folders are the layers. An include between folders points to one that stands further down, and no two
files include each other, directly or around a corner. A header and the source of its name count as one
file; tevpf.hpp counts as a file of include/tevpf. --draw prints which folders include which.
"""

import pathlib
import re
import sys

# From bottom to top; folders on the same line do not depend on each other.
LAYERS = [["include"], ["core/base"], ["core/sequence"], ["core/io"], ["core"], ["values"],
          ["lists", "tables"], ["reports"], ["include/tevpf"], ["sql"],
          ["tools", "python/src"]]
PUBLIC = {"include", "include/tevpf"}
# These use only the public headers, as any program does; the tool the engine of SQL as well.
OUTSIDE = {"include/tevpf": PUBLIC, "sql": PUBLIC, "tools": PUBLIC | {"sql"},
           "python/src": PUBLIC}

ROOT = pathlib.Path(__file__).resolve().parent.parent
RANKS = {folder: rank for rank, folders in enumerate(LAYERS) for folder in folders}


def folder_of(unit):
    return unit.rpartition("/")[0]


def is_allowed(unit, target):
    here, there = folder_of(unit), folder_of(target)
    if here in OUTSIDE:
        return there == here or there in OUTSIDE[here]
    return here == there or RANKS[there] < RANKS[here]


def unit_of(path):
    if path.name == "tevpf.hpp":
        path = path.with_suffix("") / path.name
    return path.relative_to(ROOT).with_suffix("").as_posix()


def included(name, source):
    for folder in (ROOT, source.parent, ROOT / "include"):
        if (folder / name).is_file():
            return unit_of((folder / name).resolve())
    raise SystemExit(f"check_layers.py: {source} includes {name}, which is not there")


def read_graph():
    """Every unit with the units that it includes."""
    graph = {}
    for folder in RANKS:
        for source in sorted((ROOT / folder).glob("*.*")):
            if source.suffix not in (".h", ".hpp", ".cpp", ".c"):
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
    for folder in reversed(RANKS):
        units = [unit for unit in graph if folder_of(unit) == folder]
        arrows = {}
        for unit in units:
            for target in graph[unit]:
                arrows[folder_of(target)] = arrows.get(folder_of(target), 0) + 1
        below = [f"{name} {arrows[name]}" for name in reversed(RANKS)
                 if name in arrows and name != folder]
        print(f"{folder:<10}{len(units):3} files  ->  {', '.join(below) or 'nothing'}")


def main():
    graph = read_graph()
    if "--draw" in sys.argv[1:]:
        draw(graph)
    faults = [f"{unit} includes {target}" for unit, targets in graph.items()
              for target in sorted(targets) if not is_allowed(unit, target)]
    faults += [f"a circle: {way}" for way in cycles(graph)]
    print("\n".join(faults) or f"check_layers.py: {len(graph)} files, every include points down")
    sys.exit(bool(faults))


main()
