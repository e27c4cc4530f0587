// SPDX-License-Identifier: MIT
// kestro-cli convert.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <string>
#include <thread>
#include <vector>

#include "Recordings/PcapngReader.h"
#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/PacketMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/EndToEnd/RecordingFixture.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

using ::testing::StartsWith;

constexpr const char* kConverter = KESTRO_PROGRAM_DIRECTORY "/kestro-cli";

constexpr std::string_view kTwoModes =
    "Timestamp,NetworkMode,RSRP,RSRQ,RSSI,CELLHEX,LACHEX,RAWCELLID,Latitude,Longitude\n"
    "2019.11.21_15.38.30,LTE,-90,-7,-70,1,9CBA,258,51.5,-8.5\n"
    "2019.11.21_15.38.40,EDGE,-71,-,-,2B,1A,43,51.6,-8.6\n";

class ConvertTest : public RecordingFixture {
 protected:
  /// Nothing else lies in the directory.
  [[nodiscard]] std::vector<std::string> files() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(directory.path())) {
      names.push_back(entry.path().filename().string());
    }
    std::ranges::sort(names);
    return names;
  }
};

TEST_F(ConvertTest, ACaptureComesBackByteForByteThroughADrive) {
  const auto a = capture("a.pcap", {ifxMessage("1"), ifxMessage("2")});
  const auto drive = directory.pathOf("b.pcapng");
  const auto back = directory.pathOf("c.pcap");
  const auto outcome = cli({"convert", a, "-o", drive});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(outcome.errors, "");
  EXPECT_EQ(cli({"convert", drive, "-o", back}).errors, "");
  EXPECT_EQ(TemporaryDirectory::read(back), TemporaryDirectory::read(a));
  EXPECT_THAT(files(), ElementsAre("a.pcap", "b.pcapng", "c.pcap"));
}

TEST_F(ConvertTest, ADriveTestLogKeepsItsTimesPositionsAndMark) {
  const auto log = directory.write("log.csv", kTwoModes);
  const auto drive = directory.pathOf("drive.pcapng");
  ASSERT_EQ(cli({"convert", log, "-o", drive}).status, 0);
  auto reader = PcapngReader::open(*RecordedFile::open(drive));
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  std::vector<std::string> found;
  while (const auto message = *(*reader)->next()) {
    EXPECT_EQ((*reader)->madeUp(), "drive-test");
    const bool isLTE = message->technology == "LTE";
    EXPECT_EQ(message->time, Moment(isLTE ? 1'574'350'710s : 1'574'350'720s));
    EXPECT_THAT(message->comments,
                ElementsAre(isLTE ? "position: 51.5, -8.5" : "position: 51.6, -8.6"));
    if (found.empty() || found.back() != message->technology) {
      found.emplace_back(message->technology);
    }
  }
  EXPECT_THAT(found, ElementsAre("LTE", "Ondrel_GSM"));
}

TEST_F(ConvertTest, WhatIsMadeUpIsMarkedMessageByMessage) {
  const auto real = capture("real.pcap", {ifxMessage("1")});
  const auto drive = directory.pathOf("drive.pcapng");
  ASSERT_EQ(cli({"convert", real, "simulation:IFX", "--to=+4s", "-o", drive}).status, 0);
  auto reader = PcapngReader::open(*RecordedFile::open(drive));
  std::vector<std::string> marks;
  while (const auto message = *(*reader)->next()) {
    if (marks.empty() || marks.back() != (*reader)->madeUp())
      marks.emplace_back((*reader)->madeUp());
  }
  EXPECT_THAT(marks, ElementsAre("simulation"));  // it begins 309 s before the capture
  ASSERT_EQ(cli({"convert", real, drive, "-o", directory.pathOf("both.pcapng")}).status, 0);
  auto both = PcapngReader::open(*RecordedFile::open(directory.pathOf("both.pcapng")));
  marks.clear();
  while (const auto message = *(*both)->next()) {
    if (marks.empty() || marks.back() != (*both)->madeUp()) marks.emplace_back((*both)->madeUp());
  }
  EXPECT_THAT(marks, ElementsAre("simulation", ""));
}

