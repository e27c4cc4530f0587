# SPDX-License-Identifier: MIT
"""Includes follow the house's arrows, and the check finds the ones that do not."""

import pathlib
import tempfile
import unittest

import house

ROOT = pathlib.Path(__file__).resolve().parents[2]


class Tree(unittest.TestCase):
    def test_every_include_follows_the_house(self):
        self.assertEqual(house.wrong_arrows(ROOT), [])

    def test_one_source_reads_command_lines(self):
        self.assertEqual([name for name, room in house.ALL_ROOMS.items()
                          if "command lines" in room.kinds], ["Options/ArgumentParser.cpp"])

    def test_every_source_begins_with_its_own_header(self):
        self.assertEqual(house.headers_not_first(ROOT), [])

    def test_every_header_is_taken_once(self):
        self.assertEqual(house.headers_without_guard(ROOT), [])

    def test_the_check_reads_the_sources(self):
        found = list(house.sources(ROOT))
        self.assertIn("Platform/PropertyList.cpp", found)
        self.assertIn("Platform/Linux/LinuxPlatform.h", found)


class Check(unittest.TestCase):
    """The check itself, on small trees of its own."""

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name)
        self.write("Platform/Clock.h")
        self.write("Platform/Linux/LinuxPlatform.h")
        self.write("Platform/Linux/Sockets.h")
        self.write("Platform/Virtual/VirtualClock.h")
        self.write("LogGenerator/LogGenerator.h")
        self.write("Model/Tree.h")
        self.write("Recordings/Recording.h")
        self.write("TelephonyServer/Channel.h")

    def write(self, path, *headers):
        file = self.root / path
        file.parent.mkdir(parents=True, exist_ok=True)
        file.write_text("".join(f"#include {header}\n" for header in headers), encoding="utf-8")

    def faults(self, path, header):
        self.write(path, header)
        return house.wrong_arrows(self.root)

    def assert_allowed(self, path, header):
        self.assertEqual(self.faults(path, header), [])

    def assert_refused(self, path, header, why):
        expected = f"{path}:1: {header.strip('<>').strip(chr(34))}: {why}"
        self.assertEqual(self.faults(path, header), [expected])

    def test_downward_arrows_are_allowed(self):
        self.assert_allowed("Model/Model.cpp", '"LogGenerator/LogGenerator.h"')
        self.assert_allowed("LogGenerator/IFX/IFX.cpp", '"Platform/Clock.h"')
        self.assert_allowed("Sources/Replay.cpp", '"Recordings/Recording.h"')

    def test_an_upward_arrow_is_refused(self):
        self.assert_refused(
            "LogGenerator/A.cpp", '"Model/Tree.h"', "LogGenerator must not know Model"
        )

    def test_a_sideways_arrow_is_refused(self):
        self.assert_refused(
            "CommandLine/A.cpp",
            '"TelephonyServer/Channel.h"',
            "CommandLine must not know TelephonyServer",
        )

    def test_angle_brackets_do_not_hide_an_arrow(self):
        self.assert_refused("Recordings/A.h", "<Model/Tree.h>", "Recordings must not know Model")

    def test_the_values_know_no_implementation_of_the_platform(self):
        self.assert_refused(
            "Platform/A.cpp",
            '"Platform/Virtual/VirtualClock.h"',
            "Platform must not know Platform/Virtual",
        )

    def test_the_model_uses_neither_sockets_nor_files_nor_qt(self):
        self.assert_refused("Model/A.cpp", "<sys/socket.h>", "Model must not use sockets")
        self.assert_refused("Model/A.cpp", "<fstream>", "Model must not use files")
        self.assert_refused("Model/A.cpp", "<unistd.h>", "Model must not use posix")
        self.assert_refused("Model/A.cpp", "<QString>", "Model must not use qt")

    def test_core_folders_use_the_standard_library_and_fmt(self):
        self.assert_allowed("LogGenerator/A.cpp", "<string_view>")
        self.assert_allowed("LogGenerator/A.cpp", "<fmt/format.h>")

    def test_only_the_linux_platform_uses_the_system_log(self):
        self.assert_allowed("Platform/Linux/Log.cpp", "<syslog.h>")
        self.assert_refused(
            "CommandLine/A.cpp", "<syslog.h>", "CommandLine must not use system log"
        )

    def test_only_recordings_use_libpcap(self):
        self.assert_allowed("Recordings/A.cpp", "<pcap/pcap.h>")
        self.assert_refused(
            "TelephonyServer/A.cpp", "<pcap.h>", "TelephonyServer must not use pcap"
        )

    def test_the_inside_of_the_linux_platform_is_closed(self):
        why = "CommandLine must not know Platform/Linux"
        self.assert_refused("CommandLine/A.cpp", '"Platform/Linux/Sockets.h"', why)

    def test_the_linux_factory_is_for_main_functions(self):
        door = '"Platform/Linux/LinuxPlatform.h"'
        self.assert_allowed("TelephonyServer/main.cpp", door)
        self.assert_refused(
            "TelephonyServer/A.cpp", door, "TelephonyServer must not know Platform/Linux"
        )

    def test_tests_of_the_linux_platform_see_its_inside(self):
        self.assert_allowed("Tests/Platform/Linux/A.cpp", '"Platform/Linux/Sockets.h"')

    def test_other_tests_do_not_see_the_inside_of_the_linux_platform(self):
        why = "Tests/Model must not know Platform/Linux"
        self.assert_refused("Tests/Model/A.cpp", '"Platform/Linux/Sockets.h"', why)

    def test_tests_share_helpers_along_the_arrows(self):
        self.write("Tests/Recordings/PcapBytes.h")
        self.write("Tests/Model/Nodes.h")
        self.assert_allowed("Tests/TelephonyServer/A.cpp", '"Tests/Recordings/PcapBytes.h"')
        self.assert_refused(
            "Tests/TelephonyServer/A.cpp",
            '"Tests/Model/Nodes.h"',
            "Tests/TelephonyServer must not know Tests/Model",
        )

    def test_an_include_relative_to_its_folder_is_refused(self):
        self.assert_refused(
            "Model/A.cpp",
            '"Tree.h"',
            "neither a path from the root nor a library that the house knows",
        )

    def test_a_source_that_begins_otherwise_is_found(self):
        self.write("Platform/Clock.cpp", "<chrono>", '"Platform/Clock.h"')
        self.assertEqual(house.headers_not_first(self.root),
                         ["Platform/Clock.cpp: Platform/Clock.h"])

    def test_a_source_that_leaves_its_header_out_is_found(self):
        self.write("Platform/Clock.cpp")
        self.assertEqual(house.headers_not_first(self.root),
                         ["Platform/Clock.cpp: Platform/Clock.h"])

    def test_a_source_without_a_header_may_begin_as_it_likes(self):
        self.write("Platform/Linux/main.cpp", "<chrono>")
        self.write("Platform/Clock.cpp", '"Platform/Clock.h"', "<chrono>")
        self.assertEqual(house.headers_not_first(self.root), [])

    def test_a_header_that_may_be_taken_twice_is_found(self):
        for header in self.root.rglob("*.h"):
            header.write_text("#pragma once\n", encoding="utf-8")
        self.write("Platform/Clock.h", "<chrono>")
        self.assertEqual(house.headers_without_guard(self.root), ["Platform/Clock.h"])

    def test_a_source_in_an_unknown_folder_is_refused(self):
        self.write("Cellar/A.cpp")
        self.assertEqual(
            house.wrong_arrows(self.root), ["Cellar/A.cpp: in no room of the house"]
        )


if __name__ == "__main__":
    unittest.main()
