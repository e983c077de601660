#!/usr/bin/env python3
"""melting_points.py [elements.csv]: plots the melting points of the elements by their atomic numbers.

Imports the CSV file into a parameter file, elements.pf, in the current directory; reads it back from
there and draws melting_points.png. Needs the package tevpf, pandas and matplotlib.
"""

import pathlib
import sys

import matplotlib
import numpy as np
import pandas as pd
import tevpf

matplotlib.use("Agg")  # a picture, no window
from matplotlib import pyplot as plt  # noqa: E402

NAMED = 3  # the highest and the lowest melting points that are labelled


def import_elements(csv, path):
    """Makes a parameter file with a table of the elements."""
    frame = pd.read_csv(csv, keep_default_na=False, na_values=[""])
    with tevpf.open(path, "w") as file:
        file.tables.create("elements", frame, unique=["number", "symbol"],
                           units={"melting": "degC", "weight": "u"},
                           bounds={"number": (1, 118), "melting": (-273.15, 5000)},
                           precision={"melting": 7, "weight": 5},
                           descriptions={"melting": "Melting point at ordinary pressure"})
        file.save()


def plot(table, path):
    number, melting = table["number"], table["melting"]
    known = ~np.isnan(melting)
    figure, axes = plt.subplots(figsize=(10, 5), layout="constrained")
    axes.plot(number[known], melting[known], color="0.8", linewidth=1, zorder=1)
    points = axes.scatter(number[known], melting[known], c=table["period"][known], cmap="viridis",
                          s=22, zorder=2)
    figure.colorbar(points, label="Period", ticks=range(1, 8))
    ordered = [row for row in table.sorted_by("melting") if not np.isnan(row["melting"])]
    for row in ordered[:NAMED] + ordered[-NAMED:]:
        axes.annotate(row["symbol"], (row["number"], row["melting"]), textcoords="offset points",
                      xytext=(5, 4))
    column = table.columns["melting"]
    axes.set_xlabel("Atomic number")
    axes.set_ylabel(f"Melting point [{column.units}]")
    axes.set_title(f"{known.sum()} of {len(table)} elements; the data have no figure for the others")
    figure.savefig(path, dpi=120)


def main():
    data = pathlib.Path(__file__).resolve().parent / "data/elements.csv"
    import_elements(sys.argv[1] if len(sys.argv) > 1 else data, "elements.pf")
    with tevpf.open("elements.pf") as file:
        table = file.tables["elements"]
        plot(table, "melting_points.png")
        iron = table.find(symbol="Fe")
        print(f"{iron['name']} melts at {iron['melting']:g} {table.columns['melting'].units}; "
              "melting_points.png shows all")


main()
