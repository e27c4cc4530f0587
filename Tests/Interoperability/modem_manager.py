# SPDX-License-Identifier: MIT
"""The real ModemManager on a bus of its own, with modems that are scripts."""

import os
import pathlib
import shutil
import signal
import subprocess
import tempfile
import time

from at_modem import AtModem

SERVICE = "org.freedesktop.ModemManager1"
PATIENCE = 20

# What a test of the services group takes, by the package that brings it.
PROGRAMS = {"ModemManager": "modemmanager", "gdbus": "libglib2.0-bin", "dbus-daemon": "dbus-daemon",
            "gpsd": "gpsd", "gpsfake": "gpsd-clients"}


def program(name):
    return shutil.which(name, path=os.environ.get("PATH", "") + ":/usr/sbin:/usr/local/sbin")


def missing_packages():
    """The packages that this machine does not have."""
    missing = [package for name, package in PROGRAMS.items() if program(name) is None]
    if subprocess.run(["/usr/bin/python3", "-c", "import dbusmock"], check=False,
                      capture_output=True).returncode != 0:
        missing.append("python3-dbusmock")
    return missing


def eventually(condition, patience=PATIENCE):
    """Calls `condition` until it holds; its last answer."""
    end = time.monotonic() + patience
    while not (answer := condition()) and time.monotonic() < end:
        time.sleep(0.05)
    return answer


class PrivateBus:
    """A bus, and the environment that makes it the system's for programs that are started with it."""

    def __init__(self):
        self.directory = tempfile.mkdtemp(prefix="kestro-modem-")
        self._processes = []
        self._logs = []
        address = f"unix:path={self.directory}/bus"
        self.environment = {**os.environ, "DBUS_SYSTEM_BUS_ADDRESS": address,
                            "DBUS_SESSION_BUS_ADDRESS": address,
                            "KESTRO_PORT_DIR": f"{self.directory}/ports", "NO_COLOR": ""}
        self.start(["dbus-daemon", "--session", "--nofork", f"--address={address}"])
        eventually(lambda: pathlib.Path(self.directory, "bus").exists())

    def start(self, command, **options):
        log = open(f"{self.directory}/{pathlib.Path(command[0]).name}.log", "ab")
        self._logs.append(log)
        options = {"stdin": subprocess.DEVNULL, "stdout": log, "stderr": log, **options}
        process = subprocess.Popen([program(command[0]) or command[0], *command[1:]],
                                   env=self.environment, **options)
        self._processes.append(process)
        return process

    def log(self, name):
        return pathlib.Path(self.directory, f"{name}.log").read_text(errors="replace")

    def call(self, destination, path, method, *arguments):
        """What a method answers, as gdbus writes it; None when it fails."""
        outcome = subprocess.run(
            [program("gdbus"), "call", "--session", "--timeout", "10", "-d", destination, "-o",
             path, "-m", method, *arguments],
            env=self.environment, capture_output=True, text=True, check=False)
        return outcome.stdout if outcome.returncode == 0 else None

    def close(self):
        for process in reversed(self._processes):
            process.send_signal(signal.SIGKILL)
            process.wait()
            for stream in (process.stdout, process.stderr):
                if stream is not None:
                    stream.close()
        for log in self._logs:
            log.close()
        shutil.rmtree(self.directory, ignore_errors=True)


class ModemManager(PrivateBus):
    """With a stand-in for polkit that allows everything."""

    def __init__(self):
        super().__init__()
        self._manager = None
        self.start(["/usr/bin/python3", "-m", "dbusmock", "--system", "--template", "polkitd"])
        polkit = ("org.freedesktop.PolicyKit1", "/org/freedesktop/PolicyKit1/Authority",
                  "org.freedesktop.DBus.Mock.AllowUnknown", "true")
        assert eventually(lambda: self.call(*polkit) is not None), "polkit's stand-in does not start"
        self.start_manager()

    def start_manager(self):
        self._manager = self.start(["ModemManager", "--test-no-udev", "--test-no-qrtr",
                                    "--test-no-suspend-resume", "--test-enable"])
        assert eventually(self.objects), "ModemManager does not start"

    def kill_manager(self):
        self._manager.send_signal(signal.SIGKILL)
        self._manager.wait()

    def objects(self):
        return self.call(SERVICE, "/org/freedesktop/ModemManager1",
                         "org.freedesktop.DBus.ObjectManager.GetManagedObjects")

    def plug(self, modem: AtModem):
        """The modem is there, again where it was there before."""
        self.call(SERVICE, "/org/freedesktop/ModemManager1",
                  f"{SERVICE}.Test.SetProfile", "kestro", "generic", f"['abstract:{modem.name}']")

    def modem_call(self, number, method, *arguments):
        return self.call(SERVICE, f"/org/freedesktop/ModemManager1/Modem/{number}",
                         f"{SERVICE}.{method}", *arguments)

    def property(self, number, interface, name):
        return self.modem_call_of_properties(number, "Get", f"{SERVICE}.{interface}", name) or ""

    def modem_call_of_properties(self, number, method, *arguments):
        return self.call(SERVICE, f"/org/freedesktop/ModemManager1/Modem/{number}",
                         f"org.freedesktop.DBus.Properties.{method}", *arguments)

    def enable(self, number):
        """Waits until the modem is disabled, that is initialised, and enables it."""
        assert eventually(lambda: "<3>" in self.property(number, "Modem", "State")), "no modem"
        assert self.modem_call(number, "Modem.Enable", "true") is not None
