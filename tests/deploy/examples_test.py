"""The examples of a release, given to the programs that they are written for."""

import json
import re
import subprocess
import time
from pathlib import Path

from deploy_case import BUILD, ENVIRONMENT, DeployCase, output_of

#: Long enough for a rotation in between.
EVENTS = [
    {
        "times": 2000,
        "every": 10,
        "event": {"eventCategory": 2, "eventId": 11, "eventSeverity": 2, "eventMsg": "Link lost",
                  "eventIdValue": "ZNT_PORT_DISCONNECT", "portIndexString": "1000024b4c100000"},
    }
]


class Examples(DeployCase):
    def setUp(self):
        super().setUp()
        self.examples = self.share.parent / "doc/kldrprovider/examples"

    def test_a_rotated_log_goes_on_in_its_place(self):
        home = self.root / "home"
        home.mkdir()
        (home / ".cimplerc").write_text("LOG_LEVEL=DBG\n", encoding="utf-8")
        events = self.root / "events.json"
        events.write_text(json.dumps(EVENTS), encoding="utf-8")
        log, former = home / ".cimple/messages", home / ".cimple/messages.1"
        configuration = self.root / "logrotate.conf"
        text = (self.examples / "logrotate").read_text(encoding="utf-8")
        self.assertIn("/root/.cimple/messages {", text)
        configuration.write_text(text.replace("/root/", f"{home}/"), encoding="utf-8")
        configuration.chmod(0o644)
        environment = {**ENVIRONMENT, "HOME": str(home), "KLDR_SIMULATOR_EVENTS": str(events)}
        with subprocess.Popen(
            [BUILD / "kldrcim", "watch"], env=environment, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE
        ) as watch:
            try:
                self.wait_for(lambda: log.exists() and log.stat().st_size > 20000)
                output_of("/usr/sbin/logrotate", "--force", "--state", str(self.root / "state"), str(configuration))
                left = former.stat().st_size
                self.assertGreater(left, 20000)
                self.wait_for(lambda: log.stat().st_size > 2000)
                self.assertIsNone(watch.poll())
            finally:
                watch.terminate()
            self.assertEqual(watch.stderr.read(), b"")
        # A log that had not been opened to append would go on at its old place, behind as many zero bytes.
        written = log.read_bytes()
        self.assertNotIn(b"\0", written)
        self.assertRegex(written.splitlines()[-1].decode(), r"^\d{4}/\d\d/\d\d \d\d:\d\d:\d\d [A-Z]+: ")
        self.assertEqual(former.stat().st_size, left, "nothing goes to the former file")

    def wait_for(self, condition):
        deadline = time.monotonic() + 60
        while not condition():
            self.assertLess(time.monotonic(), deadline)
            time.sleep(0.02)

    def test_systemd_accepts_the_unit(self):
        text = (self.examples / "kldrcim.service").read_text(encoding="utf-8")
        unit = self.root / "kldrcim.service"
        # The program is looked for where the unit says.
        unit.write_text(text.replace("/usr/bin/", f"{self.prefix}/bin/"), encoding="utf-8")
        # That its man page is not installed here is the machine's affair.
        done = subprocess.run(
            ["systemd-analyze", "verify", "--man=no", str(unit)], capture_output=True, text=True, check=False, env=ENVIRONMENT
        )
        self.assertEqual((done.returncode, [line for line in done.stderr.splitlines() if "kldrcim" in line]), (0, []))
        unit.write_text(text.replace("/usr/bin/kldrcim", "/nowhere/kldrcim"), encoding="utf-8")
        done = subprocess.run(
            ["systemd-analyze", "verify", "--man=no", str(unit)], capture_output=True, text=True, check=False, env=ENVIRONMENT
        )
        self.assertIn("/nowhere/kldrcim", done.stderr)

    def test_the_unit_says_what_the_program_understands(self):
        text = (self.examples / "kldrcim.service").read_text(encoding="utf-8")
        words = re.search(r"^ExecStart=(.*)$", text, re.M)[1].split()
        self.assertEqual(words[:2], ["/usr/bin/kldrcim", "serve"])
        if not re.search("(?m)^  serve ", output_of(BUILD / "kldrcim", "--help")):
            self.skipTest("this build has no verb serve")
        understood = output_of(BUILD / "kldrcim", "serve", "--help")
        for word in set(re.findall(r"--[a-z-]+", " ".join(words))) | set(re.findall(r"--[a-z-]+", text)):
            self.assertIn(f"  {word}", understood)
        self.assertTrue(Path(self.prefix / "bin/kldrcim").exists())
