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
from pages_test import NO_PART, bare, read, rows  # noqa: E402


def may_include(folder):
    """A row of the linter's table in the words of the pages."""
    names = [name.removeprefix("module/") if folder.startswith("module/") else name for name in ALLOWED[folder].split()]
    return "all" if names == ["*"] else " ".join(names) or "nothing"


class Tables(unittest.TestCase):
    def test_contributing_shows_who_may_include_whom(self):
        told = [tuple(row) for row in map(bare, rows(ROOT / "CONTRIBUTING.md", "folder", "may include"))]
        self.assertEqual(told, [(f"{folder}/", may_include(folder)) for folder in ALLOWED])

    def test_so_does_the_readme_of_what_runs(self):
        told = {folder: row for folder, _, row in map(bare, rows(ROOT / "README.md", "folder", "holds", "may include"))}
        self.assertEqual(told, {f"{folder}/": may_include(folder) for folder in ALLOWED if folder not in folders.WORKSHOP})

    def test_the_readme_explains_each_entry_of_the_root(self):
        told = " ".join(" ".join(row) for row in rows(ROOT / "README.md", "entry", "holds"))
        for entry in ROOT.iterdir():
            if not entry.name.startswith(".") and entry.name not in NO_PART | {"README.md", "LICENSE"}:
                self.assertIn(f"`{entry.name}{'/' if entry.is_dir() else ''}`", told)

    def test_each_folder_of_code_has_a_readme(self):
        for folder in ALLOWED:
            # Those of the command line and the contracts share one.
            home = folder if folder.startswith("module/") else folder.split("/")[0]
            if folder not in folders.WORKSHOP:
                self.assertTrue((ROOT / home / "README.md").exists(), folder)


class Drawing(unittest.TestCase):
    """docs/design/rooms.svg."""

    def setUp(self):
        self.drawing = read(ROOT / "docs/design/rooms.svg")
        self.arrows = folders.drawn(read(BUILD / "links.txt").splitlines())

    def test_it_is_what_the_build_draws(self):
        made = BUILD / "docs/rooms.svg"
        self.assertTrue(made.exists(), "not drawn: Debian's graphviz is missing")
        self.assertTrue(self.drawing == read(made), f"cp {made.relative_to(ROOT)} docs/design/rooms.svg")

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
            self.assertIn(f">{folder}/</text>", self.drawing)

    def test_who_opens_a_library_is_drawn(self):
        opening = set()
        for path in sources():
            # With RTLD_NOLOAD it only asks for what is there.
            if path.suffix == ".cpp" and re.search(r"\bdlopen\((?![^;]*RTLD_NOLOAD)", read(ROOT / path)):
                opening.add(str(path.parent))
        # A test's way to the library that it has opened anyway.
        self.assertEqual({each for each in opening if not each.startswith("tests")} - {"simulator"}, set(folders.OPENED))


class Tool(unittest.TestCase):
    def test_a_shortcut_is_left_out(self):
        self.assertEqual(folders.without_shortcuts({("a", "b"), ("b", "c"), ("a", "c")}), {("a", "b"), ("b", "c")})

    def test_what_is_reachable(self):
        self.assertEqual(folders.reachable("a", {("a", "b"), ("b", "c"), ("d", "e")}), {"b", "c"})

    def test_links_are_read_from_targets(self):
        lines = ["app broker kldr_runtime pthread", "kldr_runtime module/runtime ", "tool  kldr_runtime", "a_test tests/broker app"]
        self.assertEqual(folders.linked(lines), {("broker", "module/runtime")})


if __name__ == "__main__":
    unittest.main()
