"""The Debian package of this word size."""

import functools
import re
import shutil
import tempfile
import unittest
from pathlib import Path

from deploy_case import BUILD, CMAKE, PROGRAMS, WORD_SIZE, output_of
from install_test import FILES

CPACK = Path(CMAKE).with_name("cpack")


PACKED = tempfile.TemporaryDirectory()


@functools.cache
def pack(generator):
    """The packages that cpack makes of the build, once for all tests of a run: debug symbols take their time."""
    folder = Path(PACKED.name) / generator
    output_of(CPACK, "-G", generator, "-B", str(folder), cwd=BUILD)
    return sorted(folder.glob(f"*.{generator.lower()}"))


class Package(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        packages = [package for package in pack("DEB") if "dbgsym" not in package.name]
        assert len(packages) == 1, packages
        cls.package = packages[0]

    def test_it_holds_what_is_installed(self):
        listed = output_of("dpkg-deb", "-c", self.package)
        files = re.findall(r"^[-l]\S+ .* \./usr/(\S+)(?: -> \S+)?$", listed, re.M)
        self.assertEqual(sorted(files), FILES)
        self.assertNotIn("dzntj", listed)

    @unittest.skipUnless(shutil.which("rpmbuild", path=PROGRAMS), "rpmbuild is not installed")
    def test_rpms_have_completion_for_zsh_where_other_distributions_look(self):
        package = next(each for each in pack("RPM") if "debuginfo" not in each.name)
        listed = output_of("rpm", "-qpl", package).splitlines()
        self.assertIn("/usr/share/zsh/site-functions/_kldrcim", listed)
        self.assertEqual([each for each in listed if "vendor-completions" in each], [])

    def test_its_control_file(self):
        field = lambda name: output_of("dpkg-deb", "-f", self.package, name).strip()
        self.assertEqual(field("Package"), "kldrprovider")
        self.assertEqual(field("Architecture"), "i386" if WORD_SIZE == 32 else output_of("dpkg", "--print-architecture").strip())
        self.assertIn("libjsoncpp", field("Depends"))
        self.assertIn("procps", field("Depends"))

    def test_an_upgrade_is_no_removal(self):
        with tempfile.TemporaryDirectory() as folder:
            output_of("dpkg-deb", "-e", self.package, folder)
            for script, words in (("prerm", ("upgrade", "2.0")), ("postrm", ("upgrade", "2.0")), ("postrm", ("remove",))):
                self.assertTrue((Path(folder) / script).stat().st_mode & 0o111)
                self.assertEqual(output_of(Path(folder) / script, *words), "")
