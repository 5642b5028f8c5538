"""The program that runs the pages' console blocks: what it reads, what it accepts, how it fails."""

import contextlib
import io
import tempfile
import unittest
from pathlib import Path

import console


class Reading(unittest.TestCase):
    def steps(self, text):
        return [[(step.line, step.command, step.expected) for step in block] for block in console.blocks(text)]

    def test_only_console_blocks_count(self):
        text = "$ no\n```\n$ no\n```\n```sh\n$ no\n```\n    $ no\n```console\n$ yes\nout\n```\n"
        self.assertEqual(self.steps(text), [[(10, "yes", ["out"])]])

    def test_commands_and_their_outputs(self):
        text = "```console\n$ one\na\n\nb  \n$ two\n$ three \\\n    more\nc\n```\n"
        self.assertEqual(
            self.steps(text), [[(2, "one", ["a", "", "b"]), (6, "two", []), (7, "three \\\n    more", ["c"])]]
        )

    def test_a_longer_fence_may_hold_a_shorter_one(self):
        self.assertEqual(self.steps("````console\n$ one\n```\n````\n"), [[(2, "one", ["```"])]])

    def test_output_before_any_command_is_refused(self):
        with self.assertRaises(SystemExit):
            console.blocks("```console\nno command\n```\n")


class Comparing(unittest.TestCase):
    def check(self, expected, lines, result):
        self.assertEqual(console.matches(expected.split("|"), lines.split("|")), result)

    def test_lines(self):
        self.check("a|b", "a|b", True)
        self.check("a|b", "a", False)
        self.check("a", "a|b", False)
        self.check("a.c", "abc", False)

    def test_elision_inside_a_line(self):
        self.check("a ... c", "a b c", True)
        self.check("a ... c", "a b d", False)
        self.check("...", "anything at all", True)

    def test_elision_of_lines(self):
        self.check("a|...|z", "a|b|c|z", True)
        self.check("a|...|z", "a|z", True)
        self.check("a|...", "a|b", True)
        self.check("...|m|...", "a|m|m|z", True)
        self.check("...|m|z", "a|m|b|m|z", True)
        self.check("a|...|z", "a|b", False)
        self.check("...|m|...", "a|b", False)


class Running(unittest.TestCase):
    def run_page(self, text):
        with tempfile.TemporaryDirectory() as name:
            source, build = Path(name) / "source", Path(name) / "out"
            build.mkdir()
            source.mkdir()
            (source / "data.txt").write_text("datum\n", encoding="utf-8")
            (build / "tool").write_text("#!/bin/sh\necho tool here >&2\n", encoding="utf-8")
            (build / "tool").chmod(0o755)
            page = source / "page.md"
            page.write_text(text, encoding="utf-8")
            out = io.StringIO()
            with contextlib.redirect_stdout(out):
                status = console.main(["--source", str(source), "--build", str(build), str(page)])
            return status, out.getvalue()

    def test_a_page_that_is_true(self):
        status, out = self.run_page(
            "```console\n$ tool\ntool here\n$ build/native/tool\ntool here\n$ cat data.txt\ndatum\n$ X=1\n$ cat; echo $X\n1\n```\n"
        )
        self.assertEqual(status, 0, out)
        self.assertIn("5 commands", out)

    def test_a_page_that_is_not(self):
        status, out = self.run_page("```console\n$ echo one\ntwo\n$ echo three\nthree\n```\n")
        self.assertEqual(status, 1)
        self.assertIn("page.md:2: $ echo one\n", out)
        self.assertIn("-two\n+one\n", out)
        self.assertIn("2 commands, 1 failures", out)

    def test_blocks_do_not_build_upon_each_other(self):
        status, out = self.run_page("```console\n$ X=1\n$ touch f\n```\n```console\n$ echo $X; ls f 2>/dev/null\n```\n")
        self.assertEqual((status, "3 commands, 0 failures" in out), (0, True), out)

    def test_a_shell_that_ends_early_is_a_failure(self):
        status, out = self.run_page("```console\n$ exit 0\n$ echo never\nnever\n```\n")
        self.assertEqual(status, 1)
        self.assertIn("the shell ended before this command", out)

    def test_pages_without_commands_are_a_failure(self):
        self.assertEqual(self.run_page("nothing\n")[0], 1)


if __name__ == "__main__":
    unittest.main()
