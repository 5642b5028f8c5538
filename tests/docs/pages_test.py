"""Whether what the pages name is there, and what they say of the code is what the code says."""

import re
import unittest
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
DESIGN = ROOT / "docs/design"
SOURCES = (".h", ".cpp", ".def", ".py", ".mof", ".md", ".json", ".map", ".sh", ".supp", ".cmake", ".txt", ".svg")
NO_PART = {"build", ".git"}


def read(path):
    return path.read_text(encoding="utf-8")


def tree():
    return [file for entry in ROOT.iterdir() if entry.name not in NO_PART
            for file in ([entry] if entry.is_file() else entry.rglob("*")) if file.is_file()]


def pages():
    return [file for file in tree() if file.suffix == ".md"]


def prose(text):
    """A page without its fenced blocks."""
    return re.sub(r"^ *(```+).*?^ *\1$", "", text, flags=re.M | re.S)


def rows(page, *heads):
    """The rows of the tables of a page that have these heads."""
    found, is_inside = [], False
    for line in read(page).splitlines():
        cells = [cell.strip() for cell in line.strip("|").split("|")] if line.startswith("|") else []
        if is_inside and set("".join(cells)) - set("-"):
            found.append(cells)
        is_inside = bool(cells) and (is_inside or cells == list(heads))
    return found


def bare(cells):
    return [cell.replace("`", "") for cell in cells]


class Named(unittest.TestCase):
    def test_links_lead_somewhere(self):
        for page in pages():
            for link in re.findall(r"\]\(([^)#\s]+)[^)]*\)", prose(read(page))):
                if "://" not in link:
                    self.assertTrue((page.parent / link).exists(), f"{page}: {link}")

    def test_files_of_the_design_pages_exist(self):
        files = tree()
        names, paths = {file.name for file in files}, {str(file.relative_to(ROOT)) for file in files}
        count = 0
        for page in [*DESIGN.glob("*.md"), ROOT / "docs/glossary.md"]:
            for name in re.findall(r"`([\w./-]+\.\w+)`", prose(read(page))):
                if name.endswith(SOURCES):
                    count += 1
                    self.assertTrue(name in (paths if "/" in name else names), f"{page}: {name}")
        self.assertGreater(count, 3)

    def test_each_page_is_in_a_list_of_pages(self):
        lists = read(ROOT / "README.md") + read(ROOT / "CONTRIBUTING.md")
        for page in (ROOT / "docs").rglob("*.md"):
            self.assertTrue(f"({page.relative_to(ROOT)})" in lists, page)


class Objects(unittest.TestCase):
    """docs/design/objects.md against the assertions that pin the layouts."""

    @staticmethod
    def pins():
        text = read(ROOT / "module/runtime/objects/layout.cpp")
        found = {}
        for record, field, *sizes in re.findall(r"^PIN\(([^,]+), *(\w+), *(\d+), *(\d+)\)", text, re.M):
            found.setdefault(record, {})[field] = tuple(map(int, sizes))
        for record, *sizes in re.findall(r"^PIN_SIZE\(([^,]+), *(\d+), *(\d+)\)", text, re.M):
            found.setdefault(record, {})["sizeof"] = tuple(map(int, sizes))
        return found

    def test_offsets_are_those_that_are_pinned(self):
        table = rows(DESIGN / "objects.md", "record", "32 bits", "64 bits")
        self.assertGreater(len(table), 5)
        for record, *cells in map(bare, table):
            for at, cell in enumerate(cells):
                told = {name: int(figure) for name, figure in map(str.split, cell.split(","))}
                self.assertEqual(told, {name: sizes[at] for name, sizes in self.pins()[record].items()}, record)


    def test_the_drawing_has_the_offsets_of_the_example(self):
        code = read(ROOT / "tests/docs/objects_page.cpp")
        asserted = {field: sizes for field, *sizes in re.findall(r"offsetof\(Example, ([\w.]+)\) *== at\((\d+), *(\d+)\)", code)}
        drawn = {field: sizes for field, *sizes in re.findall(r"^\| (\w[\w.]+) [^|]*\|[ >-]+(\d+) +(\d+)\b", read(DESIGN / "objects.md"), re.M)}
        self.assertGreater(len(asserted), 8)
        for field, sizes in asserted.items():
            self.assertEqual(drawn[field], sizes, field)


class Doors(unittest.TestCase):
    """docs/design/one_request.md: each function stands in the file that is named with it."""

    def test_functions_stand_where_the_page_says(self):
        table = rows(DESIGN / "one_request.md", "door", "function", "file", "what passes")
        self.assertGreater(len(table), 30)
        for _, function, file, _ in map(bare, table):
            name = re.escape(function if file.endswith(".cpp") else function.split("::")[-1])
            # A definition, not a call: at the beginning of a line or behind what it returns.
            self.assertRegex(read(ROOT / file), rf"(?m)^(?! *return\b)[\w:<>*&, ]*\b{name}\([^;]*({{.*)?$", file)


