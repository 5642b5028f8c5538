"""kldr-register against servers below a folder: what it does, what it says, and how it fails."""

import os
import shutil
import subprocess
import tempfile
from pathlib import Path

from deploy_case import DeployCase
from fake_servers import Fake_Servers

LIBRARY = "/usr/lib/cim/libkldrprovider_Module.so"
STAGED = [
    "mofs/root/interop/60_kldr_interop.mof",
    "mofs/root/kaldera/20_kldrprovider.mof",
    "regs/kldrprovider.reg",
]


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
        )
        self.assertEqual(done.returncode, status, done.stdout + done.stderr)
        self.complaint = done.stderr.replace(root, "")
        return done.stdout.replace(root, "").splitlines()

    def text(self, path):
        return (self.servers.root / path).read_text(encoding="utf-8")

    def link(self, path):
        return os.readlink(self.servers.root / path)


class Sfcb(RegisterCase):
    def setUp(self):
        super().setUp()
        self.servers.sfcb()

    def test_install_stages_links_and_rebuilds(self):
        lines = self.register("install")
        self.assertEqual(self.servers.files("var/lib/sfcb/stage"), sorted(["default.reg", *STAGED]))
        self.assertEqual(self.link("usr/lib/libkldrprovider_Module.so"), LIBRARY)
        self.assertEqual(
            self.servers.calls(), ["sfcbrepos -f -s /var/lib/sfcb/stage -r /var/lib/sfcb/registration"]
        )
        self.assertIn("sfcb: restart sfcb when it suits: it reads its registration at its start", lines)
        self.assertTrue(all(line.startswith("sfcb: ") for line in lines))
        self.assertEqual(self.text("var/lib/sfcb/registration/providerRegister").count("kldrprovider_Module"), 76)

    def test_a_second_install_does_nothing(self):
        self.register("install")
        self.servers.calls()
        self.assertEqual(self.register("install"), ["sfcb: already registered: 76 classes"])
        self.assertEqual(self.servers.calls(), [])

    def test_remove_leaves_what_was_there_before(self):
        before = self.servers.files("var"), self.servers.files("usr/lib")
        self.register("install")
        self.servers.calls()
        lines = self.register("remove")
        self.assertEqual((self.servers.files("var"), self.servers.files("usr/lib"))[1], before[1])
        self.assertEqual(self.servers.files("var/lib/sfcb/stage"), ["default.reg"])
        self.assertEqual(self.text("var/lib/sfcb/registration/providerRegister"), "[Other]\n   location: other\n")
        self.assertEqual(len(self.servers.calls()), 1)
        # The link goes when the server can no longer be told of the library.
        self.assertIn("rm -f", lines[-1])
        self.assertEqual(self.register("remove"), ["sfcb: not registered"])
        self.assertEqual(self.servers.calls(), [])

    def test_another_release_replaces_what_is_staged(self):
        self.register("install")
        self.servers.calls()
        file = self.servers.root / "usr/share/kldrprovider/mof/kldrprovider.mof"
        file.write_text("// another release\n", encoding="utf-8")
        self.register("install")
        self.assertEqual(self.text("var/lib/sfcb/stage/mofs/root/kaldera/20_kldrprovider.mof"), "// another release\n")
        self.assertEqual(len(self.servers.calls()), 1)

    def test_a_failed_rebuild_is_tried_again(self):
        self.servers.tool("sfcbrepos", 3, "no room")
        self.register("install", status=4)
        self.assertEqual(self.complaint, "kldr-register: sfcb: 'sfcbrepos' failed: no room\n")
        self.servers.tool("sfcbrepos")
        self.register("install")
        self.register("check")

    def test_a_missing_tool_is_named(self):
        self.servers.without("sfcbrepos")
        self.register("install", status=4)
        self.assertEqual(self.complaint, "kldr-register: sfcb: 'sfcbrepos' is not on PATH; it comes with the server\n")

    def test_without_the_servers_schema(self):
        (self.servers.root / "usr/share/sfcb/CIM/CIM_Schema.mof").unlink()
        self.register("install", status=4)
        self.assertIn("no CIM Schema in /usr/share/sfcb/CIM", self.complaint)
        self.assertEqual(self.servers.files("var/lib/sfcb/stage"), ["default.reg"])
        self.register("install", "--schema", "own")
        self.assertEqual(
            self.servers.files("var/lib/sfcb/stage/mofs/root/kaldera"),
            ["10_kldr_qualifiers.mof", "11_kldr_structure.mof", "20_kldrprovider.mof"],
        )
        self.register("remove")
        self.assertEqual(self.servers.files("var/lib/sfcb/stage"), ["default.reg"])

    def test_folders_come_from_the_servers_settings(self):
        self.servers.sfcb("# providerDirs: /nowhere\nproviderDirs: /opt/none /opt/cmpi\nregistrationDir: /opt/reg\n")
        for folder in ("opt/cmpi", "opt/reg"):
            (self.servers.root / folder).mkdir(parents=True)
        self.servers.tool("sfcbrepos", 1, "stop here")
        self.register("install", status=4)
        self.assertEqual(self.link("opt/cmpi/libkldrprovider_Module.so"), LIBRARY)
        self.assertEqual(self.servers.calls(), ["sfcbrepos -f -s /var/lib/sfcb/stage -r /opt/reg"])

    def test_a_link_of_the_installation_is_used_and_left_alone(self):
        (self.servers.root / "usr/lib/cmpi").mkdir()
        (self.servers.root / "usr/lib/cmpi/libkldrprovider_Module.so").symlink_to("../cim/libkldrprovider_Module.so")
        self.register("install")
        self.assertFalse((self.servers.root / "usr/lib/libkldrprovider_Module.so").is_symlink())
        self.register("remove")
        self.assertEqual(self.link("usr/lib/cmpi/libkldrprovider_Module.so"), "../cim/libkldrprovider_Module.so")

    def test_no_provider_folder(self):
        self.servers.sfcb("providerDirs: /opt/none\n")
        self.register("install", status=4)
        self.assertIn("none of its provider folders exists: /opt/none", self.complaint)

    def test_dry_run_changes_nothing(self):
        before = self.servers.files("")
        lines = self.register("install", "--dry-run")
        self.assertEqual(self.servers.files(""), before)
        self.assertIn("sfcb: would run: sfcbrepos -f -s /var/lib/sfcb/stage -r /var/lib/sfcb/registration", lines)
        self.register("install")
        before = self.servers.files("var")
        self.servers.calls()
        self.register("remove", "--dry-run")
        self.assertEqual(self.servers.files("var"), before)
        self.assertEqual(self.servers.calls(), [])

    def test_check_tells_what_is_missing(self):
        lines = self.register("check", status=1)
        self.assertEqual([line.split(": ")[1] for line in lines], ["missing"] * 5)
        self.register("install")
        lines = self.register("check")
        self.assertEqual([line.split(": ")[1] for line in lines], ["ok"] * 5)
        (self.servers.root / "var/lib/sfcb/stage/regs/kldrprovider.reg").write_text("", encoding="utf-8")
        self.assertIn("sfcb: missing: registration staged", self.register("check", status=1))

    def test_list(self):
        self.assertEqual(self.register("list"), ["sfcb: 0 of 76 classes registered", "pegasus: not on this machine"])
        self.register("install")
        self.assertEqual(self.register("list", "--server", "sfcb"), ["sfcb: 76 of 76 classes registered"])


