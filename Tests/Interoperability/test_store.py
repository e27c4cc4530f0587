# SPDX-License-Identifier: MIT
"""A store of measurements, read by Python's sqlite3, with the queries of measurements.md.

The program is found through $KESTRO_CLI."""

import collections
import csv
import io
import math
import os
import pathlib
import re
import sqlite3
import subprocess
import tempfile
import unittest

PAGE = pathlib.Path(__file__).resolve().parents[2] / "Documentation" / "measurements.md"
DRIVE = ["simulation:LTE", "--to=+300s"]


def run(*arguments):
    return subprocess.run([os.environ["KESTRO_CLI"], *arguments], capture_output=True, text=True,
                          check=True).stdout


def rows_of(command):
    return list(csv.DictReader(io.StringIO(run(command, *DRIVE, "--format=csv"))))


class Store(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.folder = tempfile.TemporaryDirectory()
        cls.addClassCleanup(cls.folder.cleanup)
        path = pathlib.Path(cls.folder.name) / "drive.sqlite"
        run("measure", *DRIVE, "-o", str(path))
        cls.store = sqlite3.connect(path)
        cls.addClassCleanup(cls.store.close)
        cls.queries = re.findall(r"```sql\n(.*?)```", PAGE.read_text(encoding="utf-8"), re.S)

    def answers(self, number):
        return self.store.execute(self.queries[number - 1]).fetchall()

    def serving_levels(self):
        """The last level of each second, worked out from the plain table."""
        levels = {}
        for time, level in self.store.execute(
                "SELECT time_us, value FROM measurement WHERE serving = 1 AND series IN "
                "(SELECT id FROM series WHERE quantity = 'level') ORDER BY message"):
            levels[time // 1000000] = level
        return levels

    def test_every_query_can_be_asked(self):
        self.assertEqual(len(self.queries), 10)
        for number in range(1, 11):
            self.answers(number)

    def test_percentiles_are_those_of_the_seconds(self):
        levels = sorted(self.serving_levels().values())
        self.assertEqual(self.answers(1), [
            (percent, levels[math.ceil(len(levels) * percent / 100) - 1])
            for percent in (10, 50, 90)])

    def test_the_worst_stretch_is_that_of_the_seconds(self):
        levels = self.serving_levels()
        means = []
        for second in levels:
            stretch = [levels[s] for s in range(second - 9, second + 1) if s in levels]
            means.append(sum(stretch) / len(stretch))
        self.assertAlmostEqual(self.answers(4)[0][2], min(means), places=2)

    def test_changes_are_those_that_events_tells(self):
        told = collections.Counter((row["technology"], row["event"]) for row in rows_of("events")
                                   if row["event"] in ("handover", "reselection"))
        self.assertGreater(sum(told.values()), 0)
        self.assertEqual({(row[0], row[1]): row[2] for row in self.answers(5)}, dict(told))

    def test_ping_pong_is_a_change_and_its_reversal(self):
        changes = [row for row in rows_of("events") if row["event"] in ("handover", "reselection")]
        expected = [(before["from"], before["to"]) for before, row in zip(changes, changes[1:])
                    if row["to"] == before["from"] and row["from"] == before["to"]]
        found = [(row[1], row[2]) for row in self.answers(2)]
        self.assertTrue(set(found) <= set(expected), (found, expected))

    def test_cells_serve_as_long_as_cells_tells(self):
        told = {row["cell"]: float(row["serving_s"]) for row in rows_of("cells")
                if float(row["serving_s"]) > 0}
        self.assertGreater(len(told), 1)
        self.assertEqual({row[1]: row[2] for row in self.answers(3)}, told)

    def test_numbers_have_values_and_texts_have_none(self):
        for kind, value, text in self.store.execute(
                "SELECT DISTINCT kind, value IS NULL, text IS NULL FROM measurement "
                "JOIN series ON series.id = measurement.series"):
            self.assertEqual((bool(value), bool(text)),
                             {"number": (False, True), "state": (False, False),
                              "text": (True, False)}[kind])


if __name__ == "__main__":
    unittest.main()
