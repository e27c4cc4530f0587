# SPDX-License-Identifier: MIT
"""Full, read-only, missing and vanishing directories."""

import contextlib
import hashlib
import json
import shutil
import subprocess
import time

from promises import Impossible, in_lanes, pause, require, spread, wait_until, waits_of_all
from world import World

INTERVAL = 0.002
REFUSED = "server, recordings and snapshots are refused with the reason"


@contextlib.contextmanager
def mounted(folder, *options):
    """A file system of its own in a folder, for a while."""
    folder.mkdir()
    flags = ",".join(["mode=0700", *options])
    command = ["mount", "-t", "tmpfs", "-o", flags, "tmpfs", str(folder)]
    mount = subprocess.run(command, stderr=subprocess.DEVNULL, check=False)
    if mount.returncode != 0:
        raise Impossible("file systems can be mounted by root or in a namespace of one's own only")
    try:
        yield
    finally:
        subprocess.run(["umount", "--lazy", str(folder)], check=True)


def remount(folder, option):
    subprocess.run(["mount", "-o", f"remount,{option}", str(folder)], check=True)


def digest(path):
    return hashlib.sha256(path.read_bytes()).hexdigest()


def decoded_messages(world, path):
    """How many messages `kestro-cli decode` finds in a capture, and its exit status."""
    decoded = world.run("decode", path, "--format=json")
    return json.loads(decoded.stdout)["messages"], decoded.returncode


def require_complaint(outcome, status, reason):
    require(outcome.returncode == status, f"exit status {status}, not {outcome.returncode}")
    require(
        len(outcome.stderr.splitlines()) == 1 and reason in outcome.stderr,
        f'one line that says "{reason}", not {outcome.stderr!r}',
    )


def full_disk(options):
    """the disk is full"""
    with World(options.programs) as world, mounted(world.folder / "disk", "size=512k"):
        disk = world.folder / "disk"
        world.write_source(1, 60_000, INTERVAL)
        world.start_server()
        saved = world.record("saved", path=disk / "saved.pcap")
        wait_until(lambda: saved.has(1, 500), "a client records")
        saved.end()
        snapshot = disk / "saved.kestro"
        save = ["snapshot", "save", disk / "saved.pcap", "-o", snapshot, "--description=x"]
        require(world.run(*save).returncode == 0, "a snapshot is saved")
        kept = {path: digest(path) for path in (saved.path, snapshot)}

        recorder = world.record("recorder", path=disk / "recorder.pcap")
        status = recorder.wait("a recording ends when the disk is full", 60)
        require(status == 1, "the exit status says that not all was done")
        error = recorder.errors().splitlines()[-1]
        require(error.endswith("No space left on device"), f"the last line says why: {error}")
        count = recorder.read().count
        require(count > 500 and len(recorder.recording.stretches) == 1, "what fitted is recorded")
        decoded, status = decoded_messages(world, recorder.path)
        require(decoded == count and status in (0, 3), "it can be read")
        longer = [*save[:-1], "--description=" + "x" * 60_000]
        require_complaint(world.run(*longer), 1, "No space left on device")
        require({path: digest(path) for path in kept} == kept, "what was saved before is whole")
        world.forget(recorder)  # which has the file open
        recorder.path.unlink()
        require(world.run(*longer).returncode == 0, "with room again, a snapshot is saved")
        return (
            f"{count} messages recorded and readable, then exit status 1 and "
            f"\"{error.rsplit(': ', 1)[1]}\"; an earlier recording and snapshot stay whole"
        )


