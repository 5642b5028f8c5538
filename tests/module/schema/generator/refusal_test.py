"""Schemas that are well written but mean nothing: each is refused with its place and reason."""

import os

from generator.cli import generate
from generator.errors import MofError
from schema_case import QUALIFIERS, SchemaCase

BASE = "class Base { [Key] string Name; uint16 Speed; string Notes[]; Base REF Other; };\n"


class Classes(SchemaCase):
    def test_unknown_superclass(self):
        self.refuse("class A : B {};", 1, "unknown superclass 'B'")

    def test_superclass_that_follows(self):
        self.refuse("class A : B {};\nclass B {};", 1, "unknown superclass 'B'")

    def test_class_declared_twice(self):
        self.refuse("class A {};\nclass a {};", 2, "class 'a' is declared twice")


class Files(SchemaCase):
    def test_a_file_that_nobody_lists(self):
        self.file("class A {};", "some/A.mof")
        self.file("class B {};", "some/B.mof")
        self.file("what is no MOF", "some/notes.txt")
        one = '#pragma include ("some/A.mof")\n'
        index = self.file(one, "index.mof")
        forgotten = os.path.realpath(os.path.join(self.folder, "some/B.mof"))
        with self.assertRaises(MofError) as caught:
            generate([QUALIFIERS, index], "P_")
        self.assertEqual(
            str(caught.exception),
            f'{forgotten}:1: not included: {index} lacks the line #pragma include ("some/B.mof")',
        )
        # Wherever it is read.
        generate([QUALIFIERS, index, forgotten], "P_")
        self.file(one + '#pragma include ("some/B.mof")\n', "index.mof")
        generate([QUALIFIERS, index], "P_")


class Types(SchemaCase):
    def test_unknown_type(self):
        self.refuse("class A {\n  uint24 x; };", 2, "unknown type 'uint24'")

    def test_unknown_type_of_a_parameter(self):
        self.refuse("class A {\n  uint8 m(\n text x); };", 3, "unknown type 'text'")

    def test_reference_to_an_unknown_class(self):
        self.refuse("class A {\n B REF x; };", 2, "'x' refers to the unknown class 'B'")

    def test_parameter_that_refers_to_an_unknown_class(self):
        self.refuse("class A { uint8 m(B REF x); };", 1, "'x' refers to the unknown class 'B'")

    def test_embedded_instance_of_an_unknown_class(self):
        self.refuse(
            'class A { uint8 m([EmbeddedInstance("B")] string x); };', 1, "'x' refers to the unknown class 'B'"
        )

    def test_embedded_instance_in_a_number(self):
        self.refuse(
            'class A { uint8 m([EmbeddedInstance("A")] uint8 x); };', 1, "'x' is embedded, but not a string"
        )


class Names(SchemaCase):
    def test_feature_declared_twice(self):
        self.refuse("class A { uint8 x;\nuint8 X; };", 2, "'X' is declared twice in 'A'")

    def test_parameter_declared_twice(self):
        self.refuse("class A { uint8 m(uint8 x,\nuint8 x); };", 2, "'x' is declared twice in 'm'")

    def test_word_of_cpp(self):
        self.refuse("class A { uint8 default; };", 1, "'default' cannot be the name of a C++ member")

    def test_name_of_the_runtime(self):
        self.refuse("class A { uint8 m(uint8 return_value); };", 1, "'return_value' is a name of the runtime")


class Qualifiers(SchemaCase):
    def test_unknown(self):
        self.refuse("class A {\n[Fast] uint8 x; };", 2, "unknown qualifier 'Fast'")

    def test_twice(self):
        self.refuse("class A { [Key, key] uint8 x; };", 1, "qualifier 'key' stands twice")

    def test_on_the_wrong_element(self):
        self.refuse("class A { [Weak] uint8 x; };", 1, "qualifier 'Weak' does not apply to a property")
        self.refuse("[Aggregation] class A {};", 1, "qualifier 'Aggregation' does not apply to a class")

    def test_value_of_the_wrong_type(self):
        self.refuse('class A { [Key("x")] uint8 x; };', 1, "qualifier 'Key' takes a boolean")
        self.refuse("class A { [Override] uint8 x; };", 1, "qualifier 'Override' takes a string")

    def test_inherited_one_turned_off(self):
        self.refuse(
            BASE + 'class A : Base { [Key(false), Override("Name")] string Name; };',
            2,
            "qualifier 'Key' is inherited and cannot be turned off",
        )

    def test_declared_twice(self):
        self.refuse(
            "Qualifier Key : boolean = false, Scope(property);", 1, "qualifier 'Key' is declared twice"
        )

    def test_without_a_bit_in_the_flag_word(self):
        self.refuse(
            "Qualifier Fast : boolean = false, Scope(property);", 1, "qualifier 'Fast' has no bit in the flag word"
        )

    def test_of_another_type(self):
        self.refuse(
            "Qualifier Max : uint32 = null, Scope(property);", 1, "qualifier 'Max' is neither boolean nor string"
        )


