#!/usr/bin/env python3
"""Joins what the two programs of ./dev bench have written into one table of ratios, printed and written as JSON.

usage: table.py BENCHMARKS.json FIGURES.tsv MODULE RESULT.json
"""

import json
import os
import re
import subprocess
import sys
import tempfile

# The rows that have a goal: what the ratio of the module to its rival is to stay below.
GOALS = [
    (r"B1 ", "time", 1.25),
    (r"B1 ", "allocations", 1.3),
    (r"B3 enumerate paths, nested", "time", 1.0),
    (r"B3 .*, index", "time", 1.25),
    (r"B4 executeMethod/no-op", "time", 1.15),
    (r"B4 executeMethod/25 members", "time", 1.05),
    (r"B4 executeMethod/30 KB", "time", 1.02),
    (r"B5 find", "time", 1 / 15),
    (r"B7 ", "time", 1.25),
]
NANOSECONDS = {"ns": 1, "us": 1e3, "ms": 1e6, "s": 1e9}


def medians(path):
    """Row name to side ("ours", "plain") to its medians."""
    with open(path, encoding="utf-8") as file:
        runs = json.load(file)["benchmarks"]
    rows = {}
    for run in runs:
        if run.get("aggregate_name") != "median":
            continue
        name = run["run_name"]
        clock = "real_time" if name.endswith("/real_time") else "cpu_time"
        row, side = re.sub("/(real_time|iterations:[0-9]+)", "", name).rsplit("/", 1)
        rows.setdefault(row, {})[side] = {
            "time": run[clock] * NANOSECONDS[run["time_unit"]],
            "delivered": run["delivered"],
            "allocations": run["allocations"],
            "bytes": run["bytes"],
        }
    return rows


def goal_of(row, what):
    return next((goal for pattern, kind, goal in GOALS if kind == what and re.match(pattern, row)), None)


def ratios(rows):
    table = []
    for name, sides in rows.items():
        if set(sides) != {"ours", "plain"}:
            continue
        ours, plain = sides["ours"], sides["plain"]
        row = {"name": name, "ours": ours, "plain": plain}
        for what in ("time", "allocations", "bytes"):
            row[what] = ours[what] / plain[what] if plain[what] else None
            row[what + "_goal"] = goal_of(name, what)
        table.append(row)
    return sorted(table, key=lambda row: [int(part) if part.isdigit() else part
                                          for part in re.split("([0-9]+)", row["name"])])


def stripped_size(module):
    with tempfile.TemporaryDirectory() as folder:
        copy = os.path.join(folder, "stripped")
        subprocess.run(["strip", "-o", copy, module], check=True)
        return os.path.getsize(copy)


def figures(path, module):
    with open(path, encoding="utf-8") as file:
        rows = [line.rstrip("\n").split("\t") for line in file]
    rows.append(["B5 size of the stripped library", str(stripped_size(module)), "bytes"])
    return [{"name": name, "value": float(value), "unit": unit} for name, value, unit in rows]


def show(row):
    def cell(what):
        if row[what] is None:
            return "-"
        goal = row[what + "_goal"]
        return f"{row[what]:.2f}" + (f" ({goal:.2f})" if goal else "")

    each = row["ours"]["time"] / row["ours"]["delivered"]
    return (f"{row['name']:<60} {row['ours']['time'] / 1000:>12.1f} {row['plain']['time'] / 1000:>12.1f} "
            f"{cell('time'):>13} {cell('allocations'):>13} {cell('bytes'):>7} {each / 1000:>10.2f}")


def main(benchmarks, figure_lines, module, result):
    table, single = ratios(medians(benchmarks)), figures(figure_lines, module)
    print(f"{'':<60} {'ours us':>12} {'plain us':>12} {'ratio (goal)':>13} {'allocations':>13} {'bytes':>7} {'us each':>10}")
    for row in table:
        print(show(row))
    print()
    for row in single:
        print(f"{row['name']:<50} {row['value']:>14,.2f} {row['unit']}")
    with open(result, "w", encoding="utf-8") as file:
        json.dump({"ratios": table, "figures": single}, file, indent=1)
        file.write("\n")


if __name__ == "__main__":
    if len(sys.argv) != 5:
        sys.exit(__doc__)
    main(*sys.argv[1:])
