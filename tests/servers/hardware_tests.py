"""Hardware tests through a server: each starts, its job ends, and it leaves the records that the command line shows of the same
test."""

import re
import subprocess
import time
from concurrent.futures import ThreadPoolExecutor
from dataclasses import dataclass

from client import pywbem

STARTED, NOT_SUPPORTED, BUSY, INVALID = 4096, 1, 4, 5
JOB_OVER, PASSED, FAILED = 7, 2, 5
#: Exit status of the command line where a test was refused.
REFUSED = 3
SECONDS = 60

#: The pauses of most loopback tests add up to some seconds, in which the test can be seen running.
SLOW = 1.0


@dataclass
class Expected:
    """What the command line shows of a run."""

    status: int
    #: Outcome and text of each record.
    records: list
    seconds: float


class Hardware_Tests:
    def __init__(self, check, kldrcim):
        self.check = check
        self.kldrcim = kldrcim
        self.connection = check.connection

    def runs(self):
        """Each test with an element that it can be run on, of each class of elements."""
        offered = {}
        for association in ("Adapter", "EthernetPort", "FCPort"):
            for each in self.kldrcim.ask("ei", f"KALDERA_AvailableDiagnosticServiceFor{association}"):
                test, element = each["properties"]["ServiceProvided"], each["properties"]["UserOfService"]
                offered.setdefault((test, association), element)
        return [
            (pywbem.CIMInstanceName.from_wbem_uri(test), pywbem.CIMInstanceName.from_wbem_uri(element))
            for (test, _), element in offered.items()
        ]

    def expected(self, run):
        test, element = run
        command = [self.kldrcim.program, "diag", "run", test["Name"], element["DeviceID"], "--wait"]
        begun = time.monotonic()
        done = subprocess.run(command, capture_output=True, text=True, check=False, env=self.kldrcim.environment)
        rows = [re.fullmatch(r"\d+ +[\d:.]+ +(passed|failed|) *(\S.*)", line.rstrip()) for line in done.stdout.splitlines()]
        return Expected(done.returncode, [(row[1], row[2]) for row in rows if row], time.monotonic() - begun)

    def wait(self, job):
        """State of the job when it is over, or at the end of patience."""
        end = time.monotonic() + SECONDS
        while True:
            instance = self.connection.GetInstance(job)
            if instance["JobState"] == JOB_OVER or time.monotonic() > end:
                return instance
            time.sleep(0.1)

    def records(self, job):
        """Those of a job, in their order, as outcome and text."""
        found = []
        for name in ("KALDERA_DiagnosticServiceRecord", "KALDERA_DiagnosticCompletionRecord"):
            for record in self.connection.EnumerateInstances(name):
                run, _, number = record["InstanceID"].rpartition(":")
                if run == job["InstanceID"]:
                    outcome = {PASSED: "passed", FAILED: "failed"}.get(record.get("CompletionState"), "")
                    found.append((int(number), (outcome, record["RecordData"])))
        return [record for _, record in sorted(found)]

    def settled_records(self, job, count):
        """The completion records come a moment after the end of the job."""
        end = time.monotonic() + 5
        while True:
            found = self.records(job)
            if len(found) >= count or time.monotonic() > end:
                return found
            time.sleep(0.1)

    def run_one(self, test, element, expected):
        what = f"RunDiagnostic {test['Name']} on {element['DeviceID']}"
        answer = self.check.attempt(what, self.connection.InvokeMethod, "RunDiagnostic", test, ManagedElement=element)
        if answer is None:
            return
        wanted = NOT_SUPPORTED if expected.status == REFUSED else STARTED
        if not self.check.expect(f"{what}: return value", int(answer[0]), wanted) or wanted == NOT_SUPPORTED:
            return
        job = answer[1]["Job"]
        if expected.seconds > SLOW:
            second, _ = self.connection.InvokeMethod("RunDiagnostic", test, ManagedElement=element)
            self.check.expect(f"{what}: a second start meanwhile", int(second), BUSY)
        over = self.check.attempt(f"{what}: job", self.wait, job)
        if over is None:
            return
        self.check.expect(f"{what}: job", (over["JobState"], over["PercentComplete"]), (JOB_OVER, 100))
        self.check.expect(f"{what}: records", self.settled_records(job, len(expected.records)), expected.records)

    def associations(self):
        """The job that is there now is joined to its test and its element."""
        for job in self.connection.EnumerateInstanceNames("KALDERA_ConcreteJob"):
            joined = {each.classname for each in self.connection.AssociatorNames(job)}
            self.check.expect_that("job: its test", any(name.endswith("DiagnosticTest") for name in joined), joined)
            self.check.expect("job: what it is joined to", len(joined), 2)

    def run(self):
        """The quick form waits for one of the slow runs only."""
        runs = self.runs()
        self.check.expect("hardware tests", len({test["Name"] for test, _ in runs}), 7)
        with ThreadPoolExecutor(len(runs)) as pool:
            expected = list(pool.map(self.expected, runs))
        slow = [run for run, each in zip(runs, expected) if each.seconds > SLOW]
        for run, each in zip(runs, expected):
            if self.check.long or run not in slow[1:]:
                self.run_one(*run, each)
        self.associations()
        what = "RunDiagnostic without an element"
        answer = self.check.attempt(what, self.connection.InvokeMethod, "RunDiagnostic", runs[0][0])
        self.check.expect(what, answer and int(answer[0]), INVALID)
