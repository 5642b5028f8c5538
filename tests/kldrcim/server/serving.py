"""What the tests of `kldrcim serve` share: the program on a port of its own, and requests as bytes."""

import http.client
import os
import re
import signal
import socket
import subprocess
import tempfile
import unittest

NAMESPACE = "root/kaldera"
#: Seconds for what should take none.
PATIENCE = 60


class Served:
    """`kldrcim serve` over a module, in a folder of its own."""

    def __init__(self, *options, module="KLDR_MODULE", namespace=NAMESPACE, **environment):
        self.namespace = namespace
        self.home = tempfile.TemporaryDirectory()
        own = {
            "PATH": "/usr/bin:/bin",
            "HOME": self.home.name,
            "LD_LIBRARY_PATH": os.environ["KLDR_SIMULATOR"],
            "KLDR_SIMULATOR_INVENTORY": os.environ["KLDR_INVENTORY"],
        }
        keep = {name: value for name, value in os.environ.items() if name.endswith("SAN_OPTIONS")}
        command = [os.environ["KLDRCIM"], "--module", os.environ[module], "--namespace", namespace, "serve"]
        self.errors = open(os.path.join(self.home.name, "errors"), "w+", encoding="utf-8")
        self.process = subprocess.Popen(
            [*command, "--listen", "127.0.0.1:0", *options],
            env=own | keep | environment,
            stdout=subprocess.PIPE,
            stderr=self.errors,
            text=True,
        )
        line = self.process.stdout.readline()
        found = re.search(r"(https?)://127\.0\.0\.1:(\d+)", line)
        if not found:
            self.stop()
            raise AssertionError(f"not serving: {line!r} {self.said!r}")
        self.port = int(found[2])
        self.url = found[0]

    def stop(self):
        """Its exit status after the signal that asks for an end."""
        if self.process.poll() is None:
            self.process.send_signal(signal.SIGTERM)
        status = self.process.wait(PATIENCE)
        self.process.stdout.close()
        self.errors.seek(0)
        self.said = self.errors.read()
        self.errors.close()
        self.home.cleanup()
        return status

    def resident(self, what="VmRSS"):
        """Bytes, now or at most."""
        with open(f"/proc/{self.process.pid}/status", encoding="ascii") as status:
            return int(re.search(rf"{what}:\s*(\d+) kB", status.read())[1]) * 1024

    def connect(self):
        return socket.create_connection(("127.0.0.1", self.port), PATIENCE)

    def raw(self, data):
        """All that comes back for these bytes, until the server closes."""
        with self.connect() as connection:
            connection.sendall(data)
            return read_all(connection)

    def post(self, body, **headers):
        """Status, header fields and body of the answer to a message."""
        connection = http.client.HTTPConnection("127.0.0.1", self.port, timeout=PATIENCE)
        fields = {"Content-Type": 'application/xml; charset="utf-8"'}
        fields |= {name.replace("_", "-"): value for name, value in headers.items()}
        try:
            connection.request("POST", "/cimom", body.encode() if isinstance(body, str) else body, fields)
            answer = connection.getresponse()
            return answer.status, answer.headers, answer.read().decode()
        finally:
            connection.close()

    def call(self, operation, parameters="", namespace=None):
        """The body of the answer to an operation."""
        status, _, body = self.post(intrinsic(operation, parameters, namespace or self.namespace))
        assert status == 200, (status, body)
        return body


def read_all(connection):
    data = b""
    try:
        while piece := connection.recv(65536):
            data += piece
    except ConnectionResetError:
        pass
    return data


def message(content, dtd="2.0", version="1.0"):
    return (
        f'<?xml version="1.0" encoding="utf-8" ?><CIM CIMVERSION="2.0" DTDVERSION="{dtd}">'
        f'<MESSAGE ID="77" PROTOCOLVERSION="{version}">{content}</MESSAGE></CIM>'
    )


def request(operation, parameters="", namespace=NAMESPACE):
    parts = "".join(f'<NAMESPACE NAME="{part}"/>' for part in namespace.split("/"))
    return (
        f'<SIMPLEREQ><IMETHODCALL NAME="{operation}"><LOCALNAMESPACEPATH>{parts}</LOCALNAMESPACEPATH>'
        f"{parameters}</IMETHODCALL></SIMPLEREQ>"
    )


def intrinsic(operation, parameters="", namespace=NAMESPACE):
    return message(request(operation, parameters, namespace))


def parameter(name, value):
    return f'<IPARAMVALUE NAME="{name}">{value}</IPARAMVALUE>'


def class_parameter(name, value):
    return parameter(name, f'<CLASSNAME NAME="{value}"/>')


def value_parameter(name, value):
    return parameter(name, f"<VALUE>{value}</VALUE>")


def error_code(body):
    """The status of an answer; 0 without an error."""
    found = re.search(r'<ERROR CODE="(\d+)"', body)
    return int(found[1]) if found else 0


class Serving_Case(unittest.TestCase):
    """One server for all tests of a class."""

    options = ()
    environment = {}
    module = "KLDR_MODULE"
    namespace = NAMESPACE

    @classmethod
    def setUpClass(cls):
        cls.served = Served(*cls.options, module=cls.module, namespace=cls.namespace, **cls.environment)

    @classmethod
    def tearDownClass(cls):
        status = cls.served.stop()
        assert status == 0, (status, cls.served.said)
        lines = [line for line in cls.served.said.splitlines() if "ERROR: " in line or "violation" in line]
        assert not lines, lines
