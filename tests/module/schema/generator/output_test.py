"""What is written: the files, their stability, the command line."""

import contextlib
import io
import os
import re

from schema_case import QUALIFIERS, SchemaCase

from generator.cli import main
from generator.output import Output

TINY = """
class C_Base { [Key] string Name; uint16 State = 5; uint32 Reset(); };
class C_Other {};
class P_Port : C_Base { [Override("Name"), Key] string Name; C_Other REF Other; datetime When[];
    uint32 Run(uint16 How[], C_Other REF On, [In(false), Out] C_Other REF Job, [In(false), Out] string Log); };
[Association] class P_Link { [Key] C_Base REF A; [Key] P_Port REF B; };
[Indication] class P_Alert { string Text; };
"""


class Fragments(SchemaCase):
    def setUp(self):
        super().setUp()
        self.files = self.generated(TINY)

    def test_a_record_is_flat_and_in_feature_order(self):
        body = self.files["module/schema/P_Port.h"].split("struct P_Port : Instance {")[1]
        cells = re.findall(r"^    ([^;]*);", body, re.MULTILINE)
        self.assertEqual(
            cells,
            [
                "Property<String> Name",
                "Property<uint16> State",
                "C_Other* Other",
                "Property<Array<Datetime>> When",
                "static const Meta_Class static_meta_class",
            ],
        )
        self.assertIn("struct C_Other;\n", self.files["module/schema/P_Port.h"])

    def test_methods_have_records_in_a_header_of_their_own(self):
        self.assertNotIn("module/schema/P_Link_methods.h", self.files)
        text = self.files["module/schema/P_Port_methods.h"]
        cells = re.findall(r"^    (.*) (\w+);", text, re.MULTILINE)
        self.assertEqual([name for _, name in cells], ["How", "On", "Job", "Log", "return_value", "static_meta_class"])
        self.assertNotIn("Reset", text)

    def test_tables_share_inherited_records(self):
        text = self.files["module/schema/tables.cpp"]
        self.assertIn(
            "_P_Port_MFA[] = {&_P_Port_Name, &_C_Base_State, &C_Base_Reset_method::static_meta_class, "
            "&_P_Port_Other, &_P_Port_When, &P_Port_Run_method::static_meta_class};",
            text,
        )
        self.assertIn("_P_Port_locals[] = {1,0,0,1,1,1};", text)
        self.assertIn("_C_Base_State_MV{.uint16_value = 5};", text)
        self.assertIn("SAME(P_Port, C_Base, State);", text)
        self.assertNotIn("_C_Other_MFA", text)

    def test_the_repository_lists_the_classes_in_order(self):
        text = self.files["module/schema/tables.cpp"]
        order = re.search(r" classes\[\] = \{(.*)\};", text)[1]
        self.assertEqual(re.findall(r"&(\w+)::", order), ["C_Base", "C_Other", "P_Port", "P_Link", "P_Alert"])
        self.assertRegex(text, r"__meta_repository_[0-9a-f]{32}\{classes, 5\}")

    def test_a_skeleton_has_a_stub_for_each_method_in_flat_order(self):
        text = self.files["module/schema/P_Port_Skeleton.h"]
        self.assertIn(
            "Invoke_Method_Status Run(const P_Port* /*self*/, const Property<Array<uint16>>& /*How*/, "
            "const C_Other* /*On*/, C_Other*& /*Job*/, Property<String>& /*Log*/, Property<uint32>& /*return_value*/) "
            "{ return INVOKE_METHOD_UNSUPPORTED; }",
            text,
        )
        self.assertEqual(re.findall(r'strcasecmp\(name, "(\w+)"\)', text), ["Reset", "Run"])

    def test_skeletons_follow_the_kind_of_the_class(self):
        for name, base in (("Port", "Instance"), ("Link", "Association"), ("Alert", "Indication")):
            self.assertIn(f"public {base}_Skeleton<P_{name}>", self.files[f"module/schema/P_{name}_Skeleton.h"])
        self.assertNotIn("module/schema/C_Base_Skeleton.h", self.files)

    def test_factories_follow_the_kind_of_the_class(self):
        text = self.files["module/exports/factories.cpp"]
        self.assertEqual(
            re.findall(r"^FACTORY\((\w+), (\w+), '(.)'\)$", text, re.MULTILINE),
            [
                ("P_Port", "Instance", "I"),
                ("P_Port", "Method", "M"),
                ("P_Link", "Association", "A"),
                ("P_Link", "Instance", "I"),
                ("P_Link", "Method", "M"),
                ("P_Alert", "Indication", "N"),
                ("P_Alert", "Method", "M"),
            ],
        )

    def test_every_provider_is_linked_once_in_order(self):
        linked = re.findall(r"LINK\((P_\w+)\)", self.files["module/exports/registration.cpp"])
        self.assertEqual(linked, ["P_Port", "P_Link", "P_Alert"])

    def test_a_class_can_go_without_a_provider(self):
        files = self.generated(TINY, without=["P_Link"])
        self.assertNotIn("module/schema/P_Link_Skeleton.h", files)
        self.assertIn("module/schema/P_Link.h", files)
        self.assertNotIn("P_Link", files["module/exports/factories.cpp"] + files["module/exports/registration.cpp"])

    def test_defaults_of_every_type(self):
        text = self.generated(
            "class C { boolean a = TRUE; sint64 b = -9223372036854775808; uint64 c = 0xFFFFFFFFFFFFFFFF; real32 d = 1.5;"
            "real64 e = 2; char16 f = 'A'; string g = \"q\\\"\"; datetime h = \"20200101000000.000000+060\";"
            'uint8 i[] = {1, 2}; string j[] = {"x"}; string k[] = {}; uint8 l = null; };'
        )["module/schema/tables.cpp"]
        values = dict(re.findall(r"Meta_Value _C_(\w)_MV\{(.*)\};", text))
        self.assertEqual(
            values,
            {
                "a": ".boolean_value = true",
                "b": ".sint64_value = -9223372036854775807 - 1",
                "c": ".uint64_value = 18446744073709551615u",
                "d": ".real32_value = 1.5f",
                "e": ".real64_value = 2.0",
                "f": ".char16_value = char16(65)",
                "g": '.string_value = "q\\""',
                "h": '.string_value = "20200101000000.000000+060"',
                "i": ".array_value = {_C_i_MV_elements, 2}",
                "j": ".array_value = {_C_j_MV_elements, 1}",
                "k": ".array_value = {nullptr, 0}",
            },
        )
        self.assertIn('static const char* const _C_j_MV_elements[] = {"x"};', text)


