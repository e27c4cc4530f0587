# SPDX-License-Identifier: MIT
"""A drive-test log, row for row: decoded as it is, and converted. The programs are found through
$KESTRO_CLI."""

import os
import pathlib
import subprocess
import tempfile
import unittest

import drive_log

COLUMNS = ("Timestamp,Longitude,Latitude,Speed,Operatorname,CellID,NetworkMode,RSRP,RSRQ,SNR,CQI,RSSI,"
           "CELLHEX,NODEHEX,LACHEX,RAWCELLID,NRxRSRP,NRxRSRQ")
# Several rows a second, all three modes, values that were not measured, a level off the scale.
ROWS = """\
2021.03.04_12.00.01,-8.5,51.5,0,B,1,LTE,-90,-7,9.0,7,-72,1,53E42,9CBA,87966209,-95.0,-16.0
2021.03.04_12.00.01,-8.5,51.5,1,B,1,LTE,-91,-8,8.0,7,-,1,53E42,9CBA,87966209,-96.0,-17.0
2021.03.04_12.00.01,-8.5,51.5,2,B,1,5G,-92,-9,8.0,7,-74,2,53E42,9CBA,87966210,-,-
2021.03.04_12.00.02,-8.6,51.6,3,B,1,-,-,-10,8.0,7,-75,2,53E42,9CBA,87966210,-,-
2021.03.04_12.00.03,-8.6,51.6,3,B,1,HSPA+,-81,-5,-,-,-,3A7,1F,2BAD,131111,-,-
2021.03.04_12.00.03,-8.6,51.6,3,B,1,UMTS,-84,-,-,-,-,3A8,1F,2BAD,131112,-,-
2021.03.04_12.00.05,-8.7,51.7,3,B,1,EDGE,-71,-,-,-,-,2B,1F,1A,43,-,-
2021.03.04_12.00.06,-8.7,51.7,3,B,1,GSM,-115,-,-,-,-,2C,1F,1A,44,-,-
2021.03.04_12.00.07,-8.8,51.8,3,B,1,LTE,-99,-11,8.0,7,-79,3,53E42,9CBB,87966211,-,-
"""


class DriveLog(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = pathlib.Path(folder.name)
        self.log = self.folder / "log.csv"
        self.log.write_text(f"{COLUMNS}\n{ROWS}")

    def check(self, recording, is_ifx=False, options=()):
        self.assertEqual(drive_log.compare(self.log, recording, is_ifx, options), (9, []))

    def convert(self, name, *options):
        path = self.folder / name
        subprocess.run([os.environ["KESTRO_CLI"], "convert", self.log, "-o", path, *options],
                       check=True, stderr=subprocess.DEVNULL)
        return path

    def test_packets_have_the_rows_numbers(self):
        self.check(self.log)

    def test_property_lists_have_the_rows_texts(self):
        self.check(self.log, True, ("--technology=IFX",))

    def test_a_converted_log_has_them_too(self):
        self.check(self.convert("drive.pcapng"))
        self.check(self.convert("ifx.pcapng", "--technology=IFX"), True)
        self.check(self.convert("ifx.pcap", "--technology=IFX"), True)

    def test_another_number_is_noticed(self):
        converted = self.convert("drive.pcapng")
        self.log.write_text(f"{COLUMNS}\n{ROWS}".replace("-99,-11", "-98,-11"))
        count, faults = drive_log.compare(self.log, converted)
        self.assertEqual((count, faults), (9, [(9, {"RSRP": (-98.0, -99.0)})]))


if __name__ == "__main__":
    unittest.main()
