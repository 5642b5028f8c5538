"""The other side of each comparison: the command line, over the same module and the same simulated host."""

import json
import re
import subprocess
import tempfile
from pathlib import Path

from client import Check


class Refusal(Exception):
    """A CIM status that a request was answered with."""

    def __init__(self, status, text):
        super().__init__(text)
        self.status = status


class Kldrcim:
    """Runs the program, once a request; what it says is kept, since a simulated host that nobody touches does not change."""

    def __init__(self, check: Check):
        self.program = check.options.kldrcim
        self.environment = check.environment
        self.options = []
        self.answers = {}
        self.folder = tempfile.TemporaryDirectory()

    def know_server(self, instances):
        """Has the module find these instances where it asks its server, so that it names the server alike."""
        entries = [
            {
                "namespace": "root/PG_InterOp",
                "class": instance.classname,
                "superclass": "CIM_ObjectManager",
                "properties": {
                    name: value for name, value in instance.items() if isinstance(value, str) and name != "CreationClassName"
                },
            }
            for instance in instances
        ]
        for entry in entries:
            if entry["class"] == entry["superclass"]:
                del entry["superclass"]
        file = Path(self.folder.name) / "server.json"
        file.write_text(json.dumps(entries), encoding="utf-8")
        self.options = ["--server-instances", str(file)]

    def ask(self, *words):
        """What it prints as JSON; an answer that names a CIM status is raised."""
        if words not in self.answers:
            self.answers[words] = self.run(*words)
        done = self.answers[words]
        if isinstance(done, Refusal):
            raise done
        return done

    def run(self, *words):
        command = [self.program, "--format", "json", *self.options, *words]
        done = subprocess.run(command, capture_output=True, text=True, check=False, env=self.environment)
        if done.returncode == 0:
            return json.loads(done.stdout)
        status = re.search(r"CIM_ERR_\w+ \((\d+)\)", done.stderr)
        if not status:
            raise AssertionError(f"{' '.join(command)}: status {done.returncode}: {done.stderr.strip()}")
        return Refusal(int(status[1]), done.stderr.strip())
