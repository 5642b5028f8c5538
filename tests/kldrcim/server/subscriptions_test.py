"""What clients do with filters, listeners and subscriptions that exist: change them, while alerts come."""

import http.server
import json
import os
import queue
import re
import ssl
import tempfile
import threading
import time
import unittest

from certificates import Certificates
from serving import NAMESPACE, WITH_ALERTS, Served, error_code, intrinsic, message, parameter, request

ALERTS = "KALDERA_AlertIndication"
#: Seconds in which alerts arrive.
PATIENCE = 30
#: Seconds in which none arrives.
SILENCE = 1
KEYS = ("SystemCreationClassName", "SystemName", "CreationClassName", "Name")
ENABLED, DISABLED = 2, 4


class Listener(http.server.BaseHTTPRequestHandler):
    """Takes what comes."""

    def do_POST(self):
        body = self.rfile.read(int(self.headers["Content-Length"])).decode()
        self.server.arrived.put(dict(re.findall(r'<PROPERTY NAME="(\w+)"[^>]*><VALUE>([^<]*)<', body)))
        self.send_response(200)
        self.send_header("Content-Length", "0")
        self.end_headers()

    def log_message(self, *_):
        pass


def listen(case, tls=None):
    server = http.server.ThreadingHTTPServer(("127.0.0.1", 0), Listener)
    server.daemon_threads = True
    server.arrived = queue.Queue()
    server.url = f"{'https' if tls else 'http'}://127.0.0.1:{server.server_port}"
    if tls:
        server.socket = tls.wrap_socket(server.socket, server_side=True)
    thread = threading.Thread(target=server.serve_forever)
    thread.start()
    case.addCleanup(thread.join)
    case.addCleanup(server.server_close)
    case.addCleanup(server.shutdown)
    return server


def escaped(text):
    return str(text).replace("&", "&amp;").replace("<", "&lt;")


def instance(class_name, **properties):
    """Numbers are uint16, pairs of a class and keys are references."""
    text = ""
    for name, value in properties.items():
        if isinstance(value, tuple):
            text += f'<PROPERTY.REFERENCE NAME="{name}">{reference(value)}</PROPERTY.REFERENCE>'
        elif isinstance(value, list):
            elements = "".join(f"<VALUE>{escaped(each)}</VALUE>" for each in value)
            text += f'<PROPERTY.ARRAY NAME="{name}" TYPE="string"><VALUE.ARRAY>{elements}</VALUE.ARRAY></PROPERTY.ARRAY>'
        elif value is None:
            text += f'<PROPERTY NAME="{name}" TYPE="string"></PROPERTY>'
        else:
            kind = "uint16" if isinstance(value, int) else "string"
            text += f'<PROPERTY NAME="{name}" TYPE="{kind}"><VALUE>{escaped(value)}</VALUE></PROPERTY>'
    return f'<INSTANCE CLASSNAME="{class_name}">{text}</INSTANCE>'


def reference(path):
    return f"<VALUE.REFERENCE>{instance_name(path)}</VALUE.REFERENCE>"


def instance_name(path):
    class_name, keys = path
    text = ""
    for name, value in keys.items():
        value = reference(value) if isinstance(value, tuple) else f"<KEYVALUE>{escaped(value)}</KEYVALUE>"
        text += f'<KEYBINDING NAME="{name}">{value}</KEYBINDING>'
    return f'<INSTANCENAME CLASSNAME="{class_name}">{text}</INSTANCENAME>'


def filter_of(name):
    return ("CIM_IndicationFilter", dict(zip(KEYS, ("CIM_ComputerSystem", "host", "CIM_IndicationFilter", name))))


def listener_of(name):
    kind = "CIM_ListenerDestinationCIMXML"
    return (kind, dict(zip(KEYS, ("CIM_ComputerSystem", "host", kind, name))))


def subscription_of(name):
    return ("CIM_IndicationSubscription", {"Filter": filter_of(name), "Handler": listener_of(name)})


