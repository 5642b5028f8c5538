"""What pywbem does with a server: its walk of name spaces and profiles, pulled enumerations, classes as MOF, methods,
and subscriptions with its listener."""

import atexit
import json
import os
import queue
import shutil
import socket
import sys
import tarfile
import tempfile
import threading
import time
import unittest
import warnings
from pathlib import Path

from serving import NAMESPACE, Served, Serving_Case

ALERTS = "KALDERA_AlertIndication"
#: Seconds in which alerts arrive.
PATIENCE = 30


def import_pywbem():
    """The library, or why it cannot be had."""
    try:
        import pywbem

        return pywbem, ""
    except ImportError:
        pass
    archive = Path(os.environ.get("KLDR_CLIENTS", "")) / "pywbem.tar.gz"
    if not archive.is_file():
        return None, "pywbem is not installed, and KLDR_CLIENTS names no folder with pywbem.tar.gz"
    folder = tempfile.mkdtemp()
    atexit.register(shutil.rmtree, folder, True)
    with tarfile.open(archive) as content:
        content.extractall(folder)
    sys.path[:0] = [str(path) for path in Path(folder).iterdir()]
    try:
        import pywbem
    except ImportError as error:
        return None, str(error)
    return pywbem, ""


warnings.simplefilter("ignore")
pywbem, REASON = import_pywbem()
needs_pywbem = unittest.skipIf(pywbem is None, REASON)


class Listener:
    """pywbem's, on a port of its own."""

    def __init__(self):
        with socket.socket() as probe:
            probe.bind(("127.0.0.1", 0))
            self.port = probe.getsockname()[1]
        self.arrived = queue.Queue()
        self.url = f"http://127.0.0.1:{self.port}"
        self.listener = pywbem.WBEMListener("127.0.0.1", http_port=self.port)
        self.listener.add_callback(lambda indication, _: self.arrived.put(indication))

    def __enter__(self):
        self.listener.start()
        return self

    def __exit__(self, *_):
        self.listener.stop()

    def take(self, count):
        return [self.arrived.get(timeout=PATIENCE) for _ in range(count)]

    def stays_silent(self):
        try:
            return self.arrived.get(timeout=1) is None
        except queue.Empty:
            return True


class Client:
    """A connection, and what makes alerts."""

    def __init__(self, served):
        self.connection = pywbem.WBEMConnection(served.url, default_namespace=NAMESPACE)
        self.interop = pywbem.WBEMConnection(served.url, default_namespace="interop")

    def create(self, class_name, **properties):
        return self.interop.CreateInstance(pywbem.CIMInstance(class_name, properties))

    def subscribe(self, url, query=f"SELECT * FROM {ALERTS}", language="WQL", persistence=2, name="test"):
        condition = self.create("CIM_IndicationFilter", Name=name, Query=query, QueryLanguage=language)
        listener = self.create(
            "CIM_ListenerDestinationCIMXML",
            Name=name,
            Destination=url,
            PersistenceType=pywbem.Uint16(persistence),
        )
        return condition, listener, self.create("CIM_IndicationSubscription", Filter=condition, Handler=listener)

    def switch(self, times):
        """Takes a port out of service, and puts it back: two alerts each time."""
        service = self.connection.EnumerateInstanceNames("KALDERA_AgentService")[0]
        port = self.connection.EnumerateInstanceNames("KALDERA_FCPort")[0]["DeviceID"]
        wwn = ":".join(port[each : each + 2] for each in range(0, len(port), 2))
        for turn in range(times):
            change = {"portStatus": bool(turn % 2)}
            request = {"method": "configuration.setPortByWwn", "params": [wwn, change, list(change)]}
            self.connection.InvokeMethod("executeMethod", service, request=json.dumps(request))


