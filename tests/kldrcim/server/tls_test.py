"""TLS of `kldrcim serve`, with certificates that openssl makes: who is trusted, who is not, and what is served without it."""

import os
import socket
import ssl
import subprocess
import tempfile
import time
import unittest

from certificates import Certificates
from serving import PATIENCE, Served, basic, class_parameter, intrinsic, read_all, write_users

NAMES = intrinsic("EnumerateInstanceNames", class_parameter("ClassName", "CIM_FCPort"))


class Tls_Case(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        folder = tempfile.TemporaryDirectory()
        cls.addClassCleanup(folder.cleanup)
        cls.made = Certificates(folder.name)

    def serve(self, *options):
        served = Served(*options)
        self.addCleanup(served.stop)
        return served

    def kldrcim(self, *arguments, **environment):
        """Status, output and complaints of the client."""
        own = {"PATH": "/usr/bin:/bin", "HOME": self.made.folder}
        keep = {name: value for name, value in os.environ.items() if name.endswith("SAN_OPTIONS")}
        command = [os.environ["KLDRCIM"], "--timeout", "20", *arguments, "ein", "CIM_FCPort"]
        done = subprocess.run(command, env=own | keep | environment, capture_output=True, text=True, timeout=PATIENCE, check=False)
        return done.returncode, done.stdout, done.stderr

    def assert_ports(self, answer):
        status, output, complaints = answer
        self.assertEqual((status, complaints), (0, ""))
        self.assertIn("10:00:02:4b:4c:10:00:00".replace(":", "").upper(), output.upper().replace(":", ""))


class Trust(Tls_Case):
    @classmethod
    def setUpClass(cls):
        super().setUpClass()
        cls.served = Served(*cls.made.options("here"))
        cls.addClassCleanup(cls.served.stop)

    def test_the_right_authority(self):
        self.assertTrue(self.served.url.startswith("https://127.0.0.1:"))
        status, fields, body = self.served.post(NAMES, self.made.trust("authority"))
        self.assertEqual((status, fields["CIMOperation"], body.count("<INSTANCENAME")), (200, "MethodResponse", 5))
        self.assert_ports(self.kldrcim("--url", self.served.url, "--cacert", self.made.file("authority.pem")))
        named = self.served.url.replace("127.0.0.1", "localhost")
        self.assert_ports(self.kldrcim("--url", named, "--cacert", self.made.file("authority.pem")))

    def test_the_metrics(self):
        status, fields, text = self.served.ask("GET", "/metrics", tls=self.made.trust("authority"))
        self.assertEqual((status, fields["Content-Type"].split(";")[0]), (200, "text/plain"))
        self.assertTrue(text.endswith("# EOF\n"))

    def test_nobody_or_a_stranger_vouches(self):
        for trust in (ssl.create_default_context(), self.made.trust("stranger")):
            with self.assertRaises(ssl.SSLCertVerificationError):
                self.served.post(NAMES, trust)
        for options in ((), ("--cacert", self.made.file("stranger.pem"))):
            status, output, complaints = self.kldrcim("--url", self.served.url, *options)
            self.assertEqual((status, output), (2, ""))
            self.assertIn(f"kldrcim: the certificate of {self.served.url} is not to be trusted: ", complaints)
            self.assertIn("; --cacert FILE names who may have signed it\n", complaints)
            self.assertEqual(complaints.count("\n"), 1)

    def test_insecure(self):
        status, output, complaints = self.kldrcim("--url", self.served.url, "--insecure")
        self.assertEqual((status, output.count("\n")), (0, 5))
        self.assertIn(f"kldrcim: warning: --insecure: whoever answers at {self.served.url} is taken for the server", complaints)

    def test_versions(self):
        for version in (ssl.TLSVersion.TLSv1_2, ssl.TLSVersion.TLSv1_3):
            trust = self.made.trust("authority")
            trust.minimum_version = trust.maximum_version = version
            self.assertEqual(self.served.post(NAMES, trust)[0], 200)
        old = self.made.trust("authority")
        # This side would do it.
        old.set_ciphers("ALL:@SECLEVEL=0")
        old.minimum_version = old.maximum_version = ssl.TLSVersion.TLSv1_1
        with self.assertRaises(ssl.SSLError):
            self.served.post(NAMES, old)

    def test_plain_http_gets_nothing(self):
        begin = time.monotonic()
        status, output, complaints = self.kldrcim("--url", self.served.url.replace("https", "http"))
        self.assertEqual((status, output, complaints.count("\n")), (2, "", 1), complaints)
        self.assertNotIn(b"INSTANCENAME", self.served.raw(f"GET /metrics HTTP/1.1\r\nHost: localhost\r\n\r\n{NAMES}".encode()))
        self.assertLess(time.monotonic() - begin, 15)
        self.assertEqual(self.served.post(NAMES)[0], 200)

    def test_who_says_nothing_holds_up_nobody(self):
        with socket.create_connection(("127.0.0.1", self.served.port), PATIENCE) as silent:
            begin = time.monotonic()
            self.assertEqual(self.served.post(NAMES)[0], 200)
            self.assertLess(time.monotonic() - begin, 8)
            self.assertEqual(read_all(silent), b"")
            self.assertLess(time.monotonic() - begin, 20)


class Mistakes(Tls_Case):
    def refused(self, *options):
        with self.assertRaises(AssertionError) as caught:
            self.serve(*options)
        return str(caught.exception)

    def test_a_certificate_of_another_host(self):
        served = self.serve(*self.made.options("elsewhere"))
        with self.assertRaises(ssl.SSLCertVerificationError):
            served.post(NAMES, self.made.trust("authority"))
        status, _, complaints = self.kldrcim("--url", served.url, "--cacert", self.made.file("authority.pem"))
        self.assertEqual(status, 2)
        self.assertIn("is not to be trusted", complaints)

    def test_a_certificate_that_is_over(self):
        served = self.serve(*self.made.options("old", "here"))
        status, output, complaints = self.kldrcim("--url", served.url, "--cacert", self.made.file("authority.pem"))
        self.assertEqual((status, output, complaints.count("\n")), (2, "", 1))
        self.assertIn("is not to be trusted: ", complaints)
        self.assertIn("expired", complaints)

    def test_tls_to_a_plain_server(self):
        served = self.serve()
        status, _, complaints = self.kldrcim("--url", served.url.replace("http", "https"), "--insecure")
        self.assertEqual(status, 2)
        self.assertIn(f"kldrcim: no TLS with https://127.0.0.1:{served.port}: ", complaints)
        self.assertEqual(served.post(NAMES)[0], 200)

    def test_files_that_do_not_serve(self):
        unusable = "the certificate or key cannot be used"
        self.assertIn(unusable, self.refused(*self.made.options("here", key="stranger")))
        self.assertIn(unusable, self.refused("--tls-cert", self.made.file("settings"), "--tls-key", self.made.file("here.key")))
        self.assertIn("No such file", self.refused("--tls-cert", "/proc/none", "--tls-key", self.made.file("here.key")))

    def test_authorities_that_are_none(self):
        self.assertIn("--cacert: no certificates in ", self.refused("--cacert", self.made.file("here.key")))
        self.assertIn("/proc/none: No such file", self.refused("--cacert", "/proc/none"))

    def test_other_hosts_take_tls_and_users(self):
        users, password = self.made.file("users"), self.made.file("password")
        write_users(users, "anne", "secret")
        tls = self.made.options("here")
        for address in ("0.0.0.0:0", "[::]:0"):
            for options in ((), tls, ("--users", users)):
                self.assertIn("can be reached from outside", self.refused("--listen", address, *options))
        served = self.serve("--listen", "0.0.0.0:0", *tls, "--users", users)
        trust = self.made.trust("authority")
        self.assertEqual(served.post(NAMES, trust)[0], 401)
        self.assertEqual(served.post(NAMES, trust, Authorization=basic("anne", "secret"))[0], 200)
        with open(password, "w", encoding="ascii") as file:
            file.write("secret\n")
        os.chmod(password, 0o600)
        url = f"https://anne@127.0.0.1:{served.port}"
        self.assert_ports(self.kldrcim("--url", url, "--cacert", self.made.file("authority.pem"), "--password-file", password))


if __name__ == "__main__":
    unittest.main()
