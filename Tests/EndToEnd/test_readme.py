# SPDX-License-Identifier: MIT
"""The README's commands, run in its order as a reader would type them."""

import os
import pathlib
import re
import shlex
import signal
import subprocess
import tempfile
import time
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]

# What takes the whole machine, is no command of ours, or is the reader's own.
EXEMPT = ("./run", "./test", "cmake --install", "bridge")

SERVER_SECONDS = 10  # a server plays so long
DISPLAY_SECONDS = 4  # a display that nobody ends is watched so long
PATIENCE_SECONDS = 90


def blocks(text):
    """The lines of each fenced block."""
    return [block.splitlines() for block in re.findall(r"^```\n(.*?)^```$", text, re.M | re.S)]


def commands(text):
    """(command, expected lines) in their order; what follows a prompt is what it prints."""
    result = []
    for lines in blocks(text):
        prompted = any(line.startswith("$ ") for line in lines)
        for line in lines:
            if line.startswith("$ "):
                result.append((line[2:], []))
            elif prompted and result:
                result[-1][1].append(line)
            elif line.startswith(("kestro", "./", "cmake", "bridge")):
                result.append((line.split("  #")[0].rstrip(), []))
    return result


def is_server(command):
    return command.startswith("kestro-telephonyd")


def is_endless(command):
    """Whether it goes on until somebody ends it, or longer than a test should wait."""
    words = shlex.split(command)
    if words[0] == "kestro":
        return not any(word.startswith("--screenshot") for word in words)
    return words[1] == "record" or (
        words[1] == "watch" and not any(word.startswith("--count") for word in words)
    )


def needs_server(command):
    words = shlex.split(command)
    is_live = words[0] == "kestro" or words[1] in ("watch", "record")
    return is_live and not any(word.startswith("--demo") for word in words)


class Readme(unittest.TestCase):
    def setUp(self):
        self.folder = tempfile.TemporaryDirectory(prefix="kestro-readme-")
        self.addCleanup(self.folder.cleanup)
        home = pathlib.Path(self.folder.name)
        (home / "Documentation").symlink_to(ROOT / "Documentation")
        programs = pathlib.Path(os.environ["KESTRO_CLI"]).parent
        self.environment = dict(
            os.environ,
            PATH=f"{programs}:{os.environ['PATH']}",
            HOME=str(home),
            TMPDIR=str(home),
            KESTRO_PORT_DIR=str(home / "ports"),
            XDG_CONFIG_HOME=str(home / "config"),
            XDG_DATA_HOME=str(home / "data"),
            QT_QPA_PLATFORM="offscreen",
            DBUS_SESSION_BUS_ADDRESS="",
        )
        self.server = None
        self.addCleanup(self.end_server)

    def start(self, command):
        return subprocess.Popen(
            ["/bin/sh", "-c", f"exec {command}"],
            cwd=self.folder.name,
            env=self.environment,
            stdin=subprocess.DEVNULL,
            stdout=subprocess.PIPE,
            stderr=subprocess.PIPE,
            text=True,
        )

    def end(self, process):
        process.send_signal(signal.SIGINT)
        return process.communicate(timeout=PATIENCE_SECONDS)

    def end_server(self):
        if self.server is None:
            return
        process, _ = self.server
        self.server = None
        _, errors = self.end(process)
        self.assertEqual(process.returncode, 0, errors)

    def start_server(self, command):
        self.end_server()
        process = self.start(command)
        self.server = (process, time.monotonic() + SERVER_SECONDS)
        self.assertIn("playing ", process.stderr.readline(), command)

    def run_command(self, command):
        """What it printed; it must end well."""
        process = self.start(command)
        if is_endless(command):
            wanted = SERVER_SECONDS if " record " in command else DISPLAY_SECONDS
            try:
                process.wait(wanted)
            except subprocess.TimeoutExpired:
                pass
            output, errors = self.end(process)
        else:
            output, errors = process.communicate(timeout=PATIENCE_SECONDS)
        self.assertEqual(process.returncode, 0, f"{command}\n{errors}")
        return output

    def test_every_command_works_as_written(self):
        found = commands((ROOT / "README.md").read_text())
        ours = [(command, lines) for command, lines in found if not command.startswith(EXEMPT)]
        self.assertGreater(len(ours), 12)
        for command, lines in ours:
            with self.subTest(command):
                if is_server(command):
                    self.start_server(command)
                    continue
                if self.server and time.monotonic() > self.server[1]:
                    self.end_server()
                if self.server is None and needs_server(command):
                    self.start_server("kestro-telephonyd")
                output = self.run_command(command)
                if command.startswith("kestro-cli explain") and lines:
                    self.assertEqual(output.rstrip("\n").splitlines(), lines)


if __name__ == "__main__":
    unittest.main()
