"""What `./dev build` builds: all that is used, and no test.

product_test.py SOURCE BUILD NINJA
"""

import re
import subprocess
import sys
import unittest
from pathlib import Path

SOURCE, BUILD, NINJA = sys.argv[1:]


class Product(unittest.TestCase):
    def setUp(self):
        inputs = subprocess.check_output([NINJA, "-C", BUILD, "-t", "inputs", "kldr_product"], text=True)
        self.inputs = [each.replace(SOURCE, "") for each in inputs.splitlines()]

    def test_has_what_is_used(self):
        used = {"libkldrprovider_Module.so", "kldrcim", "libdzntj.so", "kldrprovider.sfcb", "kldrprovider.registration"}
        self.assertEqual(used - {Path(each).name for each in self.inputs}, set())

    def test_has_no_test_and_no_measure(self):
        self.assertEqual([each for each in self.inputs if re.search("tests/|gtest|bench", each)], [])


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1])
