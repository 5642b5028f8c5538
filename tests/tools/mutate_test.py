"""The program that mutates the module: where it does, what it draws, what it says of a mutant."""

import sys
import tempfile
import unittest
from pathlib import Path

sys.path.insert(0, str(Path(__file__).resolve().parents[2] / "tools"))

import mutate
from mutants import places as reading
from mutants import tree as trees


class Places(unittest.TestCase):
    def mutated(self, kind, text):
        """Every text that a mutation of the kind makes of this one."""
        return [place.apply(text, choice) for place in reading.places(text) if place.kind == kind
                for choice in place.choices]

    def check(self, kind, text, *expected):
        self.assertEqual(self.mutated(kind, text), list(expected))

    def body(self, kind, statements, *expected):
        before, after = "int f(int x)\n{\n", "\n    return x;\n}\n"
        self.check(kind, before + statements + after, *(before + each + after for each in expected))

    def test_comparisons_are_flipped(self):
        self.check("comparison", "a == b", "a != b")
        self.check("comparison", "a != b", "a == b")
        self.check("comparison", "a < b || c >= d", "a >= b || c >= d", "a < b || c < d")

    def test_boundaries_are_moved(self):
        self.check("boundary", "a < b", "a <= b")
        self.check("boundary", "a <= b", "a < b")
        self.check("boundary", "a > b", "a >= b")
        self.check("boundary", "a >= b", "a > b")
        self.check("boundary", "a == b")

    def test_brackets_of_templates_are_no_comparisons(self):
        for text in ("Ref<T> x;", "template <class T>", "bool operator<(A) const;", "a->b", "a <=> b", "x << 1", "x >> 1"):
            self.check("comparison", text)
            self.check("boundary", text)

    def test_constants_change_by_one(self):
        self.check("constant", "x = 7;", "x = 8;", "x = 6;")
        self.check("constant", "x = 0;", "x = 1;")
        self.check("constant", "x = 0x1Fu;", "x = 0x20u;", "x = 0x1eu;")
        self.check("constant", "x = 1'000ul;", "x = 1001ul;", "x = 999ul;")
        self.check("constant", "x = 0600;", "x = 385;", "x = 383;")
        self.check("constant", "x = true;", "x = false;")
        self.check("constant", "uint32 x1 = 1.5 + y.z2;")
        self.check("constant", "virtual void f() const = 0;")

    def test_conditions_are_negated(self):
        self.check("condition", "if (f(a) && b)", "if (!(f(a) && b))")
        self.check("condition", "while (!x)", "while (!(!x))")
        self.check("condition", "y = !x && z;", "y = x && z;")
        for text in ("if (const auto x = f())", "if (T* x = f(); x)", "if (T x = f())", "a != b", "for (;;)"):
            self.check("condition", text)

    def test_statements_are_dropped(self):
        self.body("statement", "    x = 2;\n    f(x);", "    {}\n    f(x);", "    x = 2;\n    {}")
        self.body("statement", "    if (x)\n        return 1;", "    if (x)\n        {}")
        self.body("statement", "    for (int i = 0; i < x; i++)\n        f(i);", "    for (int i = 0; i < x; i++)\n        {}")
        self.body("statement", "    switch (x) {\n    case A::B:\n        g();\n    }",
                  "    switch (x) {\n    case A::B:\n        {}\n    }")
        self.body("statement", "    switch (x) {\n    default:\n        break;\n    }")
        self.body("statement", "    if (x)\n        g();\n    else\n        h(\n            1);",
                  "    if (x)\n        {}\n    else\n        h(\n            1);",
                  "    if (x)\n        g();\n    else\n        {}")
        self.body("statement", "    each([&](int i) { g(i); });", "    {}", "    each([&](int i) { {} });")
        self.body("statement", "    delete y;", "    {}")

    def test_declarations_stay(self):
        for statement in ("int y = 2;", "const Lock lock(m);", "auto* y = x;", "T<int> y{1, 2};", "String& y = x;", "Text y;",
                          "using A = B;", "static int y;", "return x;"):
            self.body("statement", statement)
        for text in ("struct A\n{\n    int x;\n    void f();\n};\n", "enum class E\n{\n    A = B,\n};\n", "namespace A {\nf;\n}\n",
                     "A::A() : _x{1}, _y(2)\n{\n}\n", "void f();\n"):
            self.check("statement", text)

    def test_bodies_of_constructors_and_of_functions_in_types(self):
        self.check("statement", "A::A() : _x{1}\n{\n    f();\n}\n", "A::A() : _x{1}\n{\n    {}\n}\n")
        self.check("statement", "struct A\n{\n    void f() const { g(); }\n};\n", "struct A\n{\n    void f() const { {} }\n};\n")

    def test_what_is_no_code_stays(self):
        for text in ("// if (a == 1) b();\n", "/* a == 1\n */", 'f("a == 1");', "#if A == 1\n", "#define X \\\n    1\n",
                     'R"(a == 1)"', "c = '1';", "static_assert(sizeof(A) == f(1));"):
            self.assertEqual(reading.places(text), [], text)

    def test_places_are_where_they_were_in_the_whole_text(self):
        text = '// 1\n"2" /* 3 */ 4\n'
        (place,) = reading.places(text)
        self.assertEqual((text[place.start : place.end], reading.line_of(text, place)), ("4", 2))