TEST_F(ConvertTest, TwoTechnologiesInPcapAreRefusedAndNothingIsLost) {
  const auto log = directory.write("log.csv", kTwoModes);
  for (const std::string name : {"drive.pcap", "drive.dlf"}) {
    const auto path = directory.write(name, std::string_view("earlier"));
    const auto outcome = cli({"convert", log, "-o", path});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.errors, HasSubstr(path + ": "));
    EXPECT_THAT(outcome.errors, HasSubstr("is Ondrel_GSM behind LTE: --technology narrows to one, "
                                          "and pcapng holds several"));
    EXPECT_EQ(TemporaryDirectory::text(path), "earlier");
  }
  EXPECT_THAT(files(), ElementsAre("drive.dlf", "drive.pcap", "log.csv"));
}

TEST_F(ConvertTest, PropertyListsInADlfLogAreRefused) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  const auto outcome = cli({"convert", a, "-o", directory.pathOf("a.dlf")});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_THAT(outcome.errors, HasSubstr("property lists: pcapng and pcap hold them"));
  EXPECT_THAT(files(), ElementsAre("a.pcap"));
}

TEST_F(ConvertTest, ADlfLogHasAVersionReportAndARecordAPacket) {
  // A prefix in front of the second packet, which is no part of its record.
  std::string first = messageOf(packet(0xB0C2).u8(40, 7));
  std::string second = messageOf(packet(0xFF0002).u8(20, 9));
  for (std::string* message : {&first, &second}) {  // the length of what follows the type byte
    (*message)[1] = static_cast<char>(message->size() - 1);
  }
  const auto a = capture("a.pcap", {first, "\x81\x01" + second, "no packet"}, "LTE");
  const auto log = directory.pathOf("a.dlf");
  const auto outcome = cli({"convert", a, "-o", log});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + a + ": message 3: it is no packet\n");
  const std::string bytes = TemporaryDirectory::text(log);
  EXPECT_THAT(bytes, StartsWith(std::string("\xA1\x00\xFD\x1F", 4)));
  EXPECT_EQ(bytes.substr(161), first.substr(1) + second.substr(1));
  // The report's time is that of the first message: 1330862709.
  EXPECT_EQ(bytes.substr(97, 4), "\x75\x5A\x53\x4F");
}

TEST_F(ConvertTest, TheFormMayBeNamed) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  const auto path = directory.pathOf("noending");
  const auto outcome = cli({"convert", a, "-o", path});
  EXPECT_EQ(outcome.status, 2);
  EXPECT_THAT(outcome.errors, HasSubstr("--to-format must say it"));
  EXPECT_EQ(cli({"convert", a, "-o", path, "--to-format=pcap"}).status, 0);
  EXPECT_EQ(TemporaryDirectory::read(path), TemporaryDirectory::read(a));
  EXPECT_EQ(cli({"convert", a, "-o", path, "--to-format=csv"}).status, 2);
}

TEST_F(ConvertTest, StandardOutputAndPipesAreWrittenAsTheyAre) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  const auto expected = TemporaryDirectory::text(a);
  EXPECT_EQ(cli({"convert", a, "-o", "-", "--to-format=pcap"}).output, expected);
  const auto pipe = directory.pathOf("pipe.pcap");
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  const auto outcome =
      run({"/bin/sh", "-c",
           "cat '" + pipe + "' & \"$0\" convert '" + a + "' -o '" + pipe + "'; wait", kConverter});
  EXPECT_EQ(outcome.output, expected);
  EXPECT_TRUE(std::filesystem::is_fifo(pipe));
}

TEST_F(ConvertTest, APipeMayBeRead) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  const auto outcome = run(
      {"/bin/sh", "-c", "cat '" + a + "' | \"$0\" convert - -o - --to-format=pcap", kConverter});
  EXPECT_EQ(outcome.output, TemporaryDirectory::text(a));
}

TEST_F(ConvertTest, AnOutputThatIsAnInputIsRefused) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  const auto link = directory.pathOf("link.pcap");
  std::filesystem::create_symlink(a, link);
  const auto before = TemporaryDirectory::text(a);
  for (const auto& output : {a, link}) {
    const auto outcome = cli({"convert", a, "-o", output});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.errors, HasSubstr("the output would replace the input"));
  }
  EXPECT_EQ(TemporaryDirectory::text(a), before);
}

