#!/usr/bin/env python3
"""Turns the benchmark's JSON into the table of ratios and into plots.

    ratios.py RESULT.json...            the table, as Markdown, on standard output
    ratios.py RESULT.json... --plots D  SVG plots of time per operation against n, in D

A factor above 1 against a peer: the library is faster by it. Against a limit (the plain thing
without a library) the figure is how many times the limit's time the library takes. Where it matters
how cost grows, it is how many times its own time at the smallest size. Memory is compared likewise.
"""
import argparse
import json
import math
import os
from collections import defaultdict

UNIT = {"ns": 1.0, "us": 1e3, "ms": 1e6, "s": 1e9}


def medians(paths):
    """{workload: {contestant: {n: nanoseconds per operation}}}, medians where a run was repeated; of
    workloads that measure memory, bytes per operation."""
    runs = defaultdict(list)
    for path in paths:
        with open(path, encoding="utf-8") as file:
            data = json.load(file)
        for run in data["benchmarks"]:
            if run.get("run_type") == "aggregate":
                continue
            workload, contestant, n = run["name"].split("/")[:3]
            figure = run.get("bytes", run["real_time"] * UNIT[run["time_unit"]])
            runs[workload, contestant, int(n)].append(figure / run["operations"])
    table = defaultdict(lambda: defaultdict(dict))
    for (workload, contestant, n), times in runs.items():
        table[workload][contestant][n] = sorted(times)[len(times) // 2]
    return data["context"], table


def short(n):
    return f"{n // 1_000_000} M" if n >= 1_000_000 else f"{n // 1000} k"


MEMORY = {"table memory"}  # the workloads whose figures are bytes


def nice(ns):
    return f"{ns:.3g} ns" if ns < 1e3 else f"{ns / 1e3:.3g} us" if ns < 1e6 else f"{ns / 1e6:.3g} ms"


# What is wanted: the factor against each peer and the multiple of the limit's time, by n; a key of 0
# holds for every n that is not named, and nothing is wanted where neither is there.
PEER = {
    "list add": {0: 5},
    "list remove": {1_000_000: 2, 0: 3},
    "list look up": {0: 3},
    "list change": {0: 3},
    "list walk": {0: 15},
    "list walk after opening": {0: 15},
    "list walk in a fresh process": {0: 15},
    "list save": {0: {"json": 4, "sqlite": 1, "sqlite backup": 1}},
    "list open": {0: 15},
    "open lists of 5": {0: 4},
    "open lists of 50": {0: 4},
    "save lists of 5": {0: 1},
    "save lists of 50": {0: 1},
    "table append in order": {0: 10},
    "table append in order, second index at random": {0: 4},
    "table append at random": {0: 4},
    "table append few values": {0: 5},
    "table append and find in turn": {0: 4},
    "table first 1000 appends after opening": {0: 1},
    "table session after opening": {1_000_000: 2, 0: 3},
    "table delete": {1_000_000: 2, 0: 3},
    "table replace": {0: 3},
    "table read in index order": {0: 30},
    "table find indexed": {1_000: 8, 0: 4},
    "table find unindexed": {1_000: None, 0: 30},
    "table find unindexed, absent": {1_000: None, 0: 30},
    "table save": {100_000: 1.5, 1_000_000: 1.5},
    "table open": {0: 15},
    "table dump": {0: 3},
    "table listing": {0: 3},
}
LIMIT = {
    "list look up": {0: 1},
    "list change": {0: 1},
    "list walk": {0: 2},
    "list walk after opening": {0: 2},
    "list walk in a fresh process": {0: 2},
    "list save": {100_000: 2, 1_000_000: 2},
    "list open": {0: 5},
    "open lists of 5": {0: 5},
    "open lists of 50": {0: 5},
    "table read in index order": {0: 3},
    "table find indexed": {10_000: 2.5, 100_000: 2.5, 1_000_000: 2.5},
    "table find unindexed": {0: 1.5},
    "table find unindexed, absent": {0: 1.5},
    "table save": {0: 1.4},
    "table save in place": {0: 1.4},
    "table open": {0: 1.5},
    "table dump": {0: 0.5},
    "table listing": {0: 0.5},
}
# At most so many nanoseconds, or bytes, per operation.
MOST = {
    "table find unindexed": {1_000: None, 0: 0.8},
    "table find unindexed, absent": {1_000: None, 0: 0.8},
    "table memory": {0: 100},
}
# At most so many times the time at the smallest size; for workloads that no peer does.
GROWTH = {
    "list add at a position": {1_000_000: 10},
    "list move a parameter": {1_000_000: 10},
    "table insert at a position": {1_000_000: 10},
    "table move a row": {1_000_000: 10},
}


def target(table, workload, n, contestant):
    wanted = table.get(workload, {})
    wanted = wanted.get(n, wanted.get(0))
    return wanted.get(contestant) if isinstance(wanted, dict) else wanted


def factor(ratio):
    return f"{ratio:.2f}" if ratio >= 0.1 else f"{ratio:.1g}"


def judged(figure, text, wanted, met):
    if wanted is None:
        return f"{figure}{text}"
    return f"{figure if met else f'**{figure}**'}{text} (wanted {wanted:g})"


def at_most(figure, ratio, text, wanted):
    return judged(figure, text, wanted, wanted is None or ratio <= wanted)


def at_least(figure, ratio, text, wanted):
    return judged(figure, text, wanted, wanted is None or ratio >= wanted)


def print_row(workload, n, contestants):
    ours = contestants["tevpf"]
    mine = f"{ours[n]:.3g} bytes" if workload in MEMORY else nice(ours[n])
    own = at_most(mine, ours[n], "", target(MOST, workload, n, None))
    peers, limits = [], []
    for name in sorted(contestants):
        if name == "tevpf" or n not in contestants[name]:
            continue
        theirs = contestants[name][n]
        if name.startswith("limit: "):
            ratio = ours[n] / theirs
            limits.append(at_most(factor(ratio) + "x", ratio, " " + name[7:], target(LIMIT, workload, n, name)))
        else:
            ratio = theirs / ours[n]
            peers.append(at_least(factor(ratio) + "x", ratio, " " + name, target(PEER, workload, n, name)))
    smallest = min(ours)
    if workload in GROWTH and n != smallest:
        ratio = ours[n] / ours[smallest]
        limits.append(at_most(factor(ratio) + "x", ratio, " " + short(smallest), target(GROWTH, workload, n, None)))
    print(f"| {workload} | {short(n)} | {own} | {', '.join(peers)} | {', '.join(limits)} |")


def print_table(context, table):
    print(f"{context['date'][:10]}, {context['num_cpus']} x {context['mhz_per_cpu']} MHz. Bold: short of what is wanted.\n")
    print("| workload | n | per operation | times as fast as | times the time of |")
    print("|---|---|---|---|---|")
    for workload in sorted(table):
        for n in sorted(table[workload]["tevpf"]):
            print_row(workload, n, table[workload])


WIDTH, HEIGHT, LEFT, TOP, RIGHT, BOTTOM = 640, 400, 70, 40, 170, 50
COLOURS = ["#0b6e99", "#c2571a", "#5a8f29", "#7a4fa3"]


def plot(workload, contestants):
    sizes = sorted({n for times in contestants.values() for n in times})
    values = [t for times in contestants.values() for t in times.values()]
    if len(sizes) < 2:
        return None
    low, high = math.floor(math.log10(min(values))), math.ceil(math.log10(max(values)) + 1e-9)

    def x(n):
        span = math.log10(sizes[-1]) - math.log10(sizes[0])
        return LEFT + (WIDTH - LEFT - RIGHT) * (math.log10(n) - math.log10(sizes[0])) / span

    def y(ns):
        return HEIGHT - BOTTOM - (HEIGHT - TOP - BOTTOM) * (math.log10(ns) - low) / max(high - low, 1)

    out = [f'<svg xmlns="http://www.w3.org/2000/svg" width="{WIDTH}" height="{HEIGHT}" font-family="sans-serif" font-size="12">',
           '<rect width="100%" height="100%" fill="white"/>',
           f'<text x="{LEFT}" y="24" font-size="15">{workload}: time per operation</text>']
    for power in range(low, high + 1):
        out.append(f'<line x1="{LEFT}" x2="{WIDTH - RIGHT}" y1="{y(10**power):.1f}" y2="{y(10**power):.1f}" stroke="#ddd"/>')
        out.append(f'<text x="{LEFT - 6}" y="{y(10**power) + 4:.1f}" text-anchor="end">{nice(10.0**power)}</text>')
    for n in sizes:
        out.append(f'<text x="{x(n):.1f}" y="{HEIGHT - BOTTOM + 18}" text-anchor="middle">{short(n)}</text>')
    for colour, (name, times) in zip(COLOURS, contestants.items()):
        points = " ".join(f"{x(n):.1f},{y(t):.1f}" for n, t in sorted(times.items()))
        out.append(f'<polyline points="{points}" fill="none" stroke="{colour}" stroke-width="2"/>')
        row = TOP + 18 * list(contestants).index(name)
        out.append(f'<rect x="{WIDTH - RIGHT + 12}" y="{row}" width="10" height="10" fill="{colour}"/>')
        out.append(f'<text x="{WIDTH - RIGHT + 28}" y="{row + 10}">{name}</text>')
    out.append("</svg>\n")
    return "\n".join(out)


# The workloads that show how cost grows: flat, with the logarithm, and with n.
PLOTTED = ["list look up", "list open", "table find indexed", "table append at random", "table delete", "table open"]


def main():
    arguments = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    arguments.add_argument("results", nargs="+")
    arguments.add_argument("--plots", metavar="D")
    arguments = arguments.parse_args()
    context, table = medians(arguments.results)
    if not arguments.plots:
        print_table(context, table)
        return
    os.makedirs(arguments.plots, exist_ok=True)
    for workload in PLOTTED:
        picture = plot(workload, table[workload])
        if picture:
            with open(os.path.join(arguments.plots, workload.replace(" ", "_") + ".svg"), "w", encoding="utf-8") as file:
                file.write(picture)


if __name__ == "__main__":
    main()
