"""OpenPegasus alone: whether it runs, whether it answers, and a namespace that was there before us."""

import os
import shutil
import subprocess
import time
from pathlib import Path

import package
import traces
from server_case import ServerCase, long

REPOSITORY = Path("/var/lib/Pegasus/repository")
SOCKETS = Path("/opt/cim-servers/pegasus/run/socket")


class Pegasus(ServerCase):
    once_a_kind = True

    def setUp(self):
        super().setUp()
        package.install()

    def test_one_repository(self):
        before = {path.name for path in REPOSITORY.iterdir()}
        package.register("install")
        self.assertEqual({path.name for path in REPOSITORY.iterdir()} - before, {"root#kaldera"})

    def test_a_zombie_is_no_running_server(self):
        program = Path("/tmp/cimserver")
        shutil.copy("/bin/true", program)
        child = subprocess.Popen([program])
        self.addCleanup(child.wait)
        while Path(f"/proc/{child.pid}/stat").read_text(encoding="utf-8").split(")")[1].split()[0] != "Z":
            time.sleep(0.01)
        self.assertEqual(package.register("list")[1:], ["pegasus: server down, not registered"])
        self.assertIn("cimmofl", "\n".join(package.register("install")))
        self.check()

    def test_a_server_that_does_not_answer_is_unknown(self):
        package.register("install")
        self.server.start()
        before = traces.stored("pegasus")
        # The tools' door to the server.
        SOCKETS.rename("/opt/sockets")
        for verb in ("list", "check", "install", "remove"):
            shown = "\n".join(package.register(verb, status=4))
            self.assertIn("it runs, and does not answer: ", shown, verb)
            self.assertNotIn("registered", shown.replace("already registered", "registered"), verb)
        self.assertIn("The CIM server may not be running", shown)
        self.assertEqual(traces.stored("pegasus"), before)
        os.rename("/opt/sockets", SOCKETS)
        self.check()

    def test_the_tool_that_tells_is_missing(self):
        package.register("install")
        self.server.start()
        shutil.move("/usr/local/bin/cimprovider", "/tmp/cimprovider")
        for verb in ("list", "remove"):
            shown = "\n".join(package.register(verb, status=4))
            self.assertIn("'cimprovider', which comes with it, is not on PATH; nothing was changed", shown)
        shutil.move("/tmp/cimprovider", "/usr/local/bin/cimprovider")
        self.check()

    @long
    def test_an_unreadable_repository_is_unknown(self):
        package.register("install")
        instances = REPOSITORY / "root#PG_InterOp/instances"
        instances.rename("/opt/instances")
        self.assertIn("cannot be read; nothing was changed", "\n".join(package.register("remove", status=4)))
        os.rename("/opt/instances", instances)
        self.check()

    @long
    def test_a_namespace_that_was_there_stays(self):
        mof = Path("/tmp/site.mof")
        mof.write_text("Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);\n"
                       "class SITE_Own { [Key] string Name; };\n", encoding="utf-8")  # fmt: skip
        self.server.start()
        package.run("cimmof", "-nroot/kaldera", mof)
        package.register("install")
        self.check()
        package.register("remove")
        self.assertIn("SITE_Own", self.server.ask("GetClass", "SITE_Own"))
        self.assertFalse([path for path in (REPOSITORY / "root#kaldera/classes").iterdir() if path.name.startswith("KALDERA")])

    @long
    def test_a_failure_says_why_in_one_line(self):
        file = Path("/usr/share/kldrprovider/mof/kldrprovider.mof")
        file.write_text(file.read_text(encoding="utf-8") + "class Broken : NoSuchClass {};\n", encoding="utf-8")
        shown = package.register("install", status=4)
        failure = [line for line in shown if "'cimmofl' failed: " in line]
        self.assertEqual(len(failure), 1, shown)
        self.assertIn("NoSuchClass", failure[0])
        self.check(status=1)
        package.run("dpkg", "-i", package.room()["package"], path=package.MAINTAINER)
        package.register("install")
        self.check()
