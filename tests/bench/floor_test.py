"""What floor.py makes of its figures, without a program that counts."""

import unittest

import floor


def row(name, ours):
    return {"name": name, "ours": ours}


class WorseRows(unittest.TestCase):
    former = {"rows": [row("ports", 1000), row("extents", 1000)]}

    def worse(self, *rows):
        return list(floor.worse_rows(rows, self.former))

    def test_three_percent_may_be_added(self):
        self.assertEqual(self.worse(row("ports", 1030), row("extents", 900)), [])

    def test_more_is_named(self):
        self.assertEqual(self.worse(row("ports", 1031), row("extents", 1000)),
                         ["ports: 1,031 instructions, where it was 1,000"])

    def test_a_new_row_has_no_former_one(self):
        self.assertEqual(self.worse(row("disks", 10000)), [])


class Goals(unittest.TestCase):
    def test_the_first_that_fits_counts(self):
        self.assertEqual(floor.goal_of("enumerate 1 FC port"), 1.6)
        self.assertEqual(floor.goal_of("enumerate 64 FC ports"), 1.55)
        self.assertEqual(floor.goal_of("associators from the host to 64 LUNs"), 1.4)
        self.assertEqual(floor.goal_of("references from the host to 64 LUNs"), 1.8)

    def test_what_nobody_asked_for_has_none(self):
        self.assertIsNone(floor.goal_of("something else"))


if __name__ == "__main__":
    unittest.main()
