# SPDX-License-Identifier: MIT
"""The dissector for Wireshark, in tshark, against what `kestro-cli explain` says of the same messages.

The program is found through $KESTRO_CLI, the dissector through $KESTRO_DISSECTOR.
$KESTRO_DISSECTOR_MESSAGES is how many random packets of each of the four technologies are compared,
besides the simulations' and the edges."""

import collections
import itertools
import json
import os
import pathlib
import re
import shutil
import struct
import subprocess
import tempfile
import unittest

import edge_packets
import pdml

CLI = os.environ.get("KESTRO_CLI", "kestro-cli")
DISSECTOR = os.environ.get("KESTRO_DISSECTOR", "kestro.lua")
RANDOM_MESSAGES = int(os.environ.get("KESTRO_DISSECTOR_MESSAGES", "100"))
PATIENCE = 600
# On the channel, in the names of fields, and in captures.
TECHNOLOGIES = {
    "Ondrel_GSM": ("gsmumts", 148),
    "Ondrel_CDMA": ("c2k", 149),
    "LTE": ("lte", 150),
    "UTRAN2": ("utran", 151),
}


def run(*command, **options):
    return subprocess.run(
        command, stdout=subprocess.PIPE, stderr=subprocess.PIPE, timeout=PATIENCE, **options
    )


def tshark(*arguments):
    """What tshark says with the dissector; its own complaints fail the test."""
    home = {**os.environ, "HOME": "/nonexistent", "XDG_CONFIG_HOME": "/nonexistent"}
    done = run("tshark", "-X", f"lua_script:{DISSECTOR}", *arguments, env=home)
    errors = done.stderr.decode().replace(
        'Running as user "root" and group "root". This could be dangerous.\n', ""
    )
    assert done.returncode == 0 and not errors, errors
    return done.stdout


