#!/usr/bin/env python3
"""Scrapes a fleet of `kldrcim serve` processes on this machine, each with a generated host of its own, with a real Prometheus, and
prints a table.

usage: fleet.py BUILD OUTPUT [--hosts N] [--seconds N] [--interval N] [--small]

BUILD is the folder with kldrcim and the simulator; the rows are also written to OUTPUT. What Prometheus says of its scrapes is its own
`scrape_duration_seconds`, at each interval; the first scrape of a host, by which the module looks at it for the first time, is
asked for before. Memory is that of the processes that serve, at its most, and of which no other process has a part.
"""

import argparse
import contextlib
import json
import pathlib
import re
import socket
import statistics
import subprocess
import sys
import tempfile
import time
import urllib.parse
import urllib.request

from markdown import print_table

SOURCE = pathlib.Path(__file__).resolve().parents[2]
# What a row is: its name, and what make_inventory.py is told.
HOSTS = [
    ("2 adapters, 4 ports, 16 targets", ("--adapters", "2", "--ports", "2", "--targets", "4", "--luns", "8")),
    ("4 adapters, 8 ports, 64 targets", ("--adapters", "4", "--ports", "2", "--targets", "8", "--luns", "32")),
    ("4 adapters, 16 ports, 512 targets", ("--adapters", "4", "--ports", "4", "--targets", "32", "--luns", "32")),
]
KILOBYTE, MEGABYTE = 1 << 10, 1 << 20


class Host:
    """One process that serves one host."""

    def __init__(self, build, folder, arguments, seed):
        folder.mkdir()
        inventory = folder / "inventory.json"
        with open(inventory, "w", encoding="utf-8") as file:
            command = [sys.executable, "-B", SOURCE / "simulator/make_inventory.py", *arguments, "--seed", str(seed)]
            subprocess.run(command, stdout=file, check=True)
        environment = {
            "PATH": "/usr/bin:/bin", "HOME": str(folder), "LD_LIBRARY_PATH": str(build / "simulator"),
            "KLDR_SIMULATOR_INVENTORY": str(inventory),
        }
        self.process = subprocess.Popen(
            [build / "kldrcim", "serve", "--listen", "127.0.0.1:0"], env=environment, stdout=subprocess.PIPE, text=True)
        line = self.process.stdout.readline()
        if " at " not in line:
            sys.exit("fleet.py: a host does not serve")
        self.target = urllib.parse.urlsplit(line.split()[-1]).netloc

    def scrape(self):
        """Seconds and size."""
        begin = time.perf_counter()
        with urllib.request.urlopen(f"http://{self.target}/metrics", timeout=60) as answer:
            size = len(answer.read())
        return time.perf_counter() - begin, size

    def memory(self):
        """Bytes at most, and bytes that no other process shares, now."""
        status = pathlib.Path(f"/proc/{self.process.pid}/status").read_text(encoding="ascii")
        rollup = pathlib.Path(f"/proc/{self.process.pid}/smaps_rollup").read_text(encoding="ascii")
        own = sum(int(value) for value in re.findall(r"^Private_\w+: *(\d+)", rollup, re.M))
        return int(re.search(r"VmHWM:\s*(\d+)", status)[1]) << 10, own << 10

    def stop(self):
        self.process.terminate()
        self.process.wait()
        self.process.stdout.close()


class Prometheus:
    """A real one, on loopback, that scrapes all hosts."""

    def __init__(self, folder, targets, interval):
        with contextlib.closing(socket.socket()) as one:
            one.bind(("127.0.0.1", 0))
            port = one.getsockname()[1]
        (folder / "prometheus.yml").write_text(json.dumps({
            "global": {"scrape_interval": f"{interval}s", "scrape_timeout": f"{interval}s"},
            "scrape_configs": [{"job_name": "fleet", "static_configs": [{"targets": targets}]}],
        }), encoding="utf-8")
        self.log = open(folder / "prometheus.log", "wb")
        self.process = subprocess.Popen(
            ["prometheus", "--config.file=prometheus.yml", "--storage.tsdb.path=data", f"--web.listen-address=127.0.0.1:{port}"],
            cwd=folder, env={"PATH": "/usr/bin:/bin", "HOME": str(folder)}, stdout=self.log, stderr=self.log)
        self.url = f"http://127.0.0.1:{port}/api/v1/query?query="

    def values(self, expression):
        """The values of a query, one a series and moment; none while there is no answer."""
        try:
            with urllib.request.urlopen(self.url + urllib.parse.quote(expression), timeout=10) as answer:
                result = json.load(answer)["data"]["result"]
        except OSError:
            return []
        return [float(value) for each in result for _, value in each.get("values") or [each["value"]]]

    def stop(self):
        self.process.terminate()
        self.process.wait()
        self.log.close()


def wait_for(condition, what):
    for _ in range(1800):
        if condition():
            return
        time.sleep(0.1)
    sys.exit(f"fleet.py: {what}")


def measure(build, arguments, options):
    hosts = options.hosts
    with contextlib.ExitStack() as stack:
        folder = pathlib.Path(stack.enter_context(tempfile.TemporaryDirectory()))
        fleet = []
        for number in range(hosts):
            fleet.append(Host(build, folder / str(number), arguments, number))
            stack.callback(fleet[-1].stop)
        first = [host.scrape() for host in fleet]
        prometheus = Prometheus(folder, [host.target for host in fleet], options.interval)
        stack.callback(prometheus.stop)
        wait_for(lambda: sum(prometheus.values("up")) == hosts, "Prometheus does not reach all hosts")
        time.sleep(options.seconds)
        times = prometheus.values(f"scrape_duration_seconds[{options.seconds}s]")
        failed = prometheus.values("count_over_time(up[1h]) - sum_over_time(up[1h])")
        samples = prometheus.values("scrape_samples_scraped")
        memory = [host.memory() for host in fleet]
    if sum(failed):
        sys.exit(f"fleet.py: {sum(failed):.0f} scrapes have failed")
    return {
        "samples": f"{statistics.median(samples):,.0f}",
        "text": f"{statistics.median(size for _, size in first) / KILOBYTE:.0f} kB",
        "first scrape": f"{statistics.median(time for time, _ in first) * 1e3:.0f} ms",
        "scrape": f"{statistics.median(times) * 1e3:.0f} ms",
        "slowest": f"{max(times) * 1e3:.0f} ms",
        "a process at most": f"{max(most for most, _ in memory) / MEGABYTE:.0f} MB",
        "of its own": f"{statistics.median(own for _, own in memory) / MEGABYTE:.0f} MB",
        "the fleet": f"{sum(own for _, own in memory) / MEGABYTE:,.0f} MB",
    }


def main():
    parser = argparse.ArgumentParser(description="scrapes a fleet of generated hosts")
    parser.add_argument("build", type=pathlib.Path)
    parser.add_argument("output", type=pathlib.Path)
    parser.add_argument("--hosts", type=int, default=50)
    parser.add_argument("--seconds", type=int, default=60)
    parser.add_argument("--interval", type=int, default=15)
    parser.add_argument("--small", action="store_true", help="the smallest host only")
    options = parser.parse_args()
    rows = []
    for name, arguments in HOSTS[:1 if options.small else None]:
        rows.append({f"{options.hosts} hosts, each of": name} | measure(options.build.resolve(), arguments, options))
        print(json.dumps(rows[-1]), file=sys.stderr, flush=True)
    print_table(rows)
    options.output.write_text(json.dumps({"rows": rows}, indent=2) + "\n", encoding="utf-8")


if __name__ == "__main__":
    main()