class Equivalents(unittest.TestCase):
    def check(self, text, *kinds):
        found = {place.kind for place in reading.places(text) if reading.is_equivalent(text, place)}
        self.assertEqual(found, set(kinds))

    def test_only_the_kinds_that_are_named(self):
        self.check("if (a < 1) // Either way (boundary): 1 was seen before.\n", "boundary")
        self.check("if (a < 1) // Either way (boundary, constant): 1 was seen before.\n", "boundary", "constant")

    def test_on_the_lines_above(self):
        self.check("// Either way (constant): a number\n// like any other.\nx = 1;\n", "constant")
        self.check("// Either way (constant): a number.\ny();\nx = 1;\n")

    def test_not_without_a_reason(self):
        self.check("x = 1; // Either way (constant):\n")
        self.check("x = 1; // Either way\n")


class Drawing(unittest.TestCase):
    def draw(self, seed, count=40):
        drawing = mutate.drawn(mutate.mutants_of(mutate.ROOT, ("module/runtime/ground/String.cpp", 0)), seed)
        return [str(next(drawing)) for _ in range(count)]

    def test_a_seed_says_all(self):
        self.assertEqual(self.draw(1), self.draw(1))
        self.assertNotEqual(self.draw(1), self.draw(2))
        self.assertEqual(len(set(self.draw(1))), 40)

    def test_every_folder_has_places_and_tests(self):
        found = mutate.mutants_of(mutate.ROOT)
        changed = {path.split("/")[1] for places in found.values() for path, _, _ in places}
        self.assertEqual(changed | {"exports"}, set(mutate.TESTS))
        self.assertTrue(all(found.values()))


class Reports(unittest.TestCase):
    def test_what_does_not_compile_is_replaced_and_the_table_adds_up(self):
        lines = []
        text = "a == 1;\nb == 2; // Either way (comparison): no difference.\nc == 3;\nd == 4;\n"
        drawing = iter([mutate.Mutant("module/model/A.cpp", place, place.choices[0], text)
                        for place in reading.places(text) if place.kind == "comparison"])
        trial = mutate.Trial(drawing, 3, lines.append)

        def judge(path, mutated, tests):
            self.assertEqual(tests, mutate.TESTS["model"])
            return ("killed", "model_test") if "a !=" in mutated else ("refused", "") if "c !=" in mutated else ("survived", "")

        trial.work(judge)
        self.assertEqual([each.verdict for each in trial.judged], ["killed", "equivalent", "survived"])
        self.assertFalse(mutate.report(trial, 5, lines.append))
        text = "\n".join(lines)
        self.assertRegex(text, r"(?m)^model +1 +1 +1$")
        self.assertRegex(text, r"(?m)^all +1 +1 +1$")
        self.assertIn("  module/model/A.cpp:4: comparison: d == 4; -> d != 4;", text)
        self.assertIn("seed 5: 50.0 % of 2 killed, 95 % is the goal; 1 more did not compile", text)

    def test_the_goal_is_reached_without_survivors(self):
        trial = mutate.Trial(iter([]), 0)
        self.assertTrue(mutate.report(trial, 1, lambda text: None))


