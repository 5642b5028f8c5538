"""kldr-register where something is in its way: it does all of a thing, or nothing, and says what it did not find out."""

import os
import shutil
import subprocess
from pathlib import Path

import package
import traces
from server_case import ServerCase, long

#: What `remove` needs of each server's tools.
NEEDED = {"sfcb": "sfcbrepos", "pegasus": "cimcli"}


class Tools(ServerCase):
    once_a_kind = True

    def setUp(self):
        super().setUp()
        package.install()

    def hide(self, tool):
        """Takes a tool away from all folders, and gives a function that brings it back."""
        path = Path("/usr/local/bin") / tool
        aside = Path("/tmp") / tool
        shutil.move(path, aside)
        return lambda: shutil.move(aside, path)

    def stored(self):
        return traces.stored(self.server.kind)

    def test_a_missing_tool_keeps_all_as_it_was(self):
        package.register("install")
        before = self.stored()
        tool = NEEDED[self.server.kind]
        bring_back = self.hide(tool)
        shown = "\n".join(package.register("remove", status=4))
        self.assertIn(f"'{tool}' is not on PATH; it comes with the server, and nothing was changed", shown)
        self.assertNotIn("not registered", shown)
        self.assertEqual(self.stored(), before)
        # The package goes all the same, and says what is left; the purge takes what was remembered.
        shown = package.remove()
        self.assertIn(f"'{tool}' is not on PATH", shown)
        self.assertIn("see kldr-register(8) for what is left to do", shown)
        self.assertNotIn("not registered", shown)
        self.assertTrue(Path("/var/lib/kldrprovider").exists())
        package.purge()
        self.assertFalse(Path("/var/lib/kldrprovider").exists())
        bring_back()
        package.install()
        package.register("remove")
        package.remove()
        package.purge()

    def test_a_dry_run_changes_nothing_and_says_so(self):
        before = self.stored()
        shown = package.register("install", "--dry-run")
        self.assertTrue(all("would run: " in line for line in shown), shown)
        self.assertEqual(self.stored(), before)
        self.assertFalse(Path("/var/lib/kldrprovider").exists())
        package.register("install")
        before = self.stored()
        shown = package.register("remove", "--dry-run")
        self.assertTrue(all("would " in line for line in shown), shown)
        self.assertEqual(self.stored(), before)

    def test_a_package_in_an_unpacked_root_leaves_this_machine_alone(self):
        self.server.start()
        package.register("install")
        self.take_up()
        root = Path("/tmp/root")
        for folder in ("usr/bin", "usr/sbin", "var/lib/dpkg/info", "var/lib/dpkg/updates", "var/lib/dpkg/triggers"):
            (root / folder).mkdir(parents=True)
        (root / "var/lib/dpkg/status").touch()
        dpkg = ["dpkg", f"--root={root}", "--force-script-chrootless", "--force-depends", "--force-architecture"]
        package.run(*dpkg, "-i", package.room()["package"], path=package.MAINTAINER)
        package.run(*dpkg, "-r", package.NAME, path=package.MAINTAINER)
        package.run(*dpkg, "-P", package.NAME, path=package.MAINTAINER)
        self.assertEqual({line.split(": ")[1] for line in self.check()}, {"ok"})
        self.assertEqual(self.server.instances("KALDERA_PortController"), 3)
        self.assertFalse((root / "var/lib/kldrprovider").exists())

    @long
    def test_what_is_registered_is_found_under_another_search_path(self):
        package.register("install")
        # As package managers call it; on its own it would find no tool.
        lines = package.register("check", path=package.MAINTAINER)
        self.assertEqual({line.split(": ")[1] for line in lines if "not asked" not in line}, {"ok"}, lines)
        self.assertFalse(any(os.access(f"/usr/bin/{tool}", os.X_OK) for tool in NEEDED.values()))


class Another_User(ServerCase):
    @long
    def test_who_may_not_look_hears_unknown(self):
        package.install()
        package.register("install")
        for folder in (Path("/opt/cim-servers"),):
            folder.chmod(0o700)
        done = subprocess.run(
            ["setpriv", "--reuid=65534", "--regid=65534", "--clear-groups", "kldr-register", "list"],
            capture_output=True, text=True, check=False, env={"PATH": package.ADMINISTRATOR},
        )  # fmt: skip
        self.assertNotIn("not registered", done.stdout)
        self.assertNotIn("0 of 76", done.stdout)
