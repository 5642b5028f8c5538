"""Pulled enumerations: the first objects come while the provider works on the others, and what waits takes no memory."""

import os
import re
import threading
import time
import unittest

from serving import PATIENCE, Serving_Case, class_parameter, error_code, value_parameter

SANITIZED = bool(os.environ.get("KLDR_SANITIZE"))
MANY = class_parameter("ClassName", "TOY_Many")
#: Sanitizers make each of them ten times as dear, and watch no memory.
VERY_MANY = 5000 if SANITIZED else 100000


class Pull_Case(Serving_Case):
    module = "KLDR_PLAIN_TOY"
    namespace = "root/toy"

    def open(self, count, more="", what="OpenEnumerateInstances"):
        return self.read(self.served.call(what, MANY + value_parameter("MaxObjectCount", count) + more))

    def pull(self, context, count, what="PullInstancesWithPath"):
        parameters = value_parameter("EnumerationContext", context) + value_parameter("MaxObjectCount", count)
        return self.read(self.served.call(what, parameters))

    def close(self, context):
        return error_code(self.served.call("CloseEnumeration", value_parameter("EnumerationContext", context)))

    def read(self, body):
        """Identifiers of the objects, the context, and whether it is at its end."""
        self.assertEqual(error_code(body), 0, body[:1000])
        ids = [int(each) for each in re.findall(r'<KEYBINDING NAME="Id"><KEYVALUE VALUETYPE="numeric">(\d+)<', body)]
        context = re.search(r'NAME="EnumerationContext" PARAMTYPE="string"><VALUE>(\d*)<', body)[1]
        return ids, context, re.search(r'NAME="EndOfSequence" PARAMTYPE="boolean"><VALUE>(\w+)<', body)[1] == "TRUE"


class While_It_Works(Pull_Case):
    environment = {"TOY_MANY": "20"}

    @classmethod
    def setUpClass(cls):
        cls.fifo = os.path.join(os.environ.get("TMPDIR", "/tmp"), f"pull_test.{os.getpid()}")
        os.mkfifo(cls.fifo)
        cls.environment = cls.environment | {"TOY_MANY_WAITS": cls.fifo}
        super().setUpClass()

    @classmethod
    def tearDownClass(cls):
        super().tearDownClass()
        os.unlink(cls.fifo)

    def go_on(self):
        """Once the provider waits in the middle."""
        with open(self.fifo, "wb"):
            pass

    def test_the_first_come_at_once(self):
        for what, pull in (("OpenEnumerateInstances", "PullInstancesWithPath"), ("OpenEnumerateInstancePaths", "PullInstancePaths")):
            ids, context, ends = self.open(5, what=what)
            self.assertEqual((ids, ends), (list(range(1, 6)), False))
            ids, context, ends = self.pull(context, 2, pull)
            self.assertEqual((ids, ends), ([6, 7], False))
            self.go_on()
            ids, _, ends = self.pull(context, 100, pull)
            self.assertEqual((ids, ends), (list(range(8, 21)), True))

    def test_a_pull_waits_for_what_it_asked_for(self):
        _, context, _ = self.open(0)
        later = threading.Timer(0.5, self.go_on)
        later.start()
        ids, _, ends = self.pull(context, 15)
        later.join()
        self.assertEqual((ids, ends), (list(range(1, 16)), False))
        self.assertEqual(self.close(context), 0)

    def test_who_closes_is_not_served_on(self):
        _, context, _ = self.open(3)
        later = threading.Timer(0.2, self.go_on)
        later.start()
        self.assertEqual(self.close(context), 0)
        later.join()
        self.assertEqual(self.close(context), 21)

    def test_who_stays_away_is_forgotten(self):
        self.open(3, value_parameter("OperationTimeout", 1))
        threads = lambda: len(os.listdir(f"/proc/{self.served.process.pid}/task"))
        before = threads()
        self.go_on()
        end = time.monotonic() + PATIENCE
        while threads() >= before and time.monotonic() < end:
            time.sleep(0.1)
        self.assertLess(threads(), before)


class Very_Many(Pull_Case):
    environment = {"TOY_MANY": str(VERY_MANY)}

    def test_memory(self):
        self.served.call("EnumerateInstances", class_parameter("ClassName", "TOY_Item"))
        before = self.served.resident("VmHWM")
        opened = [self.open(1) for _ in range(5)]
        contexts, found = [each[1] for each in opened], [each[0] for each in opened]
        ends = False
        while not ends:
            for i, context in enumerate(contexts):
                ids, _, ends = self.pull(context, VERY_MANY // 11)
                found[i] += ids
        for ids in found:
            self.assertEqual(ids, list(range(1, VERY_MANY + 1)))
        if not SANITIZED:
            self.assertLess(self.served.resident("VmHWM") - before, 30 << 20)

    def test_the_end_does_not_wait_for_clients(self):
        for _ in range(3):
            self.open(1)
        begin = time.monotonic()
        self.assertEqual(self.served.stop(), 0)
        self.assertLess(time.monotonic() - begin, PATIENCE / 2)
        type(self).setUpClass()


class Failing(Pull_Case):
    environment = {"TOY_MANY": "20", "TOY_MANY_FAILS": "1"}

    def test_what_came_before_can_be_pulled(self):
        ids, context, ends = self.open(15)
        self.assertEqual((ids, ends), (list(range(1, 16)), False))
        body = self.served.call("PullInstancesWithPath", value_parameter("EnumerationContext", context) + value_parameter("MaxObjectCount", 10))
        self.assertEqual(error_code(body), 1)
        self.assertIn('DESCRIPTION="no more of them"', body)
        self.assertEqual(self.close(context), 21)

    def test_nothing_is_opened_that_fails_at_once(self):
        body = self.served.call("OpenEnumerateInstances", MANY + value_parameter("MaxObjectCount", 20))
        self.assertEqual(error_code(body), 1)
        self.assertNotIn("IRETURNVALUE", body)


if __name__ == "__main__":
    unittest.main()
