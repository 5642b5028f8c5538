"""Every verb of `kldrcim --url` against `kldrcim serve`: it writes what it writes in process."""

import json
import os
import re
import signal
import subprocess
import tempfile
import time
import unittest

from asking import in_process, run, start
from serving import PATIENCE, WITH_ALERTS, Served, Serving_Case

PORT = 'KALDERA_FCPort.SystemCreationClassName="KALDERA_ComputerSystem",SystemName="{}",CreationClassName="KALDERA_FCPort",DeviceID="1000024b4c100000"'
AGENT = 'KALDERA_AgentService.Name="Kaldera Agent Service Provider"'

#: Of the classes: a sanitizer learns from a few what it would see in all of them, several times slower.
EACH = 6 if os.environ.get("KLDR_SANITIZE") else 1

#: What a server adds: arguments, then what there is in its place in process.
ADDED = [
    ("ei KALDERA_None", "KALDERA_None", 'the module has no class KALDERA_None; "kldrcim classes" lists them'),
    ("ei CIM_None", "CIM_None", 'the module has no class CIM_None; "kldrcim classes" lists them'),
]


def same_words(text):
    """The server tells the module its own name, where nobody does in process; a measured time is no answer."""
    text = re.sub(r"kldrcim:[\w.-]+", "CIM Server", text)
    return re.sub(r"(kldr_collect_seconds) .*", r"\1", text)


