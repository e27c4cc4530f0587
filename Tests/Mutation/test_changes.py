# SPDX-License-Identifier: MIT
"""How a list of changes is read, refused and made, and that the list here can be tried."""

import pathlib
import tempfile
import unittest

import changes

HERE = pathlib.Path(__file__).resolve().parent
ROOT = HERE.parents[1]

ENTRY = """
[[change]]
name = "the bound"
file = "A.cpp"
before = "a < b"
after = "a <= b"
program = "Tests"
tests = ["BoundTest.Holds", "BoundTest.Ends"]
"""


class Folder(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name)
        (self.root / "Tests").mkdir()
        self.tests = self.root / "Tests/BoundTest.cpp"
        self.tests.write_text("TEST(BoundTest, Holds) {}\nTEST_F(\n    BoundTest,\n    Ends) {}\n",
                              "utf-8")
        self.source = self.root / "A.cpp"
        self.source.write_text("if (a < b) return;\n", "utf-8")

    def refusal(self, text=ENTRY):
        with self.assertRaises(changes.BadList) as caught:
            changes.checked(changes.parse(text), self.root)
        return str(caught.exception)


class Lists(Folder):
    def test_an_entry_is_read(self):
        change, = changes.checked(changes.parse(ENTRY), self.root)
        self.assertEqual((change.before, change.after), ("a < b", "a <= b"))
        self.assertEqual(change.tests, ["BoundTest.Holds", "BoundTest.Ends"])

    def test_a_text_that_is_gone_is_refused(self):
        self.source.write_text("if (a > b) return;\n", "utf-8")
        self.assertEqual(self.refusal(), "the bound: its text stands in A.cpp 0 times, not once")

    def test_a_text_that_stands_twice_is_refused(self):
        self.source.write_text("a < b; a < b;\n", "utf-8")
        self.assertEqual(self.refusal(), "the bound: its text stands in A.cpp 2 times, not once")

    def test_an_empty_text_is_refused(self):
        self.assertIn("0 times", self.refusal(ENTRY.replace('"a < b"', '""')))

    def test_a_file_that_is_gone_is_refused(self):
        self.source.unlink()
        self.assertEqual(self.refusal(), "the bound: there is no A.cpp")

    def test_a_test_that_is_gone_is_refused(self):
        self.tests.write_text("TEST(BoundTest, Holds) {}\n", "utf-8")
        self.assertEqual(self.refusal(), "BoundTest.Ends: there is no such test")

    def test_a_change_that_is_none_is_refused(self):
        self.assertEqual(self.refusal(ENTRY.replace("a <= b", "a < b")),
                         "the bound: it changes nothing")

    def test_a_change_without_tests_is_refused(self):
        text = ENTRY.replace('["BoundTest.Holds", "BoundTest.Ends"]', "[]")
        self.assertEqual(self.refusal(text), "the bound: it names no test")

    def test_a_name_that_is_used_twice_is_refused(self):
        self.assertEqual(self.refusal(ENTRY + ENTRY), "the bound: the name is used twice")

    def test_an_entry_that_lacks_something_is_refused(self):
        self.assertIn("the bound: it needs name, file", self.refusal(ENTRY.replace("program", "x")))


class Trying(Folder):
    def setUp(self):
        super().setUp()
        self.change, = changes.parse(ENTRY)

    def test_a_change_is_made_and_taken_back(self):
        with self.change.applied(self.root):
            self.assertEqual(self.source.read_text("utf-8"), "if (a <= b) return;\n")
        self.assertEqual(self.source.read_text("utf-8"), "if (a < b) return;\n")

    def test_a_change_is_taken_back_when_something_fails(self):
        with self.assertRaises(KeyError), self.change.applied(self.root):
            raise KeyError
        self.assertEqual(self.source.read_text("utf-8"), "if (a < b) return;\n")

    def test_every_test_that_does_not_fail_is_named(self):
        self.assertEqual(changes.survivors(self.change, lambda test: True), [])
        self.assertEqual(changes.survivors(self.change, lambda test: test == "BoundTest.Holds"),
                         ["the bound: BoundTest.Ends does not fail"])


class ThisList(unittest.TestCase):
    def test_it_can_be_tried(self):
        text = (HERE / "Changes.toml").read_text("utf-8")
        self.assertTrue(changes.checked(changes.parse(text), ROOT))


if __name__ == "__main__":
    unittest.main()
