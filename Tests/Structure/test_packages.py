# SPDX-License-Identifier: MIT
"""packages.txt has three groups, and what installs them takes those that it is told."""

import os
import pathlib
import shutil
import subprocess
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
GROUPS = ("run", "test", "services")


def shell(root, commands, path=""):
    """What bash prints of commands with .ci/common.sh of a tree at hand."""
    environment = dict(os.environ, PATH=path + os.environ["PATH"])
    environment.pop("KESTRO_SKIP_PACKAGES", None)
    run = subprocess.run(
        ["bash", "-c", f"set -euo pipefail; source '{root}/.ci/common.sh'; {commands}"],
        capture_output=True, text=True, check=True, env=environment)
    return run.stdout


class Tree(unittest.TestCase):
    def packages(self, *groups):
        return shell(ROOT, "listed_packages " + " ".join(groups)).split()

    def test_every_package_stands_in_one_group(self):
        every = self.packages(*GROUPS)
        self.assertEqual(sorted(every), sorted(set(every)))
        self.assertEqual(len(every), sum(len(self.packages(group)) for group in GROUPS))

    def test_groups_are_in_order(self):
        for group in GROUPS:
            self.assertEqual(self.packages(group), sorted(self.packages(group)))

    def test_running_takes_a_compiler_and_no_tests(self):
        self.assertIn("g++", self.packages("run"))
        self.assertIn("libgtest-dev", self.packages("test"))
        self.assertNotIn("libgtest-dev", self.packages("run"))


class Installing(unittest.TestCase):
    """On a tree of its own, where asking for packages and installing them only look so."""

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name).resolve()
        (self.root / ".ci").mkdir()
        shutil.copy(ROOT / ".ci/common.sh", self.root / ".ci")
        (self.root / "packages.txt").write_text(
            "# words\n[run]  # more words\nhere\nengine\n\n[test]\ntester\n[services]\ndaemon\n")
        self.command("dpkg-query", "echo installed here; echo config-files engine")
        self.command("apt-get", f'echo "$@" >> {self.root}/installed')
        self.command("sudo", '[ "$1" = -n ] && shift; "$@"')

    def command(self, name, text):
        file = self.root / "bin" / name
        file.parent.mkdir(exist_ok=True)
        file.write_text(f"#!/bin/sh\n{text}\n")
        file.chmod(0o755)

    def installed(self, *groups):
        """The packages that installing these groups asked for."""
        shell(self.root, "install_packages " + " ".join(groups), f"{self.root}/bin:")
        calls = (self.root / "installed").read_text().splitlines()
        return [call.split("--no-install-recommends ")[1].split() for call in calls
                if "--no-install-recommends" in call]

    def test_a_group_is_what_stands_under_its_name(self):
        self.assertEqual(shell(self.root, "listed_packages run").split(), ["here", "engine"])
        self.assertEqual(shell(self.root, "listed_packages run services").split(),
                         ["here", "engine", "daemon"])

    def test_only_what_is_missing_of_the_groups_is_installed(self):
        self.assertEqual(self.installed("run"), [["engine"]])

    def test_services_are_installed_when_asked_for(self):
        self.assertEqual(self.installed("run", "test"), [["engine", "tester"]])
        self.assertEqual(self.installed("services")[-1], ["daemon"])

    def test_nothing_missing_asks_nobody(self):
        self.command("dpkg-query", "echo installed here; echo installed engine")
        shell(self.root, "install_packages run", f"{self.root}/bin:")
        self.assertFalse((self.root / "installed").exists())


class Scripts(unittest.TestCase):
    """What each script installs."""

    def groups(self, script):
        lines = (ROOT / script).read_text().splitlines()
        return [line.split("install_packages ", 1)[1] for line in lines
                if "install_packages " in line]

    def test_running_installs_what_running_takes(self):
        self.assertEqual(self.groups("run"), ["run"])

    def test_all_that_a_change_must_pass_has_services(self):
        self.assertEqual(self.groups(".ci/run"), ["run test services"])

    def test_testing_has_services_only_when_asked_for(self):
        text = (ROOT / "test").read_text()
        self.assertIn("groups=(run test)\n", text)
        self.assertIn("--with-services) groups+=(services) ;;", text)


if __name__ == "__main__":
    unittest.main()
