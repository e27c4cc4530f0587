# SPDX-License-Identifier: MIT
"""A peer in another language plays the server to kestro-cli, and the client to kestro-telephonyd.

The programs are found through $KESTRO_CLI and $KESTRO_TELEPHONYD."""

import json
import os
import pathlib
import socket
import subprocess
import sys
import tempfile
import time
import unittest

PEER = [sys.executable, "-B", str(pathlib.Path(__file__).with_name("peer.py"))]
PATIENCE = 30


class Interoperability(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.ports = pathlib.Path(folder.name)
        self.environment = {**os.environ, "KESTRO_PORT_DIR": folder.name}

    def start_server(self, command):
        """Starts a program that owns the port TelephonyServer until the test ends."""
        process = subprocess.Popen(command, env=self.environment)
        self.addCleanup(process.wait)
        self.addCleanup(process.kill)
        deadline = time.monotonic() + PATIENCE
        while not self.listens("TelephonyServer"):
            self.assertIsNone(process.poll(), "the server has ended")
            self.assertLess(time.monotonic(), deadline, "the server does not open its port")
            time.sleep(0.01)

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

    def test_the_peer_watches_the_server(self):
        self.start_server(
            [os.environ["KESTRO_TELEPHONYD"], "--source=simulation", "--technology=IFX", "--speed=50"]
        )
        lines = self.output([*PEER, "client", "3"])
        self.assertEqual(lines, ["2", "IFX", "0 dict", "0 dict", "0 dict"])


if __name__ == "__main__":
    unittest.main()
