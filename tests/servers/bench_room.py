"""The inside of a machine whose server is measured: does what comes line by line on standard input, as JSON, and writes what came
of it to standard output."""

import json
import os
import re
import sys
from pathlib import Path

import bench_requests
import mixed_requests
from alert_measure import measure_alerts
from measured_server import Measured_Server, write_inventory
from server import INVENTORY


class Room:
    def __init__(self):
        self.measured = Measured_Server()
        if self.measured.server.room["plain"]:
            self.measured.take_plain_providers()
        if self.measured.server.room["log"]:
            Path("/root/.cimplerc").write_text(self.measured.server.room["log"], encoding="utf-8")

    def start(self, host, first):
        """`host` are words for make_inventory.py; without them it is the demo host. Seconds until the first answer."""
        return self.measured.start(write_inventory(host) if host else INVENTORY, first)

    def questions(self):
        return [[each.title, each.message, each.count] for each in bench_requests.questions(self.measured.answer)]

    def answer(self, message):
        return self.measured.answer(message)

    def count(self, message):
        """How many instances an answer has, of those that are too long to be told."""
        self.measured.answer(message)
        return len(re.findall(rb"<INSTANCE ", self.measured.connection.buffer[: self.measured.connection.size]))

    def measure(self, message, times):
        return self.measured.measure(message, times)

    def alerts(self, count):
        return measure_alerts(self.measured, count)

    def mix(self, count):
        return mixed_requests.ask(self.measured, count)

    def stop(self):
        self.measured.stop()


def main():
    said = os.fdopen(os.dup(sys.stdout.fileno()), "w", encoding="utf-8")
    # What tools say while they work is no part of it.
    os.dup2(sys.stderr.fileno(), sys.stdout.fileno())
    room = Room()
    print(json.dumps("ready"), file=said, flush=True)
    for line in sys.stdin:
        order = json.loads(line)
        result = getattr(room, order["do"])(*order["with"])
        print(json.dumps(result), file=said, flush=True)
    room.stop()


if __name__ == "__main__":
    main()
