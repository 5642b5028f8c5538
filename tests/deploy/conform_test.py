"""`kldrcim conform` over simulated hosts: what a client of the Storage HBA profile finds, and what it misses."""

import json
import re
import subprocess
import tempfile
import unittest
from pathlib import Path

from deploy_case import BUILD, ENVIRONMENT, SOURCE

HBA = {"hbaData": {"wwn": "20:00:02:4b:4c:13:00:00"}, "fcPorts": [{"wwn": "10:00:02:4b:4c:13:00:00"}]}


class Conform(unittest.TestCase):
    def conform(self, inventory, status, *options):
        if isinstance(inventory, dict):
            folder = tempfile.TemporaryDirectory()
            self.addCleanup(folder.cleanup)
            file = Path(folder.name) / "inventory.json"
            file.write_text(json.dumps(inventory), encoding="utf-8")
        else:
            file = SOURCE / "simulator/inventories" / inventory
        done = subprocess.run(
            [BUILD / "kldrcim", "conform", *options], capture_output=True, text=True, check=False,
            env={**ENVIRONMENT, "KLDR_SIMULATOR_INVENTORY": str(file)},
        )
        self.assertEqual((done.returncode, done.stderr), (status, ""), done.stdout)
        return done.stdout

    def rows(self, inventory, status):
        found = json.loads(self.conform(inventory, status, "--format", "json"))
        return {row["element"]: row for row in found}

    def verdicts(self, rows):
        return {name: (row["verdict"], row["missing"]) for name, row in rows.items() if row["verdict"] != "ok"}

    def test_the_demo_host_lacks_nothing(self):
        rows = self.rows("demo.json", 0)
        self.assertEqual({row["verdict"] for row in rows.values()} - {"ok", "none", "not reached"}, set())
        found = {name: row["found"] for name, row in rows.items()}
        for name, count in {
            "SMI-S": 1, "Storage HBA": 1, "Server": 1, "profiles of SMI-S": 14, "subprofiles": 1, "implementation": 1,
            "object manager": 1, "namespaces": 1, "communication": 1, "host": 1, "adapters": 3, "cards": 3, "products": 3,
            "software": 7, "installed software": 7, "FC ports": 5, "initiators": 5, "logical units": 8,
        }.items():
            self.assertEqual(found[name], count, name)

    def test_a_host_without_adapters(self):
        rows = self.rows("empty.json", 1)
        verdicts = self.verdicts(rows)
        self.assertEqual(verdicts["adapters"], ("missing", ["none at 1 of 1"]))
        self.assertEqual(verdicts["installed software"], ("missing", ["none at 1 of 1"]))
        for name in ("software", "cards", "products", "FC ports", "initiators", "logical units"):
            self.assertEqual(verdicts[name], ("not reached", []), name)
        # The profiles and the server's description of itself need no adapter.
        for name in ("SMI-S", "Storage HBA", "Server", "host", "object manager", "namespaces"):
            self.assertNotIn(name, verdicts)

    def test_a_property_without_a_value_is_named(self):
        adapters = [json.loads(json.dumps(HBA)), json.loads(json.dumps(HBA).replace("4b:4c:13", "4b:4c:14"))]
        adapters[1]["hbaData"]["model"] = None
        rows = self.rows({"adapters": adapters}, 1)
        self.assertEqual(self.verdicts(rows)["cards"], ("missing", ["Model in 1 of 2"]))

    def test_one_adapter_without_fc_ports_is_counted(self):
        cna = {"hbaData": {"hbaMAC": "02:4b:4c:20:00:00"}, "ethPorts": [{"mac": "02:4b:4c:20:00:01"}]}
        rows = self.rows({"adapters": [HBA, cna]}, 1)
        self.assertEqual(self.verdicts(rows)["FC ports"], ("missing", ["none at 1 of 2"]))
        self.assertEqual(rows["FC ports"]["found"], 1)

    def test_the_table(self):
        text = self.conform("demo.json", 0)
        self.assertRegex(text, r"(?m)^Adapters +adapters +CIM_PortController +host +1 or more +3 +ok$")
        self.assertRegex(text, r"(?m)^ +statistics +CIM_FCPortStatistics +FC ports +at most 1 +5 +ok$")
        self.assertTrue(text.endswith("\neverything mandatory is there\n"))
        text = self.conform("empty.json", 1)
        self.assertRegex(text, r"(?m)^Adapters +adapters .* 0 +missing: none at 1 of 1$")
        self.assertTrue(text.endswith("\nelements with something missing: 2\n"))

    def test_the_plan_names_classes_and_properties_of_the_schema(self):
        """A slip of the pen would look like something missing."""
        import deploy_case  # noqa: F401, for the path of the generator
        from generator.parser import parse
        from generator.resolver import resolve

        classes = {c.name: c for c in resolve(parse([str(SOURCE / "module/schema" / f) for f in ("cim.mof", "kaldera.mof")]))}
        text = (SOURCE / "kldrcim/walks/Conformance_Plan.cpp").read_text(encoding="utf-8")
        constants = dict(re.findall(r'(\w+) =\s+"([^"]*)";', text))
        names = set()
        rows = [re.findall(r'"[^"]*"|\w+', line) for line in text.splitlines() if re.match(r"    \{(\"|nullptr)", line)]
        for row in rows[:-1]:
            section, name, start, association, near, far, target, least, most, properties = (
                cell[1:-1] if cell[0] == '"' else constants.get(cell, cell) for cell in row
            )
            self.assertTrue(start == "nullptr" or start in names, start)
            self.assertNotIn(name, names)
            names.add(name)
            for each in properties.split():
                self.assertGreaterEqual(classes[target].find(each), 0, f"{target}.{each}")
            if start != "nullptr":
                for role in (near, far):
                    self.assertGreaterEqual(classes[association].find(role), 0, f"{association}.{role}")
        self.assertEqual(len(names), len(rows) - 1)