class Same_Answers(Serving_Case):
    def same(self, *arguments):
        with self.subTest(" ".join(arguments)):
            here = in_process(*arguments)
            there = run("--url", self.served.url, *arguments)
            self.assertEqual(here[0], there[0], there)
            self.assertEqual(same_words(here[1]), same_words(there[1]))
            self.assertEqual(here[2], there[2])

    @classmethod
    def setUpClass(cls):
        super().setUpClass()
        cls.host = re.search(r'Name="([^"]*)"', in_process("ein", "KALDERA_ComputerSystem")[1])[1]
        cls.port = PORT.format(cls.host)

    def test_instances_of_every_class(self):
        classes = [each["class"] for each in json.loads(in_process("classes", "--format", "json")[1])]
        self.assertGreater(len(classes), 70)
        # An alert is no instance to enumerate, and the object manager is the server itself.
        for name in sorted({*classes} - {"KALDERA_AlertIndication", "KALDERA_ObjectManager"})[::EACH]:
            self.same("ei", name, "--format", "json")
            self.same("ein", name)

    def test_operations_in_every_format(self):
        system = f'KALDERA_ComputerSystem.CreationClassName="KALDERA_ComputerSystem",Name="{self.host}"'
        for form in ("table", "json", "mof"):
            self.same("gi", self.port, "--format", form)
            self.same("gi", self.port, "--properties", "Speed,PortType", "--format", form)
            for verb in ("ai", "ain", "ri", "rin"):
                self.same(verb, self.port, "--format", form)
            self.same("ei", "CIM_FCPort", "--format", form)
            self.same("cm", AGENT, "executeMethod", 'request={"method":"x","id":1}', "--format", form)
        filters = ["--assoc", "CIM_SystemDevice", "--role", "GroupComponent"]
        self.same("ain", system, *filters, "--result", "CIM_PortController", "--result-role", "PartComponent")
        self.same("rin", system, *filters)

    def test_part_of_the_results(self):
        for form in ("table", "json", "jsonl", "mof"):
            self.same("ei", "KALDERA_FCPort", "--where", "OperationalStatus=no contact", "--properties", "DeviceID", "--format", form)
            self.same("ei", "CIM_NetworkPort", "--where", "Speed!=0", "--sort", "-Speed", "--properties", "DeviceID,Speed", "--format", form)
            self.same("ein", "KALDERA_FCPort", "--where", "DeviceID~*4C10*", "--where", "DeviceID!=1000024b4c100000", "--format", form)
            self.same("ai", self.port, "--where", "ElementName~*", "--format", form)
        # What is looked at and not shown is asked for, too; what only a subclass has is found.
        self.assertEqual("1\n", run("--url", self.served.url, "ei", "KALDERA_FCPort", "--where", "PortNumber=1", "--where", "Speed=0", "--count")[1])
        self.same("ei", "CIM_LogicalDevice", "--where", "PermanentAddress~1000*", "--sort", "DeviceID", "--properties", "DeviceID")
        for verb in ("ain", "rin", "ri"):
            self.same(verb, self.port, "--count")
        self.same("ain", self.port, "--sort", "-Name", "--assoc", "KALDERA_DeviceSAPImplementation")
        for refused in (("--where", "PortType=Q"), ("--where", "NoSuch=1"), ("--sort", "NoSuch"), ("--where", "Speed")):
            self.same("ei", "KALDERA_FCPort", *refused)
        self.same("ein", "KALDERA_FCPort", "--where", "Speed=0")
        self.same("ai", self.port, "--where", "NoSuch=1")

    def test_walks(self):
        for form in ("table", "json"):
            self.same("tree", "--format", form, "--software", "--connectors")
            self.same("health", "--format", form)
            self.same("luns", "--format", form)
            self.same("luns", "--format", form, "--where", "redundancy=one_path", "--sort", "-identifier")
        for form in ("table", "json", "mof"):
            self.same("conform", "--format", form)
        self.same("graph")
        self.same("profiles")
        self.same("diag", "list")

    def test_the_agent(self):
        self.same("rpc", "discovery.getPortByWwn", "10:00:02:4b:4c:10:00:00")
        self.same("rpc", "--list")
        self.same("rpc", "nosuch.method")
        self.same("rpc", "--raw", '{"x')

    def test_refusals(self):
        self.same("gi", 'KALDERA_AgentService.Name="nobody"')
        self.same("gi", 'KALDERA_FCPort.DeviceID="x"')
        self.same("cm", "KALDERA_AgentService", "None")
        self.same("di", self.port)
        self.same("mi", self.port, "ElementName=x")
        self.same("ci", "KALDERA_FCPort", "DeviceID=x")
        self.same("flash", "2000024b4c100000", "file:///nonexistent/image", "--yes")

    def test_what_the_server_adds(self):
        for arguments, there_text, here_text in ADDED:
            here = in_process(*arguments.split())
            there = run("--url", self.served.url, *arguments.split())
            self.assertEqual(here[0], there[0])
            self.assertEqual(here[2].replace(here_text, there_text), there[2])
        status, out, errors = run("--url", self.served.url, "ein", "KALDERA_FCPort", "--namespace", "root/other")
        self.assertEqual((1, "", "kldrcim: CIM_ERR_INVALID_NAMESPACE (3): root/other\n"), (status, out, errors))

    def test_classes_without_the_kinds_of_provider(self):
        here = json.loads(in_process("classes", "KALDERA_FCPort*", "--format", "json")[1])
        there = json.loads(run("--url", self.served.url, "classes", "KALDERA_FCPort*", "--format", "json")[1])
        for each in here:
            each["provider"] = []
        self.assertEqual(here, there)

    def test_the_environment_names_the_usual_server(self):
        usual = {"KLDRCIM_URL": "http://127.0.0.1:1"}
        self.assertEqual(2, run("ein", "KALDERA_FCPort", **usual)[0])
        # What is said counts.
        self.assertEqual(0, run("--url", self.served.url, "ein", "KALDERA_FCPort", **usual)[0])
        self.assertEqual(0, in_process("ein", "KALDERA_FCPort", **usual)[0])

    def test_options_that_make_no_sense_together(self):
        for option in ("--leaks", "--user=me", "--module=x", "--server-instances=x"):
            status, _, errors = run("--url", self.served.url, option, "tree")
            name = option.split("=")[0]
            self.assertEqual((2, f"kldrcim: {name} makes no sense with --url: it is for a module in this process\n"), (status, errors))
        for option in ("--insecure", "--cacert=x", "--password-file=x"):
            self.assertEqual(2, in_process(option, "tree")[0])
        self.assertEqual(2, run("--url", self.served.url, "serve")[0])


class Late_Failures(Serving_Case):
    module = "KLDR_PLAIN_TOY"
    namespace = "root/toy"
    environment = {"TOY_MANY": "20000", "TOY_MANY_FAILS": "1"}

    def test_the_provider_is_heard_behind_what_came(self):
        status, out, errors = run("--url", self.served.url, "--namespace", "root/toy", "ein", "TOY_Many")
        self.assertEqual((1, "kldrcim: CIM_ERR_FAILED (1): no more of them\n"), (status, errors))
        self.assertEqual(20000, out.count("\n"))


class Jobs_Of_A_Server(Serving_Case):
    def test_a_test_is_followed_to_its_end(self):
        status, out, errors = run("--url", self.served.url, "diag", "run", "MemoryTest", "2000024b4c100000", "--wait")
        self.assertEqual(0, status, errors)
        self.assertRegex(out, r"KALDERA_ConcreteJob(.|\n)*passed\n$")
        # The server has the records when the program has gone.
        self.assertIn("MemoryTest", run("--url", self.served.url, "ein", "KALDERA_DiagnosticCompletionRecord")[1])

    def test_who_leaves_leaves_the_test_alone(self):
        process = start("--url", self.served.url, "diag", "run", "SerdesLoopbackTest", "1000024b4c100000", "--wait")
        self.assertIn("KALDERA_ConcreteJob", process.stdout.readline())
        process.send_signal(signal.SIGINT)
        _, errors = process.communicate(timeout=PATIENCE)
        self.assertEqual(130, process.returncode)
        self.assertIn("kldrcim: interrupted: the server goes on with the test\n", errors)
        self.assertEqual(3, run("--url", self.served.url, "diag", "run", "MemoryTest", "2000024b4c100000")[0])


