"""GET /metrics: the host in numbers for a collector, under the rules of all other requests."""

import os
import re
import subprocess
import tempfile
import threading
import unittest

from serving import Served, Serving_Case, basic, error_code, class_parameter, write_users

PROMETHEUS = "text/plain; version=0.0.4; charset=utf-8"
OPENMETRICS = "application/openmetrics-text; version=1.0.0; charset=utf-8"
#: As Prometheus sends it.
BOTH = "application/openmetrics-text;version=1.0.0;q=0.5,text/plain;version=0.0.4;q=0.3,*/*;q=0.2"


def printed(served, *options):
    """What the verb says of the same host."""
    command = [os.environ["KLDRCIM"], "--url", served.url, "metrics", *options]
    environment = {"PATH": "/usr/bin:/bin", "HOME": served.home.name}
    return subprocess.run(command, env=environment, capture_output=True, text=True, check=True).stdout


def timeless(text):
    return re.sub(r"(?m)^kldr_collect_seconds .*$", "kldr_collect_seconds", text)


class Scrapes(Serving_Case):
    def scrape(self, method="GET", path="/metrics", **headers):
        return self.served.ask(method, path, **headers)

    def test_the_text_is_that_of_the_verb(self):
        for accept, media, options in (
            (None, PROMETHEUS, ()),
            ("text/plain", PROMETHEUS, ()),
            ("*/*", PROMETHEUS, ()),
            (BOTH, OPENMETRICS, ("--format", "openmetrics")),
            ("Application/OpenMetrics-Text", OPENMETRICS, ("--format", "openmetrics")),
        ):
            status, fields, text = self.scrape(**({"Accept": accept} if accept else {}))
            self.assertEqual((status, fields["Content-Type"]), (200, media), accept)
            self.assertNotIn("CIMOperation", fields)
            self.assertIn('kldr_port_in_service{port="10:00:02:4b:4c:10:00:00"} 1\n', text)
            self.assertEqual(timeless(text), timeless(printed(self.served, *options)))

    def test_a_question_mark_and_a_body_change_nothing(self):
        self.assertEqual(self.scrape(path="/metrics?x=1")[0], 200)
        self.assertEqual(self.scrape(body=b"x", Content_Type="text/plain")[0], 200)

    def test_head(self):
        status, fields, text = self.scrape("HEAD")
        self.assertEqual((status, fields["Content-Type"], text), (200, PROMETHEUS, ""))
        self.assertLess(1000, int(fields["Content-Length"]))

    def test_what_is_no_such_page(self):
        for method, path in (("GET", "/"), ("GET", "/metrics/"), ("GET", "/cimom"), ("HEAD", "/"), ("PUT", "/metrics")):
            self.assertEqual(self.scrape(method, path)[0], 405, (method, path))

    def test_web_pages_are_kept_out(self):
        self.assertEqual(self.scrape(Origin="http://evil.example")[0], 403)
        self.assertEqual(self.scrape(Host="evil.example")[0], 403)

    def test_many_at_once(self):
        texts = []
        threads = [threading.Thread(target=lambda: texts.append(timeless(self.scrape()[2]))) for _ in range(8)]
        for thread in threads:
            thread.start()
        call = self.served.call("EnumerateInstanceNames", class_parameter("ClassName", "CIM_FCPort"))
        self.assertEqual(error_code(call), 0)
        for thread in threads:
            thread.join()
        self.assertEqual((len(texts), len(set(texts))), (8, 1))


class Other_Module(Serving_Case):
    module = "KLDR_PLAIN_TOY"
    namespace = "root/toy"

    def test_a_module_without_such_a_host(self):
        status, fields, text = self.served.ask("GET", "/metrics")
        self.assertEqual((status, text), (503, ""))
        self.assertEqual(fields["PGErrorDetail"], "the%20module%20does%20not%20answer")


class Passwords(unittest.TestCase):
    def test_a_scrape_needs_one_too(self):
        with tempfile.TemporaryDirectory() as folder:
            users = os.path.join(folder, "users")
            write_users(users, "prometheus", "secret")
            served = Served("--users", users)
            status, fields, text = served.ask("GET", "/metrics")
            self.assertEqual((status, text), (401, ""))
            self.assertTrue(fields["WWW-Authenticate"].startswith("Basic realm="))
            self.assertEqual(served.ask("GET", "/metrics", Authorization=basic("prometheus", "wrong"))[0], 401)
            status, _, text = served.ask("GET", "/metrics", Authorization=basic("prometheus", "secret"))
            self.assertEqual(status, 200)
            self.assertTrue(text.endswith("\n# EOF\n"))
            self.assertEqual(served.stop(), 0)


if __name__ == "__main__":
    unittest.main()
