#!/usr/bin/env python3
"""Alerts: subscriptions that a client makes, and what a real listener then gets: every alert, in order, with the types of its
class; by the class, by its superclass, by a query with a condition; in two name spaces; and nothing after the end."""

import json
import queue
import socket
import sys
import threading
import time
from contextlib import contextmanager

from catalogue import Catalogue
from client import NAMESPACE, Check, pywbem
from comparison import plain

CLASS = "KALDERA_AlertIndication"
#: What a port tells that is taken out of service, and put back: the keys of both events.
DISABLED, ENABLED = "131080", "131079"
EVENTS = {DISABLED: "ZNT_PORT_DISABLE", ENABLED: "ZNT_PORT_ENABLE"}
#: What an alert has of its own, in lower case.
PASSING = {"eventtime", "indicationtime", "sequencenumber"}
#: Seconds of silence that mean that nothing comes any more; the module spaces alerts by 20 ms.
SILENCE = 1


def most_off(arrived, expected):
    """How many places the one stands off that stands most off; of equal ones the first is the first."""
    places = {}
    for at, each in enumerate(expected):
        places.setdefault(each, []).append(at)
    return max((abs(at - places[each].pop(0)) for at, each in enumerate(arrived) if places.get(each)), default=0)


class Listener:
    """The client library's listener on a port of its own."""

    def __init__(self):
        with socket.socket() as probe:
            probe.bind(("127.0.0.1", 0))
            self.port = probe.getsockname()[1]
        self.arrived = queue.Queue()
        self.listener = pywbem.WBEMListener("127.0.0.1", http_port=self.port)
        self.listener.add_callback(lambda indication, _: self.arrived.put(indication))
        self.listener.start()

    @property
    def url(self):
        return f"http://127.0.0.1:{self.port}"

    def take(self, count, seconds=60):
        """So many alerts, or fewer if no more come."""
        taken = []
        end = time.monotonic() + seconds
        while len(taken) < count and time.monotonic() < end:
            try:
                taken.append(self.arrived.get(timeout=min(seconds, 10)))
            except queue.Empty:
                break
        return taken

    def stays_silent(self):
        try:
            return self.arrived.get(timeout=SILENCE)
        except queue.Empty:
            return None


