# SPDX-License-Identifier: MIT
"""Packets at the edges of what decoders read: of every length, of every byte, with counts that lie,
and captures of them."""

import random
import struct

HEADER_SIZE = 13
EXTRA_CODES = 0xFF0000


def message(code, payload, kind=None, prefix=b""):
    """A packet of a log code; the length in its header is right."""
    is_extra = code >= EXTRA_CODES
    kind = (0xFF if is_extra else 1) if kind is None else kind
    header = struct.pack("<BHHQ", kind, (12 + len(payload)) & 0xFFFF, code & 0xFFFF, 1_330_862_709_000_000)
    return prefix + header + payload


def capture(link_type, messages):
    """A pcap file."""
    parts = [struct.pack("<IHHQII", 0xA1B2C3D4, 2, 4, 0, 262144, link_type)]
    for number, body in enumerate(messages):
        parts.append(struct.pack("<IIII", 1_330_862_709, number % 1_000_000, len(body), len(body)) + body)
    return b"".join(parts)


def sub_packets(random_bytes, identifiers, claimed=None):
    """A payload of sub-packets, each of 4 bytes and what random_bytes() yields."""
    parts = []
    for identifier in identifiers:
        body = random_bytes()
        parts.append(struct.pack("<BBH", identifier, 0, 4 + len(body)) + body)
    count = len(identifiers) if claimed is None else claimed
    return b"\0" + bytes([count]) + b"\0\0" + b"".join(parts)


class Edges:
    """The edge packets of one technology, by what `codes --format=json` says; the same every time."""

    def __init__(self, technology, seed=1):
        self._codes = [
            (int(code["code"], 16), code["minimumLength"]) for code in technology["codes"]
        ]
        self._extents = [
            (int(code["code"], 16), requirement)
            for code in technology["codes"] for readings in code["takers"]
            for reading in readings for requirement in reading["requirements"]
            if requirement["kind"] in ("holdsRecords", "endsWithRecords")
        ]
        self._random = random.Random(seed)

    def bytes(self, count):
        return self._random.randbytes(count)

    def _small(self, count):
        """Bytes of small numbers, as counts are."""
        return bytes(self._random.choice((0, 0, 1, 1, 2, 3, 5, 8)) for _ in range(count))

    def every_length(self):
        """From no byte to beyond the least length and the first record; of long packets only some
        lengths."""
        for code, least in self._codes:
            lengths = list(range(0, least - HEADER_SIZE + 30))
            if len(lengths) > 100:
                lengths = lengths[:15] + lengths[-50::7]
            for length in lengths:
                fill = self.bytes if length % 7 == 0 else self._small
                yield message(code, fill(length))
        for length in range(HEADER_SIZE + 4):
            yield message(self._codes[0][0], b"\1\2\3\4")[:length]
            yield b"\x81\0" + message(self._codes[0][0], b"\1\2\3\4")[:length]

    def fillings(self):
        """All bits clear, all set, and small numbers, with room for all records and without."""
        for code, least in self._codes:
            size = max(least - HEADER_SIZE, 0)
            yield message(code, bytes(size + 7))
            yield message(code, b"\xff" * size)
            for payload in (b"\xff" * (size + 700), self._small(size + 700), self._small(size + 70)):
                yield message(code, payload)

    def odd_frames(self):
        """Unknown codes and types, prefixes, property lists that are none."""
        for kind in (0, 1, 2, 0x81, 0xFF):
            yield message(self._codes[0][0], self.bytes(60), kind=kind)
            yield message(0x1234, self.bytes(20), kind=kind)
        for code, least in self._codes:
            yield message(code, self.bytes(least + 20), prefix=b"\x81\0")
            yield message(code | EXTRA_CODES, b"bplist00" + self.bytes(30))
            yield message(code | EXTRA_CODES, b"<plist version='1.0'>\n<dict/>\xff\n</plist>\n")
            yield message(code | EXTRA_CODES, b"")

    def fitting(self):
        """Packets that are exactly as long as the records that they must hold, and almost so."""
        for code, extent in self._extents:
            for count in range(7):
                length = extent["base"] + extent["stride"] * count
                for fill in (self.bytes, self._small):
                    packet = bytearray(message(code, fill(length - HEADER_SIZE)))
                    packet[extent["count"]["offset"]] = count
                    yield bytes(packet)
                    yield bytes(packet)[:-1]
                    yield bytes(packet) + b"\0"

    def with_sub_packets(self, code):
        """Sub-packets in order, out of order, missing, too long, and more than there are."""
        for identifiers in ((1, 2, 3, 4), (4, 3, 2, 1), (9, 1, 2, 3, 4, 11), (1, 2), (11,), ()):
            for size in (0, 6, 30, 90):
                fill = lambda: self._small(size)
                yield message(code, sub_packets(fill, identifiers))
                yield message(code, sub_packets(lambda: self.bytes(size), identifiers))
                yield message(code, sub_packets(fill, identifiers, claimed=255))
                yield message(code, sub_packets(fill, identifiers)[: 20 + size])
        # The last one may reach 16 bytes past the end, and no further.
        for cut in (1, 16, 17, 18, 50):
            yield message(code, sub_packets(lambda: self._small(60), (1, 2, 3, 4))[:-cut])
            yield message(code, sub_packets(lambda: self._small(60), (1, 11))[:-cut])

    def random(self):
        """Without end: packets of random codes, lengths and bytes."""
        while True:
            code, least = self._random.choice(self._codes)
            size = max(least - HEADER_SIZE, 0) + self._random.choice((0, 1, 5, 40, 200, 600))
            if code >= EXTRA_CODES:
                size = 10
            if self._random.random() < 0.2:
                size = self._random.randrange(size + 1)
            fill = self._random.choice((self.bytes, self._small))
            if code in (0x119C, 0x119D):
                yield message(code, sub_packets(lambda: fill(self._random.randrange(80)),
                                                self._random.choices(range(1, 13), k=6)))
                continue
            yield message(code, fill(size))

    def all(self):
        yield from self.every_length()
        yield from self.fillings()
        yield from self.odd_frames()
        yield from self.fitting()
        for code, _ in self._codes:
            if code in (0x119C, 0x119D):
                yield from self.with_sub_packets(code)
