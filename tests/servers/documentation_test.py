"""The shortest way that docs/installation.md shows, taken word for word."""

import re
import shutil
from pathlib import Path

import package
from server_case import ServerCase

PAGE = Path("/mnt/source/docs/installation.md")
#: What only the block of this server has.
STARTED_BY = {"sfcb": "sfcbd -d", "pegasus": "cimserver"}


class Documentation(ServerCase):
    def block(self):
        section = re.search(r"(?ms)^## The shortest way$(.*?)^## ", PAGE.read_text(encoding="utf-8"))[1]
        blocks = re.findall(r"(?ms)^```sh\n(.*?)^```$", section)
        mine = [block for block in blocks if STARTED_BY[self.server.kind] in block.splitlines()]
        self.assertEqual((len(blocks), len(mine)), (2, 1))
        return mine[0]

    def test_from_nothing_to_the_first_instance(self):
        folder = Path("/tmp/downloads")
        folder.mkdir()
        shutil.copy(package.room()["package"], folder / "kldrprovider_1.deb")
        shutil.copy(package.room()["adapter_library"], folder)
        shown = package.run("bash", "-e", "-c", self.block(), cwd=folder, environment=self.server.environment())
        self.assertRegex(shown.splitlines()[-1], r"KALDERA_ComputerSystem\..*Name=\"?cim-machine")
        self.assertEqual(self.server.instances("KALDERA_PortController"), 3)
