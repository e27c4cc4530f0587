# SPDX-License-Identifier: MIT
"""kestro-extcap in tshark, as a capture interface: live packets, by the dissector's fields.

The programs are found through $KESTRO_EXTCAP, $KESTRO_CLI and $KESTRO_TELEPHONYD, the dissector
through $KESTRO_DISSECTOR."""

import os
import pathlib
import shutil
import signal
import subprocess
import tempfile
import time
import unittest

EXTCAP = os.environ.get("KESTRO_EXTCAP", "kestro-extcap")
TELEPHONYD = os.environ.get("KESTRO_TELEPHONYD", "kestro-telephonyd")
DISSECTOR = os.environ.get("KESTRO_DISSECTOR", "kestro.lua")
PATIENCE = 60


@unittest.skipUnless(shutil.which("tshark"), "there is no tshark")
class Extcap(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.home = pathlib.Path(folder.name)
        self.environment = {
            **os.environ, "HOME": folder.name, "KESTRO_PORT_DIR": folder.name, "TMPDIR": folder.name
        }
        self.environment.pop("XDG_CONFIG_HOME", None)
        extcaps = self.home / ".config/wireshark/extcap"
        extcaps.mkdir(parents=True)
        (extcaps / "kestro-extcap").symlink_to(EXTCAP)

    def tshark(self, *arguments):
        """Runs tshark to its end; it is killed when that does not come."""
        with subprocess.Popen(
            ["tshark", "-X", f"lua_script:{DISSECTOR}", *arguments],
            env=self.environment, stdout=subprocess.PIPE, stderr=subprocess.PIPE,
            start_new_session=True,
        ) as process:
            try:
                output, errors = process.communicate(timeout=PATIENCE)
            except subprocess.TimeoutExpired:
                os.killpg(process.pid, signal.SIGKILL)
                raise
        return output.decode(), errors.decode()

    def extcaps(self):
        """The command lines of the captures that run from this home."""
        mark = str(self.home).encode()
        found = []
        for entry in pathlib.Path("/proc").glob("[0-9]*/environ"):
            try:
                if mark in entry.read_bytes():
                    line = entry.with_name("cmdline").read_bytes()
                    if b"kestro" in line.split(b"\0")[0]:
                        found.append(line)
            except OSError:
                pass
        return found

    def await_no_extcap(self):
        deadline = time.monotonic() + PATIENCE
        while self.extcaps():
            self.assertLess(time.monotonic(), deadline, self.extcaps())
            time.sleep(0.05)

    def test_the_interfaces_are_there(self):
        listed, _ = self.tshark("-D")
        self.assertRegex(listed, r"\. kestro-channel \(Kestro log channel\)")
        self.assertRegex(listed, r"\. kestro-simulation \(Kestro simulation\)")

    def test_a_hundred_packets_of_the_simulation(self):
        field = "kestro.gsmumts.active_set.rscp"
        output, errors = self.tshark(
            "-i", "kestro-simulation", "-o", "extcap.kestro_simulation.technology:Ondrel_GSM",
            "-c", "100", "-l", "-Y", field, "-T", "fields", "-e", "frame.number", "-e", field,
        )
        lines = [line.split("\t") for line in output.splitlines()]
        self.assertGreater(len(lines), 2, errors)
        self.assertLessEqual(int(lines[-1][0]), 100)
        self.assertGreater(int(lines[-1][0]), 50)
        levels = [float(level) for _, shown in lines for level in shown.split(",")]
        self.assertTrue(all(-150 <= level <= -30 for level in levels), levels)
        self.await_no_extcap()

    def test_the_log_channel_of_a_server(self):
        server = subprocess.Popen(
            [TELEPHONYD, "--source=simulation:UTRAN2", "--speed=20", "--name=Other"],
            env=self.environment,
        )
        self.addCleanup(server.wait)
        self.addCleanup(server.kill)
        output, errors = self.tshark(
            "-i", "kestro-channel", "-o", "extcap.kestro_channel.servername:Other", "-c", "20",
            "-T", "fields", "-e", "_ws.col.Protocol",
        )
        self.assertEqual(set(output.split()), {"UTRAN"}, errors)

    def test_it_ends_with_the_reader_of_its_pipe(self):
        pipe = self.home / "pipe"
        os.mkfifo(pipe)
        reader = os.open(pipe, os.O_RDONLY | os.O_NONBLOCK)
        capture = subprocess.Popen(
            [EXTCAP, "--capture", "--extcap-interface", "kestro-channel", "--fifo", str(pipe)],
            env=self.environment, stderr=subprocess.PIPE,
        )
        self.addCleanup(capture.stderr.close)
        self.addCleanup(capture.kill)
        time.sleep(1)
        self.assertIsNone(capture.poll())  # no server is there: it waits for one
        os.close(reader)
        self.assertEqual(capture.wait(timeout=PATIENCE), 0)
        self.assertEqual(capture.stderr.read(), b"")

    def test_it_ends_when_asked_to(self):
        pipe = self.home / "pipe"
        os.mkfifo(pipe)
        reader = os.open(pipe, os.O_RDONLY | os.O_NONBLOCK)
        self.addCleanup(os.close, reader)
        capture = subprocess.Popen(
            [EXTCAP, "--capture", "--extcap-interface=kestro-simulation", f"--fifo={pipe}"],
            env=self.environment,
        )
        self.addCleanup(capture.kill)
        time.sleep(1)
        capture.terminate()
        self.assertEqual(capture.wait(timeout=PATIENCE), 0)
        self.await_no_extcap()

    def test_what_it_cannot_do(self):
        for arguments in (
            ["--extcap-interface=eth0", "--extcap-dlts"],
            ["--capture", "--extcap-interface=kestro-channel"],
            ["--capture", "--extcap-interface=kestro-channel", "--fifo=/nowhere/pipe",
             "--extcap-capture-filter=tcp"],
        ):
            done = subprocess.run([EXTCAP, *arguments], stderr=subprocess.PIPE, timeout=PATIENCE)
            self.assertEqual(done.returncode, 1, arguments)
            self.assertRegex(done.stderr, b"^kestro-extcap: ")


if __name__ == "__main__":
    unittest.main()