class Subscribing_Case(unittest.TestCase):
    def setUp(self):
        self.folder = tempfile.TemporaryDirectory()
        self.addCleanup(self.folder.cleanup)
        self.state = os.path.join(self.folder.name, "state")
        self.turn = 0

    def serve(self, *options):
        self.served = Served("--state", self.state, *options, **WITH_ALERTS)

    def tearDown(self):
        self.assertEqual(self.served.stop(), 0)

    def call(self, operation, parameters, space="interop"):
        status, _, body = self.served.post(intrinsic(operation, parameters, space))
        self.assertEqual(status, 200)
        return body

    def create(self, path, **more):
        body = self.call("CreateInstance", parameter("NewInstance", instance(path[0], **(path[1] | more))))
        self.assertEqual(error_code(body), 0, body)

    def modify(self, path, names=None, keys=None, **properties):
        """The status; as `wbemcli mi`, with the keys."""
        value = f"<VALUE.NAMEDINSTANCE>{instance_name(path)}{instance(path[0], **(path[1] | (keys or {}) | properties))}</VALUE.NAMEDINSTANCE>"
        listed = "" if names is None else parameter(
            "PropertyList", "<VALUE.ARRAY>" + "".join(f"<VALUE>{each}</VALUE>" for each in names) + "</VALUE.ARRAY>")
        body = self.call("ModifyInstance", parameter("ModifiedInstance", value) + listed)
        self.assertNotIn("IRETURNVALUE", body)
        return error_code(body)

    def value(self, path, name):
        body = self.call("GetInstance", parameter("InstanceName", instance_name(path)))
        return re.search(rf'NAME="{name}"[^>]*>(?:<VALUE>([^<]*)</VALUE>)?', body)[1]

    def subscribe(self, name, url, query=f"SELECT * FROM {ALERTS}", **more):
        self.create(filter_of(name), Query=query, QueryLanguage="WQL")
        self.create(listener_of(name), Destination=url)
        self.create(subscription_of(name), **more)

    def switch(self):
        """Takes a port out of service, or puts it back: two alerts."""
        self.turn += 1
        wwn = "10:00:02:4b:4c:10:00:00"
        change = {"portStatus": self.turn % 2 == 0}
        text = json.dumps({"method": "configuration.setPortByWwn", "params": [wwn, change, list(change)]})
        place = request("x", namespace=NAMESPACE).split("<LOCALNAMESPACEPATH>")[1].split("</LOCALNAMESPACEPATH>")[0]
        agent = instance_name(("KALDERA_AgentService", {"Name": "Kaldera Agent Service Provider"}))
        status, _, body = self.served.post(message(
            f'<SIMPLEREQ><METHODCALL NAME="executeMethod"><LOCALINSTANCEPATH><LOCALNAMESPACEPATH>{place}</LOCALNAMESPACEPATH>'
            f'{agent}</LOCALINSTANCEPATH><PARAMVALUE NAME="request"><VALUE>{escaped(text)}</VALUE></PARAMVALUE></METHODCALL></SIMPLEREQ>'))
        self.assertEqual((status, error_code(body)), (200, 0), body)

    def silent(self, listener):
        try:
            return listener.arrived.get(timeout=SILENCE) is None
        except queue.Empty:
            return True

    def take(self, listener, count):
        return [listener.arrived.get(timeout=PATIENCE) for _ in range(count)]


