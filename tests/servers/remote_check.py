#!/usr/bin/env python3
"""The command line over the wire: every verb of `kldrcim --url` gives of the server what it gives of the module in its own
process, and `watch` takes its subscription back however it ends."""

import json
import re
import signal
import subprocess
import sys
import tempfile
import time
from contextlib import contextmanager
from dataclasses import dataclass
from pathlib import Path

from catalogue import Catalogue
from client import NAMESPACE, Check, pywbem
from comparison import Comparison, plain
from kldrcim import Kldrcim
from subscriptions_check import DISABLED, ENABLED, PASSING, Alerts, Listener

PATIENCE = 60
SUBSCRIPTIONS = ("CIM_IndicationSubscription", "CIM_IndicationFilter", "CIM_ListenerDestinationCIMXML")
#: How `watch` names what it puts into a server.
OWN = "kldrcim:"
NEW_VERSION = "3.2.2.0"
#: The quick form takes one class of so many.
QUICK_STEP = 6
#: Exit status of `health`: the simulated host has something of everything.
CRITICAL = 2
#: Exit statuses of `diag run`.
PASSED, REFUSED = 0, 3


@dataclass
class Said:
    status: int
    out: str
    errors: str

    def json(self):
        return json.loads(self.out)

    def objects(self):
        """Also of a verb that shows but one."""
        found = self.json()
        return found if isinstance(found, list) else [found]


class Remote:
    """Both ways of asking."""

    def __init__(self, check):
        self.check = check
        self.traits = check.traits
        self.catalogue, self.kldrcim = Catalogue(), Kldrcim(check)
        self.comparison = Comparison(check, self.catalogue)
        self.kldrcim.know_server(check.connection.EnumerateInstances("CIM_ObjectManager", namespace=check.interop))
        self.url = ["--url", check.options.url]
        self.program = check.options.remote_kldrcim or self.kldrcim.program

    def start(self, program, *words):
        return subprocess.Popen(
            [program, *words], env=self.kldrcim.environment, stdin=subprocess.DEVNULL,
            stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True, start_new_session=True,
        )  # fmt: skip

    def run(self, program, *words):
        process = self.start(program, *words)
        try:
            out, errors = process.communicate(timeout=PATIENCE)
        except subprocess.TimeoutExpired:
            process.kill()
            out, errors = process.communicate()
            errors += f"no end within {PATIENCE} s"
        return Said(process.returncode, out, errors)

    def here(self, *words):
        return self.run(self.kldrcim.program, *self.kldrcim.options, *words)

    def there(self, *words):
        return self.run(self.program, *self.url, *words)

    def same(self, *words, status=0, in_order=True):
        """Exit status, output and errors are alike to the letter, but for what is measured; a status of CIM comes with the
        server's own words."""
        what = " ".join(words)
        there, here = self.there(*words), self.here(*words)
        self.check.expect(f"{what}: exit status", (there.status, here.status), (status, status))
        self.check.expect(f"{what}: errors", without_words(there.errors), without_words(here.errors))
        lines = [measured(each.out) for each in (there, here)]
        if not in_order:
            lines = [sorted(each) for each in lines]
        if lines[0] != lines[1]:
            self.check.differs(what, first_difference(*lines))
        self.check.compared += 1
        return there

    def same_objects(self, *words):
        """Objects are alike, in whatever order they and their properties come."""
        words = (*words, "--format", "json")
        what = " ".join(words)
        there, here = self.there(*words), self.here(*words)
        self.check.expect(f"{what}: exit status", (there.status, there.errors), (here.status, here.errors))
        if there.status == 0 and here.status == 0:
            self.comparison.objects(what, there.objects(), here.objects())
        return there


def without_words(errors):
    """Of a status of CIM its name and number."""
    return re.sub(r"(CIM_ERR_\w+ \(\d+\))[^\n]*", r"\1", errors)


def measured(out):
    """Without the time that a collection took."""
    return re.sub(r"(?m)^(kldr_collect_seconds) .*$", r"\1", out).splitlines()


def first_difference(there, here):
    for number, (one, other) in enumerate(zip(there, here)):
        if one != other:
            return f"line {number + 1}: {one!r} instead of {other!r}"
    return f"{len(there)} lines instead of {len(here)}: {(there[len(here):] or here[len(there):])[:1]}"


def check_objects(remote):
    """Each class, and what is associated with its first object; in the quick form all that but the instances for some classes."""
    for name in remote.catalogue.of_kind("instance", "association"):
        remote.same_objects("ei", name)
    names = remote.catalogue.of_kind("instance")
    for name in names if remote.check.long else names[::QUICK_STEP]:
        remote.same_objects("ein", name)
        for path in remote.kldrcim.ask("ein", name)[:1]:
            for verb in ("gi", "ai", "ain", "ri", "rin"):
                remote.same_objects(verb, path)
    remote.same_objects("ei", "CIM_FCPort")


