"""kldr-register where no server is needed: its command line, and what it makes of tools that fail. The rest is seen on real
servers, in tests/servers/."""

import os
import re
import shutil
import subprocess
import tempfile
from pathlib import Path

from deploy_case import DeployCase
from fake_servers import Fake_Servers


def copy(source, target):
    """The library is large, and no test writes to it."""
    return os.link(source, target) if source.endswith(".so") else shutil.copy2(source, target)


class RegisterCase(DeployCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.servers = Fake_Servers(folder.name)
        shutil.copytree(self.prefix, Path(folder.name) / "usr", symlinks=True, copy_function=copy)
        shutil.rmtree(Path(folder.name) / "usr/lib/cmpi")

    def register(self, *words, status=0):
        """Runs the installed program; gives its lines and the complaints, the root taken out."""
        root = str(self.servers.root)
        done = subprocess.run(
            [f"{root}/usr/sbin/kldr-register", "--root", root, *words],
            capture_output=True, text=True, check=False, env=self.servers.environment(),
        )  # fmt: skip
        self.assertEqual(done.returncode, status, done.stdout + done.stderr)
        self.complaint = done.stderr.replace(root, "")
        return done.stdout.replace(root, "").splitlines()

    def schema_classes(self):
        text = (self.share / "mof/kldr_structure.mof").read_text(encoding="utf-8")
        return re.findall(r"(?m)^class (\w+)", text)


class Failures(RegisterCase):
    def setUp(self):
        super().setUp()
        self.servers.sfcb(self.schema_classes())
        self.servers.pegasus()

    def failure_of(self, words, *options):
        """What is said where cimmofl ends with these words."""
        self.servers.tool("cimmofl", 1, words)
        self.register("install", "--server", "pegasus", *options, status=4)
        self.assertTrue(self.complaint.startswith("kldr-register: pegasus: 'cimmofl' failed: "), self.complaint)
        return self.complaint.partition(" failed: ")[2].rstrip("\n")

    def test_the_reason_is_one_line(self):
        more = " (--verbose shows all of it)"
        for words, reason in (
            ("", "no reason given"),
            ("no room\n", "no room"),
            ("\n\nUsage: cimmofl\n  -h\nParse error in line 3\n", "Parse error in line 3" + more),
            ("cimmofl 2.14\nWarning: Use of cimmofl can corrupt\nError adding class X\n", "Error adding class X" + more),
            ("first\nsecond\n", "first" + more),
            ("cimmofl: Unknown value for option -u.\nUse '--help' to obtain command syntax.\n",
             "cimmofl: Unknown value for option -u." + more),
        ):  # fmt: skip
            self.assertEqual(self.failure_of(words), reason)
            self.assertEqual(self.failure_of(words, "--verbose"), words.rstrip("\n") or "no reason given")

    def test_a_refused_file_is_the_last(self):
        self.failure_of("no room\n")
        self.assertEqual(len(self.servers.calls("cimmofl")), 1)

    def test_each_server_has_its_turn(self):
        self.servers.tool("sfcbrepos", 1, "no room")
        self.register("install", status=4)
        self.assertIn("kldr-register: sfcb: 'sfcbrepos' failed: no room\n", self.complaint)
        self.assertIn("kldr-register: pegasus: 'cimmofl' failed: no reason given\n", self.complaint)

    def test_nothing_stays_of_a_failed_rebuild(self):
        before = self.servers.files()
        self.register("install", "--server", "sfcb", status=4)
        self.assertEqual(self.servers.files(), before)
        self.assertEqual(len(self.servers.calls("sfcbrepos")), 1)
        self.assertRegex(self.servers.calls("sfcbrepos")[0], r"^-f -s \S+ -r \S+ -c /usr/share/sfcb/CIM$")

    def test_a_tool_that_reads_nothing_is_unknown(self):
        file = self.servers.root / "var/lib/sfcb/registration/repository/root/kaldera/classSchemas"
        file.parent.mkdir(parents=True)
        file.write_text("what no tool reads", encoding="utf-8")
        lines = self.register("check", "--server", "sfcb", status=4)
        self.assertTrue([line for line in lines if line.startswith("sfcb: unknown: product classes in the class repository: ")])

    def test_no_provider_folder(self):
        (self.servers.root / "usr/lib/Pegasus/providers").rmdir()
        self.register("install", "--server", "pegasus", status=4)
        self.assertIn("none of its provider folders exists", self.complaint)

    def test_another_interop_namespace(self):
        (self.servers.root / "var/lib/Pegasus/repository/root#other/instances").mkdir(parents=True)
        self.servers.tool("cimmofl", 0)
        self.register("install", "--server", "pegasus", "--interop", "root/other")
        spaces = [re.search(r" -n(\S+) ", call)[1] for call in self.servers.calls("cimmofl")]
        self.assertEqual(spaces, ["root/kaldera"] * 3 + ["root/other"] * 2)

    def test_a_module_of_another_word_size_says_so(self):
        # The first byte behind the mark of an ELF file tells.
        ours = (self.prefix / "lib/cim/libkldrprovider_Module.so").read_bytes()[4]
        (self.servers.root / "usr/lib/Pegasus/providers/libOther.so").write_bytes(b"\x7fELF" + bytes([3 - ours]) + b"\0" * 11)
        # Each file that it is given, behind each other.
        keep = self.servers.root / "given"
        (self.servers.tools / "cimmofl").write_text(f'#!/bin/sh\nfor file; do :; done\ncat "$file" >>"{keep}"\n', encoding="utf-8")
        self.register("install", "--server", "pegasus")
        self.assertIn(f'    Location = "kldrprovider_Module";\n    Bitness = {ours + 1};\n', keep.read_text(encoding="utf-8"))


class Command_Line(RegisterCase):
    def test_no_server(self):
        self.register("install", status=3)
        self.assertEqual(
            self.complaint, "kldr-register: no CIM server on this machine: neither sfcb nor OpenPegasus\n"
        )
        self.register("install", "--server", "sfcb", status=3)
        self.assertEqual(self.complaint, "kldr-register: sfcb: not on this machine\n")
        self.assertEqual(self.register("list"), ["sfcb: not on this machine", "pegasus: not on this machine"])

    def test_usage(self):
        for words, complaint in (
            ([], "a verb is needed"),
            (["install", "remove"], "one verb at a time"),
            (["install", "--server", "other"], "--server is sfcb or pegasus"),
            (["install", "--schema"], "--schema is own or server"),
            (["install", "--state", "half"], "--state is running or down"),
            (["install", "--interop"], "--interop needs a namespace"),
            (["install", "--root", "/no/such/folder"], "--root needs a folder"),
            (["install", "--fast"], "'--fast' is not understood"),
        ):
            self.register(*words, status=2)
            self.assertEqual(self.complaint, f"kldr-register: {complaint}; see --help\n")
        self.assertIn("usage: kldr-register", "\n".join(self.register("--help")))
