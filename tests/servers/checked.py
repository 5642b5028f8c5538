"""Runs a check inside the machine: package installed, module registered by the documentation alone, server running.

checked.py FILE [--long]
"""

import os
import subprocess
import sys

import package
from server import ADMINISTRATOR, Server

#: Every kind of thing once.
INVENTORY = "/mnt/source/simulator/inventories/rich.json"


def main(file, *options):
    server = Server()
    server.module_environment["KLDR_SIMULATOR_INVENTORY"] = INVENTORY
    server.prepare()
    package.install()
    package.register("install")
    server.start()
    environment = [f"{name}={value}" for name, value in server.module_environment.items()]
    own = {"PATH": ADMINISTRATOR, "HOME": "/root", "LC_ALL": "C.UTF-8", "KLDR_CLIENTS": os.environ["KLDR_CLIENTS"]}
    done = subprocess.run(
        [sys.executable, "-B", file, "--url", server.url, "--server", server.kind, "--kldrcim", "/usr/bin/kldrcim",
         "--module-environment", *environment, *options],
        env=own, check=False,
    )  # fmt: skip
    server.kill()
    return done.returncode


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))
