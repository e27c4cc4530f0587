// SPDX-License-Identifier: MIT
// kestro-cli snapshot, as its users start it.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {
namespace {

using namespace std::chrono_literals;
using namespace std::string_literals;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::StartsWith;

/// An LTE message that only its time tells from others: type 1, a record of 13 bytes, code 0x4179.
const std::string kMessage = "\x01\x0D\x00\x79\x41\0\0\0\0\0\0\0\0\x55"s;

class SnapshotCommandTest : public ::testing::Test {
 protected:
  void SetUp() override { ::setenv("TZ", "UTC0", 1); }
  void TearDown() override { ::unsetenv("TZ"); }

  [[nodiscard]] std::string pathOf(const std::string& name) const {
    return directory.directory() + "/" + name;
  }
  void writeIFX(const std::vector<std::string>& messages) {
    writeCapture(capture, messages, 1500ms);
  }
  void writeLTE(const std::vector<std::string>& messages) {
    writeCapture(capture, messages, 1500ms, "LTE");
  }
  void writeSnapshot(std::string_view contents) {
    std::ofstream(snapshot, std::ios::binary) << contents;
  }

  Outcome save(const std::string& description = "tunnel") {
    return run({"kestro-cli", "snapshot", "save", capture, "-o", snapshot,
                "--description=" + description});
  }
  Outcome show() { return run({"kestro-cli", "snapshot", "show", snapshot}); }
  Outcome exportDlf(const std::vector<std::string>& options = {}) {
    std::vector<std::string> arguments{"kestro-cli", "snapshot", "export-dlf", snapshot, "-o", dlf};
    arguments.insert(arguments.end(), options.begin(), options.end());
    return run(arguments);
  }

  TemporaryFile directory;
  std::string capture = pathOf("a.pcap");
  std::string snapshot = pathOf("a.kestro");
  std::string dlf = pathOf("a.dlf");
};

/// A directory entry's permissions mean nothing to root.
bool isRoot() { return ::geteuid() == 0; }

TEST_F(SnapshotCommandTest, ShowsWhatWasSaved) {
  writeIFX({ifxMessage("1"), ifxMessage("2")});
  const Outcome saved = save();
  EXPECT_EQ(saved.status, 0);
  EXPECT_EQ(saved.output, "");
  EXPECT_EQ(saved.errors, "");
  const Outcome shown = show();
  EXPECT_EQ(shown.status, 0);
  EXPECT_EQ(shown.errors, "");
  EXPECT_EQ(shown.output,
            "Timestamp    2012-03-04 12:05:10 +0000\n"
            "Description  tunnel\n"
            "History      1 entry\n"
            "\n"
            "Snapshot (2012-03-04 12:05:10 +0000)\n"
            "  Count  2\n"
            "  Cells\n"
            "    #  ARFCN  RxLev\n"
            "    0     62      2\n");
}

TEST_F(SnapshotCommandTest, ShowsTheNewestFiveDisplaysAndTheirPackets) {
  // Messages at 0, 1.5, … 13.5 s. Refreshes at 2, 4, … 12 s, each before the message that comes
  // with it, and at the end: the last five have 1, 2, 1, 1 and 2 messages.
  writeLTE(std::vector<std::string>(10, kMessage));
  ASSERT_EQ(save("").status, 0);
  const Outcome shown = show();
  EXPECT_EQ(shown.status, 0);
  EXPECT_THAT(shown.output, StartsWith("Timestamp    2012-03-04 12:05:22 +0000\n"
                                       "Description\n"
                                       "History      5 entries\n"
                                       "DLF log      254 bytes\n"));
  EXPECT_THAT(shown.output, HasSubstr("\nSnapshot (2012-03-04 12:05:15 +0000)\n"
                                      "  Packets  1 (14 bytes)\n"));
  EXPECT_THAT(shown.output, HasSubstr("\nSnapshot (2012-03-04 12:05:22 +0000)\n"
                                      "  Packets  2 (28 bytes)\n"));
}

TEST_F(SnapshotCommandTest, AnEmptyDescriptionMayBeWrittenBothWays) {
  writeIFX({ifxMessage("1")});
  EXPECT_EQ(save("").status, 0);
  EXPECT_EQ(
      run({"kestro-cli", "snapshot", "save", capture, "-o", snapshot, "--description", ""}).status,
      0);
  EXPECT_THAT(TemporaryDirectory::text(snapshot),
              HasSubstr("<key>Description</key>\n\t<string></string>"));
}

TEST_F(SnapshotCommandTest, ADescriptionThatIsNoUtf8DoesNotLoseTheSnapshot) {
  writeIFX({ifxMessage("1")});
  EXPECT_EQ(save("a\xFF\x1B!").status, 0);
  EXPECT_THAT(TemporaryDirectory::text(snapshot), HasSubstr("<string>a\uFFFD\uFFFD!</string>"));
}

TEST_F(SnapshotCommandTest, MessagesThatCannotBeDecodedAreNamedAndTheRestSaved) {
  writeIFX({ifxMessage("1"), "garbage"});
  const Outcome outcome = save();
  EXPECT_EQ(outcome.status, 3);
  EXPECT_THAT(outcome.errors, StartsWith("kestro-cli: " + capture + ": message 2: "));
  EXPECT_THAT(show().output, HasSubstr("  Count  1\n"));
}

TEST_F(SnapshotCommandTest, ACaptureWithoutMessagesHasAnEmptyHistory) {
  writeIFX({});
  EXPECT_EQ(save().status, 0);
  EXPECT_THAT(show().output, MatchesRegex("Timestamp    20[-0-9: ]+ \\+0000\n"
                                          "Description  tunnel\n"
                                          "History      0 entries\n"));
}

TEST_F(SnapshotCommandTest, NothingIsWrittenWithoutACapture) {
  EXPECT_EQ(save().status, 1);
  std::ofstream(capture) << "no capture";
  EXPECT_EQ(save().status, 1);
  EXPECT_FALSE(std::filesystem::exists(snapshot));
}

TEST_F(SnapshotCommandTest, AMissingDirectoryIsNotMade) {
  writeIFX({ifxMessage("1")});
  snapshot = pathOf("nowhere/a.kestro");
  const Outcome outcome = save();
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + snapshot + ": No such file or directory\n");
  EXPECT_FALSE(std::filesystem::exists(pathOf("nowhere")));
}

