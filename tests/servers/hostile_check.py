#!/usr/bin/env python3
"""Requests that no honest client makes: each is answered, the module's process stays, and holds no more than before."""

import re
import sys
from pathlib import Path

from client import Check, pywbem
from hostile_requests import Hostile
from kldrcim import Kldrcim
from provider_process import Provider_Process

#: Written by whoever takes a text for a command.
TRACE = Path("/tmp/hit")
#: In MB; the servers' own memory grows for some thousand requests, and with the longest of them.
GROWTH = 25


def contains_exceptions(kldrcim):
    """Whether the module turns what it throws into a status by itself: the command line says so if not."""
    answer = kldrcim.run("cm", kldrcim.ask("ein", "KALDERA_AgentService")[0], "executeMethod", "request=[1]")
    return "an exception left the provider" not in str(answer)


def check_words(check, hostile):
    """A contained exception is a failure that says in which method, and what it was."""
    for text in Hostile.THROWN:
        try:
            hostile.execute(text)
        except pywbem.CIMError as error:
            check.expect(f"{text}: status", error.status_code, pywbem.CIM_ERR_FAILED)
            words = str(error.status_description)
            found = re.search(r"invokeMethod\(executeMethod\): \w.*", words)
            check.expect_that(f"{text}: words", found is not None, words)
        except pywbem.Error as error:
            check.expect_that(text, False, error)
        else:
            check.expect_that(text, False, "an answer instead of a failure")


def one_round(check, requests, process, long):
    count = 0
    for what, request in requests:
        count += 1
        check.compared += 1
        try:
            request()
        except pywbem.Error as error:
            # Refused, by whomever; the client library calls it several things if nothing comes.
            if isinstance(error, pywbem.TimeoutError) or "timed out" in str(error):
                check.differs(what, "no answer", error)
        if long or count % 10 == 0:
            process.is_the_same(what)
    process.is_the_same("all")
    return count


def main():
    check = Check(__doc__)
    contained = contains_exceptions(Kldrcim(check))
    if not contained:
        print(f"this module lets its exceptions out: {len(Hostile.THROWN)} kinds of request are left out")
    process, hostile = Provider_Process(check), Hostile(check)
    before = None
    for _ in range(5 if check.long else 3):
        count = one_round(check, hostile.all(contained), process, check.long)
        # The first round brings all to its size.
        before = before or process.figures()
    check.expect_that("kinds of hostile requests", count >= 46, count)
    process.has_not_grown(before, GROWTH)
    if contained:
        check_words(check, hostile)
        process.is_the_same("after what was thrown")
    check.expect("commands run", TRACE.exists(), False)
    hosts = check.attempt("afterwards", check.connection.EnumerateInstances, "KALDERA_ComputerSystem")
    check.expect("hosts afterwards", len(hosts or []), 1)
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
