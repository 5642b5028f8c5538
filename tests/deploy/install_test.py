"""What `cmake --install` puts on a machine: these files, and no others."""

import os
import re

from deploy_case import CMAKE, BUILD, WORD_SIZE, DeployCase, output_of

FILES = """
bin/kldrcim
lib/cim/libkldrprovider_Module.so
lib/cmpi/libkldrprovider_Module.so
sbin/kldr-register
share/bash-completion/completions/kldr-register
share/bash-completion/completions/kldrcim
share/doc/kldrprovider/changelog.gz
share/doc/kldrprovider/copyright
share/doc/kldrprovider/examples/kldr_alerts.yml
share/doc/kldrprovider/examples/kldr_dashboard.json
share/doc/kldrprovider/examples/kldrcim.service
share/doc/kldrprovider/examples/logrotate
share/fish/vendor_completions.d/kldrcim.fish
share/kldrprovider/completion/classes
share/kldrprovider/mof/kldr_qualifiers.mof
share/kldrprovider/mof/kldr_structure.mof
share/kldrprovider/mof/kldrprovider.mof
share/kldrprovider/registration/kldrprovider.pegasus.mof
share/kldrprovider/registration/kldrprovider.profiles.mof
share/kldrprovider/registration/kldrprovider.registration
share/kldrprovider/registration/kldrprovider.sfcb
share/lintian/overrides/kldrprovider
share/man/man1/kldrcim.1.gz
share/man/man5/cimplerc.5.gz
share/man/man7/kldrprovider.7.gz
share/man/man8/kldr-register.8.gz
share/zsh/vendor-completions/_kldrcim
""".split()


class Install(DeployCase):
    def test_exactly_these_files(self):
        found = [path.relative_to(self.prefix) for path in self.prefix.rglob("*") if not path.is_dir()]
        self.assertEqual(sorted(map(str, found)), FILES)

    def test_the_link_is_relative_and_leads_to_the_library(self):
        link = self.prefix / "lib/cmpi/libkldrprovider_Module.so"
        self.assertEqual(os.readlink(link), "../cim/libkldrprovider_Module.so")
        self.assertTrue(link.resolve().samefile(self.prefix / "lib/cim/libkldrprovider_Module.so"))

    def test_the_library_looks_where_it_stands_and_nowhere_in_the_build(self):
        dynamic = output_of("readelf", "-d", self.prefix / "lib/cim/libkldrprovider_Module.so")
        self.assertEqual(re.findall(r"\((RUNPATH|RPATH)\).*\[(.*)\]", dynamic), [("RUNPATH", "/usr/lib/cim")])
        self.assertIn("libjsoncpp.so", dynamic)
        self.assertNotIn("dzntj", dynamic)
        header = output_of("readelf", "-h", self.prefix / "lib/cim/libkldrprovider_Module.so")
        self.assertIn(f"ELF{WORD_SIZE}", header)

    def test_the_installed_program_finds_the_installed_library(self):
        listed = output_of(self.prefix / "bin/kldrcim", "classes", cwd="/")
        self.assertEqual(len(re.findall(r"^KALDERA_", listed, re.M)), 76)

    def test_a_root_can_be_put_before_the_prefix(self):
        stage = self.root / "stage"
        output_of("env", f"DESTDIR={stage}", CMAKE, "--install", str(BUILD), "--prefix", "/usr")
        self.assertEqual(
            os.readlink(stage / "usr/lib/cmpi/libkldrprovider_Module.so"), "../cim/libkldrprovider_Module.so"
        )
