"""Clients that go on asking while a server is away, as management software does."""

import threading
import time

from client import pywbem

CLIENTS = 8
CLASSES = ("KALDERA_FCPort", "KALDERA_FCPortStatistics", "KALDERA_PortController", "KALDERA_StorageExtent")
#: In a row and without a failure, from each client.
ANSWERS = 12
#: In seconds.
PATIENCE = 60


class Client(threading.Thread):
    """Has a connection of its own, and keeps it through failures."""

    def __init__(self, check, expected, number):
        super().__init__(daemon=True)
        self.connection = check.connect()
        self.expected = expected
        self.number = number
        self.is_over = False
        self.is_counted_anew = False
        #: Since it was last counted anew, or since the last failure.
        self.answers = 0
        self.failure = None

    def run(self):
        while not self.is_over:
            if self.is_counted_anew:
                self.answers, self.is_counted_anew = 0, False
            self.number += 1
            name = CLASSES[self.number % len(CLASSES)]
            try:
                self.take(name, len(self.connection.EnumerateInstances(name)))
            except pywbem.Error as error:
                self.take(name, " ".join(str(error).split()))
                time.sleep(0.1)
        self.connection.close()

    def take(self, name, found):
        if found == self.expected[name]:
            self.answers += 1
        else:
            self.answers, self.failure = 0, f"{name}: {found} instead of {self.expected[name]}"


class Lasting_Clients:
    """All ask from the beginning."""

    def __init__(self, check):
        self.check = check
        expected = {name: len(check.connection.EnumerateInstances(name)) for name in CLASSES}
        check.expect_that("instances", all(expected.values()), expected)
        self.clients = [Client(check, expected, number) for number in range(CLIENTS)]
        for client in self.clients:
            client.start()

    def wait_for_answers(self):
        """Each client must be answered from now on, again and again."""
        for client in self.clients:
            client.is_counted_anew = True
        end = time.monotonic() + PATIENCE
        for client in self.clients:
            while (client.is_counted_anew or client.answers < ANSWERS) and time.monotonic() < end:
                time.sleep(0.05)
            done = not client.is_counted_anew and client.answers >= ANSWERS
            self.check.expect_that("answers to a client", done, client.answers, client.failure)

    def end(self):
        for client in self.clients:
            client.is_over = True
        for client in self.clients:
            client.join(PATIENCE)
            self.check.expect("a client still waits", client.is_alive(), False)
