#!/usr/bin/env python3
"""Measures `kldrcim` on large hosts: how long it takes, how much memory at its most, when the first line is there. Prints tables.

usage: large.py BUILD OUTPUT [--before KLDRCIM] [--lines N] [--instances N]

BUILD is the folder with kldrcim, the simulator and the toy provider of the tests; the rows are also written to OUTPUT. --before names
a former kldrcim, which is measured by turns with this one; it uses the module beside it. --lines is the number of lines of the
largest tree, --instances that of what is enumerated.

An enumeration is that of a provider which makes each instance as it is returned and keeps none, so that what is measured is kldrcim
alone: one releases what it made, the other leaves it all to the server, as it may. It notes when it hands over the first, and the
first line is timed from there, through a pipe. What the module enumerates, and a tree, is measured with the module and the simulated
host in the process, and once more as a client of `kldrcim serve`, alone.
"""

import argparse
import contextlib
import json
import math
import os
import pathlib
import resource
import subprocess
import sys
import tempfile
import time

from markdown import print_table

SOURCE = pathlib.Path(__file__).resolve().parents[2]
# Adapters, ports, targets and LUNs, each of each.
HOSTS = [(1, 2, 2, 4), (4, 4, 32, 32), (8, 4, 64, 64), (8, 8, 128, 64), (16, 8, 128, 128)]
#: That of the enumerations.
UNITS = (8, 4, 60, 64)
MEGABYTE = 1 << 20


class Run:
    """One process: the processor's seconds, the moment of the first byte, bytes at most, lines."""

    piece = bytearray(1 << 16)

    def __init__(self, *command, **environment):
        own = {"PATH": "/usr/bin:/bin", "HOME": "/nonexistent", "LC_ALL": "C.UTF-8"}
        with subprocess.Popen(command, env=own | environment, stdout=subprocess.PIPE, bufsize=0) as process:
            self.first, self.lines = None, 0
            while size := process.stdout.readinto(self.piece):
                self.first = self.first or time.monotonic()
                self.lines += self.piece.count(b"\n", 0, size)
            _, status, usage = os.wait4(process.pid, 0)
            process.returncode = os.waitstatus_to_exitcode(status)
        if process.returncode:
            sys.exit(f"large.py: {command} ended with {process.returncode}")
        self.processor = usage.ru_utime + usage.ru_stime
        self.most = usage.ru_maxrss << 10
        # A process begins with the memory of who starts it in this account.
        self.is_peak_known = usage.ru_maxrss > resource.getrusage(resource.RUSAGE_SELF).ru_maxrss

    def peak(self):
        return ("" if self.is_peak_known else "< ") + f"{self.most / MEGABYTE:,.0f} MB"


def figures(run, name=""):
    """Empty for what was not run."""
    return {f"{name}time": f"{run.processor:.2f} s" if run else "", f"{name}peak": run.peak() if run else ""}


def size_of(counts):
    return " x ".join(map(str, counts))


@contextlib.contextmanager
def served(build, *options, **environment):
    """The address of a server over the module, or another one."""
    process = subprocess.Popen(
        [build / "kldrcim", "serve", "--listen", "127.0.0.1:0", *options],
        env={"PATH": "/usr/bin:/bin", "HOME": "/nonexistent"} | environment, stdout=subprocess.PIPE, text=True)
    try:
        yield process.stdout.readline().split()[-1]
    finally:
        process.terminate()
        process.wait()
        process.stdout.close()


def enumerations(build, many, folder):
    """Of a provider that keeps nothing."""
    space = ("--namespace", "root/toy")
    own = ("--module", build / "tests/broker/libtoy_plain.so", *space)
    notes = os.path.join(folder, "notes")
    toy = {"TOY_MANY": str(many), "TOY_MANY_NOTES": notes}

    def first_line(run):
        with open(notes, encoding="ascii") as file:
            return f"{(run.first - float(file.read())) * 1e3:.0f} ms"

    for form in ("table", "json", "jsonl", "mof"):
        row = {f"ei, {many:,} instances": form}
        asked = ("--format", form, "ei", "TOY_Many")
        for name, left in (("released: ", {}), ("left: ", {"TOY_MANY_LEAVES": "1"})):
            run = Run(build / "kldrcim", *own, *asked, **toy | left)
            row |= figures(run, name) | {f"{name}first line": first_line(run)}
        with served(build, *own, **toy) as url:
            run = Run(build / "kldrcim", "--url", url, *space, *asked)
            row |= figures(run, "as a client: ") | {"as a client: first line": first_line(run)}
        yield row


@contextlib.contextmanager
def simulated(build, counts):
    """The environment in which the module finds a host of that size."""
    with tempfile.NamedTemporaryFile("w", suffix=".json") as inventory:
        options = [word for name, count in zip(("--adapters", "--ports", "--targets", "--luns"), counts) for word in (name, str(count))]
        subprocess.run([sys.executable, "-B", SOURCE / "simulator/make_inventory.py", *options], stdout=inventory, check=True)
        yield {"LD_LIBRARY_PATH": str(build / "simulator"), "KLDR_SIMULATOR_INVENTORY": inventory.name}


def walked(build, before, counts, host, *words):
    """One row: in the process, as it was before, and as a client. What kept all of it would take tens of gigabytes of a larger host,
    and of the largest the module's own lists take some."""
    units = math.prod(counts)
    there = Run(before, *words, **host) if before and units < 200_000 else None
    here = Run(build / "kldrcim", *words, **host) if units < 1_000_000 else None
    with served(build, **host) as url:
        # The module looks at all of a large host before it hands over the first.
        client = Run(build / "kldrcim", "--url", url, "--timeout", "3600", *words)
    row = {"host": size_of(counts), "verb": " ".join(words), "lines": f"{client.lines:,}"}
    row |= figures(here) | figures(client, "as a client: ")
    if before:
        row |= figures(there, "before: ")
    print(json.dumps(row), file=sys.stderr, flush=True)
    return row


def of_the_module(build, before, most):
    for counts, verbs in ((UNITS, (("ei", "KALDERA_StorageExtent", "--format", "json"), ("ein", "KALDERA_StorageExtent"))),
                          *((each, (("tree",), ("tree", "--format", "json"), ("graph",))) for each in HOSTS)):
        units = math.prod(counts)
        if units > most:
            continue
        # The lines of JSON are ten times as many.
        verbs = verbs if units < 200_000 else [words for words in verbs if "json" not in words]
        with simulated(build, counts) as host:
            for words in verbs:
                yield walked(build, before, counts, host, *words)


def main():
    parser = argparse.ArgumentParser(description="measures kldrcim on large hosts")
    parser.add_argument("build", type=pathlib.Path)
    parser.add_argument("output", type=pathlib.Path)
    parser.add_argument("--before", type=pathlib.Path)
    parser.add_argument("--lines", type=int, default=1 << 21)
    parser.add_argument("--instances", type=int, default=100_000)
    options = parser.parse_args()
    build = options.build.resolve()
    print(f"load of the machine before: {os.getloadavg()[0]:.1f}")
    with tempfile.TemporaryDirectory() as folder:
        tables = [list(enumerations(build, options.instances, folder))]
    # The rest takes half an hour.
    print_table(tables[0])
    sys.stdout.flush()
    tables.append(list(of_the_module(build, options.before, options.lines)))
    print_table(tables[1])
    print(f"\nload of the machine behind: {os.getloadavg()[0]:.1f}")
    options.output.write_text(json.dumps({"tables": tables}, indent=2) + "\n", encoding="utf-8")


if __name__ == "__main__":
    main()
