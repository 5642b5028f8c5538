"""The process of the server that has the module loaded, and what it holds."""

import os
import time
from dataclasses import dataclass
from pathlib import Path

MODULE = "libkldrprovider_Module.so"


@dataclass
class Figures:
    process: int
    descriptors: int
    threads: int
    #: Resident memory in MB.
    megabytes: float


def holders():
    """Processes with the module in memory, but for this one."""
    found = []
    for entry in Path("/proc").iterdir():
        try:
            if entry.name.isdigit() and int(entry.name) != os.getpid() and MODULE in (entry / "maps").read_text():
                found.append(int(entry.name))
        except OSError:
            continue
    return sorted(found)


def figures(process):
    status = dict(
        line.split(":", 1) for line in Path(f"/proc/{process}/status").read_text(encoding="utf-8").splitlines() if ":" in line
    )
    return Figures(
        process, len(os.listdir(f"/proc/{process}/fd")), int(status["Threads"]), int(status["VmRSS"].split()[0]) / 1024
    )


class Provider_Process:
    """Must be made when the module is loaded."""

    def __init__(self, check):
        self.check = check
        check.connection.EnumerateInstanceNames("KALDERA_ComputerSystem")
        found = holders()
        check.expect("processes with the module", len(found), 1)
        self.process = found[0] if found else None

    def is_the_same(self, what):
        return self.check.expect(f"{what}: the module's process", holders(), [self.process])

    def figures(self):
        """Once what serves a request has ended: threads of the last ones may be there for a moment."""
        now = figures(self.process)
        for _ in range(20):
            time.sleep(0.1)
            now, before = figures(self.process), now
            if now.threads == before.threads and now.descriptors == before.descriptors:
                break
        return now

    def has_not_grown(self, before, megabytes):
        """Descriptors and threads stay; memory may grow by so much."""
        after = self.figures()
        self.check.expect_that("descriptors", after.descriptors <= before.descriptors, before, after)
        pool = self.check.traits.thread_pool
        self.check.expect_that("threads", after.threads <= before.threads + 2 + pool, before, after)
        self.check.expect_that("memory", after.megabytes <= before.megabytes + megabytes, before, after)
