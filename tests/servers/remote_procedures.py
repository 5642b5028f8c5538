"""The discovery procedures of the management protocol, sent through a server and to the command line: both replies are the same
text."""

import json
import subprocess

from client import pywbem

#: Texts that are no call of a procedure, or none that can be made.
ODD_REQUESTS = (
    "",
    "{",
    "{}",
    "null",
    '{"method": "discovery.getPort", "params": []}',
    '{"method": "discovery.getLldp", "params": [], "id": {"a": [null]}, "version": "9"}',
    '{"method": "discovery.getLldp", "params": [7], "id": "\\u00fc <&> \\"\'"}',
)
#: What is another with each call.
PASSING = ("discovery.getServerTime",)


def colons(address):
    return ":".join(address[each : each + 2] for each in range(0, len(address), 2))


class Procedures:
    def __init__(self, check, kldrcim):
        self.check = check
        self.kldrcim = kldrcim
        self.service = check.connection.EnumerateInstanceNames("KALDERA_AgentService")[0]

    def through_server(self, text):
        status, out = self.check.connection.InvokeMethod("executeMethod", self.service, request=text)
        return int(status), out["response"]

    def through_command_line(self, text):
        command = [self.kldrcim.program, *self.kldrcim.options, "rpc", "--raw", "-"]
        done = subprocess.run(
            command, input=text, capture_output=True, text=True, check=True, env=self.kldrcim.environment
        )
        return done.stdout

    def arguments(self):
        """Values for parameters by their names, from what the model shows: those of a port with a remote port, then those of an
        adapter."""
        path = self.kldrcim.ask("ei", "KALDERA_SCSIInitiatorTargetLogicalUnitPath")[0]["properties"]
        initiator, target = (pywbem.CIMInstanceName.from_wbem_uri(path[role])["Name"] for role in ("Initiator", "Target"))
        adapter, ethernet = (
            self.kldrcim.ask("ei", name)[0]["properties"]["DeviceID"]
            for name in ("KALDERA_PortController", "KALDERA_EthernetPort")
        )
        port, remote, mac = colons(initiator), colons(target.split("_")[-1]), colons(ethernet)
        of_port = {"rPortWwn": remote, "mac": mac, "hbaWwn": colons(adapter), "lunId": "0"}
        yield lambda name: of_port.get(name, port)
        yield lambda name: colons(adapter) if name in ("wwn", "indexStr", "hbaWwn") else "no address"

    def compare(self, text):
        what = f"executeMethod {text[:100]}"
        found = self.check.attempt(what, self.through_server, text)
        if found:
            self.check.expect(what, found, (0, self.through_command_line(text)))

    def same_members(self, text):
        found = self.check.attempt(text, self.through_server, text)
        if found:
            members = sorted(json.loads(found[1]))
            self.check.expect(text, members, sorted(json.loads(self.through_command_line(text))))

    def run(self):
        methods = self.kldrcim.ask("rpc", "--list", "discovery.*")
        self.check.expect_that("discovery procedures", len(methods) > 50, len(methods))
        for argument in self.arguments():
            for method in methods:
                values = [argument(parameter["name"]) for parameter in method["parameters"]]
                text = json.dumps({"method": method["method"], "params": values, "id": 1, "version": "1.1"})
                (self.same_members if method["method"] in PASSING else self.compare)(text)
        for text in ODD_REQUESTS:
            self.compare(text)