class Threads(unittest.TestCase):
    """docs/design/threads.md against the locks in the code."""

    #: What is never part of a running product.
    ELSEWHERE = {"deploy", "docs", "tests", "tools"}
    LOCK = re.compile(
        r"^\s*(?:(?:mutable|static|constinit) )*(?:std::(?:recursive_|shared_)?mutex|Mutex|Standard_Mutex<[\w:]*>)"
        r" (\w+)(?:;|\(|{)", re.M)
    #: What defines a lock is none, nor is the example of how one is written.
    WORKSHOP = {"Mutex", "Standard_Mutex", "Auto_Lock", "thread_annotations"}

    def test_each_lock_is_told_and_no_other(self):
        there = set()
        for file in tree():
            path = file.relative_to(ROOT)
            if path.parts[0] not in self.ELSEWHERE and file.suffix in (".h", ".cpp") and file.stem not in self.WORKSHOP:
                there |= {(name, str(path)) for name in self.LOCK.findall(read(file))}
        told = rows(DESIGN / "threads.md", "lock", "file", "fields under it", "while it is held")
        self.assertGreater(len(there), 20)
        self.assertEqual({(lock, file) for lock, file, _, _ in map(bare, told)}, there)

    def test_the_fields_are_there(self):
        for _, file, fields, _ in rows(DESIGN / "threads.md", "lock", "file", "fields under it", "while it is held"):
            header = ROOT / file.strip("`")
            text, source = read(header), header.with_suffix(".cpp")
            if source.exists():
                text += read(source)
            for field in re.findall(r"`(\w+)`", fields):
                self.assertRegex(text, rf"\b{field}\b", file)


class Tried(unittest.TestCase):
    """docs/design/tried.md against the table of docs/performance.md."""

    def test_a_path_costs_what_the_benchmark_says(self):
        figures = {}
        for line in read(ROOT / "docs/performance.md").splitlines():
            found = re.match(r"\| paths by (index|nested loops), ([^,]*?) +\| +([\d,]+) \| +([\d,]+) \|", line)
            if found:
                numbers = list(map(int, re.findall(r"\d+", found[2])))
                module, rival = (int(text.replace(",", "")) / (numbers[0] * numbers[1] * numbers[2]) for text in found.groups()[2:])
                figures.setdefault(found[1], []).append((f"{module:.1f}", f"{rival:.1f}"))
        (index, loops), page = (figures["index"], figures["nested loops"]), DESIGN / "tried.md"
        told = rows(page, "microseconds a path", "2,048 paths", "16,384 paths", "65,536 paths")
        self.assertEqual([row[1:] for row in told],
                         [[module for module, _ in index], [rival for _, rival in index], [rival for _, rival in loops]])


class Failure(unittest.TestCase):
    """The table of CONTRIBUTING.md against what the folders throw."""

    THROW = re.compile(r"(?m)^(?:(?!//).)*?\bthrow (?:std::)?(\w+)[({]")
    #: In every folder, as the page says before the table.
    ANYWHERE = {"bad_alloc"}

    def test_what_is_thrown_is_told(self):
        page = ROOT / "CONTRIBUTING.md"
        table = rows(page, "folder", "returns on failure", "may throw", "logs", "owns")
        self.assertGreater(len(table), 10)
        # What these throw inside stands below.
        below = {folder: re.search(rf"^{begin}.*?\n\n", read(page), re.M | re.S)[0] for folder, begin in
                 (("module/agent/", "The methods of the agent throw"), ("kldrcim/", "The command line throws"))}
        for folder, _, throws, _, _ in map(bare, table):
            files = [file for file in (ROOT / folder).rglob("*") if file.suffix in (".h", ".cpp")]
            self.assertTrue((ROOT / folder).is_dir(), folder)
            # It throws what its inventory says.
            if folder != "simulator/":
                for name in {name for file in files for name in self.THROW.findall(read(file))} - self.ANYWHERE:
                    self.assertRegex(throws + below.get(folder, ""), rf"\b{name}\b", folder)


class Traps(unittest.TestCase):
    """The traps of CONTRIBUTING.md against `traps_page.cpp`, which is compiled."""

    def test_what_the_page_calls_right_is_code(self):
        code = {line.strip() for line in read(ROOT / "tests/docs/traps_page.cpp").splitlines()}
        traps = read(ROOT / "CONTRIBUTING.md").split("## Traps\n")[1].split("\n## ")[0]
        numbers = re.findall(r"^(\d+)\. ", traps, re.M)
        examples = re.findall(r"```cpp\n +// wrong\n(.*?) +// right\n(.*?) +```", traps, re.S)
        self.assertEqual(numbers, [str(number + 1) for number in range(len(examples))])
        for wrong, right in examples:
            self.assertTrue(0 < wrong.count("\n") <= 3 and 0 < right.count("\n") <= 3, right)
            for line in right.splitlines():
                self.assertIn(line.strip(), code)


class Glossary(unittest.TestCase):
    def test_words_stand_once_and_in_order(self):
        words = [word.lower() for word, _ in rows(ROOT / "docs/glossary.md", "word", "means")]
        self.assertGreater(len(words), 39)
        self.assertEqual(words, sorted(set(words)))


if __name__ == "__main__":
    unittest.main()