@unittest.skipUnless(shutil.which("tshark"), "there is no tshark")
class Dissector(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        listed = json.loads(run(CLI, "codes", "--format=json").stdout)
        cls.codes = {one["technology"]: one for one in listed}

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = pathlib.Path(folder.name)

    def compare(self, recording):
        """Compares every message of a recording with what is explained of it; how many of each
        technology there are, and how many values they have."""
        explained = json.loads(run(CLI, "explain", "--format=json", str(recording)).stdout)
        comparisons = {
            name: pdml.Comparison(word, self.codes[name]) for name, (word, _) in TECHNOLOGIES.items()
        }
        tree = self.folder / "tree.pdml"
        tree.write_bytes(tshark("-r", str(recording), "-T", "pdml"))
        self.assertNotIn(b"Lua Error", tree.read_bytes())
        counts = collections.Counter()
        with tree.open("rb") as stream:
            for proto, message in itertools.zip_longest(pdml.packets(stream), explained["messages"]):
                technology = message.get("technology", explained.get("technology"))
                counts[technology] += 1
                self.assertEqual(proto.get("name"), f"kestro.{TECHNOLOGIES[technology][0]}")
                faults = list(comparisons[technology].faults(proto, message))
                self.assertFalse(faults, f"{technology}: {json.dumps(message)[:2000]}")
        return counts, sum(comparison.values for comparison in comparisons.values())

    def write(self, technology, messages):
        capture = self.folder / f"{technology}.pcap"
        capture.write_bytes(edge_packets.capture(TECHNOLOGIES[technology][1], messages))
        return capture

    def convert(self, source, *options):
        """A recording of a source, as fast as it goes."""
        recording = self.folder / "source.pcapng"
        done = run(CLI, "convert", source, "-o", str(recording), *options)
        self.assertEqual(done.returncode, 0, done.stderr)
        return recording

    def fields(self, capture, *names):
        """The fields' values of every packet, one after the other."""
        arguments = itertools.chain.from_iterable(("-e", name) for name in names)
        lines = tshark("-r", str(capture), "-T", "fields", *arguments).decode().splitlines()
        return [line.split("\t") for line in lines]

    def test_every_function_has_one_in_lua(self):
        text = pathlib.Path(DISSECTOR).read_text(encoding="utf-8")
        asked = json.dumps(list(self.codes.values()))
        names = set(re.findall(r'"function": "(\w+)"', asked))
        self.assertGreater(len(names), 5)
        for name in names:
            self.assertRegex(text, rf"\nfunction kestro\.(texts|numbers)\.{name}\(")

    def test_property_lists(self):
        xml = "<plist version='1.0'>\n<dict><key>×</key>\n</dict></plist>"
        messages = [xml.encode(), b"bplist00\xff", b"<\xff\n>", b"", b"\0", b"\n" * 30_000]
        capture = self.folder / "IFX.pcap"
        capture.write_bytes(edge_packets.capture(147, messages))
        names = [f"kestro.ifx.property_list.{name}" for name in ("text", "data")]
        found = self.fields(capture, *names)
        self.assertEqual(found[0], [xml.replace("\n", "\\n"), ""])
        self.assertEqual(found[1], ["", "62706c6973743030ff"])
        self.assertEqual(found[2], ["<\N{REPLACEMENT CHARACTER}\\n>", ""])
        self.assertEqual(found[3], ["", ""])
        self.assertEqual(found[4], ["", "00"])
        lines = tshark("-r", str(capture), "-T", "fields", "-e", "kestro.ifx.property_list.line",
                       "-c", "1", "-E", "separator=;", "-E", "aggregator=|")
        self.assertEqual(lines.decode(), "<plist version='1.0'>|<dict><key>×</key>|</dict></plist>\n")
        self.assertNotIn(b"Lua Error", tshark("-r", str(capture), "-V"))

    def test_columns_and_filters(self):
        # The cell 14 with -88.50 dBm, in steps of 0.25 dB from -140 dBm.
        payload = bytearray(20)
        struct.pack_into("<HI", payload, 6, 14, 206)
        capture = self.write("LTE", [edge_packets.message(0xB17F, bytes(payload)),
                                     edge_packets.message(0xB17F, bytes(20))])
        columns = tshark("-r", str(capture), "-Y", "kestro.lte.serving_cell_measurements.measured_rsrp > -90",
                         "-T", "fields", "-e", "_ws.col.Protocol", "-e", "_ws.col.Info")
        self.assertEqual(columns.decode(), "LTE\t0xB17F LTE serving-cell measurement: PCI 14, RSRP -88.50 dBm\n")

    def test_what_stands_for_a_number_is_a_text(self):
        # P_Max, bits 15 to 21 of the integer at byte 25: 64 says that there is none, 3 that it is -27.
        payloads = [bytes(12) + struct.pack("<I", raw << 15) + bytes(4) for raw in (64, 3)]
        capture = self.write("LTE", [edge_packets.message(0xB17F, payload) for payload in payloads])
        name = "kestro.lte.serving_cell_measurements.p_max"
        self.assertEqual(self.fields(capture, name, name + ".text"),
                         [["", "Not Present"], ["-27", ""]])

    def test_edge_packets(self):
        for technology in TECHNOLOGIES:
            with self.subTest(technology=technology):
                edges = edge_packets.Edges(self.codes[technology])
                messages = list(edges.all())
                messages += itertools.islice(edges.random(), RANDOM_MESSAGES)
                counts, values = self.compare(self.write(technology, messages))
                self.assertEqual(counts, {technology: len(messages)})
                self.assertGreater(values, len(messages))

    def test_simulations(self):
        for technology in TECHNOLOGIES:
            with self.subTest(technology=technology):
                recording = self.convert(f"simulation:{technology}", "--to=+20s")
                counts, values = self.compare(recording)
                self.assertGreater(counts[technology], 100)
                self.assertGreater(values, counts[technology])

    def test_a_drive_through_two_technologies(self):
        log = self.folder / "drive.csv"
        log.write_text(
            "Timestamp,NetworkMode,RSRP,RSRQ,RAWCELLID,CELLHEX,LACHEX\n"
            "2019.11.21_15.38.36,LTE,-93,-11,27447297,1,2A\n"
            "2019.11.21_15.38.37,UMTS,-81,-5,1234,2,2A\n"
            "2019.11.21_15.38.38,LTE,-95,-12,27447297,1,2A\n"
        )
        counts, _ = self.compare(self.convert(str(log)))
        self.assertEqual(set(counts), {"LTE", "Ondrel_GSM"})
        self.assertGreater(min(counts.values()), 5)

    def test_the_simulation_of_ifx(self):
        recording = self.convert("simulation:IFX", "--to=+20s")
        lists = self.fields(recording, "_ws.col.Protocol", "kestro.ifx.property_list.data")
        self.assertGreater(len(lists), 20)
        for protocol, data in lists:
            self.assertEqual(protocol, "IFX")
            self.assertTrue(bytes.fromhex(data).startswith(b"bplist00"))


if __name__ == "__main__":
    unittest.main()
