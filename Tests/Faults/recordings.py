# SPDX-License-Identifier: MIT
"""Sources whose messages are numbered, and the check of what became of them.

Every message is an IFX display that names the life of the server which sent it and its serial
number in that life. So a recording shows by itself whether something is missing, twice or late."""

import contextlib
import functools
import itertools
import re
import struct
import time

from promises import require

FILE_HEADER = struct.Struct("<IHHQII")
RECORD_HEADER = struct.Struct("<IIII")
MAGIC, LINK_TYPE_IFX = 0xA1B2C3D4, 147
FIRST_SECOND = 1_330_862_709  # 2012-03-04 12:05:09 UTC
LIFE_PLACE = b"<LIFE..>"
NUMBERS = re.compile(rb"<key>Life</key><string>(\d+)</string><key>Serial</key><string>(\d+)<")


def message(life, serial, padding):
    return (
        b'<plist version="1.0"><dict><key>Life</key><string>%s</string>'
        b"<key>Serial</key><string>%d</string><key>Filling</key><string>%s</string>"
        b"</dict></plist>" % (life, serial, b"." * padding)
    )


@functools.lru_cache(maxsize=4)
def _source_bytes(messages, interval):
    """A capture of so many messages, `interval` seconds apart, without their life."""
    parts = [FILE_HEADER.pack(MAGIC, 2, 4, 0, 262144, LINK_TYPE_IFX)]
    for serial in range(1, messages + 1):
        body = message(LIFE_PLACE, serial, 0)
        seconds, fraction = divmod(round(serial * interval * 1_000_000), 1_000_000)
        length = len(body)
        parts.append(RECORD_HEADER.pack(FIRST_SECOND + seconds, fraction, length, length))
        parts.append(body)
    return b"".join(parts)


def write_source(path, life, messages, interval):
    contents = _source_bytes(messages, interval)
    path.write_bytes(contents.replace(LIFE_PLACE, b"%08d" % life))


def feed_stream(stream, interval, padding):
    """Writes messages as a framed stream, `interval` seconds apart, until nobody reads them."""
    with contextlib.suppress(OSError, ValueError):
        for serial in itertools.count(1):
            body = message(b"%08d" % 1, serial, padding)
            stream.write(struct.pack("<I", len(body)) + body)
            stream.flush()
            time.sleep(interval)


class Recording:
    """A growing capture, read as it grows. Messages in it must come in order, none twice; they form
    stretches without a gap, one for each connection."""

    def __init__(self, name):
        self.name = name
        self.count = 0
        self.stretches = []  # [life, first serial, last serial]
        self.times = []  # of the records, when kept
        self.keeps_times = False
        self._unread = b""
        self._has_header = False

    def feed(self, data):
        """Takes the next bytes of the capture; the rest of a record may follow later."""
        self._unread += data
        if not self._has_header and len(self._unread) >= FILE_HEADER.size:
            require(
                FILE_HEADER.unpack_from(self._unread)[0] == MAGIC, f"{self.name} is a capture"
            )
            self._has_header = True
            self._unread = self._unread[FILE_HEADER.size :]
        offset = 0
        while self._has_header and len(self._unread) - offset >= RECORD_HEADER.size:
            seconds, fraction, length, _ = RECORD_HEADER.unpack_from(self._unread, offset)
            end = offset + RECORD_HEADER.size + length
            if end > len(self._unread):
                break
            if self.keeps_times:
                self.times.append(seconds + fraction / 1_000_000)
            self._take(self._unread[offset + RECORD_HEADER.size : end])
            offset = end
        self._unread = self._unread[offset:]

    def _take(self, message):
        numbers = NUMBERS.search(message)
        require(numbers is not None, f"{self.name} holds what the source has")
        life, serial = int(numbers[1]), int(numbers[2])
        self.count += 1
        if self.stretches:
            last = self.stretches[-1]
            if (life, serial) == (last[0], last[2] + 1):
                last[2] = serial
                return
            require(
                (life, serial) > (last[0], last[2]),
                f"{self.name} has each once, in order ({life}/{serial} after {last[0]}/{last[2]})",
            )
        self.stretches.append([life, serial, serial])

    @property
    def unread_bytes(self):
        """What follows the last whole record."""
        return len(self._unread)

    def last_of(self, life):
        """The last serial number of a life; 0 when it has none."""
        return max((last for number, _, last in self.stretches if number == life), default=0)

    def stretches_of(self, life):
        return sum(1 for number, _, _ in self.stretches if number == life)
