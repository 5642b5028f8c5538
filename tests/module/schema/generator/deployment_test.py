"""What servers read: registrations of three forms, and MOF in an order that a compiler can load."""

import re

from schema_case import QUALIFIERS, SchemaCase

from generator.cli import deployment
from generator.loading import loading_order

TINY = """
class C_Base { [Key] string Name; };
class P_Port : C_Base { uint32 Run(); };
[Association] class P_Link { [Key] C_Base REF A; [Key] P_Port REF B; };
[Indication] class P_Alert { string Text; };
"""

PEGASUS_LINK = """instance of PG_ProviderCapabilities
{
    ProviderModuleName = "KLDRProviderModule";
    ProviderName = "P_Link_Provider";
    CapabilityID = "P_Link";
    ClassName = "P_Link";
    Namespaces = {"root/kaldera"};
    ProviderType = {2, 3, 5};
};
"""


class Registrations(SchemaCase):
    def files(self, text=TINY):
        return deployment([QUALIFIERS, self.file(text)], "P_", (), "1.2.3").files

    def test_sections_of_sfcb(self):
        text = self.files()["registration/kldrprovider.sfcb"]
        self.assertTrue(
            text.startswith(
                "[P_Port]\n   provider: P_Port_Provider\n   location: kldrprovider_Module\n   type: instance method\n"
                "   namespace: root/kaldera root/interop\n   unload: never\n   group: kldrprovider\n"
            )
        )
        self.assertEqual(
            re.findall(r"^   type: (.*)$", text, re.M), ["instance method", "association instance method", "indication"]
        )

    def test_instances_of_pegasus(self):
        text = self.files()["registration/kldrprovider.pegasus.mof"]
        self.assertIn(PEGASUS_LINK, text)
        self.assertIn('    Version = "1.2.3";\n', text)
        self.assertEqual(re.findall(r"ProviderType = (.*);", text), ["{2, 5}", "{2, 3, 5}", "{4}"])
        self.assertNotIn("Bitness", text)

    def test_neutral_lines(self):
        self.assertEqual(
            self.files()["registration/kldrprovider.registration"],
            "P_Port root/kaldera P_Port_Provider kldrprovider_Module instance method\n"
            "P_Link root/kaldera P_Link_Provider kldrprovider_Module association instance method\n"
            "P_Alert root/kaldera P_Alert_Provider kldrprovider_Module indication\n",
        )

    def test_mof_keeps_the_words_of_the_sources(self):
        one = self.file("class C_One { [Key] string Name; };\n", "one.mof")
        two = self.file("// Why it is.\nclass P_Two : C_One { [Key, Override(\"Name\")] string Name; };\n", "two.mof")
        files = deployment([QUALIFIERS, one, two], "P_", (), "1").files
        self.assertIn("// Why it is.\nclass P_Two : C_One", files["mof/kldrprovider.mof"])
        self.assertNotIn("class C_One", files["mof/kldrprovider.mof"])
        self.assertIn("class C_One {", files["mof/kldr_structure.mof"])
        self.assertIn("Qualifier Key : boolean", files["mof/kldr_qualifiers.mof"])


class Order(SchemaCase):
    def order(self, text):
        return [class_.name for class_ in loading_order(list(self.classes(text).values()))]

    def test_targets_stand_before_associations(self):
        self.assertEqual(
            self.order("[Association] class L { [Key] A REF a; [Key] B REF b; }; class B {}; class A {};"), ["A", "B", "L"]
        )

    def test_a_target_that_derives_from_the_class_stays_behind_it(self):
        self.assertEqual(self.order("class A { B REF b; }; class B : A {};"), ["A", "B"])

    def test_a_way_round_does_not_put_a_class_before_its_superclass(self):
        self.assertEqual(self.order("class A { B REF b; }; class B { C REF c; }; class C : A {};"), ["B", "A", "C"])

    def test_classes_of_embedded_instances_stand_before_what_names_them(self):
        self.assertEqual(
            self.order('class A { [EmbeddedInstance("B")] string b; }; class B {}; class C { uint32 m([EmbeddedInstance("D")] '
                       "string d); }; class D {};"),
            ["B", "A", "D", "C"],
        )

    def test_a_reference_gives_way_to_an_embedded_instance(self):
        self.assertEqual(self.order('class A { B REF b; }; class B { [EmbeddedInstance("A")] string a; };'), ["A", "B"])