class Changes(Subscribing_Case):
    def setUp(self):
        super().setUp()
        self.serve()

    def test_a_listener_moves(self):
        old, new = listen(self), listen(self)
        self.subscribe("a", old.url)
        self.switch()
        self.take(old, 2)
        self.assertEqual(self.modify(listener_of("a"), Destination=new.url), 0)
        self.assertEqual(self.value(listener_of("a"), "Destination"), new.url)
        self.switch()
        self.assertEqual([each["SequenceNumber"] for each in self.take(new, 2)], ["0", "1"])
        self.assertTrue(self.silent(old))

    def test_a_query_changes(self):
        listener = listen(self)
        self.subscribe("a", listener.url)
        self.assertEqual(self.modify(filter_of("a"), ["Query"], Query="SELECT MessageID FROM CIM_AlertIndication"), 0)
        self.switch()
        for alert in self.take(listener, 2):
            self.assertEqual(set(alert), {"MessageID", "SequenceContext", "SequenceNumber"})
        self.assertEqual(self.modify(filter_of("a"), Query=f"SELECT * FROM {ALERTS} WHERE MessageID = 'none'"), 0)
        self.switch()
        self.assertTrue(self.silent(listener))

    def test_a_subscription_pauses(self):
        listener, other = listen(self), listen(self)
        self.subscribe("a", listener.url)
        self.subscribe("b", other.url, SubscriptionState=DISABLED)
        self.assertEqual(self.modify(subscription_of("a"), SubscriptionState=DISABLED), 0)
        self.switch()
        self.assertTrue(self.silent(listener) and self.silent(other))
        for name in "ab":
            self.assertEqual(self.modify(subscription_of(name), ["SubscriptionState"], SubscriptionState=ENABLED), 0)
        self.switch()
        self.take(listener, 2)
        self.take(other, 2)

    def test_what_is_refused_changes_nothing(self):
        listener = listen(self)
        self.subscribe("a", listener.url)
        query = self.value(filter_of("a"), "Query")
        for number, path, changes in (
            (15, filter_of("a"), {"Query": "SELECT"}),
            (15, filter_of("a"), {"Query": None}),
            (14, filter_of("a"), {"QueryLanguage": "SQL"}),
            (5, filter_of("a"), {"Query": "SELECT * FROM CIM_FCPort"}),
            (3, filter_of("a"), {"SourceNamespaces": ["root/other"]}),
            (12, filter_of("a"), {"Nothing": "x"}),
            (4, filter_of("a"), {"keys": {"Name": "b"}}),
            (4, listener_of("a"), {"Destination": "file:///etc/passwd"}),
            (4, subscription_of("a"), {"keys": {"Filter": filter_of("b")}}),
            (6, filter_of("b"), {"Query": query}),
            (12, filter_of("a"), {"names": ["Query", "Nothing"], "Query": "SELECT *"}),
        ):
            self.assertEqual(self.modify(path, **changes), number, (path, changes))
        self.assertEqual(self.value(filter_of("a"), "Query"), query)
        self.assertEqual(self.value(listener_of("a"), "Destination"), listener.url)
        self.switch()
        self.take(listener, 2)

    def test_what_is_not_listed_stays(self):
        self.subscribe("a", "http://127.0.0.1:1")
        self.assertEqual(self.modify(filter_of("a"), [], Query="SELECT"), 0)
        self.assertEqual(self.modify(filter_of("a"), ["querylanguage"], Query="SELECT", QueryLanguage="DMTF:CQL"), 0)
        self.assertEqual(self.value(filter_of("a"), "QueryLanguage"), "DMTF:CQL")
        self.assertNotEqual(self.value(filter_of("a"), "Query"), "SELECT")

    def test_set_property(self):
        listener = listen(self)
        self.subscribe("a", "http://127.0.0.1:1")
        new = parameter("PropertyName", "<VALUE>Destination</VALUE>") + parameter("NewValue", f"<VALUE>{listener.url}</VALUE>")
        body = self.call("SetProperty", parameter("InstanceName", instance_name(listener_of("a"))) + new)
        self.assertEqual(error_code(body), 0)
        self.switch()
        self.take(listener, 2)

    def test_what_has_changed_is_kept(self):
        listener, unheard = listen(self), listen(self)
        self.subscribe("a", unheard.url)
        self.subscribe("b", unheard.url, SubscriptionState=DISABLED)
        self.assertEqual(self.modify(listener_of("a"), Destination=listener.url), 0)
        self.assertEqual(self.served.stop(), 0)
        self.serve()
        self.switch()
        self.take(listener, 2)
        self.assertTrue(self.silent(unheard))
        self.assertEqual(self.value(subscription_of("b"), "SubscriptionState"), str(DISABLED))

    def test_references_from_elsewhere(self):
        """A client's paths have the host and the name space as it knows them."""
        listener = listen(self)
        self.create(filter_of("a"), Query=f"SELECT * FROM {ALERTS}", QueryLanguage="WQL")
        self.create(listener_of("a"), Destination=listener.url)
        spaces = '<LOCALNAMESPACEPATH><NAMESPACE NAME="root"/><NAMESPACE NAME="PG_InterOp"/></LOCALNAMESPACEPATH>'

        def far(name, path):
            return (
                f'<PROPERTY.REFERENCE NAME="{name}"><VALUE.REFERENCE><INSTANCEPATH><NAMESPACEPATH><HOST>elsewhere:5988</HOST>{spaces}'
                f"</NAMESPACEPATH>{instance_name(path)}</INSTANCEPATH></VALUE.REFERENCE></PROPERTY.REFERENCE>")

        ends = far("Filter", filter_of("a")) + far("Handler", listener_of("a"))
        body = self.call("CreateInstance", parameter("NewInstance", f'<INSTANCE CLASSNAME="CIM_IndicationSubscription">{ends}</INSTANCE>'))
        self.assertEqual(error_code(body), 0, body)
        self.switch()
        self.take(listener, 2)
        body = self.call("DeleteInstance", parameter("InstanceName", instance_name(subscription_of("a"))))
        self.assertEqual(error_code(body), 0, body)


