# SPDX-License-Identifier: MIT
"""Clients that mean harm, on sockets of their own."""

import contextlib
import plistlib
import socket
import struct

from promises import require, wait_until
from world import World

MESSAGE, REQUEST = 1, 2
CREATE_LOG_CHANNEL = 2
NO_LOCAL_PORT = 2
# More than a server has channels.
MANY = 600


def header(kind, message_id, sequence, length):
    return struct.pack("<B3xiII", kind, message_id, sequence, length)


def connect(path):
    peer = socket.socket(socket.AF_UNIX)
    peer.settimeout(10)
    peer.connect(str(path))
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
