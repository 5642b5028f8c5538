#!/usr/bin/env python3
"""Methods: the procedures of the management protocol, the alarm of a port, hardware tests, and the installation of firmware."""

import sys

from client import Check, pywbem
from firmware import Firmware
from hardware_tests import Hardware_Tests
from kldrcim import Kldrcim
from remote_procedures import Procedures

DONE, FAILED = 0, 2
OFF, ON = 1, 3


def check_alarm(check):
    """The beacon of a port: off, on, off again; what is in force already, or no state at all, fails."""
    connection = check.connection

    def ask(device, state, expected):
        what = f"SetAlarmState {state} of {device['DeviceID']}"
        parameters = {} if state is None else {"RequestedAlarmState": pywbem.Uint16(state)}
        answer = check.attempt(what, connection.InvokeMethod, "SetAlarmState", device, **parameters)
        if answer is not None:
            check.expect(what, int(answer[0]), expected)

    for instance in connection.EnumerateInstances("KALDERA_AlarmDevice"):
        device, before = instance.path, instance["AlarmState"]
        for state in (ON if before == OFF else OFF, before):
            ask(device, state, DONE)
            check.expect(f"AlarmState of {device['DeviceID']}", connection.GetInstance(device)["AlarmState"], state)
            ask(device, state, FAILED)
        for state in (0, 2, 4, 65535, None):
            ask(device, state, FAILED)
    check.refused("no such method", pywbem.CIM_ERR_METHOD_NOT_FOUND, connection.InvokeMethod, "Ring", device)


def main():
    check = Check(__doc__)
    kldrcim = Kldrcim(check)
    Procedures(check, kldrcim).run()
    check_alarm(check)
    Firmware(check).run()
    Hardware_Tests(check, kldrcim).run()
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