TEST_F(ConvertTest, WhereItCannotBeWrittenNothingIsLeft) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  std::filesystem::create_directory(directory.pathOf("d.pcap"));
  for (const std::string name : {"d.pcap", "none/x.pcap"}) {
    const auto path = directory.pathOf(name);
    const auto outcome = cli({"convert", a, "-o", path});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.errors, StartsWith("kestro-cli: " + path + ": cannot create: "));
  }
  EXPECT_THAT(files(), ElementsAre("a.pcap", "d.pcap"));
  const auto full = cli({"convert", a, "-o", "/dev/full", "--to-format=pcapng"});
  EXPECT_EQ(full.status, 1);
  EXPECT_THAT(full.errors, StartsWith("kestro-cli: /dev/full: "));
}

TEST_F(ConvertTest, AnEarlierFileKeepsItsModeAndALinkLeadsToTheNewOne) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  const auto target = directory.write("target.pcap", std::string_view("earlier"));
  std::filesystem::permissions(target, std::filesystem::perms(0640));
  const auto link = directory.pathOf("link.pcap");
  std::filesystem::create_symlink(target, link);
  ASSERT_EQ(cli({"convert", a, "-o", link}).status, 0);
  EXPECT_TRUE(std::filesystem::is_symlink(link));
  EXPECT_EQ(TemporaryDirectory::read(target), TemporaryDirectory::read(a));
  EXPECT_EQ(std::filesystem::status(target).permissions(), std::filesystem::perms(0640));
}

TEST_F(ConvertTest, KilledItLeavesTheEarlierFileAndNothingElse) {
  const auto path = directory.write("a.pcapng", std::string_view("earlier"));
  Process process({"kestro-cli", "convert", "simulation:LTE", "--to=+10000h", "-o", path});
  std::this_thread::sleep_for(300ms);
  process.signal(SIGTERM);
  EXPECT_EQ(process.wait(), -SIGTERM);
  EXPECT_EQ(TemporaryDirectory::text(path), "earlier");
  EXPECT_THAT(files(), ElementsAre("a.pcapng"));
}

TEST_F(ConvertTest, ADamagedInputIsConvertedUpToTheDamage) {
  const auto a = capture("a.pcap", {ifxMessage("1"), ifxMessage("2")});
  std::filesystem::resize_file(a, std::filesystem::file_size(a) - 1);
  const auto path = directory.pathOf("b.pcap");
  EXPECT_EQ(cli({"convert", a, "-o", path}).status, 3);
  EXPECT_EQ(cli({"decode", path}).output, cli({"decode", a}).output);
}

TEST_F(ConvertTest, WhatPcapDoesNotKeepIsTold) {
  const auto log = directory.write("log.csv", kTwoModes);
  const auto outcome = cli({"convert", log, "-o", directory.pathOf("a.pcap"), "--technology=LTE"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_THAT(outcome.errors, HasSubstr("are not kept in pcap; pcapng holds them"));
}

TEST_F(ConvertTest, NotesBehindTheLastMessageAreKept) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  const auto drive = directory.pathOf("b.pcapng");
  ASSERT_EQ(cli({"convert", a, "-o", drive}).status, 0);
  {  // A section without messages, whose comment is a note.
    std::ofstream file(drive, std::ios::binary | std::ios::app);
    file << std::string("\x0A\x0D\x0D\x0A\x28\0\0\0\x4D\x3C\x2B\x1A\x01\0\0\0", 16)
         << std::string(8, '\xFF') << std::string("\x01\0\x03\0bye\0\0\0\0\0\x28\0\0\0", 16);
  }
  const auto again = directory.pathOf("c.pcapng");
  ASSERT_EQ(cli({"convert", drive, "-o", again}).status, 0);
  auto reader = PcapngReader::open(*RecordedFile::open(again));
  while (*(*reader)->next()) {
  }
  EXPECT_THAT((*reader)->closingNotes(), ElementsAre("bye"));
}

}  // namespace
}  // namespace kestro::testing
