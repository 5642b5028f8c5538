"""What collectors make of `kldrcim metrics`: promtool, the node exporter and Prometheus itself, each of the real ones, on loopback
and for a short time."""

import json
import os
import re
import socket
import subprocess
import tempfile
import time
import unittest
import urllib.error
import urllib.parse
import urllib.request
from contextlib import closing, contextmanager
from pathlib import Path

from deploy_case import BUILD, ENVIRONMENT, SOURCE, output_of

EXAMPLES = SOURCE / "deploy/monitoring"
INVENTORIES = sorted((SOURCE / "simulator/inventories").glob("*.json"))
SECONDS = 60


def metrics(*arguments, inventory=None):
    environment = dict(ENVIRONMENT, **({"KLDR_SIMULATOR_INVENTORY": str(inventory)} if inventory else {}))
    done = subprocess.run([BUILD / "kldrcim", "metrics", *arguments], capture_output=True, text=True, check=True, env=environment)
    return done.stdout


def promtool(*arguments, text=None, cwd=None):
    done = subprocess.run(["promtool", *arguments], input=text, capture_output=True, text=True, check=False, env=ENVIRONMENT, cwd=cwd)
    return done.returncode, done.stdout + done.stderr


def families(text):
    return set(re.findall(r"^# TYPE (\S+) ", text, re.M))


def samples(text, name):
    """Value by label of a family with one label."""
    return dict(re.findall(rf'^{name}\{{[a-z]+="([^"]*)"\}} (\S+)$', text, re.M))


class Texts(unittest.TestCase):
    def test_promtool_finds_no_fault_in_any_host(self):
        self.assertLess(5, len(INVENTORIES))
        for inventory in INVENTORIES:
            text = metrics(inventory=inventory)
            self.assertEqual(promtool("check", "metrics", text=text), (0, ""), inventory.name)
            self.assertTrue(text.endswith("\n# EOF\n"))

    def test_promtool_would_find_one(self):
        broken = metrics().replace("# HELP kldr_port_speed_bytes", "# HELP kldr_port_sped_bytes")
        self.assertNotEqual(promtool("check", "metrics", text=broken)[0], 0)

    def test_both_texts_say_the_same(self):
        own, open_text = metrics(), metrics("--format", "openmetrics")

        def said(text):
            return [line for line in text.splitlines() if not line.startswith("#") and "seconds" not in line]

        self.assertEqual(said(own), said(open_text))
        # A counter is announced without what its samples end in, information likewise.
        self.assertIn("# TYPE kldr_port_crc_errors counter\n", open_text)
        self.assertIn("# TYPE kldr_port_crc_errors_total counter\n", own)
        self.assertIn("# TYPE kldr_adapter info\n", open_text)
        self.assertIn("# TYPE kldr_adapter_info gauge\n", own)

    def test_samples_of_openmetrics_belong_to_what_is_announced_before(self):
        suffix = {"counter": "_total", "info": "_info", "gauge": ""}
        announced = None
        for line in metrics("--format", "openmetrics").splitlines()[:-1]:
            if line.startswith("# TYPE "):
                _, _, name, kind = line.split()
                announced = name + suffix[kind]
            elif not line.startswith("#"):
                self.assertEqual(re.match(r"\w+", line)[0], announced)

    def test_base_units(self):
        text = metrics()
        self.assertEqual(samples(text, "kldr_port_speed_bytes")["10:00:02:4b:4c:10:00:00"], "1000000000")
        self.assertEqual(samples(text, "kldr_port_supply_volts")["10:00:02:4b:4c:10:00:00"], "3.29")
        self.assertEqual(samples(text, "kldr_port_receive_power_watts")["10:00:02:4b:4c:10:00:00"], "0.00048")
        self.assertEqual(samples(text, "kldr_port_logical_units")["10:00:02:4b:4c:10:00:00"], "5")
        # An empty slot has no temperature, and a link that is down no speed.
        self.assertNotIn("10:00:02:4b:4c:10:00:01", samples(text, "kldr_port_temperature_celsius"))
        self.assertNotIn("10:00:02:4b:4c:10:00:01", samples(text, "kldr_port_speed_bytes"))