def check_forms(remote):
    """The ways to write what came: properties that no server adds to, and that have one order in all classes."""
    port = remote.kldrcim.ask("ein", "KALDERA_FCPort")[0]
    system = remote.kldrcim.ask("ein", "KALDERA_ComputerSystem")[0]
    shown = ["--properties", "DeviceID,Speed,PortType,OperationalStatus"]
    for form in ("table", "json", "jsonl", "mof"):
        remote.same("ei", "KALDERA_FCPort", *shown, "--format", form)
        remote.same("ein", "KALDERA_FCPort", "--format", form)
    for form in ("table", "json", "mof"):
        remote.same("gi", port, *shown, "--format", form)
    remote.same("ei", "KALDERA_FCPort", *shown, "--where", "Speed!=0", "--sort", "DeviceID", "--raw")
    remote.same("ein", "KALDERA_FCPort", "--count")
    filters = ["--assoc", "CIM_SystemDevice", "--role", "GroupComponent"]
    remote.same_objects("ain", system, *filters, "--result", "CIM_PortController", "--result-role", "PartComponent")
    remote.same_objects("rin", system, *filters)


def check_refusals(remote):
    port = remote.kldrcim.ask("ein", "KALDERA_FCPort")[0]
    remote.same("gi", port.replace("DeviceID=\"", "DeviceID=\"0"), status=1)
    remote.same("gi", 'KALDERA_AgentService.Name="nobody"', status=1)
    remote.same("ei", "KALDERA_None", status=1)
    remote.same("di", port, status=1)
    remote.same("mi", port, "ElementName=x", status=1)
    remote.same("ci", "KALDERA_FCPort", "DeviceID=x", status=1)
    remote.same("cm", remote.kldrcim.ask("ein", "KALDERA_AgentService")[0], "None", status=1)
    there = remote.there("ein", "KALDERA_FCPort", "--namespace", "root/other")
    remote.check.expect("namespace: errors", without_words(there.errors), "kldrcim: CIM_ERR_INVALID_NAMESPACE (3)\n")


def check_walks(remote):
    for form in ("table", "json"):
        remote.same("tree", "--format", form, "--software", "--connectors")
        remote.same("tree", "--format", form, "--luns", "count")
        remote.same("health", "--format", form, status=CRITICAL)
        remote.same("luns", "--format", form)
        remote.same("profiles", "--format", form)
        remote.same("conform", "--format", form)
    remote.same("conform", "--format", "mof")
    remote.same("health", "--format", "plugin", status=CRITICAL)
    remote.same("graph")
    remote.same("metrics")
    remote.same("metrics", "--format", "openmetrics")
    # A server may name the classes below another in any order.
    remote.same("diag", "list", in_order=False)


def check_classes(remote):
    """A server lists all its classes; ours are as they are in the module, whoever is above them."""
    there = {each["class"]: each for each in remote.there("classes", "--format", "json").json()}
    for each in remote.kldrcim.ask("classes"):
        found = there.get(each["class"], {"superclass": None, "keys": None})
        for fact in ("superclass", "keys"):
            ours, theirs = each[fact], found[fact]
            if fact == "keys" and theirs:
                ours, theirs = sorted(ours), sorted(theirs)
            remote.check.expect(f"classes: {each['class']}: {fact}", theirs, ours)


def check_diff(remote):
    with tempfile.TemporaryDirectory() as name:
        there, here = Path(name) / "there.json", Path(name) / "here.json"
        words = ["tree", "--format", "json", "--luns", "each", "--software", "--connectors"]
        there.write_text(remote.there(*words).out, encoding="utf-8")
        here.write_text(remote.here(*words).out, encoding="utf-8")
        remote.check.expect("diff", remote.run(remote.kldrcim.program, "diff", str(here), str(there)), Said(0, "", ""))


def check_agent(remote):
    port = remote.kldrcim.ask("ein", "KALDERA_FCPort")[0]
    wwn = address_of(port)
    remote.same("rpc", "--list")
    remote.same("rpc", "discovery.getPortByWwn", wwn)
    remote.same("rpc", "discovery.getPortByWwn", wwn, "+", "discovery.getLldp", "no address", status=1)
    remote.same("rpc", "discovery.getPortByWwn", status=1)
    remote.same("rpc", "nosuch.method", status=1)
    remote.same("rpc", "--raw", '{"method": "x", "id": "\u00fc <&> \\"\'"}')
    remote.same("cm", remote.kldrcim.ask("ein", "KALDERA_AgentService")[0], "executeMethod", 'request={"method":"x","id":1}')


