# SPDX-License-Identifier: MIT
"""The check of recordings must see what is missing, twice, out of order or cut off."""

import pathlib
import tempfile
import unittest

from promises import BrokenPromise
from recordings import FILE_HEADER, Recording, write_source


class RecordingTest(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        path = pathlib.Path(folder.name) / "source.pcap"
        write_source(path, 7, 9, 0.5)
        contents = path.read_bytes()
        self.header, records = contents[: FILE_HEADER.size], contents[FILE_HEADER.size :]
        size = len(records) // 9
        self.records = [records[size * i : size * (i + 1)] for i in range(9)]

    def read(self, *numbers, tail=b""):
        recording = Recording("it")
        contents = self.header + b"".join(self.records[i - 1] for i in numbers) + tail
        for at in range(0, len(contents), 5):
            recording.feed(contents[at : at + 5])
        return recording

    def test_what_is_whole_is_one_stretch(self):
        recording = self.read(3, 4, 5)
        self.assertEqual(recording.stretches, [[7, 3, 5]])
        self.assertEqual(recording.count, 3)
        self.assertEqual(recording.last_of(7), 5)
        self.assertEqual(recording.last_of(8), 0)

    def test_a_gap_parts_stretches(self):
        self.assertEqual(self.read(1, 2, 5).stretches, [[7, 1, 2], [7, 5, 5]])
        self.assertEqual(self.read(1, 2, 5).stretches_of(7), 2)

    def test_twice_is_refused(self):
        with self.assertRaises(BrokenPromise):
            self.read(1, 2, 2)

    def test_out_of_order_is_refused(self):
        with self.assertRaises(BrokenPromise):
            self.read(1, 3, 2)

    def test_a_cut_record_is_not_counted(self):
        recording = self.read(1, tail=self.records[1][:-1])
        self.assertEqual(recording.count, 1)
        self.assertEqual(recording.unread_bytes, len(self.records[1]) - 1)

    def test_what_is_no_capture_is_refused(self):
        with self.assertRaises(BrokenPromise):
            Recording("it").feed(b"x" * 100)


if __name__ == "__main__":
    unittest.main()