class Hostile(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = Path(folder.name)

    def on(self, **host):
        inventory = self.folder / "inventory.json"
        inventory.write_text(json.dumps(host), encoding="utf-8")
        return metrics(inventory=inventory)

    def test_names_that_no_label_can_hold_as_they_are(self):
        port = {"wwn": "10:00:02:4b:4c:10:00:00", "PortSymbolicName": 'a"b\\c\nd\u00e9'}
        text = self.on(adapters=[{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "fcPorts": [port]}])
        self.assertIn('name="a\\"b\\\\c\\nd\u00e9"} 1\n', text)
        self.assertEqual(promtool("check", "metrics", text=text), (0, ""))

    def test_things_without_a_name_of_their_own_come_once(self):
        adapters = [
            {"hbaData": {"wwn": f"20:00:02:4b:4c:{n}0:00:00"}, "driver": {"storageDriverName": None},
             "fcPorts": [{"wwn": f"10:00:02:4b:4c:{n}0:00:00"}]} for n in (1, 2)
        ]
        text = self.on(adapters=adapters)
        self.assertEqual(len(re.findall(r'^kldr_adapter_in_service\{adapter=""\}', text, re.M)), 1)
        self.assertEqual(promtool("check", "metrics", text=text), (0, ""))

    def test_a_host_without_adapters(self):
        text = self.on()
        self.assertEqual(families(text), families(metrics()))
        self.assertIn("\nkldr_collect_failures 0\n", text)
        self.assertEqual(promtool("check", "metrics", text=text), (0, ""))

    def test_what_the_agent_refuses_is_left_out(self):
        port = {"wwn": "10:00:02:4b:4c:10:00:00", "optics": {"readings": None}}
        text = self.on(adapters=[{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "fcPorts": [port]}])
        self.assertEqual(samples(text, "kldr_port_temperature_celsius"), {})


class Files(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = Path(folder.name)
        self.file = self.folder / "kldr.prom"

    def test_a_file_is_there_as_a_whole(self):
        self.file.write_text("old\n", encoding="utf-8")
        self.file.chmod(0o600)
        os.link(self.file, self.folder / "before")
        old = os.umask(0o022)
        self.addCleanup(os.umask, old)
        self.assertEqual(metrics("--output", self.file), "")
        self.assertTrue(self.file.read_text(encoding="utf-8").endswith("# EOF\n"))
        self.assertEqual(self.file.stat().st_mode & 0o777, 0o644)
        # Replaced and not written over: who had it open reads on.
        self.assertEqual((self.folder / "before").read_text(encoding="utf-8"), "old\n")
        self.assertEqual(sorted(each.name for each in self.folder.iterdir()), ["before", "kldr.prom"])

    def test_what_cannot_be_written_is_named(self):
        for name, reason in ((self.folder / "no/kldr.prom", "No such file or directory"), (self.folder, "Is a directory")):
            done = subprocess.run([BUILD / "kldrcim", "metrics", "--output", name], capture_output=True, text=True, check=False, env=ENVIRONMENT)
            self.assertEqual((done.returncode, done.stdout), (1, ""))
            self.assertEqual(done.stderr, f"kldrcim: cannot write {name}: {reason}\n")
        self.assertEqual(list(self.folder.iterdir()), [])

    def test_bad_input_is_named(self):
        for arguments, error in (
            (["metrics", "--output="], '--output takes a file name, not ""'),
            (["metrics", "--format", "json"], "--format json makes no sense for metrics"),
            (["tree", "--format", "openmetrics"], "--format openmetrics makes no sense for tree"),
            (["tree", "--output", "x"], "--output makes no sense for tree; it is for metrics"),
            (["metrics", "x"], "usage: kldrcim [options] metrics"),
        ):
            done = subprocess.run([BUILD / "kldrcim", *arguments], capture_output=True, text=True, check=False, env=ENVIRONMENT)
            self.assertEqual((done.returncode, done.stderr), (2, f"kldrcim: {error}\n"))


class Examples(unittest.TestCase):
    def test_the_alert_rules_are_rules(self):
        status, said = promtool("check", "rules", EXAMPLES / "kldr_alerts.yml")
        self.assertEqual(status, 0, said)

    def test_the_alerts_come_when_they_should(self):
        with tempfile.TemporaryDirectory() as name:
            folder = Path(name)
            for file in (EXAMPLES / "kldr_alerts.yml", SOURCE / "tests/deploy/kldr_alerts_test.yml"):
                (folder / file.name).write_text(file.read_text(encoding="utf-8"), encoding="utf-8")
            status, said = promtool("test", "rules", "kldr_alerts_test.yml", cwd=folder)
            self.assertEqual(status, 0, said)
            # Each rule is tried.
            names = set(re.findall(r"alert: (\w+)", (folder / "kldr_alerts.yml").read_text(encoding="utf-8")))
            tried = set(re.findall(r"alertname: (\w+)\n", (folder / "kldr_alerts_test.yml").read_text(encoding="utf-8")))
            self.assertEqual(names, tried)
            # A rule that is wrong is seen.
            rules = (folder / "kldr_alerts.yml").read_text(encoding="utf-8")
            (folder / "kldr_alerts.yml").write_text(rules.replace("celsius > 70", "celsius > 80"), encoding="utf-8")
            self.assertNotEqual(promtool("test", "rules", "kldr_alerts_test.yml", cwd=folder)[0], 0)

    def test_rules_and_dashboard_name_metrics_that_there_are(self):
        known = families(metrics())
        for file in (EXAMPLES / "kldr_alerts.yml", EXAMPLES / "kldr_dashboard.json"):
            named = set(re.findall(r"\bkldr_[a-z_]+\b", file.read_text(encoding="utf-8"))) - {"kldr_"}
            self.assertLess(8, len(named))
            self.assertEqual(named - known, set(), file.name)

    def test_each_expression_of_the_dashboard_is_one(self):
        dashboard = json.loads((EXAMPLES / "kldr_dashboard.json").read_text(encoding="utf-8"))
        expressions = [target["expr"] for panel in dashboard["panels"] for target in panel["targets"]]
        self.assertLess(15, len(expressions))
        rules = [{"record": f"panel:{number}", "expr": self.as_grafana_asks(each)} for number, each in enumerate(expressions)]
        with tempfile.TemporaryDirectory() as name:
            file = Path(name) / "rules.yml"
            # JSON is YAML.
            file.write_text(json.dumps({"groups": [{"name": "dashboard", "rules": rules}]}), encoding="utf-8")
            status, said = promtool("check", "rules", file)
            self.assertEqual(status, 0, said)
            self.assertIn(f"{len(rules)} rules found", said)

    def as_grafana_asks(self, expression):
        return expression.replace("$__rate_interval", "5m").replace("$instance", ".*")

    def test_the_page_lists_the_metrics_that_there_are(self):
        page = (SOURCE / "docs/fleet.md").read_text(encoding="utf-8")
        self.assertEqual(set(re.findall(r"^\| `(kldr_\w+)`", page, re.M)), families(metrics()))


def free_port():
    with closing(socket.socket()) as one:
        one.bind(("127.0.0.1", 0))
        return one.getsockname()[1]


@contextmanager
def running(*command, cwd):
    with open(Path(cwd) / "log", "ab") as log, subprocess.Popen(
        command, cwd=cwd, env=dict(ENVIRONMENT, HOME=str(cwd)), stdout=log, stderr=log, stdin=subprocess.DEVNULL
    ) as program:
        try:
            yield program
        finally:
            program.kill()


class Collected(unittest.TestCase):
    """One Prometheus that scrapes `kldrcim serve`, openly and by TLS with a password, and another host through the files of a
    node exporter."""

    @classmethod
    def setUpClass(cls):
        folder = tempfile.TemporaryDirectory()
        cls.addClassCleanup(folder.cleanup)
        cls.folder = Path(folder.name)
        cls.make_guard()
        serve, guarded = free_port(), free_port()
        cls.start(BUILD / "kldrcim", "serve", "--listen", f"127.0.0.1:{serve}")
        cls.start(BUILD / "kldrcim", "serve", "--listen", f"127.0.0.1:{guarded}",
                  "--tls-cert", "cert.pem", "--tls-key", "key.pem", "--users", "users")
        files = cls.folder / "files"
        files.mkdir()
        metrics("--output", files / "kldr.prom", inventory=SOURCE / "simulator/inventories/rich.json")
        exporter, cls.port = free_port(), free_port()
        cls.start("prometheus-node-exporter", "--collector.disable-defaults", "--collector.textfile",
                  f"--collector.textfile.directory={files}", f"--web.listen-address=127.0.0.1:{exporter}")
        (cls.folder / "prometheus.yml").write_text(json.dumps({
            "global": {"scrape_interval": "2s", "scrape_timeout": "2s", "evaluation_interval": "1s"},
            "rule_files": [str(EXAMPLES / "kldr_alerts.yml")],
            "scrape_configs": [
                {"job_name": "serve", "static_configs": [{"targets": [f"127.0.0.1:{serve}"]}]},
                {"job_name": "guarded", "scheme": "https", "tls_config": {"ca_file": "cert.pem"},
                 "basic_auth": {"username": "prometheus", "password_file": "password"},
                 "static_configs": [{"targets": [f"127.0.0.1:{guarded}"]}]},
                {"job_name": "files", "static_configs": [{"targets": [f"127.0.0.1:{exporter}"]}]},
            ],
        }), encoding="utf-8")
        cls.start("prometheus", "--config.file=prometheus.yml", f"--storage.tsdb.path={cls.folder / 'data'}",
                  f"--web.listen-address=127.0.0.1:{cls.port}")

    @classmethod
    def make_guard(cls):
        """Certificate, password and users."""
        key = ("-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:P-256", "-nodes", "-keyout", "key.pem", "-out", "cert.pem")
        output_of("openssl", "req", "-x509", *key, "-subj", "/CN=host", "-addext", "subjectAltName=IP:127.0.0.1", cwd=cls.folder)
        (cls.folder / "password").write_text("secret", encoding="ascii")
        done = output_of("openssl", "passwd", "-6", "secret")
        (cls.folder / "users").write_text(f"prometheus:{done}", encoding="ascii")
        (cls.folder / "users").chmod(0o600)

    @classmethod
    def start(cls, *command):
        program = running(*command, cwd=cls.folder)
        program.__enter__()
        cls.addClassCleanup(program.__exit__, None, None, None)

    def ask(self, path, **arguments):
        url = f"http://127.0.0.1:{self.port}/api/v1/{path}?{urllib.parse.urlencode(arguments)}"
        with urllib.request.urlopen(url, timeout=10) as answer:
            return json.load(answer)["data"]

    def query(self, expression):
        """Value by labels that are worth comparing; asked until there is one."""
        end = time.monotonic() + SECONDS
        while time.monotonic() < end:
            try:
                found = self.ask("query", query=expression)["result"]
            except (urllib.error.URLError, ConnectionError, json.JSONDecodeError):
                found = []
            if found:
                return {
                    tuple(sorted((k, v) for k, v in each["metric"].items() if k not in ("__name__", "instance", "job"))): each["value"][1]
                    for each in found
                }
            time.sleep(0.2)
        raise AssertionError(f"no answer to {expression}: {(self.folder / 'log').read_text(encoding='utf-8', errors='replace')[-2000:]}")

    def test_a_scrape_shows_the_host(self):
        self.assertEqual(
            self.query('kldr_port_in_service{job="serve"} == 0'), {(("port", "10:00:02:4b:4c:10:00:01"),): "0"}
        )
        self.assertEqual(self.query('sum(kldr_target_logical_units{job="serve"})'), {(): "8"})
        self.assertEqual(self.query('kldr_module_info{job="serve"}'), {(("version", "3.2.3.0"),): "1"})
        self.query('up{job="serve"} == 1')
        # Prometheus prefers OpenMetrics, where a counter is announced without what its samples end in.
        kinds = {(each["target"]["job"], each["type"]) for each in self.ask("targets/metadata", metric="kldr_port_crc_errors")}
        self.assertIn(("serve", "counter"), kinds)

    def test_a_scrape_by_tls_with_a_password(self):
        self.query('up{job="guarded"} == 1')
        self.assertEqual(self.query('sum(kldr_target_logical_units{job="guarded"})'), {(): "8"})

    def test_a_file_comes_through_the_node_exporter(self):
        self.assertEqual(self.query('node_textfile_scrape_error{job="files"}'), {(): "0"})
        text = metrics(inventory=SOURCE / "simulator/inventories/rich.json")
        self.assertEqual(
            {labels[0][1]: value for labels, value in self.query('kldr_port_in_service{job="files"}').items()},
            samples(text, "kldr_port_in_service"),
        )

    def test_an_alert_of_the_examples_begins(self):
        self.query('ALERTS{alertname="TargetWithOnePath", alertstate="pending", target="50:24:b4:c0:00:50:00:01"}')


if __name__ == "__main__":
    unittest.main()