class Alerts:
    def __init__(self, check):
        self.check = check
        self.traits = check.traits
        self.cells = Catalogue().cells(CLASS)
        self.interop = check.connect(check.interop)
        self.manager = check.connection.EnumerateInstances("CIM_ObjectManager", namespace=check.interop)[0]
        self.service = check.connection.EnumerateInstanceNames("KALDERA_AgentService")[0]
        self.port = check.connection.EnumerateInstanceNames("KALDERA_FCPort")[0]["DeviceID"]
        self.count = 0

    def create(self, class_name, **properties):
        return self.interop.CreateInstance(pywbem.CIMInstance(class_name, properties))

    def named(self, class_name):
        """The keys of a filter or a destination."""
        self.count += 1
        return {
            "SystemCreationClassName": "CIM_ComputerSystem",
            "SystemName": self.manager["SystemName"],
            "CreationClassName": class_name,
            "Name": f"kaldera check {self.count}",
        }

    def delete(self, path):
        try:
            self.interop.DeleteInstance(path)
        except pywbem.CIMXMLParseError:
            # One server answers nothing with an empty list of something.
            self.check.expect_that(f"delete {path.classname}", self.traits.void_is_a_list, "an answer that cannot be read")

    @contextmanager
    def subscription(self, listener, query=f"SELECT * FROM {CLASS}", namespace=NAMESPACE):
        made = []
        try:
            made.append(
                self.create(
                    "CIM_IndicationFilter",
                    Query=query,
                    QueryLanguage="WQL",
                    SourceNamespace=namespace,
                    SourceNamespaces=[namespace],
                    **self.named("CIM_IndicationFilter"),
                )
            )
            made.append(
                self.create(
                    "CIM_ListenerDestinationCIMXML",
                    Destination=listener.url,
                    PersistenceType=pywbem.Uint16(3),
                    **self.named("CIM_ListenerDestinationCIMXML"),
                )
            )
            made.append(self.create("CIM_IndicationSubscription", Filter=made[0], Handler=made[1]))
            yield
        finally:
            for path in reversed(made):
                self.delete(path)

    def switch(self, times):
        """Takes a port out of service and puts it back, in turn; returns the identities of the alerts of that."""
        expected = []
        wwn = ":".join(self.port[each : each + 2] for each in range(0, len(self.port), 2))
        for turn in range(times):
            key = ENABLED if turn % 2 else DISABLED
            change = {"portStatus": bool(turn % 2)}
            request = {"method": "configuration.setPortByWwn", "params": [wwn, change, list(change)]}
            self.check.connection.InvokeMethod("executeMethod", self.service, request=json.dumps(request))
            expected += [f"KLDR{key}", f"PROPKLDR{key}"]
        return expected

    def in_order(self, alerts):
        """As the module has numbered them. Both alerts of an event have its time, and the standard one goes first."""
        if self.traits.numbers_alerts:
            return sorted(alerts, key=lambda each: (each["EventTime"].datetime, each["MessageID"]))
        return sorted(alerts, key=lambda each: each["SequenceNumber"])

    def compare(self, what, alerts, expected):
        arrived = [each.get("MessageID") for each in alerts]
        alerts = self.in_order(alerts)
        self.check.expect(f"{what}: alerts", [each.get("MessageID") for each in alerts], expected)
        places = most_off(arrived, expected)
        self.check.expect_that(f"{what}: order", places <= self.traits.alerts_overtake, f"{places} places off: {arrived}")
        numbers = sorted(each["SequenceNumber"] for each in alerts)
        self.check.expect(f"{what}: sequence", [int(each - numbers[0]) for each in numbers], list(range(len(alerts))))
        for alert in alerts[:20]:
            self.one(what, alert)

    def compare_properties(self, alerts, watched):
        """Each alert against what the command line gives of the same event; moments and numbers are those of another run."""
        for alert, other in zip(self.in_order(alerts), watched, strict=True):
            expected = {name.lower(): value for name, value in other["properties"].items()}
            found = {name.lower(): plain(cell.value) for name, cell in alert.properties.items()}
            for name in sorted(set(found) | set(expected)):
                what = f"{alert['MessageID']}: {name}"
                if name in PASSING:
                    self.check.expect_that(what, found.get(name) is not None, "null")
                elif name in self.traits.fills_in_alerts:
                    self.check.expect(what, expected.get(name), None)
                else:
                    self.check.expect(what, found.get(name), expected.get(name))

    def one(self, what, alert):
        for name, cell in alert.properties.items():
            wanted = self.cells.get(name.lower())
            if wanted is None:
                self.check.expect_that(f"{what}: {name} is not of the class", cell.value is None, cell.value)
            else:
                self.check.expect(f"{what}: {name}: type", (cell.type, bool(cell.is_array)), (wanted.type, wanted.array))
        self.check.expect(f"{what}: class", alert.classname, CLASS)
        self.check.expect(f"{what}: EventID", alert["EventID"], EVENTS[alert["MessageID"].rpartition("KLDR")[2]])
        for words in ("KALDERA_FCPort.", f'DeviceID="{self.port}"'):
            element = alert["AlertingManagedElement"]
            self.check.expect_that(f"{what}: AlertingManagedElement", words in element, element)


def check_order(alerts, listener, times):
    with alerts.subscription(listener):
        expected = alerts.switch(times)
        alerts.compare(f"{len(expected)} in a row", listener.take(len(expected)), expected)
        alerts.check.expect("one more", listener.stays_silent(), None)
    alerts.switch(2)
    alerts.check.expect("after the end", listener.stays_silent(), None)


def check_queries(alerts, listener):
    with alerts.subscription(listener, "SELECT * FROM CIM_AlertIndication"):
        expected = alerts.switch(2)
        # What came while nobody had subscribed is gone.
        alerts.compare("superclass", listener.take(len(expected)), expected)
    with alerts.subscription(listener, f"SELECT * FROM {CLASS} WHERE MessageID = \"KLDR{ENABLED}\""):
        alerts.switch(2)
        alerts.check.expect("condition", [each["MessageID"] for each in listener.take(1)], [f"KLDR{ENABLED}"])
        alerts.check.expect("condition", listener.stays_silent(), None)


def check_two_name_spaces(alerts, listener):
    """The module delivers once in each name space with a filter; whether a server has it in a second one is its own affair."""
    other, second = Listener(), alerts.check.interop
    with alerts.subscription(listener):
        if alerts.traits.alerts_in_interop:
            with alerts.subscription(other, namespace=second):
                expected = alerts.switch(2) * alerts.traits.alerts_in_interop
                for each in (listener, other):
                    # Those of one name space are in order, but not those of both.
                    found = [alert["MessageID"] for alert in each.take(len(expected))]
                    alerts.check.expect("two name spaces", sorted(found), sorted(expected))
                    alerts.check.expect("two name spaces: one more", each.stays_silent(), None)
        else:
            refused = alerts.subscription(other, namespace=second)
            alerts.check.refused(f"subscription in {second}", pywbem.CIM_ERR_NOT_FOUND, refused.__enter__)
    other.listener.stop()


def main():
    check = Check(__doc__)
    alerts, listener = Alerts(check), Listener()
    check_order(alerts, listener, 500 if check.long else 50)
    check_queries(alerts, listener)
    check_two_name_spaces(alerts, listener)
    listener.listener.stop()
    alerts.interop.close()
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
