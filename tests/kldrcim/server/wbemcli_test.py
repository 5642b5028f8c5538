"""Every verb of Debian's wbemcli, and every class, beside what `kldrcim` says of the same."""

import json
import os
import re
import subprocess
import unittest

from serving import NAMESPACE, PATIENCE, Serving_Case


class Wbemcli(Serving_Case):
    def run_wbemcli(self, verb, place, *arguments):
        """Output lines; the status is expected to be 0."""
        status, out, errors = self.try_wbemcli(verb, place, *arguments)
        self.assertEqual(status, 0, (verb, place, out, errors))
        return out.splitlines()

    def try_wbemcli(self, verb, place, *arguments, namespace=NAMESPACE):
        command = ["/usr/bin/wbemcli", verb, f"{self.served.url}/{namespace}:{place}", *arguments]
        done = subprocess.run(
            command, capture_output=True, text=True, timeout=PATIENCE, check=False, env={"HOME": "/nonexistent"}
        )
        return done.returncode, done.stdout, done.stderr

    def kldrcim(self, *arguments):
        command = [os.environ["KLDRCIM"], "--module", os.environ["KLDR_MODULE"], "--format", "json", *arguments]
        own = {
            "PATH": "/usr/bin:/bin",
            "HOME": "/nonexistent",
            "LD_LIBRARY_PATH": os.environ["KLDR_SIMULATOR"],
            "KLDR_SIMULATOR_INVENTORY": os.environ["KLDR_INVENTORY"],
        }
        done = subprocess.run(command, capture_output=True, text=True, timeout=PATIENCE, check=True, env=own)
        return json.loads(done.stdout)

    def paths(self, lines):
        """Without the host."""
        return [re.sub(r"^[^/]*/root/kaldera:", "", line) for line in lines]

    def first(self, class_name):
        return self.paths(self.run_wbemcli("ein", class_name))[0]

    def failed(self, number, verb, place, *arguments, **more):
        status, out, errors = self.try_wbemcli(verb, place, *arguments, **more)
        self.assertEqual(status, 16, (out, errors))
        self.assertIn(f"Cim: ({number}) ", out + errors)

    def test_every_class_is_enumerated(self):
        classes = [each["class"] for each in self.kldrcim("classes") if "instance" in each["provider"]]
        self.assertGreater(len(classes), 30)
        found = 0
        for name in classes:
            names = self.run_wbemcli("ein", name)
            instances = self.run_wbemcli("ei", name)
            expected = len(self.kldrcim("ein", name))
            self.assertEqual((len(names), len(instances)), (expected, expected), name)
            found += expected
        self.assertGreater(found, 60)

    def test_every_class_is_declared(self):
        names = [line.split(":")[-1] for line in self.run_wbemcli("ecn", "")]
        self.assertIn("CIM_FCPort", names)
        for name in names:
            self.assertTrue(self.run_wbemcli("gc", name)[0].split(":")[-1].startswith(name))

    def test_subclasses(self):
        below = self.paths(self.run_wbemcli("ecn", "CIM_LogicalPort"))
        self.assertIn("KALDERA_FCPort", below)
        self.assertNotIn("CIM_LogicalPort", below)
        self.assertEqual(len(self.run_wbemcli("ec", "CIM_LogicalPort")), len(below))
        self.failed(5, "ecn", "CIM_Nothing")
        self.failed(6, "gc", "CIM_Nothing")

    def test_an_instance(self):
        path = self.first("KALDERA_FCPort")
        line = self.run_wbemcli("gi", path)[0]
        expected = self.kldrcim("gi", path)["properties"]
        for name in ("DeviceID", "ElementName", "Speed", "PortType"):
            self.assertRegex(line, rf'[ ,]{name}="?{re.escape(str(expected[name]))}"?(,|$)')
        self.assertEqual(self.run_wbemcli("gp", path, "Speed")[0].split("=")[-1], str(expected["Speed"]))
        self.failed(6, "gi", path.replace("DeviceID=", "DeviceID=0") if "=0" in path else path[:-1] + '0"')
        self.failed(5, "gi", 'CIM_Nothing.a="b"')
        self.failed(3, "gi", path, namespace="root/nothing")

    def test_a_superclass(self):
        self.assertEqual(len(self.run_wbemcli("ein", "CIM_FCPort")), len(self.run_wbemcli("ein", "KALDERA_FCPort")))

    def test_associations(self):
        host = self.first("KALDERA_ComputerSystem")
        for verb, filters in (("ain", ["-ac", "CIM_SystemDevice"]), ("ain", []), ("rin", []), ("rin", ["-arc", "CIM_SystemDevice"])):
            line = self.run_wbemcli(verb, host, *filters)
            named = {"-ac": "--assoc", "-arc": "--assoc"}
            expected = self.kldrcim(verb, host, *[named.get(each, each) for each in filters])
            self.assertEqual(len(line), len(expected), (verb, filters))
        self.assertEqual(
            len(self.run_wbemcli("ai", host, "-ac", "CIM_SystemDevice")),
            len(self.run_wbemcli("ain", host, "-ac", "CIM_SystemDevice")),
        )
        self.assertEqual(
            len(self.run_wbemcli("ri", host, "-arc", "CIM_SystemDevice")),
            len(self.run_wbemcli("rin", host, "-arc", "CIM_SystemDevice")),
        )

    def test_a_method(self):
        service = self.first("KALDERA_AgentService")
        lines = self.run_wbemcli("cm", service, 'executeMethod.request="{}"')
        self.assertIn("executeMethod: 0", lines[0])
        document = "".join(self.run_wbemcli("cmx", service, 'executeMethod.request="{}"'))
        self.assertRegex(document, '<METHODRESPONSE NAME="executeMethod">.*<PARAMVALUE NAME="response"')
        self.failed(17, "cm", service, "nothing")

    def test_what_cannot_be_changed(self):
        path = self.first("KALDERA_ComputerSystem")
        self.failed(7, "sp", path, "ElementName=x")
        self.failed(7, "mi", path, "ElementName=x")
        # It asks for the class first, and looks there.
        self.assertIn("Unknown property", "".join(self.try_wbemcli("sp", path, "Nothing=x")[1:]))
        self.failed(6, "mi", path[:-1] + '0"', "ElementName=x")
        self.failed(7, "di", path)
        self.failed(7, "dc", "CIM_FCPort")

    def test_a_filter_of_indications(self):
        where, name = "interop", "CIM_IndicationFilter"
        # It wants all keys of the class.
        keys = f'SystemCreationClassName="a",SystemName="b",CreationClassName="{name}",Name="one"'

        def create(query):
            return self.try_wbemcli(
                "ci", f"{name}.{keys}", f'{keys},QueryLanguage="WQL",Query="{query}"', namespace=where
            )

        query = "select * from KALDERA_AlertIndication"
        status, out, errors = create(query)
        self.assertEqual(status, 0, (out, errors))
        path = re.sub(r"^[^/]*/interop:", "", out.strip())
        self.assertEqual(path, f"{name}.{keys}")
        self.assertIn("(11) ", "".join(create(query)[1:]))
        status, out, errors = self.try_wbemcli("gi", path, namespace=where)
        self.assertEqual(status, 0, (out, errors))
        self.assertIn(query, out)
        self.assertEqual(self.try_wbemcli("di", path, namespace=where)[0], 0)
        self.failed(6, "di", path, namespace=where)
        self.assertIn("(15) ", "".join(create(query + " where")[1:]))


if __name__ == "__main__":
    unittest.main()
