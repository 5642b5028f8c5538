"""What the numbers of a host mean: `kldrcim` over the simulated hosts, and the MOF that an installation brings."""

import json
import re
import shutil
import subprocess
import tempfile
from contextlib import contextmanager
from pathlib import Path

from deploy_case import BUILD, ENVIRONMENT, SOURCE, DeployCase

from generator.parser import parse
from generator.resolver import resolve
from generator.value_maps import effective, read

#: Numbers that count or measure, which the schema maps to nothing.
MEASURES = re.compile(
    r".*(Count|Counter|Errors|Frames|Failures|Words)|Bytes\w+|Packets\w+|(Major|Minor)Version|RevisionNumber|BuildNumber|PortNumber|"
    r"(Max)?Speed|SupportedMaximumTransmissionUnit|MaxDataSize|NumPhysicalPins|MaxNumberControlled|TimesSinceReset|SequenceNumber|"
    r"PercentComplete"
)


@contextmanager
def running_agent():
    """A process of the agent's name: two classes have instances only while it runs."""
    with tempfile.TemporaryDirectory() as folder:
        program = shutil.copy("/usr/bin/sleep", Path(folder, "qxmagent"))
        with subprocess.Popen([program, "600"]) as agent:
            try:
                yield
            finally:
                agent.kill()


def numbers_of(value):
    values = value if isinstance(value, list) else [value]
    return [each for each in values if isinstance(each, int) and not isinstance(each, bool)]


class Words(DeployCase):
    def ask(self, *arguments, inventory="demo.json"):
        done = subprocess.run(
            [BUILD / "kldrcim", *arguments], capture_output=True, text=True, check=False,
            env={**ENVIRONMENT, "KLDR_SIMULATOR_INVENTORY": str(SOURCE / "simulator/inventories" / inventory)},
        )
        self.assertEqual(done.stderr, "", arguments)
        return done.stdout

    def instances(self, class_name, inventory):
        return json.loads(self.ask("ei", class_name, "--format", "json", inventory=inventory))

    def test_every_number_that_is_no_measure_has_its_word(self):
        with running_agent():
            seen = self.look_at_every_number()
        self.assertGreater(len(seen), 35, sorted(seen))
        self.assertIn("AccessContext", seen)

    def look_at_every_number(self):
        """The names of the properties that had one."""
        seen = set()
        classes = [each["class"] for each in json.loads(self.ask("classes", "--format", "json"))]
        for inventory in ("demo.json", "rich.json", "one_cna.json"):
            for class_name in classes:
                if class_name == "KALDERA_AlertIndication":
                    continue
                for each in self.instances(class_name, inventory):
                    for name, value in each["properties"].items():
                        numbers = numbers_of(value)
                        if not numbers or MEASURES.fullmatch(name):
                            continue
                        seen.add(name)
                        said = each.get("words", {}).get(name)
                        said = said if isinstance(value, list) else [said]
                        self.assertEqual(len(numbers), len(said), f"{class_name}.{name}")
                        self.assertNotIn(None, said, f"{class_name}.{name} {value}")
        return seen

    def test_tables_blocks_and_numbers_alone(self):
        columns = ("ei", "KALDERA_FCPort", "--properties", "DeviceID,PortType,OperationalStatus")
        self.assertRegex(self.ask(*columns), r"(?m)^1000024b4c100001  10 \(N\) +12 \(No Contact\)$")
        self.assertRegex(self.ask(*columns, "--raw"), r"(?m)^1000024b4c100001  10 +\{12\}$")
        self.assertEqual(self.ask("--raw", *columns), self.ask(*columns, "--raw"))
        path = self.ask("ein", "KALDERA_ComputerSystem").strip()
        self.assertRegex(self.ask("gi", path), r"(?m)^  Dedicated +\= 0 \(Not Dedicated\), 14 \(Management\)$")
        self.assertRegex(self.ask("gi", path, "--raw"), r"(?m)^  Dedicated +\= \{0, 14\}$")
        self.assertNotIn("words", self.ask("gi", path, "--raw", "--format", "json"))
        self.assertRegex(self.ask("ai", path, "--assoc", "KALDERA_FCPortSystemDevice"), r"LinkTechnology +\= 4 \(FC\)")
        # MOF is for compilers: they know the map.
        self.assertEqual(self.ask("gi", path, "--format", "mof"), self.ask("gi", path, "--format", "mof", "--raw"))

    def test_json_keeps_its_members(self):
        for each in self.instances("KALDERA_FCPort", "demo.json"):
            self.assertEqual(list(each), ["class", "path", "properties", "words"])
            self.assertEqual(each["properties"]["PortType"], 10)
            self.assertEqual(each["words"]["PortType"], "N")
            self.assertEqual(len(each["words"]["OperationalStatus"]), 1)
        self.assertEqual(list(self.instances("KALDERA_FCPortStatistics", "demo.json")[0]), ["class", "path", "properties"])

    def test_what_a_method_returns(self):
        service = self.ask("ein", "KALDERA_HBASoftwareInstallationService").strip()
        call = ("cm", service, "InstallFromURI")
        self.assertRegex(self.ask(*call, "URI=nowhere://x"), r"^  return_value = \d+ \([A-Z][^)]*\)\n")
        self.assertRegex(self.ask(*call, "URI=nowhere://x", "--raw"), r"^  return_value = \d+\n")
        said = json.loads(self.ask(*call, "URI=nowhere://x", "--format", "json"))
        self.assertIsInstance(said["return_value"], int)
        self.assertIsInstance(said["words"]["return_value"], str)

    def test_the_installed_mof_says_the_same(self):
        files = [str(self.share / "mof" / name) for name in ("kldr_qualifiers.mof", "kldr_structure.mof", "kldrprovider.mof")]
        classes = resolve(parse(files))
        maps = read(SOURCE / "module/schema/value_maps.txt", classes)
        found = 0
        for class_ in classes:
            for feature in class_.features:
                value_map = effective(class_, feature, maps)
                stated = (feature.qualifiers.get("valuemap"), feature.qualifiers.get("values"))
                if value_map:
                    found += 1
                    meanings = value_map.meanings
                    self.assertEqual(stated, ([each.text for each in meanings], [each.word for each in meanings]), feature.name)
                else:
                    self.assertEqual(stated, (None, None), f"{class_.name}.{feature.name}")
        self.assertGreater(found, 300)
