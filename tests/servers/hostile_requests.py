"""Requests that no honest client makes: a name and what is sent, for every kind."""

import json

from client import NAMESPACE, pywbem

HUGE = "x" * 1_000_000
LONG = "x" * 100_000
#: Deeper than any reader should follow.
DEEP = 10_000
TEXTS = {
    "empty": "",
    "format": "%s%n%s%n%x",
    "shell": "$(touch /tmp/hit);`touch /tmp/hit`|touch /tmp/hit&",
    "path": "../../../../etc/passwd",
    "quotes": "\"'\\\"\\\\",
    "line feeds": "a\nb\r\nc\t",
    "beyond ASCII": "\u00fc\u20ac\U0001f600\u202e",
    "long": LONG,
}


class Hostile:
    def __init__(self, check):
        self.connection = check.connection
        self.port = self.connection.EnumerateInstanceNames("KALDERA_FCPort")[0]
        self.alarm = self.connection.EnumerateInstanceNames("KALDERA_AlarmDevice")[0]
        self.link = self.connection.EnumerateInstanceNames("KALDERA_FCPortSystemDevice")[0]
        self.service = self.connection.EnumerateInstanceNames("KALDERA_AgentService")[0]
        self.test = self.connection.EnumerateInstanceNames("KALDERA_MemoryDiagnosticTest")[0]
        self.installer = self.connection.EnumerateInstanceNames("KALDERA_HBASoftwareInstallationService")[0]
        self.adapter = self.connection.EnumerateInstanceNames("KALDERA_PortController")[0]

    def name(self, class_name, namespace=NAMESPACE, **keys):
        return pywbem.CIMInstanceName(class_name, keys, namespace=namespace)

    def with_key(self, value, key="DeviceID"):
        path = self.port.copy()
        path[key] = value
        return path

    def paths(self):
        """Names of objects that nobody has."""
        for title, text in TEXTS.items():
            yield f"key with {title} text", self.with_key(text)
        yield "number for a text key", self.with_key(pywbem.Uint64(2**64 - 1))
        yield "negative number for a text key", self.with_key(pywbem.Sint64(-(2**63)))
        yield "boolean for a text key", self.with_key(True)
        yield "reference for a text key", self.with_key(self.port)
        yield "surplus key", self.with_key("x", "Surplus")
        yield "key of another name", self.name("KALDERA_FCPort", Nmae="x")
        yield "no key", self.name("KALDERA_FCPort")
        yield "unknown class", self.name("KALDERA_Nothing", DeviceID="x")
        yield "class of a long name", self.name("K" * 5000, DeviceID="x")
        yield "unknown name space", self.name("KALDERA_FCPort", "root/nowhere", DeviceID="x")
        for title, value in (
            ("text", "KALDERA_FCPort.DeviceID=x"),
            ("number", pywbem.Uint32(7)),
            ("reference to an unknown class", self.name("KALDERA_Nothing", A="b")),
            ("reference without keys", self.name("KALDERA_FCPort")),
            ("reference elsewhere", self.name("KALDERA_FCPort", "root/nowhere", DeviceID="x")),
            ("reference in references", self.nested(5)),
        ):
            path = self.link.copy()
            path["PartComponent"] = value
            yield f"reference key with {title}", path

    def nested(self, depth):
        path = self.port
        for _ in range(depth):
            path = self.name("KALDERA_FCPortSystemDevice", GroupComponent=path, PartComponent=path)
        return path

    def reads(self):
        c = self.connection
        for title, path in self.paths():
            yield f"get: {title}", lambda path=path: c.GetInstance(path)
            yield f"associators: {title}", lambda path=path: c.AssociatorNames(path, AssocClass="KALDERA_FCPortSystemDevice")
        yield "enumerate: unknown class", lambda: c.EnumerateInstances("KALDERA_Nothing")
        yield "enumerate: class in other letters", lambda: c.EnumerateInstances("kaldera_FCPORT")
        yield "enumerate: unknown properties", lambda: c.EnumerateInstances("KALDERA_FCPort", PropertyList=["Nmae", ""])
        yield "enumerate: 10,000 properties", lambda: c.EnumerateInstances(
            "KALDERA_FCPort", PropertyList=[f"P{number}" for number in range(10_000)]
        )
        yield "enumerate: long property", lambda: c.EnumerateInstances("KALDERA_FCPort", PropertyList=[LONG])
        for title, filters in (
            ("unknown association", {"AssocClass": "KALDERA_Nothing"}),
            ("no association", {"AssocClass": "KALDERA_FCPort"}),
            ("unknown result", {"AssocClass": "KALDERA_FCPortSystemDevice", "ResultClass": "KALDERA_Nothing"}),
            ("long role", {"AssocClass": "KALDERA_FCPortSystemDevice", "Role": LONG}),
            ("hostile role", {"AssocClass": "KALDERA_FCPortSystemDevice", "Role": TEXTS["shell"]}),
        ):
            yield f"associators: {title}", lambda filters=filters: c.Associators(self.port, **filters)

    def writes(self):
        c = self.connection
        instance = pywbem.CIMInstance("KALDERA_FCPort", {"DeviceID": "x", "Speed": pywbem.Sint8(-1)}, path=self.port)
        yield "create", lambda: c.CreateInstance(instance)
        yield "create: a property of another type", lambda: c.CreateInstance(
            pywbem.CIMInstance("KALDERA_FCPort", {"DeviceID": pywbem.Real64(1e300), "OperationalStatus": ["x"], "Nmae": True})
        )
        yield "modify", lambda: c.ModifyInstance(instance)
        yield "delete", lambda: c.DeleteInstance(self.port)
        yield "delete: association", lambda: c.DeleteInstance(self.link)

    def methods(self):
        c = self.connection
        for title, parameters in (
            ("another type", {"RequestedAlarmState": "on"}),
            ("a number out of range", {"RequestedAlarmState": pywbem.Sint64(-1)}),
            ("an array", {"RequestedAlarmState": [pywbem.Uint16(3)] * 1000}),
            ("a surplus parameter", {"RequestedAlarmState": pywbem.Uint16(9), "Surplus": LONG}),
        ):
            yield f"SetAlarmState: {title}", lambda parameters=parameters: c.InvokeMethod(
                "SetAlarmState", self.alarm, **parameters
            )
        yield "unknown method", lambda: c.InvokeMethod("Nothing", self.alarm)
        yield "method of a class", lambda: c.InvokeMethod("SetAlarmState", "KALDERA_AlarmDevice")
        for title, element in (
            ("itself", self.test),
            ("an unknown object", self.with_key("x")),
            ("an unknown class", self.name("KALDERA_Nothing", A="b")),
            ("a text", "KALDERA_FCPort"),
        ):
            yield f"RunDiagnostic: {title}", lambda element=element: c.InvokeMethod(
                "RunDiagnostic", self.test, ManagedElement=element
            )
        shell = f"file:///tmp/{TEXTS['shell']}"
        for uri in ("", "file://", f"file://{LONG}", shell, "tftp://", "tftp://$(hit)/x", "tftp://-h/-f"):
            yield f"InstallFromURI: {uri[:30]}", lambda uri=uri: c.InvokeMethod(
                "InstallFromURI", self.installer, URI=uri, Target=self.adapter, InstallOptions=[pywbem.Uint16(5)]
            )

    def requests(self):
        """Texts for `executeMethod` that are answered with a reply."""
        call = {"method": "discovery.getPortByWwn", "params": ["10:00:02:4b:4c:10:00:00"], "id": 1}
        yield "deep array", '{"method": "discovery.getLldp", "params": ' + "[" * DEEP + "]" * DEEP + "}"
        yield "deep object", '{"a":' * DEEP + "1" + "}" * DEEP
        yield "unclosed", "[" * DEEP
        yield "huge text", json.dumps({**call, "params": [HUGE]})
        yield "huge method", json.dumps({**call, "method": HUGE})
        yield "many parameters", json.dumps({**call, "params": [0] * 100_000})
        yield "many members", json.dumps({**call, **{f"m{number}": number for number in range(20_000)}})
        yield "number beyond all", '{"method": "discovery.getPortByWwn", "params": [' + "9" * 5000 + "]}"
        yield "lone surrogate", '{"method": "discovery.getPortByWwn", "params": ["\\ud800"]}'
        yield "NUL in a text", '{"method": "discovery.getPortByWwn", "params": ["a\\u0000b"]}'
        yield "comment", "/*" + LONG
        for title, text in TEXTS.items():
            yield f"{title} text", json.dumps({**call, "params": [text]})
        for value in (None, True, -1, 1e308, [], {}, [[]]):
            yield f"parameter {value!r}", json.dumps({**call, "params": [value]})
            yield f"parameters {value!r}", json.dumps({**call, "params": value})

    #: Texts at which a module throws that does not contain its exceptions.
    THROWN = ("[1]", "7", '"text"', '{"method": 5}', '{"method": []}', '{"method": "x", "version": {}}')

    def all(self, with_thrown):
        yield from self.reads()
        yield from self.writes()
        yield from self.methods()
        texts = list(self.requests()) + [(text, text) for text in self.THROWN if with_thrown]
        for title, text in texts:
            yield f"executeMethod: {title}", lambda text=text: self.execute(text)

    def execute(self, text):
        return self.connection.InvokeMethod("executeMethod", self.service, request=text)
