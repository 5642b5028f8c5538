#!/usr/bin/env python3
"""Counts what requests cost against their floor, prints a table and writes it as JSON.

usage: floor.py PROGRAMS RESULT.json [--rows TEXT] [--times N] [--compare FORMER.json]

PROGRAMS is the folder with kldr_floor and kldr_heap_floor. Instructions are counted by valgrind, one process for each side
of a row; the times are medians of N calls by turns. --rows takes the rows whose name holds the text. --compare fails if a
row takes more than 3 % more instructions than it took in the former result.
"""

import argparse
import concurrent.futures
import json
import os
import re
import subprocess
import sys
import tempfile

# What the ratio of the module to its floor is to come down to.
GOALS = [
    (r"enumerate 1 FC port", 1.6),
    (r"enumerate [0-9,]+ FC ports", 1.55),
    (r"enumerate [0-9,]+ (extents|disks)", 1.55),
    (r"enumerate paths", 1.25),
    (r"get .* FC ports", 1.35),
    (r"get .* extents", 1.3),
    (r"get .* paths", 1.2),
    (r"(associators|associator names|references|reference names) from one of 2,048 LUNs", 1.2),
    (r"associators from the host to 64 LUNs", 1.4),
    (r".*(adapters|host)", 1.8),
    (r"executeMethod, no-op", 1.04),
    (r"executeMethod", 1.01),
]
HEAP_GOAL = 1 << 20
WORSE = 1.03
COUNTED = 2


def goal_of(name):
    return next((goal for pattern, goal in GOALS if re.match(pattern, name)), None)


def ask(program, *words):
    return subprocess.run([program, *words], check=True, stdout=subprocess.PIPE, text=True).stdout


def count(program, name, side):
    """The instructions of one request; what was made before it and the program's beginning do not count."""
    with tempfile.TemporaryDirectory() as folder:
        file = os.path.join(folder, "callgrind.out")
        run = subprocess.run(
            ["valgrind", "--tool=callgrind", f"--callgrind-out-file={file}", "--instr-atstart=no",
             program, name, side, str(COUNTED)],
            stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True, check=False)
        if run.returncode != 0:
            sys.exit(f"floor.py: {name}, {side}: {run.stderr}")
        with open(file, encoding="utf-8") as text:
            total = next(line for line in text if line.startswith("totals:"))
    return int(total.split()[1]) // COUNTED


def measure_row(program, name):
    ours, floor = count(program, name, "ours"), count(program, name, "floor")
    return {"name": name, "ours": ours, "floor": floor, "ratio": ours / floor, "goal": goal_of(name)}


def add_times(program, rows, times):
    """One after the other, since each takes a processor for itself."""
    for row in rows:
        row["ours_ns"], row["floor_ns"] = map(int, ask(program, row["name"], "times", str(times)).split())


def heap(program):
    lines = (line.split("\t") for line in ask(program).splitlines())
    return [{"name": name, "ours": int(ours), "floor": int(floor)} for name, ours, floor in lines]


def show(rows, peaks):
    print(f"{'instructions, and microseconds of CPU':<60} {'module':>12} {'floor':>12} {'ratio (goal)':>13} "
          f"{'module us':>10} {'floor us':>10} {'ratio':>6}")
    for row in rows:
        goal = f" ({row['goal']:.2f})" if row["goal"] else ""
        print(f"{row['name']:<60} {row['ours']:>12,} {row['floor']:>12,} {row['ratio']:>6.3f}{goal:>7} "
              f"{row['ours_ns'] / 1000:>10.1f} {row['floor_ns'] / 1000:>10.1f} {row['ours_ns'] / row['floor_ns']:>6.2f}")
    print(f"\n{'peak heap, bytes':<60} {'module':>12} {'floor':>12} {'above (goal)':>25}")
    for row in peaks:
        print(f"{row['name']:<60} {row['ours']:>12,} {row['floor']:>12,} {row['ours'] - row['floor']:>12,} "
              f"({HEAP_GOAL:,})")


def worse_rows(rows, former):
    """What takes more than it took, as texts."""
    before = {row["name"]: row for row in former["rows"]}
    for row in rows:
        known = before.get(row["name"])
        if known and row["ours"] > known["ours"] * WORSE:
            yield f"{row['name']}: {row['ours']:,} instructions, where it was {known['ours']:,}"


def main():
    parser = argparse.ArgumentParser(usage=__doc__)
    parser.add_argument("programs")
    parser.add_argument("result")
    parser.add_argument("--rows", default="")
    parser.add_argument("--times", type=int, default=9)
    parser.add_argument("--compare")
    options = parser.parse_args()
    former = None
    if options.compare:
        with open(options.compare, encoding="utf-8") as file:
            former = json.load(file)

    program = os.path.join(options.programs, "kldr_floor")
    names = [name for name in ask(program).splitlines() if options.rows in name]
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
        rows = list(pool.map(lambda name: measure_row(program, name), names))
    add_times(program, rows, options.times)
    peaks = [] if options.rows else heap(os.path.join(options.programs, "kldr_heap_floor"))
    show(rows, peaks)
    with open(options.result, "w", encoding="utf-8") as file:
        json.dump({"rows": rows, "heap": peaks}, file, indent=1)
        file.write("\n")
    if former:
        worse = list(worse_rows(rows, former))
        for line in worse:
            print("WORSE: " + line, file=sys.stderr)
        return 1 if worse else 0
    return 0


if __name__ == "__main__":
    sys.exit(main())
