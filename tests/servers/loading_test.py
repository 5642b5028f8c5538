"""The shortest way: package, registration, server; and the module answers."""

import package
from server_case import ServerCase


class Loading(ServerCase):
    def test_the_server_answers_with_the_module(self):
        package.install()
        package.register("install")
        self.server.start()
        self.assertEqual(self.server.instances("KALDERA_ComputerSystem"), 1)
        self.assertEqual(self.server.instances("KALDERA_PortController"), 3)
