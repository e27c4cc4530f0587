# SPDX-License-Identifier: MIT
"""The real programs, each world with a port directory of its own."""

import contextlib
import json
import os
import pathlib
import shutil
import signal
import socket
import subprocess
import tempfile
import threading

from promises import require, wait_until
from recordings import Recording, feed_stream, write_source


class Process:
    """A program that runs. `limits` are those of its descriptors, soft and hard, `address_space`
    that of its memory in bytes; a `pipe` takes what it writes, and `fed` gives it an input of its
    own."""

    def __init__(
        self,
        name,
        command,
        environment,
        folder,
        *,
        limits=None,
        address_space=None,
        pipe=False,
        fed=False,
    ):
        self.name = name
        self._output = folder / f"{name}.out"
        self._errors = folder / f"{name}.err"
        if limits is not None:
            command = ["prlimit", "--nofile={}:{}".format(*limits), *command]
        if address_space is not None:
            command = ["prlimit", f"--as={address_space}", *command]
        with open(self._output, "wb") as output, open(self._errors, "wb") as errors:
            self._process = subprocess.Popen(
                command,
                env=environment,
                stdin=subprocess.PIPE if fed else subprocess.DEVNULL,
                stdout=subprocess.PIPE if pipe else output,
                stderr=errors,
            )
        self.pipe = self._process.stdout
        self.input = self._process.stdin

    def signal(self, number):
        self._process.send_signal(number)

    def stop(self):
        self.signal(signal.SIGSTOP)

    def go_on(self):
        self.signal(signal.SIGCONT)

    def kill(self):
        self._process.kill()
        self._process.wait()

    def is_running(self):
        return self._process.poll() is None

    def end(self, promise="a program that is asked to end does so", patience=10):
        """Asks it to end; its exit status."""
        self.signal(signal.SIGTERM)  # background jobs of a shell ignore SIGINT
        return self.wait(promise, patience)

    def wait(self, promise, patience=10):
        try:
            return self._process.wait(patience)
        except subprocess.TimeoutExpired:
            require(False, f"{promise} within {patience} s")

    def output(self):
        return self._output.read_text()

    def errors(self):
        return self._errors.read_text()

    def memory(self):
        """Bytes of its own: what it shares with other processes is not counted."""
        status = pathlib.Path(f"/proc/{self._process.pid}/status").read_text()
        return 1024 * int(status.split("RssAnon:")[1].split()[0])

    def most_resident(self):
        """The most bytes that were resident at once, what is shared included."""
        status = pathlib.Path(f"/proc/{self._process.pid}/status").read_text()
        return 1024 * int(status.split("VmHWM:")[1].split()[0])

    def descriptors(self):
        return len(os.listdir(f"/proc/{self._process.pid}/fd"))

    def cpu_seconds(self):
        statistics = pathlib.Path(f"/proc/{self._process.pid}/stat").read_text()
        fields = statistics.rsplit(")", 1)[1].split()
        return (int(fields[11]) + int(fields[12])) / os.sysconf("SC_CLK_TCK")

    def forget(self):
        """Kills it if it still runs, and lets go of what is held for it."""
        with contextlib.suppress(ProcessLookupError):
            self.kill()
        if self.pipe:
            self.pipe.close()


class Recorder(Process):
    """`kestro-cli record`, to a file or (`pipe`) to a pipe."""

    def __init__(self, world, name, path=None, pipe=False, **options):
        self.path = path or world.folder / f"{name}.pcap"
        if pipe:  # by a name that asks for pcap
            self.path.symlink_to("/dev/stdout")
        command = [world.program("kestro-cli"), "record", "--output", str(self.path)]
        super().__init__(name, command, world.environment, world.folder, pipe=pipe, **options)
        self.recording = Recording(name)
        self._file = None
        if pipe:
            self._file = self.pipe
            os.set_blocking(self.pipe.fileno(), False)

    def read(self):
        """Reads what has been recorded; the recording."""
        if self._file is None and self.path.exists():
            self._file = open(self.path, "rb")  # its writer replaces no file that it has begun
        while self._file is not None and (data := self._file.read(1 << 20)):
            self.recording.feed(data)
        return self.recording

    def has(self, life, serial=1):
        return self.read().last_of(life) >= serial

    def forget(self):
        super().forget()
        if self._file is not None:
            self._file.close()


class Watcher(Process):
    """`kestro-cli watch`, a line of JSON for each display."""

    def __init__(self, world, name, preload=None):
        environment = dict(world.environment)
        environment.update(preload or {})
        command = [world.program("kestro-cli"), "watch", "--format=ndjson"]
        super().__init__(name, command, environment, world.folder)

    def lines(self):
        *whole, _ = self.output().split("\n")
        return [json.loads(line) for line in whole]

    def life(self):
        lines = self.lines()
        return int(lines[-1]["display"]["Life"]) if lines else 0


class World:
    """A folder with a port directory, a source and the programs that meet there. All of them end
    with it."""

    def __init__(self, programs):
        self._programs = pathlib.Path(programs)
        self.folder = pathlib.Path(tempfile.mkdtemp(prefix="kestro-faults-"))
        self.environment = {**os.environ, "TMPDIR": str(self.folder), "TZ": "UTC"}
        self.use_ports(self.folder / "ports")
        self._started = []

    def __enter__(self):
        return self

    def __exit__(self, *_):
        for process in self._started:
            process.forget()
        shutil.rmtree(self.folder, ignore_errors=True)

    def use_ports(self, directory):
        """Who starts from now on meets there."""
        self.ports = directory
        self.environment["KESTRO_PORT_DIR"] = str(directory)

    def program(self, name):
        return str(self._programs / name)

    def keep(self, process):
        """Sees to it that a process ends with the world; the process."""
        self._started.append(process)
        return process

    def forget(self, process):
        process.forget()
        self._started.remove(process)

    def run(self, *arguments, patience=30):
        """Runs kestro-cli to its end."""
        return subprocess.run(
            [self.program("kestro-cli"), *map(str, arguments)],
            env=self.environment,
            stdin=subprocess.DEVNULL,
            capture_output=True,
            text=True,
            timeout=patience,
            check=False,
        )

    def write_source(self, life, messages, interval):
        write_source(self.folder / "source.pcap", life, messages, interval)

    def launch_server(self, source=None, preload=None, **options):
        """Starts a server that plays the source; it need not succeed."""
        source = source or f"capture:{self.folder}/source.pcap"
        command = [self.program("kestro-telephonyd"), f"--source={source}"]
        environment = {**self.environment, **(preload or {})}
        return self.keep(Process("server", command, environment, self.folder, **options))

    def start_server(self, **options):
        """The same, and waits until it listens."""
        server = self.launch_server(**options)
        wait_until(self.is_served, "a server that was started listens", interval=0.005)
        return server

    def start_fed_server(self, interval, padding):
        """Starts a server with an endless stream of messages of one life."""
        server = self.start_server(source="stream:-", fed=True)
        threading.Thread(
            target=feed_stream, args=[server.input, interval, padding], daemon=True
        ).start()
        return server

    def is_served(self):
        with socket.socket(socket.AF_UNIX) as probe:
            return probe.connect_ex(str(self.ports / "TelephonyServer")) == 0

    def record(self, name, **options):
        return self.keep(Recorder(self, name, **options))

    def watch(self, name="watch", **options):
        return self.keep(Watcher(self, name, **options))
