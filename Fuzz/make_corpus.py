#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Makes seeds for the harnesses out of recordings: make_corpus.py TECHNOLOGY=CAPTURE...

Each recording (kestro-cli record) yields seeds for the generator, the template and the capture
harness of its technology: a few messages each, of every length and log code that occurs."""

import pathlib
import struct
import sys

FUZZ = pathlib.Path(__file__).parent
TEMPLATES = {
    "LTE": "LTE",
    "Ondrel_GSM": "Ondrel_GSM",
    "UTRAN2": "UTRAN",
    "Ondrel_CDMA": "C2KTemplate",
}
KINDS = 40  # of messages, per technology


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


def make(technology, capture):
    kinds = [message for message in kinds_of(messages_of(capture)) if len(message) < 2048]
    for number, message in enumerate(kinds):
        write(f"GeneratorFuzz_{technology}", f"message-{number:02}",
              b"\x00\x00" + framed(message))
    everything = b"".join(b"\x00" + framed(message) for message in kinds)
    write(f"GeneratorFuzz_{technology}", "drive", b"\x00" + everything + b"\x0c\x0d\x0e" + everything)
    write(f"GeneratorFuzz_{technology}", "unbound", b"\x03" + everything)
    if technology in TEMPLATES:
        template = (FUZZ.parent / "Resources" / f"{TEMPLATES[technology]}.plist").read_bytes()
        short = [message for message in kinds if len(message) < 512][:8]
        write(f"TemplateFuzz_{technology}", "own",
              framed(template) + b"".join(framed(message) for message in short))
    head = pathlib.Path(capture).read_bytes()[:24]
    records = b"".join(struct.pack("<IIII", 1, 2, len(message), len(message)) + message
                       for message in kinds[:3])
    write("CaptureFuzz", technology, head + records)
    write("StreamFuzz", technology,
          b"\xff" + b"".join(struct.pack("<I", len(message)) + message for message in kinds[:3]))


if __name__ == "__main__":
    for argument in sys.argv[1:]:
        make(*argument.split("=", 1))
