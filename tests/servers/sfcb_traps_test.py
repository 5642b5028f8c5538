"""What docs/servers.md says of sfcb, and what is easily different in another release."""

import re
import subprocess

import cim_question
import package
from server_case import ServerCase, long


class Traps(ServerCase):
    def setUp(self):
        super().setUp()
        package.install()
        package.register("install")

    def version(self):
        return tuple(map(int, re.search(r"(\d+)\.(\d+)\.(\d+)", package.run("sfcbd", "-v")).groups()))

    @long
    def test_keys_and_property_lists(self):
        self.server.start()
        answer = cim_question.ask(
            self.server.port, "root/kaldera", "EnumerateInstances", "KALDERA_ComputerSystem", properties=["ElementName"]
        )
        self.assertEqual('<KEYBINDING NAME="Name">' in answer, self.version() >= (1, 3, 18))

    @long
    def test_titles_are_written_over_the_environment(self):
        settings = self.server.home / "etc/sfcb/sfcb.cfg"
        text = settings.read_text(encoding="utf-8")
        plain = {"PATH": package.ADMINISTRATOR, **self.server.module_environment}
        for shown, kept in (("true", False), ("false", self.version() >= (1, 3, 18))):
            settings.write_text(re.sub(r"(?m)^argvDebug:.*$", f"argvDebug: {shown}", text), encoding="utf-8")
            subprocess.run(
                [self.server.home / "start", str(self.server.port)], env=plain, check=True, start_new_session=True,
                stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL,
            )  # fmt: skip
            self.assertEqual(self.server.instances("KALDERA_PortController") == 3, kept, f"argvDebug: {shown}")
            self.server.kill()
