"""Alerts that go from the module through a server to a listener: how long they take, and what they cost."""

import time

from client import Check
from measured_server import Measured_Server
from subscriptions_check import Alerts, Listener

#: Each change of a port's state is told twice.
ALERTS_OF_CHANGE = 2


def processor_time(measured: Measured_Server, work):
    before = measured.reading()
    work()
    return sum(measured.reading().since(before))


def measure_alerts(measured, count):
    """Seconds from the first change of a port's state until so many alerts have come, and nanoseconds of the processor that an alert
    takes of the server beyond the change itself."""
    check = Check(__doc__, ["--url", measured.server.url, "--server", measured.server.kind, "--kldrcim", "/usr/bin/kldrcim"])
    alerts, listener = Alerts(check), Listener()
    changes, taken = count // ALERTS_OF_CHANGE, []
    silent = processor_time(measured, lambda: alerts.switch(changes))
    with alerts.subscription(listener):
        begin = time.monotonic()

        def until_all_have_come():
            alerts.switch(changes)
            taken.extend(listener.take(count))

        told = processor_time(measured, until_all_have_come)
        seconds = time.monotonic() - begin
    listener.listener.stop()
    alerts.interop.close()
    check.connection.close()
    return {"arrived": len(taken), "seconds": seconds, "nanoseconds": (told - silent) / count}
