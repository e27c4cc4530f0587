# SPDX-License-Identifier: MIT
"""kestro-telephonyd with the real ModemManager, whose modem is a script.

The programs are found through $KESTRO_CLI and $KESTRO_TELEPHONYD. Skipped where a package of the
services group is missing."""

import itertools
import json
import os
import signal
import subprocess
import threading
import time
import unittest

import modem_manager
from at_modem import IMEI, AtModem
from modem_manager import ModemManager, eventually

MISSING = modem_manager.missing_packages()
SERIALS = itertools.count()


class Display:
    """The last display of `kestro-cli watch`."""

    def __init__(self, bus):
        self._process = bus.start([os.environ["KESTRO_CLI"], "watch", "--format=ndjson"],
                                  stdout=subprocess.PIPE)
        self._last = {}
        threading.Thread(target=self._read, daemon=True).start()

    def _read(self):
        for line in self._process.stdout:
            self._last = json.loads(line).get("display") or self._last

    def section(self, name):
        for key, section in self._last.items():
            if key == name or key.endswith(";" + name):
                return section
        return {}

    def value(self, section, key):
        values = self.section(section)
        return values.get(key) if isinstance(values, dict) else None

    def stop(self):
        self._process.terminate()
        self._process.wait()


@unittest.skipIf(MISSING, f"not installed: {', '.join(MISSING)}")
class RealModemManager(unittest.TestCase):
    def setUp(self):
        self.manager = ModemManager()
        self.addCleanup(self.manager.close)
        self.modem = AtModem(f"kestro-{os.getpid()}-{next(SERIALS)}")
        self.addCleanup(self.modem.close)

    def start_server(self, *options):
        self.server = self.manager.start([os.environ["KESTRO_TELEPHONYD"], "--source=modem",
                                          *options])
        ports = os.path.join(self.manager.directory, "ports", "TelephonyServer")
        self.assertTrue(eventually(lambda: os.path.exists(ports)))

    def watch(self):
        self.display = Display(self.manager)

    def shows(self, section, key, text, patience=modem_manager.PATIENCE):
        def is_shown():
            return self.display.value(section, key) == text

        self.assertTrue(eventually(is_shown, patience),
                        f"{section}, {key}: not {text!r} in {self.display.section(section)}")

    def rate(self, number=0):
        return self.manager.property(number, "Modem.Signal", "Rate")

    def test_what_a_modem_says_is_shown_and_follows_it(self):
        self.manager.plug(self.modem)
        self.manager.enable(0)
        self.start_server()
        self.watch()
        self.shows("Mode", "State", "registered")
        self.shows("Radio Quality", "RSRP", "-86 dBm")
        self.shows("Radio Quality", "RSRQ", "-10 dB")
        self.shows("Registration", "Operator", "Kestro Test")
        self.shows("Mode", "Equipment Identifier", "*" * 11 + IMEI[-4:])
        self.shows("Mode", "Not Reported", "cells: the modem does not report it")

        self.modem.level = 41
        begin = time.monotonic()
        self.shows("Radio Quality", "RSRP", "-100 dBm")
        # One second of ModemManager's, one of the server's, two of the display's.
        self.assertLess(time.monotonic() - begin, 4.5)

        self.modem.register(False)
        self.shows("Mode", "State", "searching")
        self.modem.register(True)
        self.shows("Mode", "State", "registered")
        self.shows("Registration", "Operator", "Kestro Test")

        self.assertIn("<uint32 1>", self.rate())
        self.display.stop()
        self.assertTrue(eventually(lambda: "<uint32 0>" in self.rate()), self.rate())

    def test_the_rate_is_given_back_when_the_server_ends(self):
        self.manager.plug(self.modem)
        self.manager.enable(0)
        self.start_server()
        self.watch()
        self.assertTrue(eventually(lambda: "<uint32 1>" in self.rate()), self.rate())
        self.server.send_signal(signal.SIGTERM)
        self.assertEqual(self.server.wait(timeout=5), 0)
        self.assertIn("<uint32 0>", self.rate())

    def test_a_modem_that_goes_and_comes_back_is_found_under_its_new_number(self):
        self.manager.plug(self.modem)
        self.manager.enable(0)
        self.start_server()
        self.watch()
        self.shows("Mode", "State", "registered")
        self.manager.plug(self.modem)  # Modem/0 goes, Modem/1 comes
        self.shows("Mode", "State", "disabled")
        self.shows("Mode", "Help", "mmcli -m 1 --enable")
        self.manager.enable(1)
        self.shows("Mode", "State", "registered")
        self.shows("Radio Quality", "RSRP", "-86 dBm")

    def test_a_modem_manager_that_is_killed_and_started_again_is_found(self):
        self.manager.plug(self.modem)
        self.manager.enable(0)
        self.start_server()
        self.watch()
        self.shows("Mode", "State", "registered")
        self.manager.kill_manager()
        self.shows("Mode", "State", "ModemManager is not running")
        self.shows("Mode", "Help", "systemctl start ModemManager")
        self.manager.start_manager()
        self.shows("Mode", "State", "the modem has gone")
        self.manager.plug(self.modem)
        self.shows("Mode", "State", "disabled")
        self.manager.enable(0)
        self.shows("Radio Quality", "RSRP", "-86 dBm")

    def test_a_locked_sim_says_so(self):
        self.modem.pin = "SIM PIN"
        self.manager.plug(self.modem)
        self.start_server()
        self.watch()
        self.shows("Mode", "State", "locked: SIM PIN")
        self.assertEqual(self.display.value("SIM", "Lock"), "SIM PIN")

    def test_modems_are_listed(self):
        self.manager.plug(self.modem)
        self.assertTrue(eventually(
            lambda: "<3>" in self.manager.property(0, "Modem", "State")))
        listed = subprocess.run([os.environ["KESTRO_TELEPHONYD"], "--list-modems"],
                                env=self.manager.environment, capture_output=True, text=True,
                                check=True)
        self.assertEqual(listed.stdout, "0  Example Model X  disabled  " + "*" * 11 + IMEI[-4:] +
                         "  /org/freedesktop/ModemManager1/Modem/0\n")


if __name__ == "__main__":
    unittest.main()
