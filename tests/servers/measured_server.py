"""A server that is asked while its processor time, its clock and its memory are read."""

import re
import shutil
import subprocess
import sys
import time
from pathlib import Path

import package
from kept_connection import Kept_Connection, No_Answer, request
from processor_time import Reading
from provider_process import holders
from server import PROCESSES, Server, processes

MODULE = package.LIBRARY_FOLDER / "libkldrprovider_Module.so"
PLAIN = Path("/mnt/packages/libplain_module.so")
INVENTORY = Path("/tmp/host.json")
#: Seconds in which a server has ended what follows an answer.
SETTLED = 0.02
#: sfcb refuses answers above its limit, which 10,000 instances exceed.
SFCB_SETTINGS = Path("/etc/sfcb/sfcb.cfg")
SFCB_LIMIT = "\nmaxMsgLen: 500000000\n"


def write_inventory(options):
    """A host as simulator/make_inventory.py makes it."""
    with INVENTORY.open("w", encoding="utf-8") as file:
        subprocess.run([sys.executable, "-B", "/mnt/source/simulator/make_inventory.py", *options], stdout=file, check=True)
    return str(INVENTORY)


class Measured_Server:
    """Installed and registered, and down."""

    def __init__(self):
        self.server = Server()
        if not self.server.is_ours:
            self.server.prepare()
        package.install()
        if not self.server.is_ours:
            package.register("install")
        if self.server.kind == "sfcb":
            with SFCB_SETTINGS.open("a", encoding="utf-8") as file:
                file.write(SFCB_LIMIT)
        self.connection = Kept_Connection(self.server.port)
        self.provider = None

    def take_plain_providers(self):
        """Puts them in the place of the module; what is registered stays as it is."""
        shutil.copy(PLAIN, MODULE)

    def start(self, inventory, first):
        """Starts it again over another simulated host. Seconds until the first request, of which `first` is the message, has been
        answered; the time of a start is that of the server, and not of the script that waits for it."""
        self.stop()
        self.server.module_environment.update(KLDR_SIMULATOR_INVENTORY=inventory, KLDR_SIMULATOR_CALLS="1000")
        environment, sent = self.server.environment(), request(first)
        begin = time.monotonic()
        starting = subprocess.Popen(
            [self.server.home / "start", str(self.server.port)], env=environment, cwd="/", start_new_session=True,
            stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL,
        )  # fmt: skip
        while not self._is_answered(sent):
            if time.monotonic() - begin > 60:
                raise AssertionError(f"{self.server.kind} does not answer")
            time.sleep(0.002)
        passed = time.monotonic() - begin
        starting.wait()
        found = holders()
        if len(found) != 1:
            raise AssertionError(f"processes with the module: {found}")
        self.provider = found[0]
        return passed

    def _is_answered(self, sent):
        try:
            self.connection.ask(sent)
        except (OSError, No_Answer):
            return False
        return "<ERROR " not in self.connection.body()

    def stop(self):
        self.connection.close()
        self.server.kill() if self.server.kind == "sfcb" else self.server.running() and self.server.stop()

    def answer(self, message):
        """The text of an answer."""
        self.connection.open()
        self.connection.ask(request(message))
        self.connection.close()
        return self.connection.body()

    def reading(self):
        time.sleep(SETTLED)
        return Reading(processes(PROCESSES[self.server.kind], zombies=True), self.provider)

    def measure(self, message, times):
        """So many answers, one after the other on a connection that is new: nanoseconds of the processor of the process with the
        module and of all others, and seconds of each answer."""
        sent = request(message)
        self.connection.close()
        before, seconds = self.reading(), []
        self.connection.open()
        for _ in range(times):
            begin = time.perf_counter()
            size = self.connection.ask(sent)
            seconds.append(time.perf_counter() - begin)
        # The connection is open: what serves it is there to be read.
        provider, others = self.reading().since(before)
        if b"<ERROR " in self.connection.buffer[: min(size, 4096)]:
            raise AssertionError(f"an error: {self.connection.body()}")
        return {"provider": provider, "others": others, "seconds": seconds}

    def memory(self):
        """Bytes that the server has in memory. Pages that several processes of it share are counted once."""
        ours = processes(PROCESSES[self.server.kind])
        word = "Rss" if len(ours) == 1 else "Pss"
        rollups = [Path(f"/proc/{process}/smaps_rollup").read_text(encoding="ascii") for process in ours]
        return sum(int(re.search(rf"^{word}: *(\d+)", text, re.M)[1]) << 10 for text in rollups)