SAMPLE = {
    "CMakePresets.json": """{"version": 6, "configurePresets": [{"name": "native", "generator": "Ninja",
        "binaryDir": "${sourceDir}/build/native", "cacheVariables": {"CMAKE_CXX_COMPILER": "g++"}}],
        "testPresets": [{"name": "native", "configurePreset": "native"}]}""",
    "CMakeLists.txt": """cmake_minimum_required(VERSION 3.25)
project(sample LANGUAGES CXX)
enable_testing()
add_library(kldrprovider_Module MODULE sample.cpp)
add_custom_target(dzntj)
add_custom_target(kldrcim)
add_executable(sample_test sample.cpp sample_test.cpp)
add_test(NAME sample_test COMMAND sample_test)
set_tests_properties(sample_test PROPERTIES ENVIRONMENT "EXPECTED=4" RESOURCE_LOCK process_list)
""",
    "sample.cpp": """int twice(int x)
{
    int sum = 0;
    for (int i = 0; i < 2; i++)
        sum += x;
    return sum;
}
int unused(int x) { return x + 10; }
""",
    "sample_test.cpp": """#include <cstdlib>
int twice(int x);
int main() { return twice(2) == atoi(getenv("EXPECTED")) ? 0 : 1; }
""",
}


class Trees(unittest.TestCase):
    """A sample with a test: what is noticed of each mutation, and that nothing of it stays."""

    @classmethod
    def setUpClass(cls):
        cls.folder = tempfile.TemporaryDirectory()
        cls.root = Path(cls.folder.name, "root")
        cls.root.mkdir()
        for name, text in SAMPLE.items():
            (cls.root / name).write_text(text)
        cls.tree = trees.Tree(str(cls.root), str(Path(cls.folder.name, "tree")), 2)
        cls.tree.prepare(["sample_test"])

    @classmethod
    def tearDownClass(cls):
        cls.folder.cleanup()

    def judge(self, old, new):
        text = SAMPLE["sample.cpp"]
        self.assertIn(old, text)
        verdict = self.tree.judge("sample.cpp", text.replace(old, new, 1), ["sample_test"])
        self.assertEqual(Path(self.tree.folder, "sample.cpp").read_text(), text)
        return verdict

    def test_what_a_test_notices_is_killed(self):
        self.assertEqual(self.judge("i < 2", "i <= 2"), ("killed", "sample_test"))

    def test_what_no_test_notices_survives(self):
        self.assertEqual(self.judge("x + 10", "x + 11"), ("survived", ""))

    def test_what_does_not_compile_is_refused(self):
        self.assertEqual(self.judge("return sum;", "return sums;"), ("refused", ""))

    def test_what_hangs_is_killed(self):
        self.tree.seconds["sample_test"] = -3.8
        self.addCleanup(self.tree.seconds.pop, "sample_test")
        self.assertEqual(self.judge("i++", "i += i < 1"), ("killed", "sample_test, hung"))

    def test_the_sources_are_not_touched(self):
        self.judge("i < 2", "i <= 2")
        self.assertEqual((self.root / "sample.cpp").read_text(), SAMPLE["sample.cpp"])

    def test_a_tree_follows_its_sources(self):
        other = Path(self.folder.name, "other")
        copied = Path(self.folder.name, "copied")
        (other / "build").mkdir(parents=True)
        (other / "build" / "built").write_text("")
        (other / "one").write_text("1")
        (other / "two").write_text("2")
        trees.copy(str(other), str(copied))
        before = (copied / "two").stat().st_mtime_ns
        (other / "one").unlink()
        (other / "three").write_text("3")
        trees.copy(str(other), str(copied))
        self.assertEqual(sorted(trees.sources(copied)), ["three", "two"])
        self.assertEqual((copied / "two").stat().st_mtime_ns, before)

    def test_a_sample_whose_test_fails_cannot_be_mutated(self):
        text = SAMPLE["sample_test.cpp"]
        Path(self.tree.folder, "sample_test.cpp").write_text(text.replace("? 0 : 1", "? 1 : 0"))
        with self.assertRaises(trees.Broken):
            self.tree.prepare(["sample_test"])
        Path(self.tree.folder, "sample_test.cpp").write_text(text)
        self.tree.prepare(["sample_test"])


if __name__ == "__main__":
    unittest.main()