TEST_F(SnapshotCommandTest, AReadOnlyDirectoryIsAFailure) {
  if (isRoot()) GTEST_SKIP() << "root may write everywhere";
  writeIFX({ifxMessage("1")});
  ASSERT_EQ(::mkdir(pathOf("locked").c_str(), 0500), 0);
  snapshot = pathOf("locked/a.kestro");
  const Outcome outcome = save();
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + snapshot + ": Permission denied\n");
}

TEST_F(SnapshotCommandTest, AFullDiskIsAFailure) {
  writeIFX({ifxMessage("1")});
  snapshot = "/dev/full";
  const Outcome outcome = save();
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: /dev/full: No space left on device\n");
}

TEST_F(SnapshotCommandTest, TheCaptureIsNotReplaced) {
  writeIFX({ifxMessage("1")});
  const std::string before = TemporaryDirectory::text(capture);
  snapshot = directory.directory() + "/./a.pcap";
  const Outcome outcome = save();
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + snapshot + ": the output would replace the input\n");
  EXPECT_EQ(TemporaryDirectory::text(capture), before);
}

TEST_F(SnapshotCommandTest, WhatIsNoSnapshotIsRefusedWithOneLine) {
  for (const std::string& contents :
       {""s, "garbage"s, "\0\0\0"s, "bplist00"s, "<plist version=\"1.0\"><dict>"s,
        "<plist version=\"1.0\"><dict/></plist>"s, "<plist version=\"1.0\"><true/></plist>"s}) {
    writeSnapshot(contents);
    for (const Outcome& outcome : {show(), exportDlf(), exportDlf({"--reframe"})}) {
      EXPECT_EQ(outcome.status, 1) << contents;
      EXPECT_EQ(outcome.output, "");
      EXPECT_THAT(outcome.errors, MatchesRegex("kestro-cli: " + snapshot + ": [^\n]+\n"));
    }
  }
  EXPECT_FALSE(std::filesystem::exists(dlf));
}

TEST_F(SnapshotCommandTest, MissingFilesAndDirectoriesAreRefused) {
  EXPECT_EQ(show().errors, "kestro-cli: " + snapshot + ": No such file or directory\n");
  snapshot = directory.directory();
  EXPECT_EQ(show().errors, "kestro-cli: " + snapshot + ": Is a directory\n");
  EXPECT_EQ(exportDlf().status, 1);
}

TEST_F(SnapshotCommandTest, ASnapshotOfOddContentsIsShownAsFarAsItGoes) {
  writeSnapshot(
      "<plist version=\"1.0\"><dict><key>Timestamp</key><string>now</string>"
      "<key>Description</key><true/>"
      "<key>Data</key><array><string>text</string><dict/>"
      "<dict><key>Description</key><string>\x1b[31mred</string><key>Display</key>"
      "<string>all</string><key>DisplayState</key><data>AQID</data></dict>"
      "</array></dict></plist>");
  const Outcome outcome = show();
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(outcome.output,
            "Timestamp    now\n"
            "Description  (unknown)\n"
            "History      3 entries\n"
            "\n"
            "(no description)  (empty)\n"
            "\n"
            "(no description)  (empty)\n"
            "\n"
            "␛[31mred\n"
            "  Packets  3 bytes\n"
            "  Display  all\n");
}

