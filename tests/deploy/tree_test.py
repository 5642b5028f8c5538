"""The options of `kldrcim tree` and `graph` over simulated hosts, and what a slow walk shows on a terminal."""

import json
import os
import pty
import subprocess
import unittest
from pathlib import Path
from tempfile import TemporaryDirectory

from deploy_case import BUILD, ENVIRONMENT, output_of

PORT = "10:00:02:4b:4c:10:00:00"


class Tree(unittest.TestCase):
    def lines(self, *options, verb="tree"):
        return output_of(BUILD / "kldrcim", verb, *options).splitlines()

    def refused(self, complaint, *options):
        done = subprocess.run(
            [BUILD / "kldrcim", "tree", *options], capture_output=True, text=True, check=False, env=ENVIRONMENT
        )
        self.assertEqual((done.returncode, done.stdout, done.stderr), (2, "", f"kldrcim: {complaint}\n"), options)

    def test_each_level_is_the_whole_tree_without_what_is_below(self):
        # A branch is drawn three characters a level.
        level = lambda line: len(line) - len(line.lstrip("│├└─ "))
        names = lambda lines, most: [line.lstrip("│├└─ ") for line in lines if level(line) <= 3 * most]
        for extra in ((), ("--software",), ("--connectors",)):
            every = self.lines(*extra)
            for depth in (1, 2, 3, 4):
                shown = self.lines("--depth", str(depth), *extra)
                self.assertEqual(names(shown, 99), names(every, depth), (depth, extra))
        self.assertEqual(len(self.lines("--depth", "1")), 4)

    def test_one_adapter_and_one_port(self):
        every = self.lines()
        shown = self.lines("--adapter", "02-4B-4C-20-00-00")
        self.assertEqual(len(shown), 6)
        self.assertIn("Kaldera CNA", shown[1])
        shown = self.lines("--port", PORT.upper())
        self.assertEqual(shown, self.lines("--port", PORT.replace(":", "")))
        self.assertIn("KLDR00A1001", shown[1])
        self.assertIn(f"FC port {PORT}", shown[2])
        self.assertEqual(sum("port" in line for line in shown), 1)
        targets = [line.strip("│├└─ ") for line in shown if "target" in line]
        self.assertEqual(targets, [line.strip("│├└─ ") for line in every if "target" in line][: len(targets)])
        self.assertEqual(len(targets), 3)
        self.assertEqual(len(self.lines("--port", "02:4b:4c:20:00:00")), 3)
        for verb in ("tree", "graph"):
            self.assertEqual(
                self.lines("--adapter", "2000024b4c100000", "--port", PORT, verb=verb), self.lines("--port", PORT, verb=verb)
            )
        self.assertEqual(sum("Kaldera" in line for line in self.lines("--port", PORT, verb="graph")), 1)

    def test_how_many_units_instead_of_each(self):
        shown = self.lines("--luns", "count")
        self.assertEqual([line.strip("│├└─ ") for line in shown if "LUN" in line], ["3 LUNs", "1 LUN", "1 LUN", "3 LUNs"])
        every = self.lines()
        units = lambda line: any(word in line for word in ("LUN", "disk ", "tape "))
        self.assertEqual(sum(map(units, every)), 8)
        self.assertEqual([line for line in shown if not units(line)], [line for line in every if not units(line)])
        tree = json.loads("\n".join(self.lines("--luns", "count", "--format", "json")))
        targets = [target for adapter in tree["children"] for port in adapter["children"] for target in port.get("children", [])]
        self.assertEqual([each["children"][0]["what"] for each in targets], ["3 LUNs", "1 LUN", "1 LUN", "3 LUNs"])
        self.assertEqual({each["children"][0]["kind"] for each in targets}, {"units"})
        graph = self.lines("--luns", "count", verb="graph")
        self.assertEqual(sum("LUNs" in line or "1 LUN" in line for line in graph), 4)

    def test_bad_input_names_its_culprit(self):
        self.refused('no adapter "nobody"; "kldrcim tree --depth 1" shows them', "--adapter", "nobody")
        self.refused('no port "nobody"; "kldrcim tree --depth 2" shows them', "--port", "nobody")
        self.refused(
            f'no port "{PORT}" of adapter "024b4c200000"; "kldrcim tree --depth 2" shows them',
            "--adapter", "024b4c200000", "--port", PORT,
        )
        self.refused('--adapter takes an address, not ""', "--adapter=")
        self.refused('--depth takes a number above 0, not "0"', "--depth", "0")
        self.refused('--depth takes a number above 0, not "2x"', "--depth", "2x")
        self.refused('--luns takes each, count or merged, not "some"', "--luns", "some")
        self.refused("--luns merged makes no sense for tree; it is for graph", "--luns", "merged")
        self.refused("--port and --depth 1 make no sense together", "--port", PORT, "--depth", "1")

    def on_terminal(self, inventory):
        """What the terminal got by standard error, and standard output."""
        with TemporaryDirectory() as folder:
            file = Path(folder) / "inventory.json"
            file.write_text(json.dumps(inventory), encoding="utf-8")
            terminal, end = pty.openpty()
            done = subprocess.run(
                [BUILD / "kldrcim", "tree"], stdout=subprocess.PIPE, stderr=end, check=False,
                env={**ENVIRONMENT, "KLDR_SIMULATOR_INVENTORY": str(file)},
            )
            os.close(end)
            try:
                shown = os.read(terminal, 65536)
            except OSError:
                shown = b""
            os.close(terminal)
        self.assertEqual(done.returncode, 0)
        return shown.decode(), done.stdout.decode()

    def test_a_slow_walk_shows_what_it_is_at_and_leaves_nothing(self):
        inventory = {"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "fcPorts": [{"wwn": PORT}]}]}
        quick, tree = self.on_terminal(inventory)
        self.assertEqual(quick, "")
        inventory["faults"] = [{"call": "*", "do": "delay", "milliseconds": 200}]
        shown, slow_tree = self.on_terminal(inventory)
        self.assertEqual(slow_tree, tree)
        self.assertRegex(shown, r"^\r\x1b\[Kkldrcim: asking for KALDERA_\w+(, \d+ so far)?\r")
        self.assertTrue(shown.endswith("\r\x1b[K"), repr(shown))
