"""sfcb alone: a CIM Schema that lacks a class, a class repository that lacks ours, and a server that was not restarted."""

import os
import re
import shutil
from pathlib import Path

import package
import traces
from server_case import ServerCase

SCHEMA = Path("/usr/share/sfcb/CIM/CIM_Schema.mof")
STAGE = Path("/var/lib/sfcb/stage")
CONFIGURATION = Path("/etc/sfcb/sfcb.cfg")
SHARE = Path("/usr/share/kldrprovider")
LACKING = "CIM_ProductElementComponent"


class Sfcb(ServerCase):
    once_a_kind = True

    def setUp(self):
        super().setUp()
        package.install()

    def take_from_schema(self):
        """As the Final form of the schema is, which leaves out what is experimental."""
        text = SCHEMA.read_text(encoding="utf-8", errors="replace")
        shorter = re.sub(rf'(?m)^#pragma include \(".*{LACKING}\.mof"\)\n', "", text)
        self.assertNotEqual(shorter, text)
        SCHEMA.write_text(shorter, encoding="utf-8")

    def test_a_schema_without_a_superclass(self):
        self.take_from_schema()
        before = traces.stored("sfcb")
        for _ in range(2):
            shown = "\n".join(package.register("install", status=4))
            self.assertIn(f"lacks {LACKING}: use --schema own", shown)
        self.assertEqual(traces.stored("sfcb"), before)
        self.check(status=1)
        package.register("install", "--schema", "own")
        # The choice is remembered.
        self.assertEqual(package.register("install"), ["sfcb: already registered: 76 classes"])
        self.check()
        self.server.start()
        self.assertEqual(self.server.instances("KALDERA_ProductElementComponent"), 3)

    def test_a_repository_without_our_classes_is_no_registration(self):
        # What is left where sfcbrepos was run by hand, and failed half way.
        self.take_from_schema()
        (STAGE / "mofs/root/kaldera").mkdir()
        shutil.copy(SHARE / "mof/kldrprovider.mof", STAGE / "mofs/root/kaldera/20_kldrprovider.mof")
        shutil.copy(SHARE / "mof/kldrprovider.mof", STAGE / "mofs/root/interop/60_kldrprovider.mof")
        shutil.copy(SHARE / "registration/kldrprovider.sfcb", STAGE / "regs/kldrprovider.reg")
        package.run("sfcbrepos", "-f", status=1)
        shown = self.check(status=1)
        self.assertIn("sfcb: ok: 76 classes in providerRegister", shown)
        self.assertTrue([line for line in shown if line.startswith("sfcb: missing: product classes in the class repository")])
        self.assertIn(LACKING, "\n".join(package.register("install", status=4)))
        package.register("install", "--schema", "own")
        self.check()

    def test_a_server_that_wants_a_password_is_not_judged(self):
        package.register("install")
        text = CONFIGURATION.read_text(encoding="utf-8")
        asking = re.sub(r"(?m)^doBasicAuth:.*$", "doBasicAuth: true", text)
        self.assertNotEqual(asking, text)
        CONFIGURATION.write_text(asking, encoding="utf-8")
        self.server.start()
        self.assertEqual(self.server.ask("EnumerateInstanceNames", "KALDERA_ComputerSystem"), "")
        line = self.check(status=4)[-1]
        self.assertIn("it asks for a name and a password", line)

    def test_a_running_server_that_was_not_restarted(self):
        self.server.start()
        shown = package.register("install")
        self.assertIn("sfcb: restart sfcb when it suits: it reads its registration at its start", shown)
        line = self.check(status=1)[-1]
        self.assertIn("sfcb: missing: the running server answers for KALDERA_ComputerSystem: ", line)
        self.assertIn("restart it if it was not restarted since", line)
        self.server.restart()
        self.check()

    def test_a_link_of_the_installation_is_used_and_stays(self):
        link = Path("/usr/lib/cmpi/libkldrprovider_Module.so")
        with open(CONFIGURATION, "a", encoding="utf-8") as settings:
            settings.write(f"providerDirs: {self.server.home}/usr/lib/sfcb {self.server.home}/usr/lib {link.parent}\n")
        self.assertNotIn("ln -s", "\n".join(package.register("install")))
        self.server.start()
        self.assertEqual(self.server.instances("KALDERA_PortController"), 3)
        package.register("remove")
        self.assertEqual(os.readlink(link), f"../cim/{link.name}")

    def test_what_clients_have_stored_stays(self):
        file = STAGE / "mofs/root/interop/70_site.mof"
        file.write_text(
            'instance of CIM_IndicationFilter { SystemCreationClassName = "a"; SystemName = "b"; CreationClassName = "c";\n'
            'Name = "d"; SourceNamespace = "root/cimv2"; QueryLanguage = "WQL"; Query = "SELECT * FROM CIM_AlertIndication"; };\n',
            encoding="utf-8",
        )
        package.run("sfcbrepos", "-f")
        # Now it is like one that a client has made.
        file.unlink()
        before = traces.stored("sfcb")
        package.register("install")
        self.server.start()
        self.assertEqual(self.server.instances("CIM_IndicationFilter", "root/interop"), 1)
        self.server.kill()
        package.register("remove")
        self.assertEqual(traces.stored("sfcb"), before)

    def test_a_failure_says_why_in_one_line(self):
        (STAGE / "mofs/root/interop/65_broken.mof").write_text("class Broken {\n  nonsense\n};\n", encoding="utf-8")
        before = traces.stored("sfcb")
        shown = package.register("install", status=4)
        failure = [line for line in shown if "'sfcbrepos' failed: " in line]
        self.assertEqual(len(failure), 1, shown)
        self.assertIn("65_broken.mof", failure[0])
        self.assertIn("sfcb: the server's classes and registration are as they were", shown[-1])
        self.assertEqual(traces.stored("sfcb"), before)
        self.assertGreater(len(package.register("install", "--verbose", status=4)), len(shown))
        self.assertFalse(list(Path("/opt/cim-servers").glob("*/usr/lib/**/libkldrprovider_Module.so")))
