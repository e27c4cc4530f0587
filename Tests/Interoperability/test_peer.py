# SPDX-License-Identifier: MIT
"""A peer in another language plays the server to kestro-cli, and the client to kestro-telephonyd.

The programs are found through $KESTRO_CLI and $KESTRO_TELEPHONYD."""

import contextlib
import itertools
import json
import os
import pathlib
import socket
import struct
import subprocess
import sys
import tempfile
import threading
import time
import unittest

PEER = [sys.executable, "-B", str(pathlib.Path(__file__).with_name("peer.py"))]
EXTENDED_PEER = [sys.executable, "-B", str(pathlib.Path(__file__).with_name("extended_peer.py"))]
PATIENCE = 30


def feed(stream):
    """Writes numbered messages as a framed stream until nobody reads them, 20 MB/s at most."""
    with contextlib.suppress(OSError, ValueError), stream:
        for serial in itertools.count(1):
            body = (
                b'<plist version="1.0"><dict><key>Serial</key><integer>%d</integer>'
                b"<key>Filling</key><string>%s</string></dict></plist>"
            ) % (serial, b"." * 20_000)
            stream.write(struct.pack("<I", len(body)) + body)
            stream.flush()
            time.sleep(0.001)


def capture(messages):
    """A capture of IFX messages, each with its microseconds."""
    parts = [struct.pack("<IHHQII", 0xA1B2C3D4, 2, 4, 0, 262144, 147)]
    for microseconds, body in messages:
        seconds, fraction = divmod(microseconds, 1_000_000)
        parts.append(struct.pack("<IIII", seconds, fraction, len(body), len(body)) + body)
    return b"".join(parts)


class Interoperability(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.ports = pathlib.Path(folder.name)
        self.environment = {**os.environ, "KESTRO_PORT_DIR": folder.name}

    def start_server(self, command, **options):
        """Starts a program that owns the port TelephonyServer until the test ends."""
        process = subprocess.Popen(command, env=self.environment, **options)
        self.addCleanup(process.wait)
        self.addCleanup(process.kill)
        deadline = time.monotonic() + PATIENCE
        while not self.listens("TelephonyServer"):
            self.assertIsNone(process.poll(), "the server has ended")
            self.assertLess(time.monotonic(), deadline, "the server does not open its port")
            time.sleep(0.01)
        return process

    def listens(self, name):
        with socket.socket(socket.AF_UNIX) as probe:
            return probe.connect_ex(str(self.ports / name)) == 0

    def output(self, command):
        finished = subprocess.run(
            command, env=self.environment, stdout=subprocess.PIPE, timeout=PATIENCE, check=True
        )
        return finished.stdout.decode().splitlines()

    def test_the_peer_serves_watch(self):
        self.start_server([*PEER, "server"])
        lines = self.output(
            [os.environ["KESTRO_CLI"], "watch", "--format=ndjson", "--count=2"]
        )
        displays = [json.loads(line)["display"] for line in lines]
        self.assertEqual(len(displays), 2)
        for display in displays:
            self.assertEqual(display["State"], "Idle")
            self.assertEqual(display["Cell"]["ARFCN"], "62")
        first, second = (int(display["Cell"]["RxLev"]) for display in displays)
        self.assertGreaterEqual(first, -90)
        self.assertGreater(second, first)

    def test_the_peer_serves_record(self):
        self.start_server([*PEER, "server"])
        path = self.ports / "recording.pcap~"
        finished = subprocess.run(
            [os.environ["KESTRO_CLI"], "record", f"--output={path}", "--duration=2"],
            env=self.environment, stderr=subprocess.PIPE, timeout=PATIENCE, check=False,
        )
        last = finished.stderr.decode().splitlines()[-1]
        self.assertRegex(last, rf" recorded [1-9]\d* messages, \d+ bytes, 0 dropped, in {path}$")
        self.assertEqual(finished.returncode, 0)

    def test_the_peer_watches_the_server(self):
        self.start_server(
            [os.environ["KESTRO_TELEPHONYD"], "--source=simulation", "--technology=IFX", "--speed=50"]
        )
        lines = self.output([*PEER, "client", "3"])
        self.assertEqual(lines, ["2", "IFX", "0 dict", "0 dict", "0 dict"])

    def test_an_extended_peer_learns_what_it_has_lost(self):
        server = self.start_server(
            [os.environ["KESTRO_TELEPHONYD"], "--source=stream:-"], stdin=subprocess.PIPE
        )
        threading.Thread(target=feed, args=[server.stdin], daemon=True).start()
        lines = self.output([*EXTENDED_PEER, "lose"])
        # One gap, of as many messages as were told; not told twice.
        self.assertEqual(lines, ["1 0 True", "False"])

    def test_an_extended_peer_learns_the_source_its_times_and_its_end(self):
        begin = 1_330_862_709_000_042
        path = self.ports / "drive.pcap~"
        path.write_bytes(capture([(begin, b"first"), (begin + 1_000_000, b"last")]))
        self.start_server(
            [os.environ["KESTRO_TELEPHONYD"], f"--source=capture:{path}", "--speed=0.25"]
        )
        lines = self.output([*EXTENDED_PEER, "follow"])
        self.assertEqual(
            lines,
            [
                f"capture {path} False False",
                f"{begin + 1_000_000} last",
                "SourceChanged capture True",
                "True",
            ],
        )


if __name__ == "__main__":
    unittest.main()
