"""What distributions ask of a package, of the release build: its binaries, its packages, and what the tools of both families of
distributions say of them."""

import mmap
import os
import re
import subprocess
import sys
import tempfile
import unittest
from pathlib import Path

from deploy_case import BUILD, ENVIRONMENT, SOURCE, WORD_SIZE, output_of
from install_test import FILES
from package_test import Package, pack

__all__ = ["Package"]  # run here too, so that everything is packed once

BINARIES = [BUILD / "libkldrprovider_Module.so", BUILD / "kldrcim"]


class Binaries(unittest.TestCase):
    def each(self, *command):
        return [output_of(*command, binary) for binary in BINARIES]

    def test_relocations_are_read_only_and_all_made_at_the_start(self):
        for headers in self.each("readelf", "-lW"):
            self.assertIn("GNU_RELRO", headers)
            self.assertRegex(headers, r"GNU_STACK .* RW ")
        for dynamic in self.each("readelf", "-dW"):
            self.assertRegex(dynamic, r"\(FLAGS\)\s+BIND_NOW")
            self.assertRegex(dynamic, r"\(FLAGS_1\)\s+Flags: NOW")

    def test_they_stand_anywhere(self):
        for header in self.each("readelf", "-hW"):
            self.assertRegex(header, r"Type: +DYN ")

    def test_calls_and_stacks_are_checked(self):
        for symbols in self.each("readelf", "--dyn-syms", "-W"):
            self.assertIn("__stack_chk_fail@", symbols)
            self.assertRegex(symbols, r"__\w+_chk@")

    def test_functions_begin_where_jumps_may_land(self):
        # Of each function that others can call; how a compiler splits its own is its own affair.
        for binary in BINARIES[:1]:
            code = output_of("objdump", "-d", "--no-show-raw-insn", binary)
            begins = re.findall(r"^[0-9a-f]+ <(\w+_Create_\w+MI)>:\n +[0-9a-f]+:\t(\w+)", code, re.M)
            self.assertLess(100, len(begins))
            self.assertEqual({first for _, first in begins}, {"endbr32" if WORD_SIZE == 32 else "endbr64"})

    def test_every_unit_was_compiled_hardened(self):
        for info in self.each("readelf", "--debug-dump=info"):
            producers = re.findall(r"DW_AT_producer +: .*(GNU C\+\+\d+ .*)", info)
            self.assertTrue(producers)
            for flag in ("-fstack-protector-strong", "-fstack-clash-protection", "-fcf-protection", "-O2"):
                self.assertEqual([each for each in producers if flag not in each], [], flag)

    def test_no_path_of_the_build_is_in_them(self):
        for binary in BINARIES:
            content = binary.read_bytes()
            for folder in (SOURCE, BUILD):
                self.assertFalse(bytes(folder) in content, f"{folder} in {binary.name}")


