"""What numbers mean: the data file, the MOF that states it, and the table for people."""

from schema_case import QUALIFIERS, SchemaCase

from generator.cli import deployment, words
from generator.errors import MofError
from generator.parser import parse
from generator.resolver import resolve
from generator.value_maps import read

BASE = """class C_Base { [Key] string Name; uint16 State; uint16 Kinds[]; uint32 Run(uint16 How); };
class C_Middle : C_Base { [Override("State")] uint16 State; };
"""
PRODUCT = """class P_Port : C_Middle
{
    // Odd on purpose: the qualifiers stand on a line of their own.
    [Override("State")]
    uint16 State;
    [Override("Run")] uint32 Run(uint16 How);
};
class P_Plain : C_Base {};
"""
MAPS = """# What they mean.
C_Base.State
  0         Unknown
  1         Other "one"
  2..4      Some \\ more
  ..        DMTF Reserved
  0x8000..  Vendor Reserved

C_Base.Run()
  0  Done
"""


class ValueMaps(SchemaCase):
    def maps(self, text=MAPS):
        return self.file(text, "maps.txt")

    def sources(self):
        return [QUALIFIERS, self.file(BASE, "base.mof"), self.file(PRODUCT, "product.mof")]

    def mof(self, text=MAPS):
        return deployment(self.sources(), "P_", (), "1", self.maps(text)).files

    def refuse_map(self, text, line, reason):
        with self.assertRaises(MofError) as caught:
            self.mof(text)
        self.assertEqual(str(caught.exception), f"{self.folder}/maps.txt:{line}: {reason}")

    def test_ranges(self):
        state = read(self.maps(), resolve(parse(self.sources())))["C_Base", "State"]
        self.assertEqual(
            [(each.least, each.most, each.word) for each in state.meanings],
            [(0, 0, "Unknown"), (1, 1, 'Other "one"'), (2, 4, "Some \\ more"), (0, 0xFFFFFFFF, "DMTF Reserved"),
             (0x8000, 0xFFFFFFFF, "Vendor Reserved")],
        )

    def test_the_mof_is_read_back(self):
        files = self.mof()
        text = "".join(files[f"mof/{name}"] for name in ("kldr_qualifiers.mof", "kldr_structure.mof", "kldrprovider.mof"))
        classes = {class_.name: class_ for class_ in resolve(parse([self.file(text, "all.mof")]))}
        plain = {class_.name: class_ for class_ in resolve(parse(self.sources()))}
        for name, class_ in classes.items():
            self.assertEqual([f.flags for f in class_.features], [f.flags for f in plain[name].features])
            state = class_.features[class_.find("State")].qualifiers
            self.assertEqual(state["valuemap"], ["0", "1", "2..4", "..", "0x8000.."])
            self.assertEqual(state["values"], ["Unknown", 'Other "one"', "Some \\ more", "DMTF Reserved", "Vendor Reserved"])
            self.assertEqual(class_.features[class_.find("Run")].qualifiers["values"], ["Done"])
            self.assertIsNone(class_.features[class_.find("Kinds")].qualifiers["values"])

    def test_a_map_stands_where_it_is_stated_and_where_a_product_class_declares_anew(self):
        files = self.mof()
        self.assertEqual(files["mof/kldr_structure.mof"].count("ValueMap {"), 2)
        self.assertEqual(files["mof/kldrprovider.mof"].count("ValueMap {"), 2)
        self.assertIn('class C_Middle : C_Base { [Override("State")] uint16 State; };', files["mof/kldr_structure.mof"])
        self.assertIn("// Odd on purpose", files["mof/kldrprovider.mof"])

    def test_without_maps_nothing_is_added(self):
        files = deployment(self.sources(), "P_", (), "1").files
        self.assertIn(PRODUCT, files["mof/kldrprovider.mof"])

    def test_the_table_has_heirs_and_the_rest_last(self):
        text = words(self.sources(), self.maps()).files["kldrcim/value_map_table.cpp"]
        self.assertIn(
            'map_0[] = {{0u, 0u, "Unknown"}, {1u, 1u, "Other \\"one\\""}, {2u, 4u, "Some \\\\ more"}, '
            '{32768u, 4294967295u, "Vendor Reserved"}, {0u, 4294967295u, "DMTF Reserved"}};',
            text,
        )
        rows = [line.strip() for line in text.splitlines() if line.startswith('    {"')]
        self.assertEqual(rows, sorted(rows))
        self.assertEqual(len(rows), 8)
        self.assertIn('{"p_plain", "run", map_1},', rows)

    def test_faulty_maps(self):
        for text, line, reason in (
            ("C_Base.State\n  x  Y\n", 2, "'x' is no number, A..B, A.. or .."),
            ("C_Base.State\n  ..5  Y\n", 2, "'..5' is no number, A..B, A.. or .."),
            ("C_Base.State\n  5..3  Y\n", 2, "'5..3' ends before it begins"),
            ("C_Base.State\n  5  Y\n  3..7  Z\n", 3, "'3..7' has a meaning already: 'Y'"),
            ("C_Base.State\n  ..  Y\n  ..  Z\n", 3, "'..' has a meaning already: 'Y'"),
            ("  5  Y\n", 1, "neither CLASS.PROPERTY nor '  NUMBER  WORD'"),
            ("C_Base.State\n  5\n", 2, "neither CLASS.PROPERTY nor '  NUMBER  WORD'"),
            ("C_None.State\n  5  Y\n", 1, "no class declares C_None.State"),
            ("P_Plain.State\n  5  Y\n", 1, "no class declares P_Plain.State"),
            ("C_Base.Run\n  5  Y\n", 1, "no class declares C_Base.Run"),
            ("C_Base.State()\n  5  Y\n", 1, "no class declares C_Base.State()"),
            ("C_Base.Name\n  5  Y\n", 1, "C_Base.Name is no integer"),
            ("C_Base.State\n", 1, "C_Base.State has no line"),
            ("C_Base.State\n  5  Y\nC_Base.State\n  6  Z\n", 3, "C_Base.State has a map already"),
        ):
            with self.subTest(text):
                self.refuse_map(text, line, reason)

    def test_lists_as_qualifiers(self):
        self.refuse('class A {\n[Values("one")] uint16 x; };', 2, "qualifier 'Values' takes a string[]")
        self.refuse('class A {\n[Key {"one"}] uint16 x; };', 2, "qualifier 'Key' takes a boolean")
        self.refuse('class A {\n[Values {1}] uint16 x; };', 2, "expected a text before '1'")
