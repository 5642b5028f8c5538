"""What the tests of `kldrcim serve` share: the program on a port of its own, and requests as bytes."""

import base64
import http.client
import os
import re
import signal
import socket
import ssl
import subprocess
import tempfile
import unittest

NAMESPACE = "root/kaldera"
#: Seconds for what should take none.
PATIENCE = 60
#: What a server is started with that delivers alerts. A delivered alert is never released, and once the module has been closed
#: nobody can tell that it was one.
WITH_ALERTS = {"LSAN_OPTIONS": "detect_leaks=0"}


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
        found = re.search(r"(https?)://[0-9.]+:(\d+)", line)
        if not found:
            self.stop()
            raise AssertionError(f"not serving: {line!r} {self.said!r}")
        self.is_tls = found[1] == "https"
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

    def ask(self, method, path, body=None, tls=None, **headers):
        """Status, header fields and body of the answer; `tls` says who is trusted, by default nobody is asked who it is."""
        if self.is_tls:
            tls = tls or ssl._create_unverified_context()
            connection = http.client.HTTPSConnection("127.0.0.1", self.port, timeout=PATIENCE, context=tls)
        else:
            connection = http.client.HTTPConnection("127.0.0.1", self.port, timeout=PATIENCE)
        try:
            connection.request(method, path, body, {name.replace("_", "-"): value for name, value in headers.items()})
            answer = connection.getresponse()
            return answer.status, answer.headers, answer.read().decode()
        finally:
            connection.close()

    def post(self, body, tls=None, **headers):
        """The answer to a message."""
        fields = {"Content_Type": 'application/xml; charset="utf-8"'} | headers
        return self.ask("POST", "/cimom", body.encode() if isinstance(body, str) else body, tls, **fields)

    def call(self, operation, parameters="", namespace=None):
        """The body of the answer to an operation."""
        status, _, body = self.post(intrinsic(operation, parameters, namespace or self.namespace))
        assert status == 200, (status, body)
        return body


def write_users(file, user, password):
    """A file for --users."""
    done = subprocess.run(
        ["/usr/bin/openssl", "passwd", "-6", "-stdin"], input=f"{password}\n", capture_output=True, text=True, check=True
    )
    with open(file, "w", encoding="utf-8") as users:
        users.write(f"# who may\n{user}:{done.stdout}")
    os.chmod(file, 0o600)


def basic(user, password):
    """The header field Authorization."""
    return "Basic " + base64.b64encode(f"{user}:{password}".encode()).decode()


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
