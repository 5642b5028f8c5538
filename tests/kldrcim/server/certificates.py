"""Certificates that openssl makes: who is trusted, who is not, and who was."""

import os
import ssl
import subprocess

SETTINGS = """
[req]
distinguished_name = name
[name]
[authority]
basicConstraints = critical,CA:TRUE
keyUsage = critical,keyCertSign
subjectKeyIdentifier = hash
[here]
subjectAltName = IP:127.0.0.1,DNS:localhost
[elsewhere]
subjectAltName = DNS:elsewhere.example
"""


class Certificates:
    """Two authorities, and what the first of them has signed."""

    def __init__(self, folder):
        self.folder = folder
        with open(self.file("settings"), "w", encoding="ascii") as settings:
            settings.write(SETTINGS)
        self.make("authority", "authority")
        self.make("stranger", "authority")
        for name in ("here", "elsewhere"):
            self.make(name, name, *self.authority())
        self.make_old("here", "old")

    def file(self, name):
        return os.path.join(self.folder, name)

    def make(self, name, extensions, *options):
        files = ("-keyout", self.file(f"{name}.key"), "-out", self.file(f"{name}.pem"))
        command = ["/usr/bin/openssl", "req", "-x509", "-config", self.file("settings"), "-extensions", extensions, "-days", "2"]
        key = ("-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:P-256", "-nodes", "-subj", f"/CN={name}")
        subprocess.run([*command, *key, *files, *options], capture_output=True, check=True)

    def make_old(self, name, old):
        """The same again, over since yesterday."""
        request = ["/usr/bin/openssl", "x509", "-x509toreq", "-in", self.file(f"{name}.pem"), "-signkey", self.file(f"{name}.key")]
        asked = subprocess.run(request, capture_output=True, check=True).stdout
        answer = ["/usr/bin/openssl", "x509", "-req", "-days", "-1", "-extfile", self.file("settings"), "-extensions", name]
        subprocess.run([*answer, *self.authority(), "-CAcreateserial", "-out", self.file(f"{old}.pem")], input=asked, capture_output=True, check=True)

    def authority(self):
        return ("-CA", self.file("authority.pem"), "-CAkey", self.file("authority.key"))

    def options(self, name, key=None):
        return ("--tls-cert", self.file(f"{name}.pem"), "--tls-key", self.file(f"{key or name}.key"))

    def trust(self, name):
        return ssl.create_default_context(cafile=self.file(f"{name}.pem"))
