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
    if server.is_ours:
        package.install()
    else:
        server.prepare()
        package.install()
        package.register("install")
    server.start()
    remote = ["--remote-kldrcim", server.room["remote_kldrcim"]] if server.room["remote_kldrcim"] else []
    environment = [f"{name}={value}" for name, value in server.module_environment.items()]
    own = {"PATH": ADMINISTRATOR, "HOME": "/root", "LC_ALL": "C.UTF-8", "KLDR_CLIENTS": os.environ["KLDR_CLIENTS"]}
    done = subprocess.run(
        [sys.executable, "-B", file, "--url", server.url, "--server", server.kind, "--kldrcim", "/usr/bin/kldrcim",
         *remote, "--module-environment", *environment, *options],
        env=own, check=False,
    )  # fmt: skip
    server.kill()
    return done.returncode


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))