class The_End_Of_A_Server(unittest.TestCase):
    """A test that a client has started is told, and not cut off."""

    def setUp(self):
        self.served = Served()
        status, out, errors = run("--url", self.served.url, "diag", "run", "SerdesLoopbackTest", "1000024b4c100000")
        self.assertEqual(0, status, errors)
        self.job = out.strip()
        self.served.process.send_signal(signal.SIGTERM)
        end = time.monotonic() + PATIENCE
        while "waiting" not in self.told() and time.monotonic() < end:
            time.sleep(0.05)
        self.assertIsNone(self.served.process.poll(), self.told())
        self.assertEqual(self.told(), f"kldrcim: waiting for the end of {self.job}; the next signal ends it as it is\n")

    def told(self):
        self.served.errors.seek(0)
        return self.served.errors.read()

    def test_it_is_waited_for(self):
        # Nobody gets in any more.
        self.assertEqual(2, run("--url", self.served.url, "ein", "KALDERA_FCPort")[0])
        self.assertEqual(0, self.served.process.wait(PATIENCE))
        self.assertEqual(0, self.served.stop())
        self.assertEqual(1, self.served.said.count("\n"), self.served.said)

    def test_the_next_signal_ends_it(self):
        self.served.process.send_signal(signal.SIGINT)
        self.assertEqual(128 + signal.SIGINT, self.served.process.wait(PATIENCE))
        self.served.stop()
        self.assertIn(f"kldrcim: left as it is: {self.job}\n", self.served.said)


class Watching(Serving_Case):
    environment = {"KLDR_SIMULATOR_EVENTS": os.environ["KLDR_EVENTS"], **WITH_ALERTS}
    classes = ("CIM_IndicationSubscription", "CIM_IndicationFilter", "CIM_ListenerDestinationCIMXML")

    def left(self):
        return [run("--url", self.served.url, "ein", name, "--namespace", "root/interop")[1] for name in self.classes]

    def test_alerts_come_and_nothing_is_left(self):
        status, out, errors = run("--url", self.served.url, "watch", "--count", "2", "--format", "json", "--properties", "MessageID")
        self.assertEqual((0, ""), (status, errors))
        alerts = json.loads("[" + out.replace("}\n{", "},\n{") + "]")
        self.assertEqual(["root/kaldera:KALDERA_AlertIndication"] * 2, [alert["path"] for alert in alerts])
        self.assertRegex(alerts[0]["properties"]["MessageID"], r"KLDR\d+$")
        self.assertEqual(["", "", ""], self.left())

    def test_a_condition_is_met_by_what_is_written_and_counted(self):
        # The first is critical, the next is not.
        status, out, errors = run(
            "--url", self.served.url, "watch", "--where", "PerceivedSeverity!=Critical", "--where", "MessageID~*83", "--count", "2",
            "--format", "jsonl", "--properties", "MessageID",
        )
        self.assertEqual((0, ""), (status, errors))
        self.assertEqual(
            ["PROPKLDR131083", "PROPKLDR327683"], [json.loads(line)["properties"]["MessageID"] for line in out.splitlines()])
        status, out, errors = run("--url", self.served.url, "watch", "--where", "NoSuch=1")
        self.assertEqual((2, "", 'kldrcim: KALDERA_AlertIndication has no property "NoSuch"\n'), (status, out, errors))
        self.assertEqual(["", "", ""], self.left())

    def test_each_filter_has_its_name_space(self):
        out = run("--url", self.served.url, "watch", "--filter", "root/kaldera", "--filter", "root/interop", "--count", "2", "--properties", "MessageID")[1]
        self.assertEqual({"root/kaldera", "root/interop"}, set(re.findall(r"^(root/\w+):", out, re.M)))
        self.assertEqual(["", "", ""], self.left())

    def test_interrupted_it_takes_all_back(self):
        for number in (signal.SIGINT, signal.SIGTERM, signal.SIGHUP):
            process = start("--url", self.served.url, "watch")
            process.stdout.readline()
            self.assertIn("kldrcim:", self.left()[0])
            process.send_signal(number)
            process.communicate(timeout=PATIENCE)
            self.assertEqual(0, process.returncode)
            self.assertEqual(["", "", ""], self.left())

    def test_what_a_dead_one_left_goes_with_the_next(self):
        process = start("--url", self.served.url, "watch")
        process.stdout.readline()
        process.kill()
        process.communicate(timeout=PATIENCE)
        self.assertIn("kldrcim:", self.left()[1])
        run("--url", self.served.url, "watch", "--count", "1")
        self.assertEqual(["", "", ""], self.left())

    def test_a_refusal_is_told(self):
        status, _, errors = run("--url", self.served.url, "watch", "KALDERA_FCPort")
        self.assertEqual(1, status)
        self.assertRegex(errors, r"^kldrcim: CIM_ERR_INVALID_CLASS \(5\): KALDERA_FCPort is no class of indications")
        self.assertEqual(["", "", ""], self.left())