class Debian_Packages(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.packages = pack("DEB")
        cls.lintian = subprocess.run(
            ["lintian", "--allow-root", "--show-overrides", "--fail-on", "error,warning", *cls.packages],
            capture_output=True, text=True, check=False, env=ENVIRONMENT,
        )

    def test_debug_symbols_are_a_package_of_their_own(self):
        names = sorted(package.name.split("_")[0] for package in self.packages)
        self.assertEqual(names, ["kldrprovider", "kldrprovider-dbgsym"])
        (symbols,) = (package for package in self.packages if "dbgsym" in package.name)
        self.assertEqual(output_of("dpkg-deb", "-f", symbols, "Depends").strip(), "kldrprovider (= 1.0.0)")
        with tempfile.TemporaryDirectory() as folder:
            output_of("dpkg-deb", "-x", symbols, folder)
            for binary in BINARIES:
                build_id = re.search(r"Build ID: (..)(\w+)", output_of("readelf", "-n", binary))
                file = Path(folder) / f"usr/lib/debug/.build-id/{build_id[1]}/{build_id[2]}.debug"
                self.assertIn(".debug_info", output_of("readelf", "-SW", file))

    def test_what_is_installed_is_stripped(self):
        (package,) = (package for package in self.packages if "dbgsym" not in package.name)
        with tempfile.TemporaryDirectory() as folder:
            output_of("dpkg-deb", "-x", package, folder)
            for name in ("usr/lib/cim/libkldrprovider_Module.so", "usr/bin/kldrcim"):
                sections = output_of("readelf", "-SW", Path(folder) / name)
                self.assertNotRegex(sections, r"\.(debug_info|symtab)\b")

    def test_lintian_has_neither_errors_nor_warnings(self):
        complaints = [line for line in self.lintian.stdout.splitlines() if line[:2] in ("E:", "W:")]
        self.assertEqual(complaints, [])
        # 1 is a failure of its own; 2 it also says of what is overridden, where that is shown.
        self.assertIn(self.lintian.returncode, (0, 2), self.lintian.stderr)

    def test_every_override_has_its_reason_and_its_use(self):
        overrides = (SOURCE / "deploy/debian/lintian-overrides").read_text(encoding="utf-8")
        self.assertRegex(overrides, r"\A((# .*\n)+kldrprovider: .*\n)+\Z")
        self.assertIn("O: kldrprovider: custom-library-search-path", self.lintian.stdout)
        self.assertNotIn("unused-override", self.lintian.stdout)


class Upgrade_Message(unittest.TestCase):
    """The script itself, among real processes."""

    POSTINST = SOURCE / "deploy/debian/postinst"

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.library = Path(folder.name) / "libkldrprovider_Module.so"
        self.library.write_bytes(b"\x7fELF" + bytes(mmap.PAGESIZE))

    def server(self, library):
        """A process that has the library mapped, and says so."""
        text = """
import mmap, sys
with open(sys.argv[1], "rb") as file:
    mapped = mmap.mmap(file.fileno(), 0, prot=mmap.PROT_READ)
print("up", flush=True)
sys.stdin.read()
"""
        process = subprocess.Popen(
            [sys.executable, "-c", text, library], stdin=subprocess.PIPE, stdout=subprocess.PIPE, text=True
        )
        self.addCleanup(process.stdout.close)
        self.addCleanup(process.wait)
        self.addCleanup(process.stdin.close)
        self.assertEqual(process.stdout.readline(), "up\n")
        return process

    def told(self, *words, **variables):
        done = subprocess.run(
            ["sh", self.POSTINST, *words], capture_output=True, text=True, check=True, env={**ENVIRONMENT, **variables}
        )
        self.assertEqual(done.stderr, "")
        # The machine may have servers of its own.
        return [line for line in done.stdout.splitlines() if re.search(rf"\(process {self.process.pid}\)", line)]

    def test_names_who_runs_the_former_module(self):
        self.process = self.server(self.library)
        self.assertEqual(self.told("configure", "0.9"), [], "it runs the one that is there")
        self.library.unlink()
        name = Path(f"/proc/{self.process.pid}/comm").read_text(encoding="utf-8").strip()
        line = f"kldrprovider: restart {name} (process {self.process.pid}): it still runs the former module"
        self.assertEqual(self.told("configure", "0.9"), [line])
        self.assertEqual(self.told("configure", ""), [], "a first installation has no former one")
        self.assertEqual(self.told("abort-upgrade", "0.9"), [])
        self.assertEqual(self.told("configure", "0.9", DPKG_ROOT="/elsewhere"), [], "those are no servers of that root")


class Rpm_Packages(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        folder = tempfile.TemporaryDirectory()
        cls.addClassCleanup(folder.cleanup)
        cls.folder = Path(folder.name)
        packages = pack("RPM")
        (cls.symbols,) = (package for package in packages if "debuginfo" in package.name)
        (cls.package,) = (package for package in packages if "debuginfo" not in package.name)

    def query(self, *words, package=None):
        return output_of("rpm", "--dbpath", str(self.folder / "none"), "-qp", *words, str(package or self.package))

    def test_they_hold_what_is_installed(self):
        listed = self.query("--qf", r"[%{FILEMODES:perms} %{FILEUSERNAME}:%{FILEGROUPNAME} %{FILENAMES}\n]")
        files = re.findall(r"^[-l]\S+ root:root /usr/(\S+)$", listed, re.M)
        # Where distributions of RPM have zsh's.
        installed = [file.replace("zsh/vendor-completions", "zsh/site-functions") for file in FILES if "lintian" not in file]
        self.assertEqual(sorted(files), sorted(installed))
        # No folder that belongs to the system.
        folders = re.findall(r"^drwxr-xr-x root:root (\S+)$", listed, re.M)
        own = ["/usr/lib/cim", "/usr/lib/cmpi", "/usr/share/doc/kldrprovider", "/usr/share/doc/kldrprovider/examples"]
        own += [f"/usr/share/kldrprovider{below}" for below in ("", "/completion", "/mof", "/registration")]
        self.assertEqual(sorted(folders), own)
        self.assertEqual(len(files) + len(folders), len(listed.splitlines()))

    def test_they_unpack_to_the_same(self):
        unpacked = self.folder / "unpacked"
        unpacked.mkdir()
        content = subprocess.run(["rpm2cpio", self.package], capture_output=True, check=True, env=ENVIRONMENT).stdout
        subprocess.run(["cpio", "-idm", "--quiet"], input=content, check=True, cwd=unpacked, env=ENVIRONMENT)
        self.assertEqual(
            os.readlink(unpacked / "usr/lib/cmpi/libkldrprovider_Module.so"), "../cim/libkldrprovider_Module.so"
        )
        listed = output_of(unpacked / "usr/bin/kldrcim", "classes", cwd="/")
        self.assertEqual(len(re.findall(r"^KALDERA_", listed, re.M)), 76)

    def test_what_they_need_and_are(self):
        needs = self.query("--requires").splitlines()
        size = "()(64bit)" if WORD_SIZE == 64 else ""
        for need in ("/bin/bash", "/usr/bin/pgrep", f"libjsoncpp.so.25{size}"):
            self.assertIn(need, needs)
        self.assertFalse([need for need in needs if "dzntj" in need])
        self.assertEqual(self.query("--requires", package=self.symbols).splitlines()[0], "kldrprovider = 1.0.0")
        self.assertEqual(self.query("--qf", "%{ARCH} %{LICENSE}"), "x86_64 MIT" if WORD_SIZE == 64 else "i686 MIT")

    def test_their_scripts_are_debians_in_their_own_words(self):
        for tag, script in (("PREUN", "prerm"), ("POSTUN", "postrm"), ("POSTIN", "postinst")):
            source = SOURCE / "deploy/debian" / script
            text = self.query("--qf", f"%{{{tag}}}")
            if not source.exists():
                self.assertEqual(text, "(none)")
                continue
            self.assertIn(source.read_text(encoding="utf-8").split("\n", 1)[1].strip(), text)
            self.assertEqual(self.query("--qf", f"%{{{tag}PROG}}"), "/bin/sh")
            words = [self.words_after(text, count) for count in ("0", "1", "2")]
            self.assertEqual(
                words,
                {
                    "prerm": ["remove", "upgrade", "upgrade"],
                    "postrm": ["purge", "upgrade", "upgrade"],
                    "postinst": ["configure ", "configure ", "configure former"],
                }[script],
            )

    def words_after(self, script, count):
        """The words that the first line of a script makes of RPM's count."""
        (first,) = [line for line in script.splitlines() if line.startswith("if [ \"$1\"")][:1]
        return output_of("sh", "-c", first + "\nprintf '%s' \"$1${2+ $2}\"", "sh", count)
