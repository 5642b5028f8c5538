"""Each registration, read back as its server reads it, is the list of providers of the built library."""

import json
import re

from deploy_case import BUILD, DeployCase, instances_of, output_of

CODES = {"2": "instance", "3": "association", "4": "indication", "5": "method"}


def sfcb_sections(text):
    """As the server reads: sections of keys, a colon directly behind each; anything else would make it exit."""
    sections = {}
    for line in text.splitlines():
        line = line.lstrip(" \t")
        if not line or line.startswith("#"):
            continue
        assert len(line) <= 1023
        heading = re.fullmatch(r"\[(\w+)\]", line)
        if heading:
            assert heading[1] not in sections
            section = sections[heading[1]] = {}
            continue
        key, values = re.fullmatch(r"(\w+): (.*)", line).groups()
        assert key in ("provider", "location", "type", "namespace", "unload", "group"), key
        assert key not in section
        section[key] = values
    return sections


def objects(class_name):
    """Properties of the instances that the module itself enumerates."""
    return [each["properties"] for each in json.loads(output_of(BUILD / "kldrcim", "ei", class_name, "--format", "json"))]


class Registrations(DeployCase):
    @classmethod
    def setUpClass(cls):
        super().setUpClass()
        listed = json.loads(output_of(BUILD / "kldrcim", "classes", "--format", "json"))
        # The delivery of alerts must end with the alerts' own cleanup, so they are registered as indication alone.
        cls.expected = {
            row["class"]: {"indication"} if "indication" in row["provider"] else set(row["provider"]) for row in listed
        }
        assert len(cls.expected) == 76

    def text(self, name):
        return (self.share / "registration" / name).read_text(encoding="utf-8")

    def test_sfcb(self):
        sections = sfcb_sections(self.text("kldrprovider.sfcb"))
        self.assertEqual({name: set(section["type"].split(" ")) for name, section in sections.items()}, self.expected)
        for name, section in sections.items():
            self.assertEqual(section["provider"], f"{name}_Provider")
        for key, value in (
            ("location", "kldrprovider_Module"),
            ("unload", "never"),
            ("group", "kldrprovider"),
        ):
            self.assertEqual({section[key] for section in sections.values()}, {value}, key)

    def test_sfcb_has_the_module_serve_the_interop_namespace(self):
        """All but what the server tells of itself there, which the module would ask itself for."""
        sections = sfcb_sections(self.text("kldrprovider.sfcb"))
        both = {name for name, section in sections.items() if section["namespace"] == "root/kaldera root/interop"}
        alone = {name for name, section in sections.items() if section["namespace"] == "root/kaldera"}
        self.assertEqual(both | alone, set(sections))
        self.assertIn("KALDERA_ElementConformsToProfile", both)
        ends = "CIMXMLCommunicationMechanism Namespace ObjectManager"
        joins = "CommMechHostedAccessPoint CommMechanismForManager NamespaceInManager ObjectManagerHostedService"
        self.assertEqual(alone, {f"KALDERA_{name}" for name in f"{ends} {joins}".split()})

    def test_profiles_for_pegasus_are_those_of_the_module(self):
        """But for those that the server registers by itself."""
        profiles = {each["InstanceID"]: each for each in objects("KALDERA_RegisteredProfile")}
        found = instances_of(self.text("kldrprovider.profiles.mof"), "PG_ProviderProfileCapabilities")
        self.assertEqual({each["CapabilityID"] for each in found}, set(profiles) - {"SMI-S", "Server"})
        registered = set()
        for each in found:
            profile = profiles[each["CapabilityID"]]
            self.assertEqual(
                (each["OtherRegisteredProfile"], each["ProfileVersion"], each["OtherProfileOrganization"]),
                (profile["RegisteredName"], profile["RegisteredVersion"], "SNIA"),
            )
            self.assertEqual(each["ConformingElements"], "KALDERA_ComputerSystem")
            self.assertEqual(each["ProviderName"], "KALDERA_ComputerSystem_Provider")
            columns = (
                each[name].split(", ") if name in each else []
                for name in ("OtherRegisteredSubProfiles", "SubProfileVersions", "OtherSubProfileOrganizations")
            )
            registered |= set(zip(*columns, strict=True))
        organizations = {2: "DMTF", 11: "SNIA"}
        expected = {
            (each["RegisteredName"], each["RegisteredVersion"], organizations[each["RegisteredOrganization"]])
            for each in objects("KALDERA_RegisteredSubProfile")
        }
        # This one belongs to the server's own profile "Server".
        self.assertEqual(registered, expected - {("Profile Registration", "1.0.0", "SNIA")})

    def test_pegasus(self):
        text = self.text("kldrprovider.pegasus.mof")
        modules = instances_of(text, "PG_ProviderModule")
        self.assertEqual(len(modules), 1)
        module = modules[0]
        self.assertEqual(
            (module["InterfaceType"], module["InterfaceVersion"], module["Location"]),
            ("CMPI", "2.0.0", "kldrprovider_Module"),
        )
        # A server that was not built for others refuses even its own word size.
        self.assertNotIn("Bitness", module)
        self.assertTrue(module["Vendor"] and module["Version"])
        providers = instances_of(text, "PG_Provider")
        self.assertEqual({each["Name"] for each in providers}, {f"{name}_Provider" for name in self.expected})
        capabilities = instances_of(text, "PG_ProviderCapabilities")
        self.assertEqual(
            {each["ClassName"]: {CODES[code] for code in each["ProviderType"].split(", ")} for each in capabilities},
            self.expected,
        )
        self.assertEqual((len(providers), len(capabilities)), (76, 76))
        for each in capabilities:
            self.assertEqual(each["ProviderName"], f"{each['ClassName']}_Provider")
            self.assertEqual(each["Namespaces"], "root/kaldera")
        self.assertEqual({each["ProviderModuleName"] for each in providers + capabilities}, {module["Name"]})

    def test_neutral_lines(self):
        found = {}
        for line in self.text("kldrprovider.registration").splitlines():
            name, namespace, provider, location, *types = line.split(" ")
            self.assertEqual((namespace, provider, location), ("root/kaldera", f"{name}_Provider", "kldrprovider_Module"))
            found[name] = set(types)
        self.assertEqual(found, self.expected)

    def test_the_installed_library_has_a_factory_for_each_type(self):
        symbols = output_of("nm", "-D", "--defined-only", self.prefix / "lib/cim/libkldrprovider_Module.so")
        factories = set(re.findall(r" T (\w+_Provider_Create_\w+MI)$", symbols, re.M))
        for name, types in self.expected.items():
            for word in types:
                self.assertIn(f"{name}_Provider_Create_{word.capitalize()}MI", factories)
