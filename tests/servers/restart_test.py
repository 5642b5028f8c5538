"""A server that is started again: clients find all as it was."""

import importlib
import json
import os
import re
import subprocess
import time
from pathlib import Path

import package
from provider_process import holders
from server import PROCESSES, processes
from server_case import ServerCase, long

#: Each brings two alerts.
EVENTS = 20
SCRIPT = Path("/tmp/events.json")
#: In seconds, for a server to end that is busy; OpenPegasus needs some.
UNDER_LOAD = 5
#: In seconds, in which a parent hears of a child's end.
MOMENT = 5


class Restart(ServerCase):
    def setUp(self):
        super().setUp()
        package.install()
        package.register("install")
        self.server.start()
        # The client library is in the machine alone, so that nothing of it may be needed to find these cases.
        client = importlib.import_module("client")
        self.check = client.Check(
            __doc__, ["--url", self.server.url, "--server", self.server.kind, "--kldrcim", "/usr/bin/kldrcim"]
        )

    def assert_no_differences(self):
        self.assertGreater(self.check.compared, 0)
        self.assertEqual(self.check.differences, [])

    def zombies(self):
        """Of the server; but those that await their parent get a moment, and so do processes that begin between two looks."""
        names = PROCESSES[self.server.kind]
        end = time.monotonic() + MOMENT
        while (found := set(processes(names, zombies=True)) - set(processes(names))) and time.monotonic() < end:
            time.sleep(0.05)
        return sorted(found)

    def assert_gone(self):
        """Nothing of the server or of the module, which a process may also hold that nobody knows any more."""
        self.assertEqual(holders(), [])
        self.assertEqual(self.zombies(), [])
        self.assertEqual(processes(PROCESSES[self.server.kind]), [])

    def assert_one_process(self):
        """Of this server, and none but it."""
        found = holders()
        self.assertEqual(len(found), 1, found)
        self.assertIn(found[0], processes(PROCESSES[self.server.kind]))
        self.assertEqual(self.zombies(), [])
        return found[0]


class Subscriptions(Restart):
    """What happens after the restart, nobody has asked for: the adapter library tells of events by itself."""

    def write_script(self, events, port):
        """Ports that are taken out of service and put back, told to the server that is started next; returns the identities of
        the alerts."""
        keys = [sorted(events)[number % 2] for number in range(EVENTS)]
        lines = [
            {
                "eventCategory": int(key) >> 16,
                "eventId": int(key) & 0xFFFF,
                "eventSeverity": 3,
                "eventIdValue": events[key],
                "eventMsg": "told by the library",
                "portIndexString": port,
            }
            for key in keys
        ]
        SCRIPT.write_text(json.dumps([{"after": 20, "event": line} for line in lines]), encoding="utf-8")
        self.server.module_environment["KLDR_SIMULATOR_EVENTS"] = str(SCRIPT)
        return [f"{prefix}{key}" for key in keys for prefix in ("KLDR", "PROPKLDR")]

    def watched(self, count):
        """The same alerts, as the command line tells them of the same events."""
        environment = {**os.environ, **self.server.module_environment}
        command = ["/usr/bin/kldrcim", "--format", "json", "watch", "--count", str(count)]
        done = subprocess.run(command, env=environment, capture_output=True, text=True, check=True, timeout=60)
        return [json.loads(each) for each in re.split(r"(?m)(?<=^})$", done.stdout) if each.strip()]

    def survives(self, end):
        subscriptions = importlib.import_module("subscriptions_check")
        alerts, listener = subscriptions.Alerts(self.check), subscriptions.Listener()
        self.addCleanup(listener.listener.stop)
        with alerts.subscription(listener):
            before = alerts.switch(2)
            alerts.compare("before", listener.take(len(before)), before)
            # For a client that keeps its connection, sfcb waits 15 seconds.
            self.check.connection.close()
            alerts.interop.close()
            self.check.connection, alerts.interop = self.check.connect(), self.check.connect(self.check.interop)
            end()
            self.assert_gone()
            scripted = self.write_script(subscriptions.EVENTS, alerts.port)
            self.server.start()
            arrived = listener.take(len(scripted))
            alerts.compare("afterwards", arrived, scripted)
            alerts.compare_properties(arrived, self.watched(len(scripted)))
            self.check.expect("one more", listener.stays_silent(), None)
            asked = alerts.switch(2)
            alerts.compare("asked for", listener.take(len(asked)), asked)
        alerts.switch(2)
        self.check.expect("after the end", listener.stays_silent(), None)
        self.assert_no_differences()

    def test_a_stored_subscription_survives_a_restart(self):
        self.survives(self.server.stop)

    @long
    def test_a_stored_subscription_survives_the_death_of_the_server(self):
        self.survives(self.server.kill)


class Load(Restart):
    def test_clients_outlast_a_restart_under_load(self):
        clients = importlib.import_module("lasting_clients").Lasting_Clients(self.check)
        clients.wait_for_answers()
        first = self.assert_one_process()
        # sfcb's own processes that serve a request wait for ever for those that have ended before them.
        self.server.stop(UNDER_LOAD)
        self.assert_gone()
        self.server.start()
        clients.wait_for_answers()
        clients.end()
        self.assertNotEqual(self.assert_one_process(), first)
        self.assert_no_differences()
        self.check.connection.close()
        self.server.stop()
        self.assert_gone()
