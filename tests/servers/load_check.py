#!/usr/bin/env python3
"""Eight clients at once, each asking for other things in turn: every answer is there and as long as the first was, and
afterwards the module's process is the same and holds no more. Ten seconds, or two minutes in the long form."""

import itertools
import sys
import threading
import time
from dataclasses import dataclass, field

from client import Check, pywbem
from provider_process import Provider_Process

CLIENTS = 8
QUICK, LONG = 10, 120
#: In seconds, after which the server has the threads that it wants.
WARM_UP = 3
#: In MB; the servers' own memory flattens after tens of thousands of requests.
GROWTH = 60


@dataclass
class Tally:
    requests: int = 0
    failures: list = field(default_factory=list)


class Client(threading.Thread):
    """Has a connection of its own, and begins at its own place in the round."""

    def __init__(self, check, expected, number, end):
        super().__init__()
        self.connection = check.connect()
        self.expected = expected
        self.number = number
        self.end = end
        self.tally = Tally()

    def run(self):
        names = sorted(self.expected)
        for what in itertools.islice(itertools.cycle(names), self.number * 3, None):
            if time.monotonic() > self.end:
                break
            self.tally.requests += 1
            try:
                count = request(self.connection, what)
                if count != self.expected[what]:
                    self.tally.failures.append(f"{what}: {count} instead of {self.expected[what]}")
            except pywbem.Error as error:
                self.tally.failures.append(f"{what}: {' '.join(str(error).split())}")
        self.connection.close()


def request(connection, what):
    """Size of the answer."""
    operation, name = what
    if operation == "AssociatorNames":
        return len(connection.AssociatorNames(connection.EnumerateInstanceNames(name)[0]))
    if operation == "InvokeMethod":
        service = connection.EnumerateInstanceNames(name)[0]
        text = '{"method": "discovery.getAllHbasByHost"}'
        return len(connection.InvokeMethod("executeMethod", service, request=text)[1]["response"])
    return len(getattr(connection, operation)(name))


def asked():
    yield "InvokeMethod", "KALDERA_AgentService"
    for name in ("KALDERA_FCPort", "KALDERA_PortController", "KALDERA_EthernetPort"):
        yield "AssociatorNames", name
    for name in (
        "CIM_ManagedSystemElement",
        "KALDERA_FCPort",
        "KALDERA_FCPortStatistics",
        "KALDERA_ObjectManager",
        "KALDERA_PhysicalConnector",
        "KALDERA_RegisteredProfile",
        "KALDERA_SCSIProtocolEndpoint",
        "KALDERA_SCSIInitiatorTargetLogicalUnitPath",
        "KALDERA_StorageExtent",
    ):
        yield "EnumerateInstances", name
        yield "EnumerateInstanceNames", name


def load(check, expected, seconds):
    """The fewest requests of a client."""
    end = time.monotonic() + seconds
    clients = [Client(check, expected, number, end) for number in range(CLIENTS)]
    for client in clients:
        client.start()
    for client in clients:
        client.join()
        check.compared += client.tally.requests
        check.differences += client.tally.failures
    return min(client.tally.requests for client in clients)


def main():
    check = Check(__doc__)
    process = Provider_Process(check)
    expected = {what: request(check.connection, what) for what in asked()}
    load(check, expected, WARM_UP)
    before = process.figures()
    fewest = load(check, expected, LONG if check.long else QUICK)
    check.expect_that("requests of each client", fewest > 1, fewest)
    if process.is_the_same("afterwards"):
        process.has_not_grown(before, GROWTH)
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