class Pegasus(RegisterCase):
    def setUp(self):
        super().setUp()
        self.servers.pegasus()

    COMPILED = [
        ("root/kaldera", "mof/kldr_qualifiers.mof"),
        ("root/kaldera", "mof/kldr_structure.mof"),
        ("root/kaldera", "mof/kldrprovider.mof"),
        ("root/PG_InterOp", "mof/kldr_interop.mof"),
        ("root/PG_InterOp", "registration/kldrprovider.pegasus.mof"),
    ]

    def compiled(self, tool):
        return [f"{tool} -w -aEV -uC -n{space} /usr/share/kldrprovider/{file}" for space, file in self.COMPILED]

    def test_install_beside_a_server_that_is_down(self):
        lines = self.register("install")
        self.assertEqual(self.servers.calls(), self.compiled("cimmofl -R/var/lib/Pegasus/repository"))
        self.assertEqual(self.link("usr/lib/Pegasus/providers/libkldrprovider_Module.so"), LIBRARY)
        self.assertEqual(lines[-1], "pegasus: registered: the server will know the module when it starts")
        self.assertEqual(self.register("install"), ["pegasus: already registered"])
        self.assertEqual(self.servers.calls(), [])
        self.register("check")

    def test_install_through_a_running_server(self):
        lines = self.register("install", "--state", "running")
        self.assertEqual([call for call in self.servers.calls() if "cimprovider" not in call], self.compiled("cimmof"))
        self.assertEqual(lines[-1], "pegasus: registered: the server loads the module at the next request")
        self.assertEqual(self.register("install", "--state", "running"), ["pegasus: already registered"])

    def test_the_servers_own_schema(self):
        self.register("install", "--schema", "server")
        self.assertEqual(len(self.servers.calls()), 3)

    def test_remove_through_a_running_server(self):
        self.register("install")
        self.servers.calls()
        lines = self.register("remove", "--state", "running")
        calls = self.servers.calls()
        self.assertIn("cimprovider -r -m KLDRProviderModule", calls)
        self.assertEqual(len([call for call in calls if call.startswith("cimcli di -n root/PG_InterOp KALDERA_")]), 15)
        self.assertIn('cimcli di -n root/PG_InterOp KALDERA_RegisteredProfile.InstanceID="FC HBA"', calls)
        self.assertIn("pegasus: left: the classes of root/kaldera, which do no harm without a provider", lines)
        self.assertEqual(self.servers.files("usr/lib/Pegasus"), [])
        self.assertEqual(self.register("remove", "--state", "running"), ["pegasus: not registered"])

    def test_remove_while_it_is_down_asks_for_it(self):
        self.register("install")
        self.register("remove", status=5)
        self.assertEqual(
            self.complaint,
            "kldr-register: pegasus: it must run to forget a registration: start it, and run this again\n",
        )
        self.assertEqual(self.link("usr/lib/Pegasus/providers/libkldrprovider_Module.so"), LIBRARY)

    def test_remove_without_a_registration_needs_no_server(self):
        self.assertEqual(self.register("remove"), ["pegasus: not registered"])

    def test_another_release_is_registered_anew(self):
        self.register("install")
        with open(self.servers.root / "usr/share/kldrprovider/mof/kldrprovider.mof", "a", encoding="utf-8") as file:
            file.write("// another release\n")
        self.register("check", status=1)
        self.register("install", status=5)
        self.servers.calls()
        self.register("install", "--state", "running")
        self.assertIn("cimprovider -r -m KLDRProviderModule", self.servers.calls())
        self.register("check")

    def test_a_refused_file_stops_and_is_tried_again(self):
        self.servers.tool("cimmofl", 1, "parse error")
        self.register("install", status=4)
        self.assertEqual(self.complaint, "kldr-register: pegasus: 'cimmofl' failed: parse error\n")
        self.assertEqual(len(self.servers.calls()), 1)
        self.servers.tool("cimmofl")
        self.register("install")
        self.assertEqual(len(self.servers.calls()), 5)

    def test_another_interop_namespace(self):
        self.register("install", "--interop", "root/interop")
        self.assertEqual([call.split()[-2] for call in self.servers.calls()][-2:], ["-nroot/interop"] * 2)

    def test_dry_run_changes_nothing(self):
        before = self.servers.files("")
        lines = self.register("install", "--dry-run")
        self.assertEqual(self.servers.files(""), before)
        self.assertEqual(len([line for line in lines if "would run: cimmofl" in line]), 5)

    def test_list(self):
        self.assertEqual(self.register("list")[1:], ["pegasus: server down, not registered"])
        self.register("install")
        self.assertEqual(
            self.register("list", "--state", "running")[1:], ["pegasus: server running, registered as KLDRProviderModule"]
        )


class Both(RegisterCase):
    def test_each_server_has_its_turn(self):
        self.servers.sfcb()
        self.servers.pegasus()
        self.servers.tool("sfcbrepos", 1, "no room")
        lines = self.register("install", status=4)
        self.assertEqual(lines[-1], "pegasus: registered: the server will know the module when it starts")
        self.register("check", "--server", "pegasus")
        self.register("check", status=1)

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