class Users_And_Certificates(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.folder = tempfile.TemporaryDirectory()
        cls.file = staticmethod(lambda name: os.path.join(cls.folder.name, name))
        for name in ("localhost", "elsewhere"):
            subprocess.run(
                ["openssl", "req", "-x509", "-newkey", "rsa:2048", "-nodes", "-days", "2", "-subj", f"/CN={name}",
                 "-addext", f"subjectAltName=DNS:{name}", "-keyout", cls.file(f"{name}.key"), "-out", cls.file(f"{name}.pem")],
                check=True, capture_output=True,
            )
        hashed = subprocess.run(["openssl", "passwd", "-6", "pass:wörd"], check=True, capture_output=True, text=True).stdout
        for name, text in (("users", f"me:{hashed}"), ("right", "pass:wörd\n"), ("wrong", "guess\n"), ("empty", "")):
            with open(cls.file(name), "w", encoding="utf-8") as file:
                file.write(text)
            os.chmod(cls.file(name), 0o600)

    @classmethod
    def tearDownClass(cls):
        cls.folder.cleanup()

    def serve(self, *options):
        served = Served(*options)
        self.addCleanup(served.stop)
        return served

    def ask(self, url, *options):
        return run("--url", url, "ein", "KALDERA_FCPort", *options)

    def refused(self, pattern, url, *options, status=2):
        found, out, errors = self.ask(url, *options)
        self.assertEqual((status, ""), (found, out), errors)
        self.assertRegex(errors.splitlines()[-1], pattern)

    def test_passwords(self):
        served = self.serve("--users", self.file("users"))
        at = f"127.0.0.1:{served.port}"
        password = lambda name: "--password-file=" + self.file(name)
        self.assertEqual(0, self.ask(f"http://me@{at}", password("right"))[0])
        self.refused(rf"^kldrcim: http://{at} does not know the user me with this password$", f"http://me@{at}", password("wrong"))
        self.refused(rf"^kldrcim: http://{at} wants to know who asks: http://USER@HOST$", f"http://{at}")
        self.refused(r"empty: no password in it$", f"http://me@{at}", password("empty"))
        self.refused(r"none: No such file or directory$", f"http://me@{at}", password("none"))
        self.refused(r"^kldrcim: no terminal to ask for the password at; --password-file names", f"http://me@{at}")
        with open(self.file("open"), "w", encoding="utf-8") as file:
            os.fchmod(file.fileno(), 0o640)
        self.refused(r"open: others may read or change it \(chmod 600\)$", f"http://me@{at}", password("open"))
        self.refused(r"^kldrcim: --password-file without a user", f"http://{at}", password("right"))

    def test_certificates(self):
        served = self.serve("--tls", self.file("localhost.pem"), self.file("localhost.key"))
        at = f"https://localhost:{served.port}"
        trust = "--cacert=" + self.file("localhost.pem")
        self.assertEqual(0, self.ask(at, trust)[0])
        self.refused(r"^kldrcim: the certificate of https://localhost:\d+ is not to be trusted: .*; --cacert FILE names", at)
        # By another name than its own.
        self.refused(r"is not to be trusted: ", f"https://127.0.0.1:{served.port}", trust)
        self.refused(r"is not to be trusted: ", at, "--cacert=" + self.file("elsewhere.pem"))
        self.refused(r"^kldrcim: --cacert: no certificates in ", at, "--cacert=" + self.file("empty"))
        status, out, errors = self.ask(at, "--insecure")
        self.assertEqual(0, status)
        self.assertRegex(errors, r"^kldrcim: warning: --insecure: whoever answers at https://localhost:\d+ is taken for the server")
        self.refused(r"^kldrcim: (no TLS with|the connection to) https://", f"https://127.0.0.1:{self.serve().port}")


if __name__ == "__main__":
    unittest.main()
