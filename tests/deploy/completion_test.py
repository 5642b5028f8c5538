"""What shells offer to complete, asked of the shells themselves."""

import json
import re

from completion_case import CompletionCase
from deploy_case import BUILD, SOURCE, output_of


class Completion(CompletionCase):
    def everywhere(self, line, expected):
        for shell in (self.bash, self.zsh, self.fish):
            with self.subTest(f"{shell.__name__}: {line}"):
                self.assertEqual(shell(line), sorted(expected))

    def help_of(self, program, section):
        text = output_of(self.prefix / program, "--help")
        return re.search(rf"^{section}\n(.*?)^$", text, re.M | re.S)[1]

    def options_of(self, verb):
        return set(re.findall(r"^  (--[a-z-]+)", output_of(self.prefix / "bin/kldrcim", verb, "--help"), re.M))

    def test_every_verb_and_option_of_kldrcim(self):
        verbs = set(re.findall(r"^  ([a-z]+)", self.help_of("bin/kldrcim", "Verbs"), re.M))
        self.assertLess(15, len(verbs))
        self.everywhere("kldrcim ", verbs)
        self.everywhere("kldrcim pro", ["profiles"])
        options = set(re.findall(r"^  (--[a-z-]+)", self.help_of("bin/kldrcim", "Options"), re.M))
        self.assertLess(15, len(options))
        self.everywhere("kldrcim --", options)
        for verb in sorted(verbs):
            self.assertEqual(self.bash(f"kldrcim {verb} --"), sorted(self.options_of(verb)), verb)

    def test_options_of_a_verb_are_those_that_it_takes(self):
        for verb in ("tree", "watch"):
            self.everywhere(f"kldrcim {verb} --", self.options_of(verb))
        self.assertNotIn("--assoc", self.bash("kldrcim ei KALDERA_FCPort --"))

    def test_classes_where_a_class_or_a_path_stands(self):
        classes = {each["class"] for each in json.loads(output_of(BUILD / "kldrcim", "classes", "--format", "json"))}
        self.assertEqual(len(classes), 76)
        self.everywhere("kldrcim ei ", classes)
        for line in ("kldrcim gi ", "kldrcim watch ", "kldrcim ai X --assoc "):
            self.assertEqual(self.bash(line), sorted(classes), line)
        self.everywhere(
            "kldrcim --format json ein KALDERA_FCPortS", ["KALDERA_FCPortStatistics", "KALDERA_FCPortSystemDevice"]
        )
        for line in ("kldrcim tree ", "kldrcim ei KALDERA_FCPort "):
            self.assertEqual(self.bash(line), [], line)

    def test_properties_and_methods_of_the_class(self):
        self.everywhere("kldrcim ei KALDERA_FCPort --properties PortT", ["PortType"])
        self.everywhere("kldrcim ei KALDERA_FCPort --properties DeviceID,PortT", ["DeviceID,PortType"])
        self.everywhere("kldrcim ei KALDERA_AlarmDevice --properties Urg", ["Urgency"])
        self.everywhere("kldrcim ei KALDERA_Nobody --properties P", [])
        self.everywhere("kldrcim cm root/kaldera:KALDERA_AlarmDevice.DeviceID=1 Set", ["SetAlarmIndicator", "SetAlarmState", "SetPowerState", "SetUrgency"])
        self.assertEqual(self.bash("kldrcim mi KALDERA_AlarmDevice.DeviceID=1 Urg"), ["Urgency="])
        self.assertEqual(self.fish("kldrcim mi KALDERA_AlarmDevice.DeviceID=1 Urg"), ["Urgency="])

    def test_tests_and_remote_procedures(self):
        tests = {
            each["properties"]["Name"].split(":")[1]
            for each in json.loads(output_of(BUILD / "kldrcim", "diag", "list", "--format", "json"))
            if "Name" in each["properties"]
        }
        self.assertLess(3, len(tests))
        self.everywhere("kldrcim diag run ", tests)
        self.everywhere("kldrcim diag ", ["list", "run"])
        self.assertEqual(self.bash("kldrcim diag run SerdesLoopbackTest "), [])
        known = {each["method"] for each in json.loads(output_of(BUILD / "kldrcim", "rpc", "--list", "--format", "json"))}
        self.assertEqual(self.bash("kldrcim rpc "), sorted(known))
        self.everywhere("kldrcim rpc discovery.getPortBy", {each for each in known if each.startswith("discovery.getPortBy")})

    def test_choices_of_options_and_verbs(self):
        formats = re.search(r"--format (\S+)", self.help_of("bin/kldrcim", "Options"))[1].split("|")
        self.everywhere("kldrcim --format ", formats)
        self.everywhere("kldrcim tree --format ", ["json", "table"])
        self.everywhere("kldrcim tree --color a", ["always", "auto"])
        self.assertEqual(self.bash("kldrcim --namespace "), [], "a verb does not stand here")
        self.assertEqual(self.bash("kldrcim rpc --raw "), [], "nor a method, behind a text")
        self.everywhere("kldrcim --ascii tre", ["tree"])
        self.assertEqual(self.bash(f"kldrcim --module {SOURCE}/LIC"), [f"{SOURCE}/LICENSE"])
        self.assertEqual(self.fish(f"kldrcim --module {SOURCE}/LIC"), [f"{SOURCE}/LICENSE"])

    def test_an_option_of_two_values(self):
        for line in ("kldrcim serve --tls ", "kldrcim serve --tls /some/certificate "):
            for shell in (self.bash, self.fish):
                self.assertEqual(shell(f"{line}{SOURCE}/LIC"), [f"{SOURCE}/LICENSE"], line)
        self.everywhere("kldrcim --tls certificate key conf", ["conform"])

    def test_kldr_register(self):
        usage = output_of(self.prefix / "sbin/kldr-register", "--help")
        verbs = re.match(r"usage: kldr-register ([a-z|]+) ", usage)[1].split("|")
        self.assertEqual(self.bash("kldr-register ", "sbin"), sorted(verbs))
        options = set(re.findall(r"(?:^  |, )(--[a-z-]+)", usage, re.M))
        self.assertLess(5, len(options))
        self.assertEqual(self.bash("kldr-register install --", "sbin"), sorted(options))
        self.assertEqual(self.bash("kldr-register --server ", "sbin"), ["pegasus", "sfcb"])
        self.assertEqual(self.bash(f"kldr-register --root {SOURCE}/deploy/deb", "sbin"), [f"{SOURCE}/deploy/debian"])
