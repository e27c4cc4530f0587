#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Makes seeds for the harnesses out of recordings: make_corpus.py TECHNOLOGY=CAPTURE...

Each recording (kestro-cli record) yields seeds for the harnesses of its technology and for those of
recordings and snapshots: a few messages each, of every length and log code that occurs."""

import pathlib
import plistlib
import random
import struct
import sys

FUZZ = pathlib.Path(__file__).parent
TEMPLATES = {
    "LTE": "LTE",
    "Ondrel_GSM": "Ondrel_GSM",
    "UTRAN2": "UTRAN",
    "Ondrel_CDMA": "C2KTemplate",
}
WORDS = {"IFX": "IFX", "Ondrel_GSM": "GsmUmts", "Ondrel_CDMA": "C2K", "LTE": "LTE",
         "UTRAN2": "UTRAN"}
TECHNOLOGIES = ["IFX", "Ondrel_GSM", "Ondrel_CDMA", "LTE", "UTRAN2"]  # as the program lists them
KINDS = 40  # of messages, per technology
# Payloads on both sides of every minimum length, for each of the plain reader's codes.
LENGTHS = {"LTE": (9, range(27)), "Ondrel_GSM": (28, range(21)), "UTRAN2": (8, range(15)),
           "Ondrel_CDMA": (8, (3, 4, 9, 10, 11, 12, 13, 36, 37, 38, 157, 158, 227, 228))}
# Payloads long enough for some records of every table, of all kinds of bytes.
RANDOM_LENGTHS = {"LTE": (300, 300), "Ondrel_GSM": (52, 150), "UTRAN2": (450, 450),
                  "Ondrel_CDMA": (52, 300)}
COUNTERS = {"Ondrel_CDMA": (2, 6)}  # codes whose packets are longer still
RULES = b"""# of all kinds
Measured RSRP < -100 dBm for 1 s
RSCP >= -90 dB
"Neighboring Cells/RSSI" != 12 # each
Rx 0 AGC > -200
RSSI == 20 for 0.5 s
"""
SECOND, REFRESH, WHOLE_MESSAGE = b"\x0a", b"\xff", b"\xfe"


def messages_of(capture):
    data = pathlib.Path(capture).read_bytes()
    offset = 24
    while offset + 16 <= len(data):
        length = struct.unpack_from("<I", data, offset + 8)[0]
        yield data[offset + 16 : offset + 16 + length]
        offset += 16 + length


def kinds_of(messages):
    """One message of each code and rough length."""
    found = {}
    for message in messages:
        found.setdefault((message[:1], message[3:5], len(message) // 64), message)
    return list(found.values())[:KINDS]


def framed(message):
    return struct.pack("<H", len(message)) + message


def write(target, name, contents):
    folder = FUZZ / "Corpus" / target
    folder.mkdir(parents=True, exist_ok=True)
    (folder / name).write_bytes(contents)


def make_comparison(technology, kinds):
    for number, message in enumerate(kinds):
        write(f"DifferentialFuzz_{WORDS[technology]}", f"message-{number:02}",
              WHOLE_MESSAGE + framed(message))
    drive = b"".join(WHOLE_MESSAGE + framed(message) for message in kinds[:12])
    write(f"DifferentialFuzz_{WORDS[technology]}", "drive", drive + REFRESH + drive + REFRESH)
    write(f"DifferentialFuzz_{WORDS[technology]}", "cut",
          b"".join(WHOLE_MESSAGE + framed(message[:-1]) for message in kinds[:12]))
    codes, lengths = LENGTHS[technology]
    for count in (0, 1, 2):  # of records, wherever it stands
        payload = bytes(count if i < 16 else 37 * i % 251 for i in range(2000))
        write(f"DifferentialFuzz_{WORDS[technology]}", f"lengths-{count}",
              b"".join(bytes([code]) + framed(payload[:length])
                       for code in range(codes) for length in lengths))


def make_identities():
    """Lists of cells' identities, an empty one too, and measurements of those cells."""
    identities, measurements = bytes([11]), bytes([7])
    cells = bytes([0, 2]) + struct.pack("<HBxHBx", 700, 52, 710, 53)
    levels = bytes(15) + bytes([3]) + b"".join(
        struct.pack("<HBI7x", channel, 60, 20) for channel in (700, 710, 720))
    steps = [identities + framed(cells), measurements + framed(levels), REFRESH,
             identities + framed(b"\x00"), measurements + framed(levels),
             identities + framed(b"\x00\x00"), measurements + framed(levels)]
    write("DifferentialFuzz_GsmUmts", "identities", b"".join(steps))


