# SPDX-License-Identifier: MIT
"""A snapshot file and its DLF log, read by Python's plistlib and by dlf.py.

The program is found through $KESTRO_CLI."""

import os
import pathlib
import plistlib
import re
import struct
import subprocess
import tempfile
import unittest

import dlf

START = 1330862709  # 2012-03-04 12:05:09 UTC
LINK_TYPES = {"IFX": 147, "LTE": 150}
ENTRY_KEYS = ["DisplayState", "Display", "ExtraInfo", "Date", "Description"]


def message(code, payload=b"", kind=1):
    """A baseband's message: the type byte and a record."""
    return struct.pack("<BHHQ", kind, 12 + len(payload), code, START * 10**6) + payload


# 0xB17F with a cell of identity 23 on channel 1300: the payload begins at the packet's byte 13.
SERVING_CELL = message(0xB17F, struct.pack("<B3xHH12x", 1, 1300, 23))

CELL = {"Cell": {"ARFCN": "62", "RxLev": "-70"}}


def ifx_message(root):
    return plistlib.dumps(root, fmt=plistlib.FMT_BINARY)


class Snapshot(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = pathlib.Path(folder.name)
        # 3 hours 30 minutes west of Greenwich, without daylight-saving time
        self.environment = {**os.environ, "TZ": "XXX3:30"}

    def cli(self, *arguments):
        command = [os.environ["KESTRO_CLI"], "snapshot", *arguments]
        done = subprocess.run(
            command, cwd=self.folder, env=self.environment, stderr=subprocess.PIPE, timeout=30
        )
        self.assertEqual(done.returncode, 0, done.stderr)

    def snapshot(self, technology, messages):
        """Saves a capture of messages 1.5 s apart; the snapshot's dictionary."""
        header = struct.pack("<IHHIIII", 0xA1B2C3D4, 2, 4, 0, 0, 262144, LINK_TYPES[technology])
        with open(self.folder / "a.pcap", "wb") as capture:
            capture.write(header)
            for i, content in enumerate(messages):
                size = len(content)
                time = START * 10**6 + i * 1500000
                capture.write(struct.pack("<IIII", *divmod(time, 10**6), size, size) + content)
        self.cli("save", "a.pcap", "-o", "a.kestro", "--description=caf\u00e9 <&>")
        return plistlib.loads((self.folder / "a.kestro").read_bytes())

    def exported(self, *options):
        self.cli("export-dlf", "a.kestro", "-o", "a.dlf", *options)
        return (self.folder / "a.dlf").read_bytes()

    def test_an_ifx_snapshot(self):
        root = self.snapshot("IFX", [ifx_message(CELL)])
        entry = {
            "DisplayState": CELL,
            "Display": CELL,
            "ExtraInfo": {},
            "Date": "2012-03-04 08:35:09 -0330",
            "Description": "Snapshot (2012-03-04 08:35:09 -0330)",
        }
        self.assertEqual(list(root), ["Timestamp", "Data", "Description"])
        self.assertEqual(root["Timestamp"], "2012-03-04 08:35:09 -0330")
        self.assertEqual(root["Description"], "caf\u00e9 <&>")
        self.assertEqual(root["Data"], [entry])
        self.assertEqual(list(root["Data"][0]), ENTRY_KEYS)

    def test_the_file_is_xml_without_a_doctype(self):
        self.snapshot("LTE", [SERVING_CELL])
        file = (self.folder / "a.kestro").read_bytes()
        self.assertTrue(file.startswith(b'<?xml version="1.0" encoding="UTF-8"?>\n<plist '))

    def test_control_characters_do_not_spoil_the_file(self):
        root = self.snapshot("IFX", [ifx_message({"State": "a\x01\ufffe!"})])
        self.assertEqual(root["Data"][0]["Display"], {"State": "a\ufffd\ufffd!"})

    def test_a_binary_channels_snapshot(self):
        # Refreshes at 2.0 s and after the last message, at 3.0 s.
        root = self.snapshot("LTE", [SERVING_CELL, message(0xB0C2), message(2, kind=0xFF)])
        *history, log = root["Data"]
        self.assertEqual(
            [entry["Description"] for entry in history],
            ["Snapshot (2012-03-04 08:35:11 -0330)", "Snapshot (2012-03-04 08:35:12 -0330)"],
        )
        self.assertEqual(history[0]["DisplayState"], SERVING_CELL + message(0xB0C2))
        self.assertEqual(history[1]["DisplayState"], message(2, kind=0xFF))
        shown = history[1]["Display"]["01;Serving Cell"]["Serving Cell Measurements"]
        self.assertEqual((shown["E-ARFCN"], shown["Physical Cell ID"]), ("1300", "23"))
        # The report, then each entry's bytes but the first.
        self.assertEqual(len(log["DLF"]), 161 + 32 + 13 + 12)
        self.assertEqual(log["DLF"][161:], (SERVING_CELL + message(0xB0C2))[1:] + message(2)[1:])
        self.assertEqual(log["Description"], "DLF binary (218 bytes)")

    def test_the_version_report(self):
        self.snapshot("LTE", [SERVING_CELL])
        log = self.exported()
        report = dlf.version_report(log)
        self.assertEqual(log[:4], b"\xa1\x00\xfd\x1f")
        self.assertEqual(log[101:103], b"\x2e\xff")
        self.assertTrue(re.fullmatch(r"[A-Z][a-z]{2} [ 1-3]\d \d{4} \d\d:\d\d", report.pop("built")))
        self.assertEqual(
            report,
            {"version": "Kestro", "executable": "EXECUTABLE_NAME", "seconds": START, "zone": -210,
             "daylight": 0},
        )

    def test_daylight_saving_time(self):
        self.environment["TZ"] = "XXX0YYY-1,J1/0,J365/23"  # all year, an hour east
        self.snapshot("LTE", [SERVING_CELL])
        report = dlf.version_report(self.exported())
        self.assertEqual((report["zone"], report["daylight"]), (60, 1))

    def test_a_reframed_log(self):
        self.snapshot("LTE", [SERVING_CELL, b"\x81\x05" + message(0xB0C2, b"ab"), SERVING_CELL])
        found = list(dlf.records(self.exported("--reframe")[161:]))
        cell = (0xB17F, START * 10**6, SERVING_CELL[13:])
        self.assertEqual(found, [cell, (0xB0C2, START * 10**6, b"ab"), cell])

    def test_an_empty_history(self):
        root = self.snapshot("LTE", [])
        self.assertEqual([entry["Description"] for entry in root["Data"]], ["DLF binary (161 bytes)"])
        self.assertEqual(len(self.exported()), 161)
        self.assertEqual(self.exported(), self.exported("--reframe"))


if __name__ == "__main__":
    unittest.main()