class Listeners_With_Tls(Subscribing_Case):
    def setUp(self):
        super().setUp()
        self.made = Certificates(self.folder.name)

    def listen(self, name):
        tls = ssl.SSLContext(ssl.PROTOCOL_TLS_SERVER)
        tls.load_cert_chain(self.made.file(f"{name}.pem"), self.made.file("here.key" if name == "old" else f"{name}.key"))
        return listen(self, tls)

    def test_who_is_trusted(self):
        self.serve("--cacert", self.made.file("authority.pem"))
        listener = self.listen("here")
        self.subscribe("a", listener.url)
        self.switch()
        self.take(listener, 2)

    def test_who_is_not(self):
        self.serve("--cacert", self.made.file("authority.pem"))
        unknown = {name: self.listen(name) for name in ("elsewhere", "old", "stranger")}
        for name, listener in unknown.items():
            self.subscribe(name, listener.url)
        self.switch()
        said = self.wait_for_lines(len(unknown))
        for name, listener in unknown.items():
            self.assertTrue(listener.arrived.empty(), name)
            line = next(each for each in said if f"listener {listener.url}: " in each)
            self.assertIn(": its certificate is not to be trusted: ", line)
            self.assertIn("; --cacert FILE names who may have signed it", line)

    def test_by_the_system_nobody_is_trusted_whom_it_does_not_know(self):
        self.serve()
        listener = self.listen("here")
        self.subscribe("a", listener.url)
        self.switch()
        self.assertIn(": its certificate is not to be trusted: ", self.wait_for_lines(1)[0])
        self.assertTrue(listener.arrived.empty())

    def test_why_nobody_answers(self):
        self.serve()
        self.subscribe("a", "http://127.0.0.1:1")
        self.switch()
        self.assertRegex(self.wait_for_lines(1)[0], r"^kldrcim: listener http://127.0.0.1:1: .*[Cc]onnect")

    def wait_for_lines(self, count):
        end = time.monotonic() + PATIENCE
        while time.monotonic() < end:
            with open(self.served.errors.name, encoding="utf-8") as errors:
                lines = errors.read().splitlines()
            if len(lines) >= count:
                return lines
            time.sleep(0.05)
        self.fail(f"{count} lines awaited")


if __name__ == "__main__":
    unittest.main()
