# SPDX-License-Identifier: MIT
"""Reads DLF logs, made from Documentation/snapshots.md alone."""
import struct

REPORT = struct.Struct("<HHQHH7s40s34sIhH56s")


def text(field):
    return field[: field.index(0)].decode("ascii")


def version_report(log):
    """The fields of the record that every log begins with."""
    (length, code, timestamp, first, second, version, executable, built, seconds, zone, daylight,
     reserved) = REPORT.unpack_from(log)
    assert (length, code, timestamp, first, second) == (161, 0x1FFD, 0, 1, 1), log[:16]
    assert reserved == bytes(56), reserved
    return {"version": text(version), "executable": text(executable), "built": text(built),
            "seconds": seconds, "zone": zone, "daylight": daylight}


def records(log):
    """Yields every record of a log in which all packets frame, as (code, time, payload)."""
    while log:
        length, code, time = struct.unpack_from("<HHQ", log)
        assert 12 <= length <= len(log), (length, len(log))
        yield code, time, log[12:length]
        log = log[length:]
