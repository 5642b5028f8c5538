"""Machines with servers that wait for orders, as whoever measures them sees them from outside."""

import atexit
import json
import subprocess
import tempfile

import machine


class Room:
    """One server in its machine; `bench_room.py` knows the orders. With `plain`, the plain providers stand in the module's place;
    `log` is the text of the module's settings of its log."""

    def __init__(self, server, build, plain=False, log=""):
        self.name = f"{server.name}, {'plain providers' if plain else 'module'}"
        self.errors = tempfile.TemporaryFile(mode="w+", encoding="utf-8")
        self.process = subprocess.Popen(
            machine.command_in(server, build / "servers", ["/usr/bin/python3", "-B", "-W", "ignore", "bench_room.py"]),
            env=machine.environment_for(server, plain=plain, log=log), stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=self.errors,
            text=True,
        )  # fmt: skip
        # Whatever ends this program, the machine ends with it.
        atexit.register(self.process.kill)

    def wait(self):
        """The result of the order that was given last, or the word that it is ready for the first one."""
        line = self.process.stdout.readline()
        if not line:
            self.errors.seek(0)
            raise SystemExit(f"bench: {self.name}:\n{self.errors.read()}")
        return json.loads(line)

    def order(self, what, *words):
        self.process.stdin.write(json.dumps({"do": what, "with": words}) + "\n")
        self.process.stdin.flush()
        return self.wait()

    def end(self):
        self.process.stdin.close()
        self.process.wait()
        self.process.stdout.close()
        self.errors.close()
