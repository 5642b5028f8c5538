"""The pages and scripts pass the tools that their readers and shells would judge them by."""

import re
import subprocess
import unittest

from deploy_case import BUILD, ENVIRONMENT, SOURCE, output_of

PAGES = sorted((SOURCE / "deploy/man").iterdir())


class Man(unittest.TestCase):
    def test_mandoc_finds_no_fault(self):
        done = subprocess.run(["mandoc", "-Tlint", *PAGES], capture_output=True, text=True, check=False, env=ENVIRONMENT)
        # Which other pages are installed is the machine's affair.
        faults = [line for line in done.stdout.splitlines() if "referenced manual not found" not in line]
        self.assertEqual(faults, [])

    def test_no_line_is_wider_than_a_terminal(self):
        for page in PAGES:
            for line in self.rendered(page).splitlines():
                self.assertLessEqual(len(line), 80, f"{page.name}: {line}")

    def test_headings_are_shown_as_they_are_meant(self):
        # A word that is the name of a macro would be taken for one.
        for page in PAGES:
            shown = self.rendered(page)
            for heading in re.findall(r"(?m)^\.S[sh] (.*)$", page.read_text(encoding="utf-8")):
                self.assertRegex(shown, rf"(?m)^ *{re.escape(heading)}$", page.name)

    def rendered(self, page):
        shown = output_of("mandoc", "-Tascii", "-Owidth=78", page)
        return re.sub(".\N{BACKSPACE}", "", shown)

    def test_every_verb_and_option_of_kldrcim_stands_in_its_page(self):
        page = (SOURCE / "deploy/man/kldrcim.1").read_text(encoding="utf-8")
        section, found = "", 0
        for line in output_of(BUILD / "kldrcim", "--help").splitlines():
            if line[:1].strip():
                section = line
            heads = re.match(r"  ([^\s,]+(?:, --\S+)*)", line)
            if not heads or section not in ("Verbs", "Options"):
                continue
            for head in heads[1].split(", "):
                found += 1
                if head.startswith("--"):
                    self.assertRegex(page, rf"(?m)\bFl -{re.escape(head[2:])}\b")
                else:
                    self.assertRegex(page, rf"(?m)^\.It Cm {head}\b")
        self.assertGreater(found, 20)

    def test_every_option_of_kldr_register_stands_in_its_page(self):
        usage = output_of(BUILD / "deploy/kldr-register", "--help")
        page = (SOURCE / "deploy/man/kldr-register.8").read_text(encoding="utf-8")
        for word in sorted({word.strip(",") for word in usage.split() if word.startswith("--")}):
            self.assertIn(f"Fl -{word[2:]}", page)


class Scripts(unittest.TestCase):
    def test_shellcheck_accepts_them(self):
        scripts = [
            BUILD / "deploy/kldr-register",
            *sorted((SOURCE / "deploy/debian").glob("p*")),
            BUILD / "deploy/completion/kldrcim.bash",
            SOURCE / "deploy/completion/kldr-register",
            SOURCE / "dev",
            SOURCE / ".ci/run",
            SOURCE / "tests/servers/machine.sh",
            SOURCE / "tests/support/own_processes.sh",
        ]
        done = subprocess.run(["shellcheck", *scripts], capture_output=True, text=True, check=False, env=ENVIRONMENT)
        self.assertEqual((done.returncode, done.stdout), (0, ""))
