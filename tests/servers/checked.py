"""Runs a check inside the machine: package installed, module registered by the documentation alone, server running.

checked.py FILE [--long]
"""

import subprocess
import sys

import package
from server import ADMINISTRATOR, Server


def main(file, *options):
    server = Server()
    server.prepare()
    package.install()
    package.register("install")
    server.start()
    environment = [f"{name}={value}" for name, value in server.module_environment.items()]
    done = subprocess.run(
        [sys.executable, "-B", file, "--url", server.url, "--server", server.kind, "--kldrcim", "/usr/bin/kldrcim",
         "--module-environment", *environment, *options],
        env={"PATH": ADMINISTRATOR, "HOME": "/root", "LC_ALL": "C.UTF-8"}, check=False,
    )  # fmt: skip
    server.kill()
    return done.returncode


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))