class Overrides(SchemaCase):
    def test_without_the_qualifier(self):
        self.refuse(
            BASE + "class A : Base { uint16 Speed; };",
            2,
            "'Speed' is already declared in 'Base': Override(\"Speed\") is missing",
        )

    def test_of_nothing(self):
        self.refuse(
            BASE + 'class A : Base { [Override("Pace")] uint16 Pace; };',
            2,
            "'Pace' overrides nothing: no superclass declares it",
        )

    def test_of_another_name(self):
        self.refuse(
            BASE + 'class A : Base { [Override("Name")] uint16 Speed; };',
            2,
            "'Speed' cannot override 'Name': the names must be the same",
        )

    def test_of_another_type(self):
        self.refuse(
            BASE + 'class A : Base { [Override("Speed")] uint32 Speed; };',
            2,
            "'Speed' is uint32, but overrides uint16 of 'Base'",
        )

    def test_of_an_array(self):
        self.refuse(
            BASE + 'class A : Base { [Override("Notes")] string Notes; };',
            2,
            "'Notes' is string, but overrides string array of 'Base'",
        )

    def test_of_another_kind(self):
        self.refuse(
            BASE + 'class A : Base { [Override("Other")] string Other; };',
            2,
            "'Other' is string, but overrides a reference of 'Base'",
        )

    def test_that_widens_a_reference(self):
        self.refuse(
            BASE + 'class B {};\nclass A : Base { [Override("Other")] B REF Other; };',
            3,
            "'Other' refers to 'B', which does not derive from 'Base'",
        )


class MethodOverrides(SchemaCase):
    BASE = "class Base { uint32 Run(uint16 How, [Out] string Log); };\n"

    def refuse_override(self, method, line, reason):
        self.refuse(self.BASE + "class A : Base { [Override(\"Run\")]\n" + method + " };", line, reason)

    def test_with_another_result(self):
        self.refuse_override(
            "uint16 Run(uint16 How, [Out] string Log);",
            3,
            "'Run' is a method of uint16, but overrides a method of uint32 of 'Base'",
        )

    def test_with_another_parameter(self):
        reason = "parameter '{}' of 'Run' differs from that of 'Base'"
        self.refuse_override("uint32 Run(uint32 How, [Out] string Log);", 3, reason.format("How"))
        self.refuse_override("uint32 Run(uint16 Why, [Out] string Log);", 3, reason.format("Why"))
        self.refuse_override("uint32 Run(uint16 How,\nstring Log);", 4, reason.format("Log"))

    def test_with_fewer_parameters(self):
        self.refuse_override(
            "uint32 Run(uint16 How);", 3, "'Run' has 1 parameters, but overrides a method of 'Base' with 2"
        )


class Defaults(SchemaCase):
    def misfit(self, declaration, shown):
        self.refuse("class A {\n" + declaration + " };", 2, f"default {shown}")

    def test_that_do_not_fit(self):
        self.misfit("uint8 x = 256;", "256 of 'x' does not fit uint8")
        self.misfit("uint8 x = -1;", "-1 of 'x' does not fit uint8")
        self.misfit("sint8 x = -129;", "-129 of 'x' does not fit sint8")
        self.misfit("uint64 x = 18446744073709551616;", "18446744073709551616 of 'x' does not fit uint64")
        self.misfit("uint16 x = true;", "true of 'x' does not fit uint16")
        self.misfit("uint16 x = 1.5;", "1.5 of 'x' does not fit uint16")
        self.misfit('uint16 x = "5";', "5 of 'x' does not fit uint16")
        self.misfit("boolean x = 1;", "1 of 'x' does not fit boolean")
        self.misfit("string x = 1;", "1 of 'x' does not fit string")
        self.misfit('datetime x = "tomorrow";', "tomorrow of 'x' does not fit datetime")
        self.misfit("char16 x = 65;", "65 of 'x' does not fit char16")
        self.misfit("uint8 x = {1};", "{...} of 'x' does not fit uint8")
        self.misfit("uint8 x[] = 1;", "1 of 'x' does not fit uint8 array")
        self.misfit("uint8 x[] = {1, 300};", "300 of 'x' does not fit uint8 array")

    def test_of_a_reference(self):
        self.refuse("class A { A REF x = null; };", 1, "'x' is a reference and takes no default")