@needs_pywbem
class Model(Serving_Case):
    def setUp(self):
        self.client = Client(self.served)
        self.connection = self.client.connection

    def failed(self, code, function, *arguments, **more):
        with self.assertRaises(pywbem.CIMError) as caught:
            function(*arguments, **more)
        self.assertEqual(caught.exception.status_code, code, caught.exception)

    def test_server(self):
        server = pywbem.WBEMServer(self.connection)
        self.assertEqual((server.interop_ns, server.brand), ("interop", "kldrcim"))
        self.assertEqual(set(server.namespaces), {"interop", "root/interop", NAMESPACE})
        self.assertEqual(len(server.profiles), 15)
        self.assertEqual(len(self.connection.EnumerateInstances("CIM_ObjectManager", "root/interop")), 1)

    def test_central_instances(self):
        server = pywbem.WBEMServer(self.connection)
        for name in ("FC HBA", "Storage HBA", "Host Discovered Resources"):
            (profile,) = server.get_selected_profiles("SNIA", name)
            (path,) = server.get_central_instances(profile.path)
            self.assertEqual((path.classname, path.namespace), ("KALDERA_ComputerSystem", NAMESPACE))
            self.assertEqual(self.connection.GetInstance(path)["Name"], path["Name"])
        (standard,) = server.get_selected_profiles("SNIA", "SMI-S")
        for path in server.get_central_instances(standard.path):
            self.assertEqual(path.namespace, "interop")
            self.connection.GetInstance(path)
        (link,) = self.connection.ReferenceNames(profile.path, ResultClass="CIM_ElementConformsToProfile", Role="ConformantStandard")
        self.assertEqual(link.namespace, "interop")
        self.assertEqual(self.connection.GetInstance(link)["ManagedElement"].namespace, NAMESPACE)

    def test_superclass_and_inheritance(self):
        deep = self.connection.EnumerateInstances("CIM_ManagedElement")
        flat = self.connection.EnumerateInstances("CIM_ManagedElement", DeepInheritance=False)
        self.assertEqual(len(deep), len(flat))
        allowed = {name.lower() for name in self.connection.GetClass("CIM_ManagedElement").properties}
        for each in flat:
            self.assertLessEqual({name.lower() for name in each.properties}, allowed)
        self.assertTrue(any("DeviceID" in each for each in deep))

    def test_property_lists(self):
        path = self.connection.EnumerateInstanceNames("KALDERA_FCPort")[0]
        get = self.connection.GetInstance
        self.assertEqual(list(get(path, PropertyList=["speed", "NOTHING", "Speed"])), ["Speed"])
        self.assertEqual(len(get(path, PropertyList=[])), 0)
        self.assertGreater(len(get(path)), 10)
        origins = get(path, IncludeClassOrigin=True).properties
        self.assertEqual(origins["Speed"].class_origin, "CIM_LogicalPort")

    def test_pulled(self):
        plain = self.connection.EnumerateInstances("CIM_ManagedElement")
        pulling = pywbem.WBEMConnection(self.served.url, default_namespace=NAMESPACE, use_pull_operations=True)
        pulled = list(pulling.IterEnumerateInstances("CIM_ManagedElement", MaxObjectCount=7))
        self.assertEqual([each.path.keybindings for each in plain], [each.path.keybindings for each in pulled])
        host = self.connection.EnumerateInstanceNames("KALDERA_ComputerSystem")[0]
        for plain_call, iterated in (
            ("EnumerateInstanceNames", "IterEnumerateInstancePaths"),
            ("Associators", "IterAssociatorInstances"),
            ("AssociatorNames", "IterAssociatorInstancePaths"),
            ("References", "IterReferenceInstances"),
            ("ReferenceNames", "IterReferenceInstancePaths"),
        ):
            start = "CIM_FCPort" if "Enumerate" in plain_call else host
            found = list(getattr(pulling, iterated)(start, MaxObjectCount=3))
            self.assertEqual(len(found), len(getattr(self.connection, plain_call)(start)), iterated)

    def test_contexts(self):
        opened = self.connection.OpenEnumerateInstancePaths("CIM_ManagedElement", MaxObjectCount=0)
        self.assertEqual((opened.paths, opened.eos), ([], False))
        # Those of other forms and name spaces leave it as it is.
        self.failed(21, self.connection.PullInstancesWithPath, opened.context, 1)
        self.failed(21, self.connection.PullInstancePaths, (opened.context[0], "interop"), 1)
        self.assertEqual(len(self.connection.PullInstancePaths(opened.context, 2).paths), 2)
        self.connection.CloseEnumeration(opened.context)
        self.failed(21, self.connection.PullInstancePaths, opened.context, 1)
        self.failed(21, self.connection.CloseEnumeration, opened.context)
        short = self.connection.OpenEnumerateInstances("CIM_ManagedElement", OperationTimeout=1, MaxObjectCount=1)
        time.sleep(1.5)
        self.failed(21, self.connection.PullInstancesWithPath, short.context, 1)
        many = [self.connection.OpenEnumerateInstances("CIM_ManagedElement") for _ in range(20)]
        self.failed(27, self.connection.OpenEnumerateInstances, "CIM_ManagedElement")
        for each in many:
            self.connection.CloseEnumeration(each.context)
        for timeout in (0, 91):
            self.failed(22, self.connection.OpenEnumerateInstances, "CIM_FCPort", OperationTimeout=timeout)
        self.failed(25, self.connection.OpenEnumerateInstances, "CIM_FCPort", FilterQueryLanguage="DMTF:FQL", FilterQuery="a=1")
        self.failed(26, self.connection.OpenEnumerateInstances, "CIM_FCPort", ContinueOnError=True)

    def test_queries(self):
        ports = self.connection.EnumerateInstances("KALDERA_FCPort")
        one = ports[0]
        query = f"SELECT * FROM CIM_FCPort WHERE DeviceID = '{one['DeviceID']}'"
        (found,) = self.connection.ExecQuery("WQL", query)
        self.assertEqual((found.path.keybindings, found.properties), (one.path.keybindings, one.properties))
        condition = "SELECT DeviceID, Speed FROM CIM_FCPort WHERE Speed > 0 AND NOT DeviceID IS NULL"
        found = self.connection.ExecQuery("DMTF:CQL", condition)
        self.assertEqual([each["DeviceID"] for each in found], [each["DeviceID"] for each in ports if each["Speed"]])
        self.assertEqual({name for each in found for name in each.keys()}, {"DeviceID", "Speed"})
        self.assertEqual(self.connection.ExecQuery("WQL", "SELECT * FROM KALDERA_FCPort WHERE DeviceID = 'x'"), [])
        profiles = self.client.interop.ExecQuery("WQL", "SELECT * FROM CIM_RegisteredProfile WHERE RegisteredName = 'SMI-S'")
        self.assertEqual([each["RegisteredName"] for each in profiles], ["SMI-S"])

    def test_pulled_queries(self):
        ports = self.connection.EnumerateInstances("KALDERA_FCPort")
        query = "SELECT DeviceID, Speed FROM CIM_FCPort"
        opened = self.connection.OpenQueryInstances("DMTF:CQL", query, ReturnQueryResultClass=True, MaxObjectCount=1)
        self.assertEqual((len(opened.instances), opened.eos), (1, False))
        self.assertEqual(set(opened.query_result_class.properties), {"DeviceID", "Speed"})
        self.assertEqual(len(opened.query_result_class.methods), 0)
        self.failed(21, self.connection.PullInstancesWithPath, opened.context, 1)
        rest = self.connection.PullInstances(opened.context, 1000)
        self.assertTrue(rest.eos)
        found = [each["DeviceID"] for each in opened.instances + rest.instances]
        self.assertEqual(found, [each["DeviceID"] for each in ports])
        every = self.connection.IterQueryInstances("WQL", query, MaxObjectCount=2)
        self.assertEqual([each["DeviceID"] for each in every.generator], found)

    def test_refused_queries(self):
        for ask in (self.connection.ExecQuery, self.connection.OpenQueryInstances):
            self.failed(14, ask, "SQL", "SELECT * FROM CIM_FCPort")
            self.failed(15, ask, "WQL", "SELECT FROM CIM_FCPort")
            self.failed(15, ask, "WQL", "SELECT * FROM CIM_FCPort, CIM_System")
            self.failed(15, ask, "WQL", "SELECT * FROM CIM_FCPort WHERE Speed")
            self.failed(15, ask, "WQL", "SELECT * FROM CIM_FCPort WHERE Nothing = 1")
            self.failed(15, ask, "WQL", "SELECT Nothing FROM CIM_FCPort")
            self.failed(15, ask, "WQL", "SELECT COUNT(*) FROM CIM_FCPort")
            self.failed(5, ask, "WQL", "SELECT * FROM CIM_Nothing")
            self.failed(3, ask, "WQL", "SELECT * FROM CIM_FCPort", namespace="root/nothing")

    def test_classes_as_mof(self):
        classes = self.connection.EnumerateClasses(DeepInheritance=True, LocalOnly=False)
        self.assertEqual(len(classes), 178)
        for each in classes:
            self.assertIn(f"class {each.classname}", each.tomof())
        roots = self.connection.EnumerateClassNames()
        self.assertIn("CIM_ManagedElement", roots)
        self.assertNotIn("CIM_FCPort", roots)
        own = self.connection.GetClass("CIM_FCPort", LocalOnly=True).properties
        self.assertNotIn("ElementName", own)
        self.assertTrue(self.connection.GetClass("CIM_System", LocalOnly=False).properties["Name"].qualifiers["Key"].value)
        names = {each.name for each in self.connection.EnumerateQualifiers()}
        self.assertLessEqual({"Key", "Association", "Indication", "In", "Out", "Values", "ValueMap"}, names)
        self.assertEqual(self.connection.GetQualifier("key").name, "Key")
        self.failed(6, self.connection.GetQualifier, "Nothing")

    def test_method(self):
        service = self.connection.EnumerateInstanceNames("KALDERA_AgentService")[0]
        invoke = self.connection.InvokeMethod
        value, out = invoke("executeMethod", service, request='{"method":"<&>\\u00e4","params":[]}')
        self.assertEqual((int(value), list(out)), (0, ["response"]))
        self.assertIn("error", json.loads(out["response"]))
        value, out = invoke("EXECUTEmethod", service, REQUEST="x" * (1 << 20))
        self.assertEqual((int(value), list(out)), (0, ["response"]))
        self.failed(17, invoke, "nothing", service)
        self.failed(4, invoke, "executeMethod", service, other="x")
        self.failed(5, invoke, "nothing", "CIM_Nothing")

    def test_refusals(self):
        self.failed(5, self.connection.EnumerateInstances, "CIM_Nothing")
        self.failed(3, self.connection.EnumerateInstances, "CIM_FCPort", namespace="root/nothing")
        path = self.connection.EnumerateInstanceNames("KALDERA_FCPort")[0]
        self.failed(4, self.connection.Associators, path, AssocClass="CIM_Nothing")
        self.failed(7, self.connection.DeleteClass, "CIM_FCPort")
        self.failed(7, self.connection.DeleteInstance, path)
        manager = self.client.interop.EnumerateInstanceNames("CIM_ObjectManager")[0]
        self.failed(7, self.client.interop.DeleteInstance, manager)


