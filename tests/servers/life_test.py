"""The life of a registration, beside a server that runs and beside one that is down: nothing of it stays in the end."""

import re

import package
import traces
from server_case import ServerCase, long

CHANGED = "KALDERA_DiagnosticTest"


def change_a_class(folder):
    """Gives a class that has subclasses another property."""
    file = folder / "usr/share/kldrprovider/mof/kldrprovider.mof"
    text = file.read_text(encoding="utf-8")
    changed = re.sub(rf"(?m)^(class {CHANGED} : \w+\s*\{{)", r"\1\n    uint32 MarkOfRelease;", text)
    assert changed != text
    file.write_text(changed, encoding="utf-8")


class Life(ServerCase):
    def setUp(self):
        super().setUp()
        self.before = traces.stored(self.server.kind), traces.registered_text(self.server.kind)

    def begin(self, running):
        package.install()
        if running:
            self.server.start()
        shown = package.register("install")
        self.assertEqual([line for line in shown if "failed" in line], [])
        self.take_up()
        return shown

    def answers(self, running):
        """Number of adapters that a client sees, and whether it sees the changed class, with the server left as it was."""
        if not running:
            self.server.start()
        found = self.server.instances("KALDERA_PortController"), "MarkOfRelease" in self.server.ask("GetClass", CHANGED)
        if not running:
            self.server.stop()
        return found

    def assert_all_ok(self, running):
        lines = self.check()
        self.assertEqual({line.split(": ")[1] for line in lines if "not asked" not in line}, {"ok"}, lines)
        self.assertEqual(any("the running server answers" in line for line in lines), running)

    def assert_as_before(self):
        self.server.stop()
        stored, text = self.before
        self.assertEqual(traces.registered_text(self.server.kind), text)
        self.assertEqual(traces.stored(self.server.kind), stored)

    def whole_life(self, running):
        self.begin(running)
        self.assert_all_ok(running)
        self.assertEqual(self.answers(running), (3, False))
        again = package.register("install")
        self.assertEqual(len(again), 1, again)
        self.assertIn("already registered", again[0])

        package.install(package.next_release(change_a_class))
        self.assertIn("missing: ", "\n".join(self.check(status=1)))
        package.register("install")
        self.take_up()
        self.assert_all_ok(running)
        self.assertEqual(self.answers(running), (3, True))

        package.register("remove")
        self.take_up()
        self.assertEqual(len(package.register("remove")), 1)
        self.check(status=1)
        package.remove()
        package.purge()
        self.assert_as_before()
        self.assertEqual(traces.of_ours(), [])

    def test_from_installation_to_purge_beside_a_running_server(self):
        self.whole_life(True)

    @long
    def test_from_installation_to_purge_beside_a_server_that_is_down(self):
        self.whole_life(False)

    def removal(self, running):
        """Removed by the package manager, which knows no folder of the server's tools."""
        self.begin(running)
        shown = package.run("apt-get", "-y", "remove", package.NAME, path=package.MAINTAINER)
        self.assertNotIn("is not on PATH", shown)
        self.assertNotIn("not registered", shown)
        self.assertNotIn("kldr-register(8)", shown)
        package.purge()
        self.assert_as_before()
        self.assertEqual(traces.of_ours(), [])

    @long
    def test_removal_of_the_package_beside_a_running_server(self):
        self.removal(True)

    def test_removal_of_the_package_beside_a_server_that_is_down(self):
        self.removal(False)
