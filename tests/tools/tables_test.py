"""The tool that aligns the tables of the pages: what it aligns, what it leaves alone."""

import sys
import unittest
from pathlib import Path

sys.path.insert(0, str(Path(__file__).resolve().parents[2] / "tools"))

import tables  # noqa: E402


class Tables(unittest.TestCase):
    def test_columns_become_as_wide_as_their_widest_cell(self):
        self.assertEqual(tables.aligned_page("a\n\n| x | long head |\n|---|---|\n| wide cell | y |\n\nb\n"),
                         "a\n\n| x         | long head |\n|-----------|-----------|\n| wide cell | y         |\n\nb\n")

    def test_an_aligned_table_is_left_as_it_is(self):
        page = "| x  |    7 |\n|----|------|\n| yy | 1207 |\n"
        self.assertEqual(tables.aligned_page(page), page)

    def test_a_bar_that_is_escaped_is_text(self):
        self.assertEqual(tables.aligned_page("| a\\|b | c |\n|---|---|\n| d | e |\n"), "| a\\|b | c   |\n|------|-----|\n| d    | e   |\n")

    def test_what_is_fenced_shows_what_it_shows(self):
        page = "```\n| a | b |\n|---|---|\n| ccccc | d |\n```\n"
        self.assertEqual(tables.aligned_page(page), page)

    def test_what_is_no_table_is_left_alone(self):
        for page in ("| a | b\n| c |\n", "| a | b |\n| cccc | d |\n", "|\n"):
            self.assertEqual(tables.aligned_page(page), page)

    def test_sentences_are_not_padded_to_the_longest(self):
        page = f"| a | b |\n|---|---|\n| c | {'word ' * 60}|\n"
        self.assertEqual(tables.aligned_page(page), page)

    def test_the_last_line_may_lack_its_end(self):
        self.assertEqual(tables.aligned_page("| ab | c |\n|---|---|\n| d | e |"), "| ab  | c   |\n|-----|-----|\n| d   | e   |")


if __name__ == "__main__":
    unittest.main()
