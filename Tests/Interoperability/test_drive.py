# SPDX-License-Identifier: MIT
"""What `record` writes of a drive through two technologies, decoded, and read by tshark.

The programs are found through $KESTRO_CLI and $KESTRO_TELEPHONYD."""

import contextlib
import itertools
import json
import os
import pathlib
import pty
import shutil
import signal
import subprocess
import tempfile
import time
import unittest

PATIENCE = 30
COLUMNS = "Timestamp,NetworkMode,RSRP,RSRQ,RAWCELLID,CELLHEX,LACHEX"
ROWS = (
    "2019.11.21_15.38.36,LTE,-93,-11,27447297,1,2A",
    "2019.11.21_15.38.37,LTE,-94,-11,27447297,1,2A",
    "2019.11.21_15.38.38,UMTS,-81,-5,1234,2,2A",
    "2019.11.21_15.38.39,UMTS,-82,-5,1234,2,2A",
    "2019.11.21_15.38.40,LTE,-95,-12,27447297,1,2A",
)
FIRST_ROW = 1574350716  # 2019-11-21 15:38:36 UTC


needs_tshark = unittest.skipUnless(
    shutil.which("tshark"), "tshark is missing: apt-get install tshark")


class Drive(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = pathlib.Path(folder.name)
        self.environment = {**os.environ, "KESTRO_PORT_DIR": str(self.folder / "ports")}

    def serve(self, source):
        server = subprocess.Popen(
            [os.environ["KESTRO_TELEPHONYD"], *source],
            env=self.environment, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        self.addCleanup(server.wait)
        self.addCleanup(server.kill)
        deadline = time.monotonic() + PATIENCE
        while not (self.folder / "ports" / "TelephonyServer").exists():
            self.assertLess(time.monotonic(), deadline)
            time.sleep(0.02)

    def command(self, path, *options):
        return [os.environ["KESTRO_CLI"], "record", "-o", str(path), *options]

    def fields(self, path, *names):
        """A list of texts for every message, as tshark reads them."""
        command = ["tshark", "-r", path, "-T", "fields", "-E", "separator=|"]
        for name in names:
            command += ["-e", name]
        run = subprocess.run(command, capture_output=True, text=True, check=True)
        return [line.split("|") for line in run.stdout.splitlines()]

    @needs_tshark
    def test_tshark_reads_both_technologies_in_one_file(self):
        log = self.folder / "mixed.csv"
        log.write_text("\n".join((COLUMNS, *ROWS)) + "\n")
        self.serve([f"--source=drive-test:{log}", "--technology=auto", "--loop", "--speed=4"])
        path = self.folder / "drive.pcapng"
        subprocess.run(
            self.command(path, "--duration=3", "--source-times"), env=self.environment,
            stdin=subprocess.DEVNULL, capture_output=True, timeout=PATIENCE, check=False)
        messages = self.fields(
            path, "frame.interface_name", "frame.time_epoch", "frame.encap_type", "frame.len")
        self.assertEqual({row[0] for row in messages}, {"LTE", "Ondrel_GSM"})
        # User link types 150 and 148 are tshark's encapsulations "user 3" and "user 1".
        self.assertEqual({(row[0], row[2]) for row in messages}, {("LTE", "48"), ("Ondrel_GSM", "46")})
        for row in messages:
            self.assertGreaterEqual(float(row[1]), FIRST_ROW)
            self.assertLess(float(row[1]), FIRST_ROW + 10)
        comments = subprocess.run(
            ["capinfos", "-k", path], capture_output=True, text=True, check=True).stdout
        self.assertIn("made-up: drive-test", comments)

    def test_both_technologies_decode_to_the_displays_that_were_watched(self):
        # Each technology stays for two ticks of the display, which begin anew with it.
        rows = [f"2019.11.21_15.38.{10 + second},{mode}"
                for second, mode in enumerate(4 * ["LTE,-93,-11,27447297,1,2A"]
                                              + 4 * ["UMTS,-81,-5,1234,2,2A"])]
        log = self.folder / "mixed.csv"
        log.write_text("\n".join((COLUMNS, *rows)) + "\n")
        self.serve([f"--source=drive-test:{log}", "--technology=auto", "--loop"])
        path = self.folder / "drive.pcapng"
        recorder = subprocess.Popen(
            self.command(path), env=self.environment, stdin=subprocess.DEVNULL,
            stderr=subprocess.PIPE)
        recorder.stderr.readline()  # it records
        watched = self.displays("watch", "--count=4")
        recorder.send_signal(signal.SIGINT)
        recorder.communicate(timeout=PATIENCE)
        decoded = self.displays("decode", path, "--refresh-every=0")
        # The recorder may know more of the first technology than the display, which came later.
        later = list(itertools.dropwhile(lambda each: each.keys() == watched[0].keys(), watched))
        self.assertGreaterEqual(len({tuple(each) for each in watched}), 2)
        for display in later:
            self.assertIn(display, decoded)

    def displays(self, command, *options):
        run = subprocess.run(
            [os.environ["KESTRO_CLI"], command, "--format=ndjson", *options],
            env=self.environment, capture_output=True, text=True, timeout=PATIENCE, check=True)
        return [json.loads(line)["display"] for line in run.stdout.splitlines()]

    @needs_tshark
    def test_tshark_shows_notes_as_comments_of_packets(self):
        self.serve(["--source=simulation"])
        path = self.folder / "drive.pcapng"
        process, terminal = pty.fork()
        if process == 0:
            os.execve(os.environ["KESTRO_CLI"], self.command(path, "--duration=2"), self.environment)
        self.addCleanup(os.close, terminal)
        while b"recording LTE" not in os.read(terminal, 4096):
            pass
        os.write(terminal, "Br\u00FCcke\n".encode())
        with contextlib.suppress(OSError):  # the terminal's other side is gone
            while os.read(terminal, 4096):
                pass
        os.waitpid(process, 0)
        comments = [row[0] for row in self.fields(path, "frame.comment") if row[0]]
        self.assertEqual(comments, ["Br\u00FCcke"])


if __name__ == "__main__":
    unittest.main()
