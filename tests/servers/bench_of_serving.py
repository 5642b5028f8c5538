"""How `kldrcim serve` does beside other servers with the same module: the same host and client, each in a machine of its own."""

import json
import random
import statistics
import sys
from itertools import chain

import bench_requests
from rooms import Room

sys.path.insert(0, str(bench_requests.SOURCE / "tests/bench"))

from markdown import print_table  # noqa: E402

OURS = "serve"
#: So many extents, and the host that has them.
HOSTS = {
    1_000: ["--adapters", "5", "--ports", "2", "--targets", "10", "--luns", "10", "--cna", "0"],
    10_000: ["--adapters", "5", "--ports", "2", "--targets", "10", "--luns", "100", "--cna", "0"],
}
EXTENTS = bench_requests.enumeration("KALDERA_StorageExtent")
PORTS = bench_requests.enumeration("KALDERA_FCPort")
#: Requests of one connection; sfcb ends it after ten.
KEPT = 8
STARTS, ALERTS, PARTS = 5, 1_000, 5
MEGABYTE = 1 << 20


class Rooms:
    """By the name of the server, ours first."""

    def __init__(self, servers, build):
        self.rooms = {server.name: Room(server, build) for server in servers}
        for room in self.rooms.values():
            room.wait()

    def each(self, *order):
        """The result of an order of each, one after the other, in an order that changes."""
        names = random.sample(list(self.rooms), len(self.rooms))
        found = {name: self.rooms[name].order(*order) for name in names}
        return {name: found[name] for name in self.rooms}

    def end(self):
        for room in self.rooms.values():
            room.end()


def medians(rounds, figure):
    """`rounds` are results of all servers; `figure` of one result."""
    return {name: statistics.median(figure(each[name]) for each in rounds) for name in rounds[0]}


def row(what, unit, figures, goal=None, **more):
    """A measurement of all servers, with the ratio of ours to the best of the others; `goal` is in words."""
    others = [figure for name, figure in figures.items() if name != OURS]
    return {"what": what, "unit": unit, "figures": figures, "ratio": figures[OURS] / min(others) if others else None, "goal": goal} | more


def enumerations(rooms, rounds):
    for count, host in HOSTS.items():
        rooms.each("start", host, PORTS)
        found = rooms.each("count", EXTENTS)
        if set(found.values()) != {count}:
            raise SystemExit(f"bench: {found} extents instead of {count}")
        turns = [rooms.each("measure", EXTENTS, 1) for _ in range(rounds)]
        yield row(f"enumerate {count:,} instances", "ms", medians(turns, lambda each: each["seconds"][0] * 1e3), "ratio below 0.5")
        yield row(
            "the same, processor's time", "us each", medians(turns, lambda each: (each["provider"] + each["others"]) / count / 1e3)
        )
        if count == min(HOSTS):
            yield from kept_connection(rooms, rounds)


def kept_connection(rooms, rounds):
    """The first request of a connection is another matter."""
    name = next(iter(rooms.rooms))
    port = bench_requests.paths_in(rooms.rooms[name].order("answer", bench_requests.names("KALDERA_FCPort")))[-1]
    turns = [rooms.each("measure", bench_requests.get_instance(port), KEPT) for _ in range(rounds * 3)]
    yield row("getInstance on a kept connection", "ms", medians(turns, lambda each: statistics.median(each["seconds"][1:]) * 1e3))
    yield row("the first on a new one", "ms", medians(turns, lambda each: each["seconds"][0] * 1e3))


def starts(rooms):
    turns = [rooms.each("start", [], PORTS) for _ in range(STARTS)]
    yield row("first answer after the start", "ms", medians(turns, lambda each: each * 1e3), "below 100 ms")


def alerts(rooms):
    """Of the demo host."""
    found = rooms.each("alerts", ALERTS)
    for name, each in found.items():
        if each["arrived"] != ALERTS:
            raise SystemExit(f"bench: {name}: {each['arrived']} alerts of {ALERTS}")
    yield row(f"{ALERTS:,} alerts to a listener", "s", {name: each["seconds"] for name, each in found.items()})
    yield row("the same, processor's time", "us each", {name: each["nanoseconds"] / 1e3 for name, each in found.items()})


def memory(rooms, requests):
    """Of the demo host, after the requests, and the growth since the first part of them."""
    parts = [rooms.each("mix", requests // PARTS) for _ in range(PARTS)]
    for name, each in parts[-1].items():
        failures = [failure for part in parts for failure in part[name]["failures"]]
        if failures:
            print(f"{name}: {len(failures)} requests were not answered, such as {failures[0]}", flush=True)
    last = {name: each["memory"] / MEGABYTE for name, each in parts[-1].items()}
    grown = {name: (parts[-1][name]["memory"] - parts[1][name]["memory"]) / MEGABYTE for name in last}
    yield row(f"memory after {requests:,} mixed requests", "MB", last, "below 30 MB")
    yield {"what": f"of that, grown in the last {requests * (PARTS - 2) // PARTS:,}", "unit": "MB", "figures": grown, "ratio": None,
           "goal": "none"}  # fmt: skip


def shown(each):
    cells = {"": each["what"]}
    cells |= {name: f"{figure:,.2f} {each['unit']}" for name, figure in each["figures"].items()}
    ratio = "-" if each["ratio"] is None else f"{each['ratio']:.2f}"
    return cells | {"ratio to the best": ratio, "goal": each["goal"] or ""}


def measure_serving(servers, build, options):
    rooms = Rooms(servers, build)
    rows = []
    for each in chain(
        enumerations(rooms, options.rounds), starts(rooms), alerts(rooms), memory(rooms, options.requests)
    ):
        print(json.dumps(each), file=sys.stderr, flush=True)
        rows.append(each)
    rooms.end()
    print_table([shown(each) for each in rows])
    return rows
