# SPDX-License-Identifier: MIT
"""Clients that mean harm, on sockets of their own."""

import contextlib
import pathlib
import plistlib
import re
import resource
import selectors
import socket
import struct
import time

from promises import MEBIBYTE, require, wait_until
from world import World

MESSAGE, REQUEST = 1, 2
CREATE_LOG_CHANNEL = 2
NO_LOCAL_PORT = 2
# More than a server has channels.
MANY = 600
LONGEST_MESSAGE = 16 * MEBIBYTE
UNIT = pathlib.Path(__file__).parents[2] / "Resources" / "kestro-telephonyd.service"
# A frame may wait so long for its next byte.
PATIENCE_OF_PORTS = 10


def header(kind, message_id, sequence, length):
    return struct.pack("<B3xiII", kind, message_id, sequence, length)


def connect(path):
    peer = socket.socket(socket.AF_UNIX)
    peer.connect(str(path))
    peer.settimeout(10)
    return peer


class Asker:
    """A client that asks for log channels."""

    def __init__(self, world):
        self._socket = connect(world.ports / "TelephonyServer")
        self._sequence = 0

    def close(self):
        self._socket.close()

    def error(self, local_port):
        """Asks for a channel to that port; the reply's error number."""
        self._sequence += 1
        body = plistlib.dumps({"LocalPort": local_port})
        self._socket.sendall(
            header(REQUEST, CREATE_LOG_CHANNEL, self._sequence, len(body)) + body
        )
        length = struct.unpack("<12xI", self._socket.recv(16, socket.MSG_WAITALL))[0]
        return plistlib.loads(self._socket.recv(length, socket.MSG_WAITALL))["Error"]


def others_ports(options):
    """a client names the server's ports, and a recorder's, as its own"""
    interval = 0.02
    with World(options.programs) as world, contextlib.ExitStack() as stack:
        world.write_source(1, round(120 / interval), interval)
        server = world.start_server()
        recorder = world.record("recorder")
        wait_until(lambda: recorder.has(1), "a client connects")
        names = [path.name for path in world.ports.iterdir() if path.is_socket()]
        (world.ports / "Link").symlink_to("TelephonyServer")
        held = server.descriptors()
        asker = stack.enter_context(contextlib.closing(Asker(world)))
        for name in [*names, "Link"]:
            for _ in range(MANY):
                error = asker.error(name)
                require(error == NO_LOCAL_PORT, f"{name} is no port of the client's ({error})")
        require(server.descriptors() <= held + 1, "nothing is kept for a client that is refused")
        visitor = world.record("visitor")
        waited = wait_until(lambda: visitor.has(1), "who comes then is served")
        count = recorder.read().count
        wait_until(lambda: recorder.read().count > count + 1 / interval, "the stream goes on")
        require(len(recorder.recording.stretches) == 1, "a recording has each message once")
        kinds = sorted({name.partition(".")[0] for name in names})
        return (
            f"{MANY} requests each for {', '.join(kinds)} and a link: all refused; "
            f"who came then was served after {waited:.1f} s"
        )


def memory_of_unit():
    """What the unit lets the server have, in bytes."""
    return MEBIBYTE * int(re.search(r"^MemoryMax=(\d+)M$", UNIT.read_text(), re.M)[1])


def leave_unfinished(peers, patience=2):
    """Sends all but the last byte of the longest message on every connection, as far as they are
    taken; how many bytes were."""
    piece = bytes(MEBIBYTE)
    left = {peer: LONGEST_MESSAGE - 1 for peer in peers}
    sent = 0
    with selectors.DefaultSelector() as selector:
        for peer in peers:
            peer.setblocking(False)
            peer.send(header(MESSAGE, 0, 0, LONGEST_MESSAGE))
            selector.register(peer, selectors.EVENT_WRITE)
        while selector.get_map() and (ready := selector.select(patience)):
            for key, _ in ready:
                peer = key.fileobj
                with contextlib.suppress(BlockingIOError):
                    try:
                        count = peer.send(piece[: left[peer]])
                    except (BrokenPipeError, ConnectionResetError):
                        count = left[peer]
                        sent -= count
                    left[peer] -= count
                    sent += count
                    if left[peer] == 0:
                        selector.unregister(peer)
    return sent


def is_closed(peer):
    peer.setblocking(False)
    try:
        return peer.recv(1) == b""
    except BlockingIOError:
        return False
    except OSError:
        return True


def unfinished_messages(options):
    """many connections each leave a long message unfinished"""
    interval, memory = 0.02, memory_of_unit()
    hard = resource.getrlimit(resource.RLIMIT_NOFILE)[1]
    resource.setrlimit(resource.RLIMIT_NOFILE, (min(4096, hard), hard))
    with World(options.programs) as world, contextlib.ExitStack() as stack:
        world.write_source(1, round(240 / interval), interval)
        server = world.start_server(address_space=memory)
        victim = world.record("victim", address_space=memory)
        wait_until(lambda: victim.has(1), "a client connects")
        local = next(world.ports.glob("KestroApp.*"))
        outcomes = []
        for process, path in [(server, world.ports / "TelephonyServer"), (victim, local)]:
            held = process.memory()
            peers = [
                stack.enter_context(contextlib.closing(connect(path)))
                for _ in range(options.connections)
            ]
            sent = leave_unfinished(peers)
            require(process.is_running(), f"the {process.name} stays")
            most = process.most_resident()
            require(most < memory, f"the {process.name} stays within its unit's memory ({most})")
            left = [peer for peer in peers if not is_closed(peer)]
            require(left, "who may stay does")
            if not options.short:
                start = time.monotonic()
                wait_until(lambda: all(map(is_closed, left)), "who does not go on is closed")
                waited = time.monotonic() - start
                require(waited < PATIENCE_OF_PORTS + 5, "nobody is waited for without end")
            if process is server and not options.short:
                wait_until(
                    lambda: server.memory() < held + 4 * MEBIBYTE, "what was held is free again"
                )
            outcomes.append(
                f"{process.name}: {sent / MEBIBYTE:.0f} MiB of {options.connections} messages "
                f"sent, {len(left)} connections stayed, at most {most / MEBIBYTE:.0f} MiB resident"
            )
        visitor = world.record("visitor")
        wait_until(lambda: visitor.has(1), "who comes then is served")
        count = victim.read().count
        wait_until(lambda: victim.read().count > count, "the stream goes on")
        require(len(victim.recording.stretches) == 1, "nobody else misses a message")
        return f"{memory // MEBIBYTE} MiB of address space; " + "; ".join(outcomes)
