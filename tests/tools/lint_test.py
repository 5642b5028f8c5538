"""The house rules: what each sees, and what it lets pass."""

import sys
import unittest
from pathlib import Path

sys.path.insert(0, str(Path(__file__).resolve().parents[2] / "tools"))

import lint  # noqa: E402


def complaints(check, path, text):
    """The lines that a check complains of, with its words."""
    found = []
    check(Path(path), text.splitlines(), lambda _, number, words: found.append((number, words)))
    return found


class Arrows(unittest.TestCase):
    def test_a_folder_includes_what_its_row_names(self):
        self.assertEqual(complaints(lint.check_arrows, "module/model/a.cpp", '#include "module/runtime/b.h"\n#include <json/json.h>\n'), [])

    def test_and_nothing_else(self):
        text = '#include "module/cmpi/b.h"\n#include <cmpidt.h>\n#  include <broker/Local_Server.h>\n'
        self.assertEqual(complaints(lint.check_arrows, "module/model/a.cpp", text),
                         [(1, "module/model/ may not include module/cmpi"), (2, "module/model/ may not include contracts/cmpi"),
                          (3, "module/model/ may not include broker")])

    def test_a_library_is_for_those_who_name_it(self):
        self.assertEqual(complaints(lint.check_arrows, "module/cmpi/a.cpp", "#include <json/json.h>\n"),
                         [(1, "module/cmpi/ may not include <json>")])

    def test_an_include_says_where_it_stands(self):
        self.assertEqual(complaints(lint.check_arrows, "broker/a.cpp", '#include "Host.h"\n'),
                         [(1, '"Host.h" does not say where it stands')])

    def test_a_folder_without_a_row_is_named(self):
        self.assertEqual(len(complaints(lint.check_arrows, "attic/a.cpp", "")), 1)

    def test_rows_name_folders_that_are_there(self):
        for folder, row in lint.ALLOWED.items():
            for each in {folder, *row.split()} - {"*"} - lint.LIBRARIES:
                self.assertTrue((lint.ROOT / each).is_dir(), each)


class Heads(unittest.TestCase):
    def test_a_source_without_header_says_first_what_it_is(self):
        for text in ("#include <cstdio>\n", "\n// Late.\n", "//\n", "// clang-format off\n", ""):
            self.assertEqual(len(complaints(lint.check_head, "broker/Nobody.cpp", text)), 1, text)

    def test_one_sentence_is_enough_on_one_line_or_on_two(self):
        for text in ("// The table of nothing.\n", "// The table of\n// nothing.\n", "// The table: of nothing\n"):
            self.assertEqual(complaints(lint.check_head, "broker/Nobody.cpp", text), [], text)

    def test_a_header_speaks_for_its_source(self):
        self.assertEqual(complaints(lint.check_head, "broker/Local_Server.cpp", ""), [])

    def test_tests_and_providers_bear_the_names_of_what_they_are_about(self):
        for path in ("tests/broker/Nobody_test.cpp", "module/providers/KALDERA_Nobody_Provider.cpp"):
            self.assertEqual(complaints(lint.check_head, path, ""), [], path)


class Names(unittest.TestCase):
    def test_tests_are_named_in_one_style(self):
        self.assertEqual(complaints(lint.check_names, "tests/a_test.cpp", "TEST(String, IsEmpty)\nTEST_F(String, is_empty)\n"),
                         [(2, "a test's name is ThatOfASentence")])

    def test_members_have_their_underscore_in_front(self):
        self.assertEqual(complaints(lint.check_names, "broker/a.h", "    int _count = 0;\n    std::map<int, int> places_;\n"),
                         [(2, "places_ is a member: _places")])


class Mutexes(unittest.TestCase):
    def test_a_mutex_guards_something(self):
        self.assertEqual(complaints(lint.check_mutexes, "broker/a.h", "Mutex lock_;\n"),
                         [(1, "lock_ guards nothing: GUARDED_BY or REQUIRES is missing")])
        self.assertEqual(complaints(lint.check_mutexes, "broker/a.h", "Mutex lock_;\nint a GUARDED_BY(lock_);\n"), [])


class Traps(unittest.TestCase):
    def test_each_pattern_is_seen_in_code_and_not_in_comments(self):
        for line in ("value.asString()", "system (line);", "using namespace std;", "std::cout << a", "std::mutex guard;",
                     "#include <iostream>"):
            self.assertEqual(len(complaints(lint.check_traps, "module/model/a.cpp", line + "\n")), 1, line)
            self.assertEqual(complaints(lint.check_traps, "module/model/a.cpp", f"// {line}\n"), [], line)


if __name__ == "__main__":
    unittest.main()
