"""A CIM server inside a machine of its own: how it is started, asked, killed, and what it knows."""

import json
import os
import signal
import socket
import subprocess
import tempfile
import time
from pathlib import Path

import cim_question

#: What each kind's processes are called.
PROCESSES = {"sfcb": ("sfcbd",), "pegasus": ("cimserver", "cimprovagt"), "serve": ("kldrcim",)}
NAMESPACE = "root/kaldera"
INVENTORY = "/mnt/source/simulator/inventories/demo.json"
#: The administrator's search path, and the one that package managers give to their scripts.
ADMINISTRATOR = "/usr/local/sbin:/usr/local/bin:/usr/sbin:/usr/bin:/sbin:/bin"
MAINTAINER = "/usr/sbin:/usr/bin:/sbin:/bin"


def room():
    """What the one who made the machine says of it: the server's name, kind and word size, and the file of the package."""
    return json.loads(os.environ["KLDR_ROOM"])


def processes(names, zombies=False):
    """Those that run under one of these names, zombies left out unless they are wanted too."""
    found = []
    for entry in Path("/proc").iterdir():
        if not entry.name.isdigit():
            continue
        try:
            status = (entry / "stat").read_text(encoding="utf-8", errors="replace")
        except OSError:
            continue
        name, _, rest = status.partition("(")[2].rpartition(")")
        if name in names and (zombies or rest.split()[0] != "Z"):
            found.append(int(entry.name))
    return found


def padded(environment):
    """sfcb writes the titles of its provider processes over the first variables of their environment. Variables of no use take
    the blow; which ones come first is decided by the shell that starts the server, and so it is asked."""
    for count in range(50, 2000, 50):
        tried = {**{f"PADDING_{number}": "." * 50 for number in range(count)}, **environment}
        listed = subprocess.run(["bash", "-c", "exec env"], env=tried, capture_output=True, text=True, check=True).stdout
        if all(line.startswith("PADDING_") for line in listed.splitlines()[:8]):
            return tried
    raise AssertionError("other variables come first")


class Server:
    def __init__(self, port=5988):
        self.room = room()
        self.kind = self.room["kind"]
        self.word_size = self.room["word_size"]
        self.home = Path("/opt/cim-servers") / self.room["name"]
        self.port = port
        #: It is of the package, and knows the module without being told.
        self.is_ours = self.kind == "serve"
        #: The module's own settings in the server's environment.
        self.module_environment = {"KLDR_SIMULATOR_INVENTORY": INVENTORY, "HOME": "/root"}

    @property
    def url(self):
        return f"http://127.0.0.1:{self.port}"

    def environment(self):
        environment = {"PATH": ADMINISTRATOR, "LC_ALL": "C.UTF-8", **self.module_environment}
        return padded(environment) if self.kind == "sfcb" else environment

    def start(self):
        """Starts it, and returns when it listens. Like an init system in the root folder, where sfcb's processes stay: firmware that
        is fetched goes into a server's working folder."""
        # A provider that is loaded at once, for a stored subscription, may keep the output: a file ends nevertheless.
        with tempfile.TemporaryFile(mode="w+", encoding="utf-8") as output:
            done = subprocess.run(
                [self.home / "start", str(self.port)], env=self.environment(), cwd="/", start_new_session=True, check=False,
                stdin=subprocess.DEVNULL, stdout=output, stderr=subprocess.STDOUT, timeout=120,
            )  # fmt: skip
            output.seek(0)
            if done.returncode:
                raise AssertionError(f"{self.kind} does not start: {output.read()}")
        self._wait(self.listens, "it does not listen")

    def stop(self, seconds=120):
        """Stops it as its administrator does, and returns when all its processes have ended; sfcb sometimes needs force, at the
        latest after so many seconds."""
        try:
            words = [self.home / "stop"]
            done = subprocess.run(words, env=self.environment(), check=False, capture_output=True, timeout=seconds)
            ended, shown = done.returncode == 0, done.stderr.decode()
        except subprocess.TimeoutExpired:
            ended, shown = False, f"not within {seconds} s"
        if not ended and self.kind == "sfcb":
            print(f"{self.kind} does not end, and is killed: {shown}", flush=True)
            self.kill()
        self._wait(lambda: not self.running(), "its processes do not end")

    def kill(self):
        """Ends all its processes at once; those again that one of them began between the look and the blow."""

        def are_gone():
            for process in processes(PROCESSES[self.kind]):
                try:
                    os.kill(process, signal.SIGKILL)
                except ProcessLookupError:
                    pass
            return not self.running()

        self._wait(are_gone, "its processes do not end")

    def restart(self):
        self.stop()
        self.start()

    def running(self):
        return bool(processes(PROCESSES[self.kind]))

    def listens(self):
        with socket.socket() as probe:
            return probe.connect_ex(("127.0.0.1", self.port)) == 0

    def _wait(self, condition, words, seconds=60):
        end = time.monotonic() + seconds
        while not condition():
            if time.monotonic() > end:
                raise AssertionError(f"{self.kind}: {words} within {seconds} s")
            time.sleep(0.05)

    def ask(self, method, class_name, namespace=NAMESPACE):
        return cim_question.ask(self.port, namespace, method, class_name)

    def instances(self, class_name, namespace=NAMESPACE):
        """How many instances of just this class it names."""
        return self.ask("EnumerateInstanceNames", class_name, namespace).count(f'<INSTANCENAME CLASSNAME="{class_name}"')

    def prepare(self):
        """Brings the server's files to the places where an installation has them, by a first start, and ends it again."""
        self.start()
        # sfcb, told to end while it is still starting, may hang.
        self.kill() if self.kind == "sfcb" else self.stop()
