// SPDX-License-Identifier: MIT
// Recordings of whole drives, and which form a recording has.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "Recordings/PcapngRecording.h"
#include "Recordings/RecordingWriter.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Recordings/PcapngBytes.h"
#include "Tests/Support/FileSizeLimit.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using testing::TemporaryDirectory;

class PcapngRecordingTest : public ::testing::Test {
 protected:
  [[nodiscard]] Bytes file() const { return TemporaryDirectory::read(_path); }
  /// An interface as the writer describes it.
  static PcapngText& interface(PcapngText& text, unsigned linkType, std::string_view name) {
    return text.interface(linkType, PcapngText().option(2, name).option(9, "\6").end(), 262'144);
  }

  TemporaryDirectory _directory;
  const std::string _path = _directory.pathOf("drive.pcapng");
};

TEST_F(PcapngRecordingTest, AllTechnologiesAreInOneFileWithTheirNotes) {
  auto recording = PcapngRecording::create(_path, "LTE", "simulation").value();
  ASSERT_TRUE(recording.addNote("first"));
  ASSERT_TRUE(recording.addNote("second"));
  ASSERT_TRUE(recording.write(Moment(), Bytes{'a'}));
  ASSERT_TRUE(recording.setTechnology("Ondrel_GSM"));
  ASSERT_TRUE(recording.write(Moment(), Bytes{'b'}));
  ASSERT_TRUE(recording.setTechnology("LTE"));
  ASSERT_TRUE(recording.write(Moment(), Bytes{'c'}));
  ASSERT_TRUE(recording.addNote("third"));
  ASSERT_TRUE(recording.finish());

  PcapngText expected = PcapngText().section(PcapngText().option(1, "made-up: simulation").end());
  interface(expected, 150, "LTE");
  expected.packet(0, 0, "a", PcapngText().option(1, "first").option(1, "second").end());
  interface(expected, 148, "Ondrel_GSM").packet(1, 0, "b").packet(0, 0, "c");
  expected.section(PcapngText().option(1, "made-up: simulation").option(1, "third").end());
  EXPECT_EQ(file(), expected.get());
  EXPECT_THAT(recording.files(), ElementsAre(_path));
  EXPECT_EQ(recording.messageCount(), 3U);
}

TEST_F(PcapngRecordingTest, WithoutNotesThereIsNoLastSection) {
  auto recording = PcapngRecording::create(_path, "LTE").value();
  ASSERT_TRUE(recording.finish());
  EXPECT_EQ(file(), PcapngText().section().get());
}

TEST_F(PcapngRecordingTest, ATooLongMessageIsCountedAndItsNotesWaitForTheNext) {
  auto recording = PcapngRecording::create(_path, "LTE").value();
  ASSERT_TRUE(recording.addNote("n"));
  ASSERT_TRUE(recording.write(Moment(), Bytes(262'145, 'x')));
  EXPECT_EQ(file(), PcapngText().section().get());
  ASSERT_TRUE(recording.write(Moment(), Bytes{'a'}));
  EXPECT_EQ(recording.messageCount(), 1U);
  EXPECT_EQ(recording.leftOutCount(), 1U);
  PcapngText expected = PcapngText().section();
  interface(expected, 150, "LTE").packet(0, 0, "a", PcapngText().option(1, "n").end());
  EXPECT_EQ(file(), expected.get());
}

TEST_F(PcapngRecordingTest, NotesThatWaitAreLimited) {
  auto recording = PcapngRecording::create(_path, "LTE").value();
  for (std::size_t i = 0; i < 1000; ++i) ASSERT_TRUE(recording.addNote("n"));
  EXPECT_FALSE(recording.addNote("n"));
  ASSERT_TRUE(recording.write(Moment(), Bytes{'a'}));
  EXPECT_TRUE(recording.addNote("n"));
}

TEST_F(PcapngRecordingTest, AnUnknownTechnologyIsRefusedAndCreatesNothing) {
  const auto refused = PcapngRecording::create(_path, "NR");
  ASSERT_FALSE(refused.has_value());
  EXPECT_EQ(refused.error().message, _path + ": \"NR\" is no technology to record");
  EXPECT_FALSE(std::filesystem::exists(_path));
  auto recording = PcapngRecording::create(_path, "LTE").value();
  EXPECT_FALSE(recording.setTechnology("NR").has_value());
}

TEST_F(PcapngRecordingTest, NoInputIsReplaced) {
  _directory.write("drive.pcapng", "an input");
  const auto refused = PcapngRecording::create(_path, "LTE", {}, {_path});
  ASSERT_FALSE(refused.has_value());
  EXPECT_EQ(refused.error().message, _path + ": the output would replace the input");
  EXPECT_EQ(TemporaryDirectory::text(_path), "an input");
}

TEST_F(PcapngRecordingTest, OnlyTheEndingPcapMakesAPcapCapture) {
  const std::string pcap = _directory.pathOf("drive.pcap");
  ASSERT_TRUE(createRecording(pcap, "LTE", "simulation", {}).has_value());
  EXPECT_EQ(TemporaryDirectory::read(pcap), captureHeader(150));
  for (const char* name : {"drive.pcapng", "drive", "drive.PCAP", "pcap", "drive.pcap.1"}) {
    const std::string path = _directory.pathOf(name);
    ASSERT_TRUE(createRecording(path, "LTE", "", {}).has_value());
    EXPECT_EQ(TemporaryDirectory::read(path), PcapngText().section().get()) << name;
  }
}

TEST_F(PcapngRecordingTest, APcapCaptureHoldsNoNotes) {
  const auto recording = createRecording(_directory.pathOf("drive.pcap"), "LTE", "", {}).value();
  EXPECT_FALSE(recording->addNote("n"));
  EXPECT_TRUE(recording->finish());
}

}  // namespace
}  // namespace kestro
