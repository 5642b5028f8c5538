"""The folders: what the pages and the drawing say of them is what the linter and the build hold them to."""

import os
import re
import sys
import unittest
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
BUILD = Path(os.environ["KLDR_BUILD"])
sys.path.insert(0, str(ROOT / "tools"))

import folders  # noqa: E402
from lint import ALLOWED, sources  # noqa: E402
from pages_test import NO_PART, read, rows  # noqa: E402


class Tables(unittest.TestCase):
    def test_the_pages_show_who_may_include_whom(self):
        for page in ("CONTRIBUTING.md", "README.md"):
            self.assertTrue(read(ROOT / page) == folders.with_table(read(ROOT / page)), f"{page}: ./dev format")

    def test_and_the_readme_what_each_folder_holds(self):
        table = rows(ROOT / "README.md", "folder", "holds", "may include")
        self.assertEqual(len(table), len(set(ALLOWED) - folders.WORKSHOP))
        for folder, holds, _ in table:
            self.assertTrue(holds, folder)

    def test_the_readme_explains_each_entry_of_the_root(self):
        told = " ".join(" ".join(row) for row in rows(ROOT / "README.md", "entry", "holds"))
        for entry in ROOT.iterdir():
            if not entry.name.startswith(".") and entry.name not in NO_PART | {"README.md", "LICENSE"}:
                self.assertIn(f"`{entry.name}{'/' if entry.is_dir() else ''}`", told)

    def test_each_folder_of_code_has_a_readme(self):
        for folder in ALLOWED:
            # Those of the command line and the contracts share one.
            home = folder if folder.startswith("module/") else folder.split("/")[0]
            self.assertTrue((ROOT / home / "README.md").exists(), folder)


class Drawing(unittest.TestCase):
    """docs/design/rooms.svg."""

    def setUp(self):
        self.drawing = read(ROOT / "docs/design/rooms.svg")
        self.arrows = folders.drawn(read(BUILD / "links.txt").splitlines())

    def test_it_is_what_the_build_draws(self):
        made = BUILD / "docs/rooms.svg"
        self.assertTrue(made.exists(), "not drawn: Debian's graphviz is missing")
        self.assertTrue(self.drawing == read(made), "./dev format")

    def test_no_arrow_runs_upwards(self):
        ways = re.findall(r'<path class="(\w+)" d="M[\d.-]+,([\d.-]+) .*?,([\d.-]+)" ', self.drawing)
        self.assertEqual(len(ways), len(self.arrows))
        self.assertEqual({kind for kind, _, _ in ways}, set(folders.KINDS))
        for kind, begin, end in ways:
            self.assertLess(float(begin), float(end), kind)

    def test_each_arrow_is_there_or_a_way_of_others(self):
        built = {(tail, head) for tail, head, kind in self.arrows if kind != "opened"}
        for tail, head in folders.included() | folders.linked(read(BUILD / "links.txt").splitlines()):
            self.assertIn(head, folders.reachable(tail, built), tail)

    def test_every_folder_that_runs_is_drawn(self):
        for folder in set(ALLOWED) - folders.WORKSHOP:
            self.assertTrue(f">{folder}/</text>" in self.drawing, folder)

    def test_who_opens_a_library_is_drawn(self):
        opening = set()
        for path in sources():
            # With RTLD_NOLOAD it only asks for what is there.
            if path.suffix == ".cpp" and re.search(r"\bdlopen\((?![^;]*RTLD_NOLOAD)", read(ROOT / path)):
                opening.add(str(path.parent))
        # A test's way to the library that it has opened anyway.
        self.assertEqual({each for each in opening if not each.startswith("tests")} - {"simulator"}, set(folders.OPENED))


class Tool(unittest.TestCase):
    def test_a_table_is_brought_up_to_date(self):
        page = "a\n\n| folder | may include |\n|---|---|\n| `attic/` | nothing |\n\n| b | c |\n"
        made = folders.with_table(page)
        self.assertNotIn("attic", made)
        self.assertRegex(made, r"\n\| `module/schema/` +\| `runtime` +\|\n")
        self.assertRegex(made, r"\n\| `tests/` +\| all +\|\n")
        self.assertTrue(made.endswith("|\n\n| b | c |\n"))

    def test_what_a_person_wrote_of_a_folder_stays(self):
        made = folders.with_table("| folder | holds | may include |\n|---|---|---|\n| `broker/` | a server | x |\n| `tests/` | y | z |\n")
        self.assertRegex(made, r"\n\| `broker/` +\| a server +\| ")
        self.assertNotIn("`tests/`", made)

    def test_a_shortcut_is_left_out(self):
        self.assertEqual(folders.without_shortcuts({("a", "b"), ("b", "c"), ("a", "c")}), {("a", "b"), ("b", "c")})

    def test_what_is_reachable(self):
        self.assertEqual(folders.reachable("a", {("a", "b"), ("b", "c"), ("d", "e")}), {"b", "c"})

    def test_links_are_read_from_targets(self):
        lines = ["app broker kldr_runtime pthread", "kldr_runtime module/runtime ", "tool  kldr_runtime", "a_test tests/broker app"]
        self.assertEqual(folders.linked(lines), {("broker", "module/runtime")})


if __name__ == "__main__":
    unittest.main()
