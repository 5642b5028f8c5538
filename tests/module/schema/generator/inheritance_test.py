"""What a class has after resolving: order, locality, flags, defaults."""

from schema_case import SchemaCase

from generator.flags import BITS, NAMES

TINY = """
[Abstract] class Root { [Key] string Name; uint16 State = 5; [Counter, Experimental] uint32 Count; };
class Middle : Root { boolean On; [Override("State")] uint16 State; };
class Leaf : Middle { string Extra[]; [Override("Count")] uint32 Count; [Override("State"), Write] uint16 State = 7; };
"""


def flag_names(word):
    return [name for name in NAMES if word & BITS[name.lower()]]


class Inheritance(SchemaCase):
    def feature(self, class_, name):
        found = self.classes(TINY)[class_]
        return found.features[found.find(name)]

    def test_own_features_stand_behind_inherited_ones(self):
        leaf = self.classes(TINY)["Leaf"]
        self.assertEqual([f.name for f in leaf.features], ["Name", "State", "Count", "On", "Extra"])

    def test_an_override_keeps_its_position_and_is_local(self):
        leaf = self.classes(TINY)["Leaf"]
        self.assertEqual([leaf.owns(f) for f in leaf.features], [False, True, True, False, True])

    def test_what_is_not_declared_is_shared(self):
        classes = self.classes(TINY)
        self.assertIs(classes["Leaf"].features[0], classes["Root"].features[0])
        self.assertIs(classes["Leaf"].features[3], classes["Middle"].features[3])

    def test_an_override_inherits_flags(self):
        self.assertEqual(
            flag_names(self.feature("Root", "Count").flags), ["Property", "Counter", "Experimental", "Read"]
        )
        self.assertEqual(flag_names(self.feature("Leaf", "State").flags), ["Property", "Read", "Write"])

    def test_experimental_is_not_inherited(self):
        self.assertEqual(flag_names(self.feature("Leaf", "Count").flags), ["Property", "Counter", "Read"])

    def test_an_override_without_a_default_keeps_the_inherited_one(self):
        state = self.feature("Middle", "State")
        self.assertEqual((state.default, state.default_owner), ("5", "Root"))

    def test_an_override_may_state_its_own_default(self):
        state = self.feature("Leaf", "State")
        self.assertEqual((state.default, state.default_owner), ("7", "Leaf"))

    def test_abstract_is_not_inherited(self):
        classes = self.classes(TINY)
        self.assertEqual(flag_names(classes["Root"].flags), ["Class", "Abstract"])
        self.assertEqual(flag_names(classes["Middle"].flags), ["Class"])


class Kinds(SchemaCase):
    def test_association_and_indication_are_no_plain_classes(self):
        classes = self.classes(
            "[Association, Aggregation] class A { [Key, Aggregate] B REF b; }; class B {};"
            "[Indication] class I {}; [Association] class C : A {}; class D : A {}; class J : I {};"
        )
        self.assertEqual(flag_names(classes["A"].flags), ["Aggregation", "Association"])
        self.assertEqual(flag_names(classes["C"].flags), ["Aggregation", "Association"])
        self.assertEqual(flag_names(classes["D"].flags), ["Aggregation", "Association"])
        self.assertEqual(flag_names(classes["I"].flags), ["Indication"])
        self.assertEqual(flag_names(classes["J"].flags), ["Indication"])
        self.assertEqual(flag_names(classes["B"].flags), ["Class"])

    def test_a_reference_is_not_read(self):
        classes = self.classes("[Association] class A { [Key, Weak] A REF a; };")
        self.assertEqual(flag_names(classes["A"].features[0].flags), ["Reference", "Key", "Weak"])

    def test_an_override_may_narrow_a_reference(self):
        classes = self.classes(
            '[Association] class A { [Key] B REF b; }; [Association] class C : A { [Override("b")] D REF b; };'
            "class B {}; class D : B {};"
        )
        self.assertEqual(classes["C"].features[0].target, "D")
        self.assertEqual(flag_names(classes["C"].features[0].flags), ["Reference", "Key"])


class Parameters(SchemaCase):
    def parameters(self, text):
        classes = self.classes("class A { uint32 m(" + text + "); };")
        return [flag_names(p.flags) for p in classes["A"].features[0].parameters]

    def test_directions(self):
        self.assertEqual(
            self.parameters("uint8 a, [Out] uint8 b, [In(false), Out] uint8 c, [Required] A REF d[]"),
            [["Property", "In"], ["Property", "In", "Out"], ["Property", "Out"], ["Reference", "In", "Required"]],
        )

    def test_an_embedded_instance_is_a_reference(self):
        self.assertEqual(
            self.parameters('[EmbeddedInstance("A")] string a[]'), [["Reference", "In", "EmbeddedInstance"]]
        )

    def test_an_overriding_method_replaces_the_inherited_one(self):
        classes = self.classes(
            'class A { uint32 m(uint8 a); uint8 x; }; class B : A { [Override("m")] uint32 m(uint8 a); };'
        )
        self.assertEqual([(f.name, f.owner) for f in classes["B"].features], [("m", "B"), ("x", "A")])
