"""What the checks of this folder share: their arguments, the client library, and the report of what differs.

A check runs beside a CIM server that has the module, and is given the command line over the same module and the same
simulated host to compare with:

    CHECK --url URL --server sfcb|pegasus|serve --kldrcim PROGRAM --module-environment NAME=VALUE... [--long]

`--remote-kldrcim PROGRAM` is a command line that knows `--url`, where that of the module's word size was built without.
It ends with 0, or with 1 and a line for each thing that is not as it should be.
"""

import argparse
import atexit
import importlib
import os
import shutil
import sys
import tarfile
import tempfile
import time
import warnings
from pathlib import Path

from server_traits import traits_of

NAMESPACE = "root/kaldera"
INTEROP = {"sfcb": "root/interop", "pegasus": "root/PG_InterOp", "serve": "interop"}
#: Seconds in which a server answers; its own limit for a provider is shorter.
PATIENCE = 60
#: What a check shows of a flood of differences.
LINES = 60


def import_pywbem():
    """The installed library, or the one that an archive below KLDR_CLIENTS holds."""
    warnings.simplefilter("ignore")
    try:
        return importlib.import_module("pywbem")
    except ImportError:
        archive = Path(os.environ.get("KLDR_CLIENTS", "")) / "pywbem.tar.gz"
        if not archive.is_file():
            sys.exit("pywbem is not installed, and KLDR_CLIENTS names no folder with pywbem.tar.gz")
    folder = tempfile.mkdtemp()
    atexit.register(shutil.rmtree, folder, True)
    with tarfile.open(archive) as content:
        content.extractall(folder)
    sys.path[:0] = [str(path) for path in Path(folder).iterdir()]
    sys.dont_write_bytecode = True
    return importlib.import_module("pywbem")


pywbem = import_pywbem()


class Check:
    """A check's options, its connection, and what it has found."""

    def __init__(self, description, arguments=None):
        parser = argparse.ArgumentParser(description=description)
        parser.add_argument("--url", required=True)
        parser.add_argument("--server", required=True, choices=sorted(INTEROP))
        parser.add_argument("--kldrcim", required=True)
        parser.add_argument("--remote-kldrcim", metavar="PROGRAM", help="for --url, where the other has it not")
        parser.add_argument("--module-environment", nargs="*", default=[], metavar="NAME=VALUE")
        parser.add_argument("--long", action="store_true")
        self.options = parser.parse_args(arguments)
        self.server = self.options.server
        self.long = self.options.long
        self.interop = INTEROP[self.server]
        self.connection = self.connect()
        self.traits = traits_of(self.server, pywbem.WBEMServer(self.connection).version)
        self.begun = time.monotonic()
        self.compared = 0
        self.differences = []

    @property
    def environment(self):
        """That of the module in the server, for programs that load it themselves."""
        return {**os.environ, **dict(each.split("=", 1) for each in self.options.module_environment)}

    def connect(self, namespace=NAMESPACE):
        return pywbem.WBEMConnection(self.options.url, default_namespace=namespace, timeout=PATIENCE)

    def differs(self, what, *details):
        self.differences.append(": ".join([what, *map(str, details)]))

    def expect(self, what, found, expected):
        """Compares two values that a reader can compare."""
        self.compared += 1
        if found != expected:
            self.differs(what, f"{found!r} instead of {expected!r}")
        return found == expected

    def expect_that(self, what, holds, *details):
        self.compared += 1
        if not holds:
            self.differs(what, *details)
        return holds

    def attempt(self, what, request, *arguments, **options):
        """The answer to a request of the client library, or None after a refusal, which is a difference."""
        self.compared += 1
        try:
            return request(*arguments, **options)
        except pywbem.Error as error:
            self.differs(what, " ".join(str(error).split()))
            return None

    def refused(self, what, status, request, *arguments, **options):
        """Expects a request to be answered with a CIM status."""
        try:
            request(*arguments, **options)
        except pywbem.CIMError as error:
            return self.expect(f"{what}: status", error.status_code, status)
        except pywbem.Error as error:
            return self.expect_that(what, False, error)
        return self.expect_that(what, False, f"an answer instead of status {status}")

    def finish(self):
        """Ends the program with what was found."""
        self.connection.close()
        seconds = time.monotonic() - self.begun
        for line in self.differences[:LINES]:
            print(line)
        if len(self.differences) > LINES:
            print(f"... and {len(self.differences) - LINES} more")
        print(f"{self.server}: {self.compared} comparisons, {len(self.differences)} differences, {seconds:.1f} s")
        # A check that compared nothing has proven nothing.
        sys.exit(1 if self.differences or not self.compared else 0)