def address_of(path):
    device = pywbem.CIMInstanceName.from_wbem_uri(path)["DeviceID"]
    return ":".join(device[each : each + 2] for each in range(0, len(device), 2))


def records(said):
    """Outcome and text of each record; times and numbers are those of the run."""
    rows = [re.fullmatch(r"\d+ +[\d:.]+ +(passed|failed|) *(\S.*)", line.rstrip()) for line in said.out.splitlines()]
    return [(row[1], row[2]) for row in rows if row] + said.out.splitlines()[-1:]


def check_tests(remote):
    """A hardware test is followed to its end; and it goes on where nobody follows any more."""
    adapter, port = (
        pywbem.CIMInstanceName.from_wbem_uri(remote.kldrcim.ask("ein", name)[0])["DeviceID"]
        for name in ("KALDERA_PortController", "KALDERA_FCPort")
    )
    words = ["diag", "run", "MemoryTest", adapter, "--wait"]
    there, here = remote.there(*words), remote.here(*words)
    remote.check.expect("diag run: exit status", (there.status, here.status), (PASSED, PASSED))
    remote.check.expect("diag run: records", records(there), records(here))
    remote.same("diag", "run", "NoTest", adapter, status=2)
    remote.same("diag", "run", "MemoryTest", "no:address", status=2)
    process = remote.start(remote.program, *remote.url, "diag", "run", "SerdesLoopbackTest", port, "--wait")
    job = process.stdout.readline()
    process.send_signal(signal.SIGINT)
    _, errors = process.communicate(timeout=PATIENCE)
    remote.check.expect("interrupted: exit status", process.returncode, 128 + signal.SIGINT)
    remote.check.expect_that("interrupted: errors", "the server goes on with the test" in errors, errors)
    remote.check.expect("another meanwhile", remote.there(*words[:-1]).status, REFUSED)
    path = pywbem.CIMInstanceName.from_wbem_uri(job.strip())
    end = time.monotonic() + PATIENCE
    while remote.check.connection.GetInstance(path)["JobState"] != 7 and time.monotonic() < end:
        time.sleep(0.2)
    remote.check.expect("the test goes on to its end", remote.check.connection.GetInstance(path)["PercentComplete"], 100)


def check_firmware(remote):
    adapter = pywbem.CIMInstanceName.from_wbem_uri(remote.kldrcim.ask("ein", "KALDERA_PortController")[0])["DeviceID"]
    with tempfile.TemporaryDirectory() as name:
        folder = Path(name)
        folder.chmod(0o755)
        image = folder / "image.bin"
        image.write_text(f"firmware-version={NEW_VERSION}\n", encoding="ascii")
        done = remote.same("flash", adapter, f"file://{image}", "--yes")
        before = re.search(r"from (\S+) to", done.out)
        if remote.check.expect_that("flash", before, done.out, done.errors):
            # The other checks expect the version of before.
            image.write_text(f"firmware-version={before[1]}\n", encoding="ascii")
            back = remote.there("flash", adapter, f"file://{image}", "--yes", "--format", "json")
            remote.check.expect("flash back", back.json()["firmware_after"], before[1])
        remote.same("flash", adapter, f"file://{folder}/missing.bin", "--yes", status=1)
        remote.same("flash", "no:adapter", f"file://{image}", "--yes", status=2)


