"""OpenPegasus gives an idle module up, and clients find all as it was; to sfcb the registration forbids it."""

import importlib
import time

from provider_process import holders
from restart_test import Restart
from server_case import long

#: In seconds. OpenPegasus looks for idle providers now and then only: seven to twelve minutes were seen.
IDLE = 900


class Idle(Restart):
    def answers(self):
        connection = self.check.connection
        return [
            [each.tomof() for each in connection.EnumerateInstances(name)] for name in ("KALDERA_PortController", "KALDERA_FCPort")
        ]

    @long
    def test_a_module_that_was_idle_is_unloaded_and_loaded_again(self):
        before = self.answers()
        self.assert_one_process()
        end = time.monotonic() + IDLE
        while holders() and time.monotonic() < end:
            time.sleep(5)
        self.assertEqual(holders(), [])
        self.assertEqual(self.answers(), before)
        self.assert_one_process()

    @long
    def test_a_subscription_keeps_the_module(self):
        subscriptions = importlib.import_module("subscriptions_check")
        alerts, listener = subscriptions.Alerts(self.check), subscriptions.Listener()
        self.addCleanup(listener.listener.stop)
        with alerts.subscription(listener):
            process = self.assert_one_process()
            time.sleep(IDLE)
            self.assertEqual(self.assert_one_process(), process)
            asked = alerts.switch(2)
            alerts.compare("after a long silence", listener.take(len(asked)), asked)
        self.assert_no_differences()
