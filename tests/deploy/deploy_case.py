"""Base of the tests of a release: the build under test, installed below a temporary folder."""

import os
import re
import subprocess
import sys
import tempfile
import unittest
from pathlib import Path

SOURCE = Path(os.environ["KLDR_SOURCE"])
BUILD = Path(os.environ["KLDR_BUILD"])
CMAKE = os.environ["KLDR_CMAKE"]
WORD_SIZE = int(os.environ.get("KLDR_WORD_SIZE") or 64)

# Nothing of the machine that runs the test but its programs: the tools of a CIM server on PATH are none of ours, and the
# simulator stands in for the adapter library.
PROGRAMS = "/usr/bin:/bin"
ENVIRONMENT = {
    "PATH": PROGRAMS,
    "HOME": "/nonexistent",
    "LC_ALL": "C.UTF-8",
    "LD_LIBRARY_PATH": str(BUILD / "simulator"),
    "KLDR_SIMULATOR_INVENTORY": str(SOURCE / "simulator/inventories/demo.json"),
}

sys.path.insert(0, str(SOURCE / "module/schema"))


def output_of(*command, **options):
    done = subprocess.run(command, capture_output=True, text=True, check=False, env=ENVIRONMENT, **options)
    if done.returncode:
        raise AssertionError(f"{command}: status {done.returncode}: {done.stderr}")
    return done.stdout


def instances_of(mof, class_name):
    """The instances of the class in a MOF text: name and value of each property, quotes and braces removed."""
    found = []
    for body in re.findall(rf"^instance of {class_name}\s*\{{\n(.*?)^\}};", mof, re.M | re.S):
        pairs = re.findall(r"^\s*(\w+) = (.*);$", body, re.M)
        found.append({name: re.sub(r'["{}]', "", value) for name, value in pairs})
    return found


class DeployCase(unittest.TestCase):
    """Installs once a class, below `root`/usr."""

    @classmethod
    def setUpClass(cls):
        folder = tempfile.TemporaryDirectory()
        cls.addClassCleanup(folder.cleanup)
        cls.root = Path(folder.name)
        cls.prefix = cls.root / "usr"
        output_of(CMAKE, "--install", str(BUILD), "--prefix", str(cls.prefix))
        cls.share = cls.prefix / "share/kldrprovider"