class Watch:
    """`watch` at a server, from its subscription on."""

    def __init__(self, remote, alerts):
        self.remote, self.check, self.alerts = remote, remote.check, alerts

    def left(self):
        """What of it the server holds: names by class."""
        interop = ["--namespace", self.check.interop]
        return {
            name: [path for path in self.remote.there("ein", name, *interop).out.splitlines() if OWN in path]
            for name in SUBSCRIPTIONS
        }

    def expect_nothing(self, what):
        self.check.expect(f"{what}: left in the server", self.left(), {name: [] for name in SUBSCRIPTIONS})

    @contextmanager
    def subscribed(self, *words):
        process = self.remote.start(self.remote.program, *self.remote.url, "watch", "--format", "jsonl", *words)
        try:
            end = time.monotonic() + PATIENCE
            own = f":{process.pid}:"
            while own not in str(self.left()[SUBSCRIPTIONS[0]]) and process.poll() is None and time.monotonic() < end:
                time.sleep(0.1)
            self.check.expect_that("watch: subscription", process.poll() is None, "the program has ended")
            yield process
        finally:
            if process.poll() is None:
                process.kill()
            process.communicate()

    def shows_alerts(self):
        """Each alert, as another client's listener has it."""
        listener = Listener()
        with self.alerts.subscription(listener), self.subscribed("--count", "4") as process:
            expected = self.alerts.switch(2)
            taken = listener.take(len(expected))
            out, errors = process.communicate(timeout=PATIENCE)
        listener.listener.stop()
        self.check.expect("watch: end", (process.returncode, errors), (0, ""))
        shown = {each["properties"]["MessageID"]: each for each in map(json.loads, out.splitlines())}
        self.check.expect("watch: alerts", sorted(shown), sorted(expected))
        for alert in taken:
            self.compare(alert, shown.get(alert["MessageID"]))
        self.expect_nothing("watch")

    def compare(self, alert, shown):
        """Numbers are counted for each listener anew."""
        if shown is None:
            return
        self.check.expect("watch: class", shown["path"], f"{NAMESPACE}:{alert.classname}")
        left_out = PASSING | self.remote.traits.fills_in_alerts
        found = {name.lower(): value for name, value in shown["properties"].items()}
        expected = {name.lower(): plain(cell.value) for name, cell in alert.properties.items()}
        for name in sorted({*found, *expected} - left_out):
            self.check.expect(f"watch: {alert['MessageID']}: {name}", found.get(name), expected.get(name))

    def interrupted(self):
        for number in (signal.SIGINT, signal.SIGTERM, signal.SIGHUP):
            with self.subscribed() as process:
                process.send_signal(number)
                _, errors = process.communicate(timeout=PATIENCE)
                self.check.expect(f"watch: {number.name}", (process.returncode, errors), (0, ""))
            self.expect_nothing(f"watch: {number.name}")

    def killed(self):
        """What a dead one has left goes with the next."""
        with self.subscribed() as process:
            process.kill()
            process.communicate()
        self.check.expect_that("watch: killed", any(self.left().values()), "nothing is left to take back")
        with self.subscribed() as process:
            self.check.expect("watch: beside a dead one", [len(each) for each in self.left().values()], [1, 1, 1])
            process.send_signal(signal.SIGINT)
            process.communicate(timeout=PATIENCE)
        self.expect_nothing("watch: after a dead one")

    def refused(self):
        said = self.remote.there("watch", "KALDERA_None")
        self.check.expect("watch of no class", (said.status, said.out), (1, ""))
        self.check.expect_that("watch of no class", re.match(r"kldrcim: CIM_ERR_\w+ \(\d+\)", said.errors), said.errors)
        self.expect_nothing("watch of no class")


def check_watch(remote):
    watch = Watch(remote, Alerts(remote.check))
    watch.shows_alerts()
    watch.interrupted()
    watch.killed()
    watch.refused()


def check_server_objects(remote):
    """Instances that a server lets a client make: a filter is made, read as another client reads it, and deleted."""
    interop = ["--namespace", remote.check.interop]
    manager = remote.check.connection.EnumerateInstances("CIM_ObjectManager", namespace=remote.check.interop)[0]
    keys = {
        "SystemCreationClassName": "CIM_ComputerSystem",
        "SystemName": manager["SystemName"],
        "CreationClassName": "CIM_IndicationFilter",
        "Name": 'remote "check" \\ <&>',
    }
    query = 'SELECT * FROM KALDERA_AlertIndication WHERE MessageID = "\u00fc & <\u20ac>"'
    more = {"Query": query, "QueryLanguage": "WQL", "SourceNamespace": NAMESPACE}
    words = [f"{name}={value}" for name, value in {**keys, **more}.items()]
    made = remote.there("ci", "CIM_IndicationFilter", *words, *interop)
    if not remote.check.expect("ci", (made.status, made.errors), (0, "")):
        return
    path = made.out.strip()
    read = remote.there("gi", path, "--properties", "Name,Query", "--format", "json")
    other = remote.check.connection.GetInstance(pywbem.CIMInstanceName.from_wbem_uri(path))
    remote.check.expect("ci: Name", other["Name"], keys["Name"])
    remote.check.expect("ci: Query", other["Query"], query)
    remote.check.expect("gi", read.status == 0 and read.json()["properties"], {"Name": other["Name"], "Query": other["Query"]})
    remote.check.expect("di", remote.there("di", path), Said(0, "", ""))
    remote.check.expect("gi of none", without_words(remote.there("gi", path).errors), "kldrcim: CIM_ERR_NOT_FOUND (6)\n")


def main():
    check = Check(__doc__)
    remote = Remote(check)
    check_objects(remote)
    check_forms(remote)
    check_refusals(remote)
    check_walks(remote)
    check_classes(remote)
    check_diff(remote)
    check_agent(remote)
    check_server_objects(remote)
    check_watch(remote)
    check_tests(remote)
    check_firmware(remote)
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
