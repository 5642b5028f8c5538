"""Requests of all kinds from several clients at once, and what the server holds meanwhile."""

import threading

import bench_requests
from client import INTEROP
from kept_connection import Kept_Connection, No_Answer, request
from memory_test import kinds_of_requests

CLIENTS = 4


class Client(threading.Thread):
    """Has a connection of its own, and begins at its own place in the round."""

    def __init__(self, port, kinds, count, number):
        super().__init__()
        self.connection = Kept_Connection(port)
        self.kinds, self.count, self.number = kinds, count, number
        self.failures = []

    def run(self):
        for turn in range(self.number, self.number + self.count):
            try:
                self.connection.ask(self.kinds[turn % len(self.kinds)])
            except (OSError, No_Answer) as failure:
                self.connection.close()
                self.failures.append(f"{turn % len(self.kinds)}: {failure}")
        self.connection.close()


def kinds_for(measured):
    system = bench_requests.paths_in(measured.answer(bench_requests.names("KALDERA_ComputerSystem")))[0]
    host = bench_requests.key_in(system, "Name")
    interop = "".join(f'<NAMESPACE NAME="{word}"/>' for word in INTEROP[measured.server.kind].split("/"))
    return [request(each.replace('<NAMESPACE NAME="interop"/>', interop)) for each in kinds_of_requests(host)]


def ask(measured, count):
    """Failures in words, and the server's memory afterwards."""
    kinds = kinds_for(measured)
    clients = [Client(measured.server.port, kinds, count // CLIENTS, number) for number in range(CLIENTS)]
    for client in clients:
        client.start()
    for client in clients:
        client.join()
    return {"memory": measured.memory(), "failures": [each for client in clients for each in client.failures]}
