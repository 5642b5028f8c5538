"""Tests of simulator/make_inventory.py, as people run it."""

import json
import subprocess
import sys
import unittest
from pathlib import Path

PROGRAM = Path(__file__).resolve().parents[2] / "simulator" / "make_inventory.py"


def run(*arguments):
    return subprocess.run([sys.executable, "-B", PROGRAM, *arguments], capture_output=True, text=True, check=False, env={})


def inventory(*arguments):
    text = run(*arguments).stdout
    comment, rest = text.split("\n", 1)
    assert comment.startswith("// ")
    return json.loads(rest)


class Inventory_Test(unittest.TestCase):
    def test_has_what_was_asked_for(self):
        host = inventory("--adapters", "3", "--ports", "2", "--targets", "17", "--luns", "5", "--cna", "0.34")
        self.assertEqual(len(host["adapters"]), 3)
        self.assertEqual([len(each["fcPorts"]) for each in host["adapters"]], [2, 2, 2])
        self.assertEqual([len(each.get("ethPorts", [])) for each in host["adapters"]], [0, 0, 2])
        self.assertEqual(len(host["remotePorts"]), 2 * 17)
        for adapter in host["adapters"]:
            for port in adapter["fcPorts"]:
                self.assertEqual(len(port["remotePorts"]), 17)
        kinds = [each["deviceData"]["type"] for each in host["remotePorts"][:17]]
        self.assertEqual(kinds, ["Disk"] * 15 + ["Tape", "Disk"])
        self.assertEqual([len(each["lunList"]) for each in host["remotePorts"][:17]], [5] * 15 + [1, 5])

    def test_no_address_comes_twice(self):
        host = inventory("--adapters", "20", "--ports", "8", "--targets", "40", "--luns", "1", "--cna", "0.5")
        addresses = [each["remotePortWwn"] for each in host["remotePorts"]]
        for adapter in host["adapters"]:
            addresses += [port["wwn"] for port in adapter["fcPorts"]] + [adapter["hbaData"]["wwn"]]
            addresses += [port["mac"] for port in adapter.get("ethPorts", [])]
        self.assertEqual(len(set(addresses)), len(addresses))
        self.assertEqual({len(each) for each in addresses}, {17, 23})

    def test_both_fabrics_show_the_same_units(self):
        host = inventory("--adapters", "1", "--ports", "2", "--targets", "3", "--luns", "2")
        units = [[lun["lunDescription"] for lun in each["lunList"]] for each in host["remotePorts"]]
        self.assertEqual(units[:3], units[3:])
        first, second = (port["remotePorts"] for port in host["adapters"][0]["fcPorts"])
        self.assertFalse(set(first) & set(second))

    def test_is_the_same_each_time_and_another_one_for_another_seed(self):
        self.assertEqual(run("--seed", "7").stdout, run("--seed", "7").stdout)
        self.assertNotEqual(inventory("--seed", "7"), inventory("--seed", "8"))

    def test_shares_hold_whatever_they_are(self):
        for cna, converged in [("0", 0), ("0.29", 29), ("0.5", 50), ("1", 100)]:
            host = inventory("--adapters", "100", "--targets", "0", "--cna", cna)
            self.assertEqual(sum("hbaMAC" in each["hbaData"] for each in host["adapters"]), converged)

    def test_a_host_may_have_nothing(self):
        self.assertEqual(inventory("--adapters", "0", "--targets", "0")["adapters"], [])


class Refusal_Test(unittest.TestCase):
    def check(self, reason, *arguments):
        result = run(*arguments)
        self.assertEqual(result.returncode, 2)
        self.assertEqual(result.stdout, "")
        self.assertEqual(result.stderr, f"make_inventory.py: {reason}\n")

    def test_silly_numbers_are_refused_in_one_line(self):
        self.check("--luns must be a number from 0 to 65536, not '-1'", "--luns", "-1")
        self.check("--ports must be a number from 1 to 8, not '0'", "--ports", "0")
        self.check("--adapters must be a number from 0 to 256, not '1e3'", "--adapters", "1e3")
        self.check("--cna must be a share from 0 to 1, not '2'", "--cna", "2")
        self.check("--cna must be a share from 0 to 1, not 'nan'", "--cna", "nan")
        self.check("134217728 LUNs are more than the 1000000 that one inventory can have",
                   "--targets", "1024", "--luns", "65536")
        self.check("unrecognized arguments: --disks 3", "--disks", "3")

    def test_a_reader_that_has_seen_enough_gets_no_complaint(self):
        with subprocess.Popen([sys.executable, "-B", PROGRAM, "--targets", "500"], stdout=subprocess.PIPE,
                              stderr=subprocess.PIPE, env={}) as program:
            program.stdout.readline()
            program.stdout.close()
            self.assertEqual(program.stderr.read(), b"")


if __name__ == "__main__":
    unittest.main()
