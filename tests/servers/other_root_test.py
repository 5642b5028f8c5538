"""The image of a machine below a folder: it is told, and this machine is not."""

import os
import shutil
from pathlib import Path

import package
import traces
from server_case import ServerCase

ROOT = Path("/tmp/image")
#: What an image has of each server, besides the package.
PARTS = {
    "sfcb": ("/etc/sfcb", "/var/lib/sfcb", "/usr/share/sfcb"),
    "pegasus": ("/etc/Pegasus", "/var/lib/Pegasus"),
}
PROVIDERS = {"sfcb": "usr/lib64/cmpi", "pegasus": "usr/lib64/Pegasus/providers"}
SETTINGS = "providerDirs: /nowhere /usr/lib64/cmpi\nregistrationDir: /var/lib/sfcb/registration\n"
LIBRARY = "libkldrprovider_Module.so"


class Other_Root(ServerCase):
    once_a_kind = True

    def setUp(self):
        super().setUp()
        package.install()
        for part in PARTS[self.server.kind]:
            shutil.copytree(part, ROOT / part[1:], symlinks=True)
        for part in ("usr/lib/cim", "usr/share/kldrprovider"):
            shutil.copytree(f"/{part}", ROOT / part)
        (ROOT / "usr/sbin").mkdir()
        shutil.copy("/usr/sbin/kldr-register", ROOT / "usr/sbin")
        self.providers = ROOT / PROVIDERS[self.server.kind]
        self.providers.mkdir(parents=True)
        if self.server.kind == "sfcb":
            with open(ROOT / "etc/sfcb/sfcb.cfg", "a", encoding="utf-8") as settings:
                settings.write(SETTINGS)

    def register(self, *words, status=0):
        return package.run(ROOT / "usr/sbin/kldr-register", "--root", ROOT, *words, status=status)

    def files(self):
        return sorted(str(path) for path in ROOT.rglob("*") if not path.is_dir())

    def test_only_the_image_is_told(self):
        # Its own server runs, and hears nothing of it.
        self.server.start()
        here, there = traces.stored(self.server.kind), self.files()
        self.register("install")
        # Links of an image lead to where the library will be.
        self.assertEqual(os.readlink(self.providers / LIBRARY), f"/usr/lib/cim/{LIBRARY}")
        self.assertIn("not asked, as it does not run", self.register("check"))
        self.assertIn("already registered", self.register("install"))
        if self.server.kind == "pegasus":
            self.assertIn("it must run to forget a registration", self.register("remove", status=5))
            self.register("check")
        else:
            self.register("remove")
            self.assertEqual(self.files(), there)
        self.assertEqual(traces.stored(self.server.kind), here)
