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
    for form in (plistlib.FMT_XML, plistlib.FMT_BINARY):
        lines = plistlib.dumps(snapshot, fmt=form, sort_keys=False).split(b"\n")
        lines = [line for line in lines if not line.startswith(b"<!DOCTYPE")]
        write("SnapshotFuzz", f"{technology}-{form.name[4:].lower()}", b"\n".join(lines))


def make_recordings(technology, kinds):
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
    for argument in sys.argv[1:]:
        make(*argument.split("=", 1))
