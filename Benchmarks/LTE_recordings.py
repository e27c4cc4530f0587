# SPDX-License-Identifier: MIT
"""Makes captures for comparisons: LTE messages as a drive's channel has them, and LTE measurement
reports as other analysers read them (GSMTAP in UDP)."""

import struct

PCAP_MAGIC = 0xA1B2C3D4
SNAPSHOT_LENGTH = 262144
LINK_TYPE_LTE = 150
LINK_TYPE_IPV4 = 228
MESSAGES_A_SECOND = 100
START = 1330862709
HEADER_SIZE = 13


class Draw:
    """Numbers that look drawn, the same in every run."""

    def __init__(self):
        self._state = 20120304

    def __call__(self, lowest, highest):
        self._state = (self._state * 6364136223846793005 + 1442695040888963407) % 2**64
        return lowest + (self._state >> 33) % (highest - lowest + 1)


def _packet(code, length):
    packet = bytearray(length)
    struct.pack_into("<BHH", packet, 0, 1, length - 1, code)
    return packet


def serving_cell_measurement(draw):
    """0xB17F."""
    packet = _packet(0xB17F, 33)
    rsrp, rsrq = draw(160, 240), draw(60, 100)
    struct.pack_into("<B3xHH", packet, 13, 1, 1300, draw(0, 503) | 6 << 9)
    struct.pack_into("<I", packet, 21, rsrp | rsrp + 1 << 9 | rsrq << 18 | rsrq - 1 << 25)
    struct.pack_into("<I", packet, 25, draw(100, 200) | 9 << 9 | 53 << 15 | 53 << 22)
    struct.pack_into("<I", packet, 29, draw(20, 80) | 23 << 13 | 7 << 19 | 1 << 26)
    return packet


def intra_frequency_measurement(draw):
    """0xB179 with four measured neighbours and two detected cells."""
    packet = _packet(0xB179, 57)
    struct.pack_into("<5H2B", packet, 17, 1300, 59, draw(0, 10239), draw(160, 240), draw(60, 100), 4, 2)
    for i in range(4):
        struct.pack_into("<3H", packet, 29 + 6 * i, draw(0, 503), draw(100, 220), draw(40, 100))
    struct.pack_into("<2H", packet, 53, draw(0, 503), draw(0, 503))
    return packet


def neighbour_measurements(draw):
    """0xB180 with four records."""
    packet = _packet(0xB180, 101)
    struct.pack_into("<B3xHH", packet, 13, 1, 1300, 9 | 3 << 6)
    for i in range(4):
        place = 21 + 20 * i
        rsrp, rsrq = draw(40, 120), draw(50, 100)
        struct.pack_into("<IHHHH", packet, place, draw(0, 503) | draw(60, 160) << 9 | rsrp << 17,
                         rsrp | rsrq << 9, rsrq | draw(20, 60) << 7, draw(0, 300), 0)
        struct.pack_into("<I", packet, place + 12, draw(0, 1023) | draw(0, 307199) << 11)
    return packet


def system_information(draw):
    """0xB0C2."""
    packet = _packet(0xB0C2, 38)
    struct.pack_into("<3H2BIHI", packet, 14, draw(0, 503), 1300, 19300, 100, 100,
                     draw(0, 2**28 - 1), 602, 3)
    return packet


# Of twenty messages.
MIX = (
    7 * (serving_cell_measurement,)
    + 6 * (intra_frequency_measurement,)
    + 6 * (neighbour_measurements,)
    + (system_information,)
)
STRIDE = 7  # goes through the mix so that kinds take turns


def _write(path, link_type, bodies):
    with open(path, "wb", buffering=2**20) as capture:
        capture.write(struct.pack("<IHHiIII", PCAP_MAGIC, 2, 4, 0, 0, SNAPSHOT_LENGTH, link_type))
        for i, body in enumerate(bodies):
            second, part = divmod(i, MESSAGES_A_SECOND)
            capture.write(struct.pack("<IIII", START + second, part * 10_000, len(body), len(body)))
            capture.write(body)


def write_lte(path, messages):
    """Returns the capture's last cell identity and RSRP text, as a display shows them."""
    draw = Draw()
    last = {}

    def bodies():
        for i in range(messages):
            make = MIX[i * STRIDE % len(MIX)]
            body = make(draw)
            last[make] = body
            yield body

    _write(path, LINK_TYPE_LTE, bodies())
    identity = struct.unpack_from("<I", last[system_information], 22)[0]
    measured = struct.unpack_from("<I", last[serving_cell_measurement], 21)[0] & 0x1FF
    return {"Cell Identity": str(identity), "Measured RSRP": f"{measured * 0.25 - 140:.2f} dBm"}


class Bits:
    """Unaligned packed encoding."""

    def __init__(self):
        self._bits = ""

    def put(self, value, width):
        self._bits += format(value, f"0{width}b")
        return self

    def bytes(self):
        padded = self._bits + "0" * (-len(self._bits) % 8)
        return int(padded, 2).to_bytes(len(padded) // 8, "big")


def measurement_report(rsrp, rsrq, neighbours):
    """An RRC MeasurementReport on the uplink's dedicated channel: the serving cell's levels and
    those of E-UTRA neighbours (cell, RSRP, RSRQ)."""
    bits = Bits().put(0, 1).put(1, 4)  # the message: a measurement report
    bits.put(0, 1).put(0, 3).put(0, 1)  # release 8, no later extension
    bits.put(0, 1).put(1, 1).put(0, 5).put(rsrp, 7).put(rsrq, 6)  # neighbours follow
    bits.put(0, 1).put(0, 2).put(len(neighbours) - 1, 3)  # a list of E-UTRA cells
    for cell, level, quality in neighbours:
        bits.put(0, 1).put(cell, 9).put(0, 1).put(3, 2).put(level, 7).put(quality, 6)
    return bits.bytes()


def gsmtap(arfcn, payload):
    """A GSMTAP version 2 frame with LTE RRC of the uplink's dedicated channel, in UDP over IPv4."""
    lte_rrc, uplink_dedicated, port = 0x0D, 3, 4729
    frame = struct.pack(">BBBBHbbIBBBB", 2, 4, lte_rrc, 0, arfcn | 0x4000, 0, 0, 0,
                        uplink_dedicated, 0, 0, 0) + payload
    udp = struct.pack(">HHHH", port, port, 8 + len(frame), 0) + frame
    ip = struct.pack(">BBHHHBBH4s4s", 0x45, 0, 20 + len(udp), 0, 0, 64, 17, 0,
                     bytes([127, 0, 0, 1]), bytes([127, 0, 0, 1]))
    return ip + udp


def write_reports(path, messages):
    """Returns what the last report's fields must be: ARFCN and the RSRP results, in order."""
    draw = Draw()
    last = []

    def bodies():
        for _ in range(messages):
            levels = [draw(20, 90) for _ in range(5)]
            neighbours = [(draw(0, 503), level, draw(5, 30)) for level in levels[1:]]
            last[:] = levels
            yield gsmtap(1300, measurement_report(levels[0], draw(5, 30), neighbours))

    _write(path, LINK_TYPE_IPV4, bodies())
    return {"arfcn": "1300", "rsrp": [str(level) for level in last]}