@needs_pywbem
class Indications(unittest.TestCase):
    def setUp(self):
        self.folder = tempfile.TemporaryDirectory()
        self.state = os.path.join(self.folder.name, "state")
        self.start()

    def start(self):
        self.served = Served("--state", self.state)
        self.client = Client(self.served)

    def tearDown(self):
        self.assertEqual(self.served.stop(), 0)
        self.folder.cleanup()

    def failed(self, code, function, *arguments, **more):
        with self.assertRaises(pywbem.CIMError) as caught:
            function(*arguments, **more)
        self.assertEqual(caught.exception.status_code, code, caught.exception)

    def count(self, class_name):
        return len(self.client.interop.EnumerateInstanceNames(class_name))

    def test_subscription_manager(self):
        with Listener() as listener:
            manager = pywbem.WBEMSubscriptionManager("test")
            server = manager.add_server(pywbem.WBEMServer(self.client.connection))
            destination = manager.add_destination(server, listener.url, owned=True, destination_id="d")
            condition = manager.add_filter(
                server, NAMESPACE, f"SELECT * FROM {ALERTS}", query_language="DMTF:CQL", owned=True, filter_id="f"
            )
            manager.add_subscriptions(server, condition.path, destination.path)
            self.client.switch(2)
            alerts = listener.take(4)
            self.assertEqual({each.classname for each in alerts}, {ALERTS})
            self.assertEqual([int(each["SequenceNumber"]) for each in alerts], [0, 1, 2, 3])
            self.assertEqual(len({each["SequenceContext"] for each in alerts}), 1)
            manager.remove_all_servers()
            self.client.switch(1)
            self.assertTrue(listener.stays_silent())
        for name in ("CIM_IndicationFilter", "CIM_ListenerDestination", "CIM_IndicationSubscription"):
            self.assertEqual(self.count(name), 0)

    def test_queries_select(self):
        def query(condition, url, name):
            self.client.subscribe(url, f"SELECT MessageID FROM CIM_AlertIndication WHERE {condition}", name=name)

        with Listener() as some, Listener() as none:
            query("MessageID LIKE 'KLDR%' AND NOT (AlertType = 99 OR OwningEntity IS NULL)", some.url, "some")
            query("MessageID = 'KLDR'", none.url, "none")
            self.client.switch(1)
            (alert,) = some.take(1)
            self.assertTrue(alert["MessageID"].startswith("KLDR"))
            self.assertEqual(set(alert.keys()), {"MessageID", "SequenceContext", "SequenceNumber"})
            self.assertTrue(none.stays_silent())

    def test_refusals(self):
        create = self.client.create
        name = {"Name": "x"}
        self.failed(15, create, "CIM_IndicationFilter", Query="SELECT", QueryLanguage="WQL", **name)
        self.failed(14, create, "CIM_IndicationFilter", Query="SELECT * FROM CIM_Indication", QueryLanguage="SQL", **name)
        self.failed(5, create, "CIM_IndicationFilter", Query="SELECT * FROM CIM_FCPort", QueryLanguage="WQL", **name)
        query = f"SELECT * FROM {ALERTS}"
        self.failed(
            3, create, "CIM_IndicationFilter", Query=query, QueryLanguage="WQL", SourceNamespaces=["root/other"], **name
        )
        self.failed(4, create, "CIM_ListenerDestinationCIMXML", Destination="file:///etc/passwd", **name)
        paths = self.client.subscribe("http://127.0.0.1:1")
        self.failed(11, self.client.subscribe, "http://127.0.0.1:1")
        self.failed(1, self.client.interop.DeleteInstance, paths[0])
        self.failed(1, self.client.interop.DeleteInstance, paths[1])
        nothing = paths[1].copy()
        nothing["Name"] = "nothing"
        self.failed(4, create, "CIM_IndicationSubscription", Filter=paths[0], Handler=nothing)
        self.failed(6, self.client.interop.DeleteInstance, nothing)
        for path in reversed(paths):
            self.client.interop.DeleteInstance(path)

    def test_missing_keys_are_filled_in(self):
        path = self.client.create("CIM_IndicationFilter", Query=f"SELECT * FROM {ALERTS}", QueryLanguage="WQL")
        self.assertEqual(len(path.keybindings), 4)
        self.assertEqual(path["CreationClassName"], "CIM_IndicationFilter")
        manager = self.client.interop.EnumerateInstances("CIM_ObjectManager")[0]
        self.assertEqual(path["SystemName"], manager["SystemName"])
        self.assertEqual(self.client.interop.GetInstance(path)["QueryLanguage"], "WQL")

    def test_associations(self):
        paths = self.client.subscribe("http://127.0.0.1:1")
        found = self.client.interop.AssociatorNames(paths[0])
        self.assertEqual([each["Name"] for each in found], [paths[1]["Name"]])
        (link,) = self.client.interop.References(paths[1], Role="Handler")
        self.assertEqual(link["Filter"]["Name"], paths[0]["Name"])
        self.assertEqual(self.client.interop.ReferenceNames(paths[1], Role="Filter"), [])

    def test_restart(self):
        with Listener() as listener:
            self.client.subscribe(listener.url)
            self.client.subscribe("http://127.0.0.1:1", persistence=3, name="transient")
            self.client.switch(1)
            before = listener.take(2)[-1]["SequenceContext"]
            self.assertEqual(self.served.stop(), 0)
            self.assertEqual(os.stat(self.state).st_mode & 0o777, 0o600)
            self.start()
            self.assertEqual(self.count("CIM_IndicationSubscription"), 1)
            self.assertEqual(self.count("CIM_ListenerDestination"), 1)
            self.client.switch(1)
            (alert,) = listener.take(1)
            self.assertNotEqual(alert["SequenceContext"], before)
            self.assertEqual(alert["SequenceNumber"], 0)

    def test_listeners_that_do_not_answer(self):
        # One that nobody hears, one that takes connections and says nothing, and one that works.
        with socket.socket() as silent, Listener() as listener:
            silent.bind(("127.0.0.1", 0))
            silent.listen()
            self.client.subscribe("http://127.0.0.1:1", name="dead")
            self.client.subscribe(f"http://127.0.0.1:{silent.getsockname()[1]}/", name="silent")
            self.client.subscribe(listener.url, name="good")
            begin = time.monotonic()
            self.client.switch(4)
            self.assertEqual(len(listener.take(8)), 8)
            self.assertLess(time.monotonic() - begin, 8)
            begin = time.monotonic()
            self.assertEqual(self.served.stop(), 0)
            self.assertLess(time.monotonic() - begin, 5)
            self.start()

    def test_listener_that_comes_back(self):
        listener = Listener()
        self.client.subscribe(listener.url)
        self.client.switch(2)
        time.sleep(0.5)
        with listener:
            alerts = listener.take(4)
        self.assertEqual([int(each["SequenceNumber"]) for each in alerts], [0, 1, 2, 3])

    def test_refusing_listener_is_not_asked_again(self):
        requests = []

        def answer(server):
            for _ in range(2):
                connection, _ = server.accept()
                with connection:
                    requests.append(connection.recv(65536))
                    connection.sendall(b"HTTP/1.1 400 Bad Request\r\nContent-Length: 0\r\nConnection: close\r\n\r\n")

        with socket.socket() as server:
            server.bind(("127.0.0.1", 0))
            server.listen()
            thread = threading.Thread(target=answer, args=(server,))
            thread.start()
            self.client.subscribe(f"http://127.0.0.1:{server.getsockname()[1]}/path")
            self.client.switch(1)
            thread.join(PATIENCE)
        first, second = requests
        self.assertTrue(first.startswith(b"POST /path HTTP/1.1\r\n"))
        for field in (b"CIMExport: MethodRequest", b"CIMExportMethod: ExportIndication", b"Content-Length: "):
            self.assertIn(field, first)
        self.assertNotIn(b"Expect:", first)
        self.assertIn(b'MESSAGE ID="0"', first)
        self.assertIn(b'MESSAGE ID="1"', second)


if __name__ == "__main__":
    unittest.main()