class Stability(SchemaCase):
    def test_the_same_schema_gives_the_same_text(self):
        self.assertEqual(self.generated(TINY), self.generated(TINY))

    def test_the_repository_is_renamed_when_the_tables_change(self):
        def tag(text):
            return re.search(r"__meta_repository_\w+", self.generated(text)["module/schema/tables.cpp"])[0]

        self.assertEqual(tag(TINY), tag("// a comment\n" + TINY))
        self.assertNotEqual(tag(TINY), tag(TINY.replace("State = 5", "State = 6")))

    def test_unchanged_files_are_not_written_again(self):
        output = Output()
        output.add("a.h", "a")
        output.add("deep/b.h", "b")
        output.write(self.folder)
        paths = [os.path.join(self.folder, name) for name in output.files]
        for path in paths:
            os.utime(path, (1, 1))
        output.add("deep/b.h", "changed")
        output.write(self.folder)
        self.assertEqual([os.stat(path).st_mtime == 1 for path in paths], [True, False])


class CommandLine(SchemaCase):
    def run_main(self, *arguments):
        out, err = io.StringIO(), io.StringIO()
        with contextlib.redirect_stdout(out), contextlib.redirect_stderr(err):
            status = main([*arguments, "--provider-prefix", "P_"])
        return status, out.getvalue(), err.getvalue()

    def test_the_list_names_what_is_written(self):
        mof = self.file(TINY)
        folder = os.path.join(self.folder, "out")
        status, listed, _ = self.run_main("--list", QUALIFIERS, mof)
        self.assertEqual(status, 0)
        self.assertFalse(os.path.exists(folder))
        self.assertEqual(self.run_main("--output", folder, QUALIFIERS, mof), (0, "", ""))
        written = [
            os.path.relpath(os.path.join(path, name), folder) for path, _, names in os.walk(folder) for name in names
        ]
        self.assertEqual(sorted(written), sorted(listed.split()))

    def test_faulty_mof_gives_status_1_and_writes_nothing(self):
        mof = self.file("class A : B {};")
        folder = os.path.join(self.folder, "out")
        status, out, err = self.run_main("--output", folder, QUALIFIERS, mof)
        self.assertEqual((status, out, err), (1, "", f"{mof}:1: unknown superclass 'B'\n"))
        self.assertFalse(os.path.exists(folder))

    def test_a_file_that_does_not_exist(self):
        status, _, err = self.run_main("--list", os.path.join(self.folder, "none.mof"))
        self.assertEqual(status, 1)
        self.assertIn("none.mof:1: cannot be read: No such file or directory", err)
