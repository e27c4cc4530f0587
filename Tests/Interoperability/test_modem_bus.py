# SPDX-License-Identifier: MIT
"""kestro-telephonyd with a stand-in for ModemManager, which says what no real one would, and with a
real gpsd.

The programs are found through $KESTRO_CLI and $KESTRO_TELEPHONYD. Skipped where a package of the
services group is missing."""

import functools
import operator
import os
import signal
import socket
import subprocess
import tempfile
import time
import unittest

import modem_manager
from modem_manager import SERVICE, PrivateBus, eventually
from test_modem import Display

MISSING = modem_manager.missing_packages()
MANAGER = "/org/freedesktop/ModemManager1"
MOCK = "org.freedesktop.DBus.Mock"
MODEM = f"{MANAGER}/Modem/0"

# Interfaces of a modem that is registered in LTE, as gdbus takes them.
REGISTERED = {
    "Modem": ("{'State': <int32 8>, 'Manufacturer': <'Example'>, 'Model': <'X'>, "
              "'EquipmentIdentifier': <'490154203237518'>, 'AccessTechnologies': <uint32 16384>}",
              "[('GetCellInfo', '', 'aa{sv}', 'ret = CELLS')]"),
    "Modem.Signal": ("{'Rate': <uint32 1>, 'Lte': <{'rsrp': <-86.0>, 'rsrq': <-10.0>}>}", "[]"),
    "Modem.Location": ("{'Enabled': <uint32 0>}",
                       "[('GetLocation', '', 'a{uv}', 'ret = dbus.Dictionary({}, "
                       "signature=\"uv\")')]"),
}


def sentence(body):
    """An NMEA sentence with its checksum."""
    checksum = functools.reduce(operator.xor, body.encode())
    return f"${body}*{checksum:02X}\r\n"


def free_port():
    with socket.socket() as probe:
        probe.bind(("127.0.0.1", 0))
        return probe.getsockname()[1]


