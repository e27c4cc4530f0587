#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Times `kestro-cli decode` on long IFX captures, and shows that its memory does not grow with them.

    Benchmarks/decode_recording.py build/release/bin/kestro-cli [--messages=200000]

Makes two captures, one a tenth as long as the other, decodes both in each format and prints
messages a second and peak memory. The exit status is 1 when an answer is wrong, or when the longer
capture takes noticeably more memory.
"""

import argparse
import json
import os
import pathlib
import plistlib
import struct
import subprocess
import sys
import tempfile
import time

PCAP_MAGIC = 0xA1B2C3D4
LINK_TYPE_IFX = 147
SNAPSHOT_LENGTH = 262144
MESSAGES_A_SECOND = 10
DIFFERENT_MESSAGES = 100

# What an allocator may keep here and there; a capture of messages would be hundreds of times that.
ALLOWED_GROWTH_KIB = 1024

FORMATS = {
    "tree": ["--format=tree"],
    "json": ["--format=json"],
    "ndjson": ["--format=ndjson"],
    "ndjson, every message": ["--format=ndjson", "--refresh-every=0"],
    "csv": ["--format=csv"],
}


def display_list(count):
    """A message as the channel has it: the first element of every array is a header."""
    cells = [
        {"ARFCN": str(60 + i), "BSIC": f"{i}-{count % 8}", "RxLev": f"-{60 + (count + i) % 50} dBm"}
        for i in range(6)
    ]
    return {
        "Mode": {"Radio Access": "GSM", "Band": "900", "State": "Dedicated"},
        "Serving Cell": {"MCC": "001", "MNC": "01", "LAC": "602", "Cell ID": str(20000 + count)},
        "Radio Quality": {"RxLev": f"-{60 + count % 50} dBm", "RxQual": str(count % 8)},
        "Neighbours": ["Neighbours", *cells],
        "Count": str(count),
    }


def write_capture(path, messages, encoding):
    bodies = [
        plistlib.dumps(display_list(i), fmt=encoding, sort_keys=False)
        for i in range(DIFFERENT_MESSAGES)
    ]
    with open(path, "wb") as capture:
        capture.write(
            struct.pack("<IHHiIII", PCAP_MAGIC, 2, 4, 0, 0, SNAPSHOT_LENGTH, LINK_TYPE_IFX)
        )
        for i in range(messages):
            body = bodies[i % DIFFERENT_MESSAGES]
            second, part = divmod(i, MESSAGES_A_SECOND)
            microseconds = part * (1_000_000 // MESSAGES_A_SECOND)
            capture.write(
                struct.pack("<IIII", 1330862709 + second, microseconds, len(body), len(body))
            )
            capture.write(body)


def check_answer(program, capture, messages):
    result = json.loads(
        subprocess.run(
            [program, "decode", capture, "--format=json"], check=True, capture_output=True
        ).stdout
    )
    last = (messages - 1) % DIFFERENT_MESSAGES
    if result["messages"] != messages or result["display"]["Count"] != str(last):
        sys.exit(f"wrong answer: {result['messages']} messages, the last {result['display']}")


def measure(program, capture, options):
    """Seconds and peak KiB of one run."""
    start = time.monotonic()
    with open(os.devnull, "wb") as nowhere:
        child = subprocess.Popen([program, "decode", capture, *options], stdout=nowhere)
        _, status, usage = os.wait4(child.pid, 0)
        child.returncode = os.waitstatus_to_exitcode(status)
    if child.returncode != 0:
        sys.exit(f"decode ended with {child.returncode}")
    return time.monotonic() - start, usage.ru_maxrss


def run(program, messages, encoding_name, encoding, folder):
    lengths = (messages // 10, messages)
    captures = [str(folder / f"{length}.pcap") for length in lengths]
    for capture, length in zip(captures, lengths):
        write_capture(capture, length, encoding)
        check_answer(program, capture, length)
    grows = False
    for name, options in FORMATS.items():
        (_, short_peak), (seconds, peak) = (measure(program, c, options) for c in captures)
        grew = peak > short_peak + ALLOWED_GROWTH_KIB
        grows = grows or grew
        print(
            f"{encoding_name:7} {name:22} {messages / seconds:10,.0f} messages/s"
            f"  peak {short_peak / 1024:6.1f} MiB at {lengths[0]:,},"
            f" {peak / 1024:6.1f} MiB at {lengths[1]:,}{'  GROWS' if grew else ''}",
            flush=True,
        )
    return not grows


def main():
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("program", help="kestro-cli, of a release build")
    parser.add_argument("--messages", type=int, default=200_000, help="in the longer capture")
    arguments = parser.parse_args()
    with tempfile.TemporaryDirectory() as folder:
        outcomes = [
            run(arguments.program, arguments.messages, name, encoding, pathlib.Path(folder))
            for name, encoding in (("XML", plistlib.FMT_XML), ("binary", plistlib.FMT_BINARY))
        ]
    sys.exit(0 if all(outcomes) else 1)


if __name__ == "__main__":
    main()