def read_only_directory(options):
    """a directory cannot be written to"""
    with World(options.programs) as world, mounted(world.folder / "disk"):
        disk = world.folder / "disk"
        world.write_source(1, 60_000, INTERVAL)
        world.use_ports(disk / "ports")
        world.ports.mkdir(mode=0o700)
        remount(disk, "ro")
        server = world.launch_server()
        require(server.wait("a server that cannot open its port ends") == 1, "with exit status 1")
        require("cannot open the port" in server.errors(), "it says that it cannot open its port")
        waiting = world.record("waiting")
        pause(1)
        require(waiting.is_running(), "a client goes on trying")
        remount(disk, "rw")
        world.start_server()
        waited = wait_until(lambda: waiting.has(1), "it connects when it can")
        remount(disk, "ro")
        world.use_ports(world.folder / "ports")
        world.start_server()
        for command in (
            ["record", "-o", disk / "x.pcap"],
            ["snapshot", "save", waiting.path, "-o", disk / "x.kestro", "--description=x"],
        ):
            outcome = world.run(*command)
            require(outcome.returncode == 1, "what cannot be written is a failure")
            require("Read-only file system" in outcome.stderr, f"it says why: {outcome.stderr!r}")
        return f"{REFUSED}; a client connected {waited:.2f} s after it could"


def missing_directory(options):
    """a directory does not exist"""
    with World(options.programs) as world:
        world.write_source(1, 60_000, INTERVAL)
        missing = world.folder / "missing"
        world.use_ports(missing / "ports")
        server = world.launch_server()
        require(server.wait("a server without a port directory ends") == 1, "with exit status 1")
        waiting = world.record("waiting")
        pause(1)
        require(waiting.is_running(), "a client goes on trying")
        missing.mkdir()
        world.start_server()
        waited = wait_until(lambda: waiting.has(1), "it connects when it can")
        nowhere = world.folder / "nowhere"
        outcome = world.run("record", "-o", nowhere / "x.pcap")
        require(outcome.returncode == 1, "what cannot be written is a failure")
        require("No such file or directory" in outcome.stderr, f"it says why: {outcome.stderr!r}")
        require_complaint(
            world.run("snapshot", "save", waiting.path, "-o", nowhere / "x", "--description=x"),
            1,
            "No such file or directory",
        )
        return f"{REFUSED}; a client connected {waited:.2f} s after it could"


def port_directory_removed(options):
    """the port directory goes away, and comes back"""
    interval = 0.01

    def moved(world, recorders, number):
        """Away and back: connections do not depend on names."""
        elsewhere = world.folder / f"elsewhere-{number}"
        counts = [recorder.read().count for recorder in recorders]
        world.ports.rename(elsewhere)
        pause(2.5)
        shutil.rmtree(world.ports, ignore_errors=True)  # a newcomer may have made it again
        elsewhere.rename(world.ports)
        for recorder, count in zip(recorders, counts):
            wait_until(lambda it=recorder, n=count: it.read().count > n + 200, "the stream goes on")

    def removed(world, server, recorders, life):
        """For good: the server ends, whoever keeps it running starts it again."""
        shutil.rmtree(world.ports)
        start = time.monotonic()
        require(server.wait("a server whose port was removed ends") == 1, "with exit status 1")
        ended = time.monotonic() - start
        require("the server's port was removed" in server.errors(), "it says why")
        world.forget(server)
        world.write_source(life, 6000, interval)
        server = world.start_server()
        waits = waits_of_all(
            [lambda it=it: it.has(life) for it in recorders], "a client is connected again"
        )
        return server, ended, waits

    def lane(rounds):
        with World(options.programs) as world:
            world.write_source(1, 6000, interval)
            server = world.start_server()
            recorders = [world.record("recorder-1"), world.record("recorder-2")]
            ends, waits = [], []
            for number in range(rounds):
                for recorder in recorders:
                    wait_until(lambda it=recorder: it.has(number + 1), "a client connects")
                if number % 3 == 0:
                    moved(world, recorders, number)
                server, ended, more = removed(world, server, recorders, number + 2)
                ends.append(ended)
                waits += more
            for recorder in recorders:
                require(len(recorder.read().stretches) == rounds + 1, "one channel for each server")
                require(recorder.end() == 3, "a client ends as asked, and tells of lost servers")
            return ends, waits

    results = in_lanes(options.lanes, max(3, options.rounds // 10), lane)
    ends = [seconds for result in results for seconds in result[0]]
    waits = [seconds for result in results for seconds in result[1]]
    return (
        f"removed {len(ends)} times: the server ended with status 1 after {spread(ends)}, clients "
        f"connected to the next after {spread(waits)}; moved away and back: nothing is missing"
    )
