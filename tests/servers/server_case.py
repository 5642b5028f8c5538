"""Base of the cases: a machine with a bare server that has been started once and is down."""

import unittest

from package import register
from server import Server


def long(test):
    """Marks a test that only the long form has time for."""
    test.long = True
    return test


class ServerCase(unittest.TestCase):
    maxDiff = None
    #: True for what the word size does not touch: the short form shows it on one server of each kind.
    once_a_kind = False

    def setUp(self):
        self.server = Server()
        self.server.prepare()
        self.addCleanup(self.server.kill)

    def take_up(self):
        """Makes a running server know what was registered: one that reads it at its start is started again."""
        if self.server.running() and self.server.kind == "sfcb":
            self.server.restart()

    def check(self, status=0):
        return register("check", status=status)