TEST_F(SnapshotCommandTest, ASnapshotOfATimestampOnlyIsShown) {
  writeSnapshot(
      "<plist version=\"1.0\"><dict><key>Timestamp</key><string>now</string></dict></plist>");
  EXPECT_EQ(show().output, "Timestamp  now\n");
  EXPECT_EQ(exportDlf().errors, "kestro-cli: " + snapshot + ": holds no DLF log\n");
}

TEST_F(SnapshotCommandTest, ExportsTheLogAsItWasSaved) {
  writeLTE({kMessage, kMessage});
  ASSERT_EQ(save().status, 0);
  const Outcome outcome = exportDlf();
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(outcome.errors, "");
  const std::string log = TemporaryDirectory::text(dlf);
  EXPECT_EQ(log.size(), 161U + 27U);
  EXPECT_THAT(log, StartsWith("\xA1\x00\xFD\x1F"s));
  EXPECT_THAT(log, EndsWith(kMessage.substr(1) + kMessage));
}

TEST_F(SnapshotCommandTest, ReframedEveryPacketFrames) {
  const std::string prefixed = "\x81\x02" + kMessage;
  writeLTE({kMessage, prefixed, kMessage, kMessage});
  ASSERT_EQ(save().status, 0);
  const Outcome outcome = exportDlf({"--reframe"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(outcome.errors, "");
  const std::string record = kMessage.substr(1);
  EXPECT_EQ(TemporaryDirectory::text(dlf).substr(161), record + record + record + record);
}

TEST_F(SnapshotCommandTest, WhatDoesNotFrameIsNamedAndLeftOut) {
  writeLTE({kMessage, "junk"});
  ASSERT_EQ(save().status, 0);
  const Outcome outcome = exportDlf({"--reframe"});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + snapshot +
                                ": entry 1: the last 4 bytes are no packets and are left out\n");
  EXPECT_EQ(TemporaryDirectory::text(dlf).substr(161), kMessage.substr(1));
}

TEST_F(SnapshotCommandTest, ALogOfOtherPacketsIsNotReframed) {
  writeSnapshot(
      "<plist version=\"1.0\"><dict><key>Timestamp</key><string>now</string><key>Data</key><array>"
      "<dict><key>DisplayState</key><data>AQID</data></dict>"
      "<dict><key>DLF</key><data>AQID</data></dict></array></dict></plist>");
  EXPECT_EQ(exportDlf().status, 0);
  EXPECT_EQ(TemporaryDirectory::text(dlf), "\x01\x02\x03");
  const Outcome outcome = exportDlf({"--reframe"});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors,
            "kestro-cli: " + snapshot + ": its DLF log does not hold the packets of its history\n");
}

TEST_F(SnapshotCommandTest, AnIFXSnapshotHasNoLog) {
  writeIFX({ifxMessage("1")});
  ASSERT_EQ(save().status, 0);
  const Outcome outcome = exportDlf();
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + snapshot + ": holds no DLF log\n");
}

TEST_F(SnapshotCommandTest, WrongUsageIsTwo) {
  const std::vector<std::vector<std::string>> wrong = {
      {"kestro-cli", "snapshot"},
      {"kestro-cli", "snapshot", "nonsense"},
      {"kestro-cli", "snapshot", "save", "a.pcap", "-o", "a.kestro"},
      {"kestro-cli", "snapshot", "save", "a.pcap", "--description=x"},
      {"kestro-cli", "snapshot", "save", "-o", "a.kestro", "--description=x"},
      {"kestro-cli", "snapshot", "show"},
      {"kestro-cli", "snapshot", "export-dlf", "a.kestro"},
  };
  for (const auto& arguments : wrong) {
    const Outcome outcome = run(arguments);
    EXPECT_EQ(outcome.status, 2) << arguments.back();
    EXPECT_EQ(outcome.output, "");
    EXPECT_NE(outcome.errors, "");
  }
}

TEST_F(SnapshotCommandTest, HelpIsAnAnswer) {
  for (const char* action : {"save", "show", "export-dlf"}) {
    const Outcome outcome = run({"kestro-cli", "snapshot", action, "--help"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, HasSubstr("Example"));
  }
  EXPECT_THAT(run({"kestro-cli", "snapshot", "--help"}).output, HasSubstr("export-dlf"));
}

}  // namespace
}  // namespace kestro::testing