@unittest.skipIf(MISSING, f"not installed: {', '.join(MISSING)}")
class StandIn(unittest.TestCase):
    def setUp(self):
        self.bus = PrivateBus()
        self.addCleanup(self.bus.close)
        self.bus.start(["/usr/bin/python3", "-m", "dbusmock", "--system", "-m", SERVICE, MANAGER,
                        SERVICE])
        self.assertTrue(eventually(
            lambda: self.bus.call(SERVICE, MANAGER, f"{MOCK}.AddProperty", SERVICE, "Version",
                                  "<'1.20.4'>") is not None))
        self.bus.call(SERVICE, MANAGER, f"{MOCK}.AddMethod", "org.freedesktop.DBus.ObjectManager",
                      "GetManagedObjects", "", "a{oa{sa{sv}}}",
                      "ret = {dbus.ObjectPath(k): dbus.Dictionary(objects[k].props, "
                      "signature='sa{sv}') for k in objects.keys() if '/Modem/' in k}")

    def add_modem(self, interfaces, cells="dbus.Array([], signature='a{sv}')", path=MODEM):
        """A modem object with these interfaces; what GetCellInfo returns, as Python."""
        (modem, methods), *others = interfaces.items()
        properties, functions = methods
        added = self.bus.call(SERVICE, MANAGER, f"{MOCK}.AddObject", path, f"{SERVICE}.{modem}",
                              properties, functions.replace("CELLS", cells.replace("'", '"')))
        self.assertIsNotNone(added)
        for name, (properties, functions) in others:
            self.assertIsNotNone(self.bus.call(SERVICE, path, f"{MOCK}.AddProperties",
                                               f"{SERVICE}.{name}", properties))
            self.assertIsNotNone(self.bus.call(SERVICE, path, f"{MOCK}.AddMethods",
                                               f"{SERVICE}.{name}", functions))

    def start(self, *options):
        self.server = self.bus.start([os.environ["KESTRO_TELEPHONYD"], "--source=modem", *options])
        ports = os.path.join(self.bus.directory, "ports", "TelephonyServer")
        self.assertTrue(eventually(lambda: os.path.exists(ports)))
        self.display = Display(self.bus)

    def shows(self, section, key, text):
        self.assertTrue(eventually(lambda: self.display.value(section, key) == text),
                        f"{section}, {key}: not {text!r} in {self.display.section(section)}; "
                        + self.bus.log("kestro-telephonyd"))

    def test_cells_are_shown(self):
        cell = ("dbus.Array([{'cell-type': dbus.UInt32(5), 'serving': True, 'physical-ci': '1A0', "
                "'earfcn': dbus.UInt32(1300), 'rsrp': -86.0}, {'cell-type': dbus.UInt32(2), "
                "'serving': False, 'arfcn': dbus.UInt32(62), 'rx-level': dbus.UInt32(20)}], "
                "signature='a{sv}')")
        self.add_modem(REGISTERED, cell)
        self.start()
        self.shows("Serving Cell", "Physical Cell ID", "416")
        self.shows("Serving Cell", "Band", "3")
        self.shows("Radio Quality", "RSRP", "-86 dBm")
        neighbour = self.display.section("Neighbour Cells")[0]
        self.assertEqual(neighbour["RxLev"], "-91 dBm")

    def test_wrong_types_are_named_and_absent(self):
        cell = ("dbus.Array([{'cell-type': dbus.UInt32(5), 'serving': True, 'physical-ci': "
                "dbus.UInt32(416), 'earfcn': '1300', 'rsrp': '-86', 'ci': 'ABC'}], "
                "signature='a{sv}')")
        self.add_modem({**REGISTERED,
                        "Modem.Signal": ("{'Rate': <'fast'>, 'Lte': <[1.5, 2.5]>}", "[]"),
                        "Modem.Modem3gpp": ("{'RegistrationState': <'home'>, 'OperatorName': "
                                            "<uint32 7>}", "[]")}, cell)
        self.start()
        self.shows("Serving Cell", "Cell ID", "2748")
        self.assertEqual(self.display.section("Serving Cell"),
                         {"Technology": "LTE", "Cell ID": "2748"})
        log = self.bus.log("kestro-telephonyd")
        for name, expected, found in (("GetCellInfo physical-ci", "s", "u"),
                                      ("GetCellInfo earfcn", "u", "s"),
                                      ("GetCellInfo rsrp", "d", "s"),
                                      ("Signal Lte", "a{sv}", "ad"),
                                      ("Signal Rate", "u", "s"),
                                      ("Modem3gpp RegistrationState", "u", "s"),
                                      ("Modem3gpp OperatorName", "s", "u")):
            line = f"{name} is left out: it has the type {found}, not {expected}"
            self.assertEqual(log.count(line), 1, log)

    def test_positions_of_a_gpsd_are_shown(self):
        track = os.path.join(self.bus.directory, "track.nmea")
        with open(track, "w", encoding="ascii") as file:
            for second in range(60):
                time = f"1200{second:02}.00"
                file.write(sentence(f"GPRMC,{time},A,5130.0000,N,00815.0000,W,010.0,090.0,221126,,,A"))
                file.write(sentence(f"GPGGA,{time},5130.0000,N,00815.0000,W,1,08,1.0,12.0,M,0.0,M,,"))
        port = free_port()
        self.start_gpsfake(["gpsfake", "-q", "-c", "0.2", "-P", str(port), track])
        self.add_modem(REGISTERED)
        self.start(f"--gps=gpsd:127.0.0.1:{port}")
        self.shows("Position", "Latitude", "51.500000")
        self.assertEqual(self.display.value("Position", "Longitude"), "-8.250000")
        self.assertEqual(self.display.value("Position", "Source"), f"gpsd 127.0.0.1:{port}")

    def start_gpsfake(self, command):
        """gpsfake outlives SIGTERM, and its gpsd outlives it: both have a group of their own."""
        process = subprocess.Popen(command, stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                                   stderr=subprocess.DEVNULL, start_new_session=True)

        def end():
            os.killpg(process.pid, signal.SIGKILL)
            process.wait()

        self.addCleanup(end)

    def test_the_server_takes_little_of_the_processor(self):
        self.add_modem(REGISTERED)
        self.start()
        self.shows("Radio Quality", "RSRP", "-86 dBm")

        def ticks():
            with open(f"/proc/{self.server.pid}/stat", encoding="ascii") as stat:
                fields = stat.read().rpartition(")")[2].split()
            return int(fields[11]) + int(fields[12])

        before = ticks()
        eventually(lambda: False, 8)
        self.assertLessEqual(ticks() - before, 8)  # of 10 ms, in 8 s: 1 % of a core


class SilentBus(unittest.TestCase):
    def test_a_bus_that_never_answers_does_not_keep_the_server(self):
        with tempfile.TemporaryDirectory() as folder, socket.socket(socket.AF_UNIX) as bus:
            bus.bind(f"{folder}/bus")
            bus.listen(5)
            environment = {**os.environ, "DBUS_SYSTEM_BUS_ADDRESS": f"unix:path={folder}/bus"}
            begin = time.monotonic()
            listed = subprocess.run([os.environ["KESTRO_TELEPHONYD"], "--list-modems"],
                                    env=environment, capture_output=True, text=True, check=False,
                                    timeout=30)
            self.assertLess(time.monotonic() - begin, 15)
            self.assertEqual(listed.returncode, 1)
            self.assertIn("the system bus does not answer", listed.stderr)


if __name__ == "__main__":
    unittest.main()
