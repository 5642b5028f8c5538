#!/usr/bin/env python3
"""Measures `kldrcim` on large hosts: how long it takes, how much memory at its most, when the first line is there. Prints tables.

usage: large.py BUILD OUTPUT [--before KLDRCIM] [--lines N] [--instances N]

BUILD is the folder with kldrcim, the simulator and the toy provider of the tests; the rows are also written to OUTPUT. --before names
a former kldrcim, which is measured by turns with this one; it uses the module beside it. --lines is the number of lines of the
largest tree, --instances that of what is enumerated.

An enumeration is that of a provider which makes each instance as it is returned and keeps none, so that what is measured is kldrcim
alone: one releases what it made, the other leaves it all to the server, as it may. A tree is measured with the module and the
simulated host in the process, and once more as a client of `kldrcim serve`, alone.
"""

import argparse
import json
import os
import pathlib
import subprocess
import sys
import tempfile
import time

from markdown import print_table

SOURCE = pathlib.Path(__file__).resolve().parents[2]
# Adapters, ports, targets and LUNs, each of each.
HOSTS = [(1, 2, 2, 4), (4, 4, 32, 32), (8, 4, 64, 64), (8, 8, 128, 64), (16, 8, 128, 128)]
MEGABYTE = 1 << 20


class Run:
    """One process: seconds, the processor's seconds, seconds to the first byte, bytes at most, lines."""

    def __init__(self, *command, **environment):
        own = {"PATH": "/usr/bin:/bin", "HOME": "/nonexistent", "LC_ALL": "C.UTF-8"}
        begin = time.monotonic()
        with subprocess.Popen(command, env=own | environment, stdout=subprocess.PIPE, bufsize=0) as process:
            self.first, self.lines = None, 0
            while piece := process.stdout.read(1 << 20):
                self.first = self.first or time.monotonic() - begin
                self.lines += piece.count(b"\n")
            _, status, usage = os.wait4(process.pid, 0)
            process.returncode = os.waitstatus_to_exitcode(status)
        if process.returncode:
            sys.exit(f"large.py: {command} ended with {process.returncode}")
        self.seconds = time.monotonic() - begin
        self.processor = usage.ru_utime + usage.ru_stime
        self.most = usage.ru_maxrss << 10


def figures(run, name=""):
    return {f"{name}time": f"{run.processor:.2f} s", f"{name}peak": f"{run.most / MEGABYTE:,.0f} MB"}


def enumerations(build, many):
    toy = build / "tests/broker/libtoy_described.so"
    for form in ("table", "json", "jsonl", "mof"):
        row = {f"ei, {many:,} instances": form}
        for name, left in (("released: ", {}), ("left: ", {"TOY_MANY_LEAVES": "1"})):
            run = Run(build / "kldrcim", "--module", toy, "--namespace", "root/toy", "--format", form, "ei", "TOY_Many",
                      TOY_MANY=str(many), **left)
            row |= figures(run, name) | {f"{name}first line": f"{run.first * 1e3:.0f} ms"}
        yield row


def served(build, environment):
    process = subprocess.Popen(
        [build / "kldrcim", "serve", "--listen", "127.0.0.1:0"], env={"PATH": "/usr/bin:/bin"} | environment,
        stdout=subprocess.PIPE, text=True)
    return process, process.stdout.readline().split()[-1]


def trees(build, before, most):
    for verb in ("tree", "graph"):
        for counts in HOSTS:
            units = counts[0] * counts[1] * counts[2] * counts[3]
            if units > most:
                continue
            with tempfile.NamedTemporaryFile("w", suffix=".json") as inventory:
                options = [word for name, count in zip(("--adapters", "--ports", "--targets", "--luns"), counts) for word in (name, str(count))]
                subprocess.run(
                    [sys.executable, "-B", SOURCE / "simulator/make_inventory.py", *options], stdout=inventory, check=True)
                host = {
                    "HOME": "/nonexistent", "LD_LIBRARY_PATH": str(build / "simulator"),
                    "KLDR_SIMULATOR_INVENTORY": inventory.name,
                }
                row = {"verb": verb, "host": " x ".join(map(str, counts))}
                if before:
                    row |= figures(Run(before, verb, **host), "before: ")
                here = Run(build / "kldrcim", verb, **host)
                row = {"verb": verb, "host": row["host"], "lines": f"{here.lines:,}"} | row | figures(here)
                process, url = served(build, host)
                row |= figures(Run(build / "kldrcim", "--url", url, verb), "as a client: ")
                process.terminate()
                process.wait()
                process.stdout.close()
            print(json.dumps(row), file=sys.stderr)
            yield row


def main():
    parser = argparse.ArgumentParser(description="measures kldrcim on large hosts")
    parser.add_argument("build", type=pathlib.Path)
    parser.add_argument("output", type=pathlib.Path)
    parser.add_argument("--before", type=pathlib.Path)
    parser.add_argument("--lines", type=int, default=1 << 21)
    parser.add_argument("--instances", type=int, default=100_000)
    options = parser.parse_args()
    build = options.build.resolve()
    tables = [list(enumerations(build, options.instances)), list(trees(build, options.before, options.lines))]
    for table in tables:
        print_table(table)
    options.output.write_text(json.dumps({"tables": tables}, indent=2) + "\n", encoding="utf-8")


if __name__ == "__main__":
    main()