def random_payload(numbers, length):
    """Counts stand in front, and small ones leave room for what they count."""
    return bytes(numbers.randrange(5) if i < 16 and numbers.random() < 0.8
                 else numbers.randrange(256) for i in range(length))


def make_random(technology):
    codes = LENGTHS[technology][0]
    for number in range(3):
        numbers = random.Random(number)
        steps = []
        for code in range(codes):
            for step, length in enumerate(RANDOM_LENGTHS[technology]):
                payload = random_payload(numbers, length)
                if code in COUNTERS.get(technology, ()):
                    # As short as may be, behind a sequence number that grows.
                    payload = bytes([0, step, 0, 0, 0]) + random_payload(numbers, 1732)
                steps.append(bytes([code]) + framed(payload))
        write(f"DifferentialFuzz_{WORDS[technology]}", f"random-{number}", b"".join(steps))


def dlf_of(entries):
    """A version report of zeros, then every entry without its first byte."""
    return bytes(161) + b"".join(entry[1:] for entry in entries)


def make_logs(technology, entries):
    write("DlfFuzz", technology,
          bytes([len(entries)]) + b"".join(framed(entry) for entry in entries) + dlf_of(entries))
    history = [{"DisplayState": entry, "Display": {"Section": ["row", {"key": "value"}]},
                "ExtraInfo": {}, "Date": "2012-03-04 13:05:09 +0100", "Description": "Snapshot"}
               for entry in entries]
    log = {"Description": "DLF binary", "DLF": dlf_of(entries)}
    snapshot = {"Timestamp": "2012-03-04 13:05:09 +0100", "Data": [*history, log],
                "Description": "drive"}
    for form in (plistlib.FMT_BINARY, plistlib.FMT_XML):
        lines = plistlib.dumps(snapshot, fmt=form, sort_keys=False).split(b"\n")
        lines = [line for line in lines if not line.startswith(b"<!DOCTYPE")]
        file = b"\n".join(lines)
        write("SnapshotFuzz", f"{technology}-{form.name[4:].lower()}", file)
    make_other_recordings(technology, entries, file)


def block(order, kind, body):
    length = struct.pack(order + "I", 12 + len(body))
    return struct.pack(order + "I", kind) + length + body + length


def option(order, code, value):
    return struct.pack(order + "HH", code, len(value)) + value + bytes(-len(value) % 4)


def section(order, *comments):
    body = struct.pack(order + "IHHq", 0x1A2B3C4D, 1, 0, -1)
    return block(order, 0x0A0D0D0A, body + b"".join(option(order, 1, text) for text in comments))


def interface(order, link_type, longest, *options):
    body = struct.pack(order + "HHI", link_type, 0, longest)
    return block(order, 1, body + b"".join(option(order, *each) for each in options))


def packet(order, number, time, data, *options):
    body = struct.pack(order + "IIIII", number, time >> 32, time & 0xFFFFFFFF, len(data), len(data))
    body += data + bytes(-len(data) % 4)
    return block(order, 6, body + b"".join(option(order, *each) for each in options))


def make_pcapng():
    """Sections in both byte orders, times of many resolutions, every kind of packet and comment."""
    for name, order in (("little", "<"), ("big", ">")):
        first = section(order) + interface(order, 150, 262144, (2, b"LTE"), (9, b"\x06"))
        packets = (packet(order, 0, 1_330_862_709_000_250, b"abc", (1, b"note"), (0, b""))
                   + packet(order, 0, 1_330_862_710_000_250, b"de"))
        write("PcapngFuzz", name, first + packets)
        write("PcapngFuzz", f"{name}-simple", first + packets
              + block(order, 3, struct.pack(order + "I", 5) + b"fghij\0\0\0")
              + block(order, 2, struct.pack(order + "HHIIII", 0, 0, 0, 9, 1, 4) + b"k\0\0\0"))
        write("PcapngFuzz", f"{name}-other", first + block(order, 5, b"\0\0\0\0") + packets
              + interface(order, 1, 0) + packet(order, 1, 3, b"ethernet") + packets)
        write("PcapngFuzz", f"{name}-sections", section(order, b"made-up: simulation")
              + interface(order, 147, 0) + packet(order, 0, 1, b"a") + section(order, b"last"))
        for resolution in (0, 3, 7, 9, 12, 19, 127, 0x80, 0x81, 0x94, 0xA0, 0xBF, 0xFF):
            times = ((9, bytes([resolution])), (14, struct.pack(order + "q", 1000)))
            write("PcapngFuzz", f"{name}-times-{resolution:02x}",
                  section(order) + interface(order, 150, 0, *times)
                  + packet(order, 0, 1_330_862_709, b"a") + packet(order, 0, 1 << 63, b"b"))


