"""Firmware installed by a client of a server: from a file, and from a real tftp server."""

import shutil
import socket
import subprocess
import tempfile
import time
from contextlib import contextmanager
from pathlib import Path

from client import pywbem

DONE, FAILED = 0, 2
INSTALL = [pywbem.Uint16(5)]
TFTP_SERVER = "/usr/sbin/in.tftpd"
NEW_VERSION = "3.2.2.0"


@contextmanager
def tftp_server(folder):
    """Serves a folder to the network of the server, which has a loopback and no more. No address is named, since the resolver
    counts none there."""
    command = [TFTP_SERVER, "--foreground", "--ipv4", "--address", ":69", "--secure", folder]
    with subprocess.Popen(command) as server:
        try:
            wait_for_port_69()
            yield
        finally:
            server.terminate()


def wait_for_port_69():
    """A port that is taken cannot be bound."""
    for _ in range(50):
        with socket.socket(socket.AF_INET, socket.SOCK_DGRAM) as probe:
            try:
                probe.bind(("127.0.0.1", 69))
            except OSError:
                return
        time.sleep(0.1)
    raise AssertionError("in.tftpd does not take port 69")


class Firmware:
    def __init__(self, check):
        self.check = check
        self.connection = check.connection
        self.service = self.connection.EnumerateInstanceNames("KALDERA_HBASoftwareInstallationService")[0]
        self.adapter = self.connection.EnumerateInstanceNames("KALDERA_PortController")[0]

    def version(self):
        name = pywbem.CIMInstanceName(
            "KALDERA_AdapterSoftwareIdentity",
            {"InstanceID": f"{self.adapter['DeviceID']}_firmware"},
            namespace=self.adapter.namespace,
        )
        return self.connection.GetInstance(name)["VersionString"]

    def install(self, uri, expected, **others):
        parameters = {"URI": uri, "Target": self.adapter, "InstallOptions": INSTALL, **others}
        parameters = {name: value for name, value in parameters.items() if value is not None}
        what = f"InstallFromURI {uri} {sorted(others)}"
        answer = self.check.attempt(what, self.connection.InvokeMethod, "InstallFromURI", self.service, **parameters)
        if answer is not None:
            self.check.expect(what, (int(answer[0]), answer[1].get("Job")), (expected, None))

    def update_and_back(self, uri_of, folder):
        """The simulated adapter has the version that the image names; the other checks expect the one of before."""
        before = self.version()
        for version in (NEW_VERSION, before):
            (folder / f"{version}.bin").write_text(f"firmware-version={version}\n", encoding="ascii")
            self.install(uri_of(f"{version}.bin"), DONE)
            self.check.expect("firmware", self.version(), version)

    def refusals(self, folder):
        self.install(f"file://{folder}/missing.bin", FAILED)
        self.install("http://127.0.0.1/image.bin", FAILED)
        self.install(f"file://{folder}/{NEW_VERSION}.bin", FAILED, Target=None)
        self.install(f"file://{folder}/{NEW_VERSION}.bin", FAILED, InstallOptions=[pywbem.Uint16(9)])

    def run(self):
        with tempfile.TemporaryDirectory() as name:
            folder = Path(name)
            folder.chmod(0o755)
            self.update_and_back(lambda image: f"file://{folder}/{image}", folder)
            self.refusals(folder)
            if self.check.long:
                self.by_tftp(folder)

    def by_tftp(self, folder):
        for program in (TFTP_SERVER, shutil.which("tftp")):
            if not program or not Path(program).exists():
                self.check.differs("InstallFromURI by tftp", "packages tftpd-hpa and tftp-hpa are needed")
                return
        with tftp_server(folder):
            self.update_and_back(lambda image: f"tftp://127.0.0.1/{image}", folder)
            self.install("tftp://127.0.0.1/missing.bin", FAILED)
