# SPDX-License-Identifier: MIT
"""Which property lists Kestro and Python's plistlib read, and where they differ.

Documentation/property-lists.md says the same in words. The program is found through $KESTRO_CLI: a
capture's IFX messages are property lists, and it names those that it cannot parse."""

import json
import os
import pathlib
import plistlib
import re
import struct
import subprocess
import tempfile
import unittest

IFX_LINK_TYPE = 147
DECLARATION = "<?xml version='1.0'?>"


def xml(element):
    """A list in UTF-8 around the elements of its value."""
    return f"{DECLARATION}<plist version='1.0'>{element}</plist>".encode()


def declared(encoding, text):
    return f"<?xml version='1.0' encoding='{encoding}'?>{text}"


def binary_array(count):
    """A binary list: an array of one boolean, `count` times."""
    array = b"\xaf\x12" + struct.pack(">I", count) + b"\x01" * count
    boolean_at = 8 + len(array)
    offsets = struct.pack(">II", 8, boolean_at)
    trailer = struct.pack(">6xBBQQQ", 4, 1, 2, 0, boolean_at + 1)
    return b"bplist00" + array + b"\x09" + offsets + trailer


READ_BY_BOTH = {
    "leading zeros": xml("<integer>-0012</integer>"),
    "blanks around a number": xml("<integer>\n 5\t</integer>"),
    "hexadecimal": xml("<integer>0x1F</integer>"),
    "64 bits": xml("<integer>18446744073709551615</integer>"),
    "the first year": xml("<date>0001-01-01T00:00:00Z</date>"),
    "the last year": xml("<date>9999-12-31T23:59:59Z</date>"),
    "the first year, binary": plistlib.dumps(
        plistlib.loads(xml("<date>0001-01-01T00:00:00Z</date>")), fmt=plistlib.FMT_BINARY
    ),
    "UTF-16": declared("UTF-16", "<plist><string>\u00e9</string></plist>").encode("utf-16"),
    "UTF-16 without a declaration": "<plist><true/></plist>".encode("utf-16"),
    "ISO-8859-1": declared("ISO-8859-1", "<plist><string>\u00e9</string></plist>").encode("latin1"),
    "a bare root": f"{DECLARATION}\n<!-- c --><array><true/></array>".encode(),
    "a key twice": xml("<dict><key>a</key><true/><key>a</key><false/></dict>"),
    "200,000 nodes": binary_array(199_999),
    "no number": xml("<real>nan</real>"),
}

READ_BY_KESTRO_ALONE = {
    "blanks before the list": b" " + xml("<true/>"),
    "a hexadecimal with a sign": xml("<integer>-0x10</integer>"),
    "UTF-16 without a byte-order mark": declared("UTF-16", "<true/>").encode("utf-16-be"),
}

READ_BY_PYTHON_ALONE = {
    "digits in groups": xml("<integer>1_000</integer>"),
    "other scripts' digits": xml("<integer>\u0663</integer>"),
    "a capital X": xml("<integer>0X1F</integer>"),
    "more than 64 bits": xml("<integer>18446744073709551616</integer>"),
    "a real's digits in groups": xml("<real>1_0.5</real>"),
    "two roots": xml("<true/><false/>"),
    "no root": xml(""),
    "an element of no property list": xml("<uid/>"),
    "text between elements": xml("<array>text</array>"),
    "a boolean with a content": xml("<true>x</true>"),
    "attributes": xml("<array x='y'/>"),
    "a comment inside a text": xml("<string>a<!-- c -->b</string>"),
    "a processing instruction": f"{DECLARATION}<?x y?><plist><true/></plist>".encode(),
    "US-ASCII": declared("US-ASCII", "<plist><true/></plist>").encode(),
    "windows-1252": declared("windows-1252", "<plist><true/></plist>").encode(),
    "129 levels": xml("<array>" * 129 + "</array>" * 129),
    "200,001 nodes": binary_array(200_000),
}

REFUSED_BY_BOTH = {
    "the year 0": xml("<date>0000-01-01T00:00:00Z</date>"),
    "the year 10000": xml("<date>10000-01-01T00:00:00Z</date>"),
    "blanks around a date": xml("<date> 2012-03-04T13:05:09Z</date>"),
    "no digits": xml("<integer></integer>"),
    "an exponent": xml("<integer>1e3</integer>"),
    "data cut off": xml("<data>A</data>"),
    "a key without a value": xml("<dict><key>a</key></dict>"),
    "an entity of one's own": (
        b"<!DOCTYPE plist [<!ENTITY a 'b'>]><plist><string>&a;</string></plist>"
    ),
    "a root without a declaration": b"<true/>",
    "UTF-32": declared("UTF-32", "<plist><true/></plist>").encode("utf-32"),
}


def python_reads(content):
    try:
        plistlib.loads(content)
    except Exception:  # plistlib lets those of whatever it calls pass
        return False
    return True


def read_by_kestro(lists):
    """The names of the lists that Kestro parses."""
    with tempfile.TemporaryDirectory() as folder:
        path = pathlib.Path(folder) / "lists.pcap"
        with open(path, "wb") as capture:
            capture.write(
                struct.pack("<IHHIIII", 0xA1B2C3D4, 2, 4, 0, 0, 262144, IFX_LINK_TYPE)
            )
            for content in lists.values():
                size = len(content)
                capture.write(struct.pack("<IIII", 1330862709, 0, size, size) + content)
        done = subprocess.run(
            [os.environ["KESTRO_CLI"], "decode", path, "--format=json"],
            stdout=subprocess.PIPE,
            stderr=subprocess.PIPE,
            text=True,
            timeout=60,
        )
    assert json.loads(done.stdout)["messages"] == len(lists), done.stderr
    refused = re.findall(r"message (\d+): Could not deserialize", done.stderr)
    names = list(lists)
    return set(names) - {names[int(number) - 1] for number in refused}


class PropertyLists(unittest.TestCase):
    maxDiff = None

    def check(self, lists, by_kestro, by_python):
        self.assertEqual(read_by_kestro(lists), set(lists) if by_kestro else set())
        read = {name for name, content in lists.items() if python_reads(content)}
        self.assertEqual(read, set(lists) if by_python else set())

    def test_what_both_read(self):
        self.check(READ_BY_BOTH, True, True)

    def test_what_kestro_alone_reads(self):
        self.check(READ_BY_KESTRO_ALONE, True, False)

    def test_what_python_alone_reads(self):
        self.check(READ_BY_PYTHON_ALONE, False, True)

    def test_what_both_refuse(self):
        self.check(REFUSED_BY_BOTH, False, False)


if __name__ == "__main__":
    unittest.main()