def make_other_recordings(technology, entries, snapshot):
    """A log as it is exported and one of whole records, and a snapshot of the same packets."""
    report = b"\xa1\x00\xfd\x1f" + bytes(157)
    write("RecordingFuzz", f"{technology}-exported", report + dlf_of(entries)[161:])
    records = b"".join(entry[1:] for entry in entries[1:])
    write("RecordingFuzz", f"{technology}-reframed", report + records)
    write("RecordingFuzz", f"{technology}-snapshot", snapshot)


def make_drives(technology, kinds):
    """Every kind of message, a second apart; of a drive-test log, and with the clock set back."""
    index = TECHNOLOGIES.index(technology)
    for name, choice, step in (("drive", index, 10), ("log", index | 0x80, 60), ("back", index, 255)):
        write("DriveFuzz", f"{technology}-{name}", framed(RULES)
              + b"".join(bytes([choice, step]) + framed(message) for message in 2 * kinds[:12]))


def make_alarms():
    """An LTE level that goes up and down around the limit of a rule, at once and for long."""
    def level(quarters):
        return (b"\x01" + struct.pack("<HHQ", 32, 0xB17F, 0)
                + struct.pack("<B3xHHI8x", 1, 1300, 14, quarters))
    drive = b"".join(bytes([3, step]) + framed(level(quarters))
                     for step, quarters in ((5, 100), (5, 200), (5, 100), (9, 100), (9, 100), (5, 200),
                                            (5, 100), (99, 100), (5, 200)))
    write("DriveFuzz", "alarms", framed(RULES) + drive)


def make_recordings(technology, kinds):
    make_drives(technology, kinds)
    write("ReplayFuzz", technology,
          bytes([TECHNOLOGIES.index(technology)])
          + b"".join(SECOND + framed(message) for message in kinds[:12]))
    if technology in TEMPLATES:
        make_comparison(technology, kinds)
        make_random(technology)
    if technology == "Ondrel_GSM":
        make_identities()
        make_logs(technology, [b"".join(kinds[:3]), kinds[3] if len(kinds) > 3 else b"", b"\x01"])


def make(technology, capture):
    kinds = [message for message in kinds_of(messages_of(capture)) if len(message) < 2048]
    make_recordings(technology, kinds)
    for number, message in enumerate(kinds):
        write(f"GeneratorFuzz_{WORDS[technology]}", f"message-{number:02}",
              b"\x00\x00" + framed(message))
    everything = b"".join(b"\x00" + framed(message) for message in kinds)
    write(f"GeneratorFuzz_{WORDS[technology]}", "drive", b"\x00" + everything + b"\x0c\x0d\x0e" + everything)
    write(f"GeneratorFuzz_{WORDS[technology]}", "unbound", b"\x03" + everything)
    if technology in TEMPLATES:
        template = (FUZZ.parent / "Resources" / f"{TEMPLATES[technology]}.plist").read_bytes()
        short = [message for message in kinds if len(message) < 512][:8]
        write(f"TemplateFuzz_{WORDS[technology]}", "own",
              framed(template) + b"".join(framed(message) for message in short))
    head = pathlib.Path(capture).read_bytes()[:24]
    records = b"".join(struct.pack("<IIII", 1, 2, len(message), len(message)) + message
                       for message in kinds[:3])
    write("RecordingFuzz", technology, head + records)
    write("StreamFuzz", technology,
          b"\xff" + b"".join(struct.pack("<I", len(message)) + message for message in kinds[:3]))


if __name__ == "__main__":
    make_pcapng()
    make_alarms()
    for argument in sys.argv[1:]:
        make(*argument.split("=", 1))
