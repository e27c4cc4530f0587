// SPDX-License-Identifier: MIT
// Recordings over changes of technology.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Recordings/PcapFormat.h"
#include "Recordings/PcapRecording.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using testing::TemporaryDirectory;

class PcapRecordingTest : public ::testing::Test {
 protected:
  TemporaryDirectory _directory;
};

Bytes recordAtZero(std::uint8_t byte) {
  return {0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0, byte};
}

TEST_F(PcapRecordingTest, GoesOnInANumberedFileWhenTheTechnologyChanges) {
  auto recording = PcapRecording::create(_directory.pathOf("drive.pcap"), "LTE");
  ASSERT_TRUE(recording.has_value());
  ASSERT_TRUE(recording->write(Moment(), Bytes{'a'}));
  ASSERT_TRUE(recording->setTechnology("Ondrel_GSM"));
  ASSERT_TRUE(recording->write(Moment(), Bytes{'b'}));
  ASSERT_TRUE(recording->setTechnology("LTE"));
  ASSERT_TRUE(recording->write(Moment(), Bytes{'c'}));

  EXPECT_THAT(recording->files(),
              ElementsAre(_directory.pathOf("drive.pcap"), _directory.pathOf("drive-2.pcap"),
                          _directory.pathOf("drive-3.pcap")));
  EXPECT_EQ(TemporaryDirectory::read(_directory.pathOf("drive.pcap")),
            joined({captureHeader(150), recordAtZero('a')}));
  EXPECT_EQ(TemporaryDirectory::read(_directory.pathOf("drive-2.pcap")),
            joined({captureHeader(148), recordAtZero('b')}));
  EXPECT_EQ(TemporaryDirectory::read(_directory.pathOf("drive-3.pcap")),
            joined({captureHeader(150), recordAtZero('c')}));
  EXPECT_EQ(recording->messageCount(), 3U);
}

TEST_F(PcapRecordingTest, TheSameTechnologyAgainStaysInTheFile) {
  auto recording = PcapRecording::create(_directory.pathOf("drive.pcap"), "LTE");
  ASSERT_TRUE(recording.has_value());
  ASSERT_TRUE(recording->setTechnology("LTE"));
  EXPECT_THAT(recording->files(), ElementsAre(_directory.pathOf("drive.pcap")));
}

TEST_F(PcapRecordingTest, StandardOutputEndsWithItsTechnology) {
  ::testing::internal::CaptureStdout();
  auto recording = PcapRecording::create("-", "LTE");
  ASSERT_TRUE(recording.has_value());
  ASSERT_TRUE(recording->write(Moment(), Bytes{'a'}));
  const auto changed = recording->setTechnology("IFX");
  const std::string written = ::testing::internal::GetCapturedStdout();
  EXPECT_EQ(Bytes(written.begin(), written.end()), joined({captureHeader(150), recordAtZero('a')}));
  ASSERT_FALSE(changed);
  EXPECT_EQ(changed.error().message,
            "standard output: the technology has changed from LTE to IFX, and a pcap capture "
            "holds one");
}

TEST_F(PcapRecordingTest, TheNumberStandsBeforeTheLastExtensionOnly) {
  auto recording = PcapRecording::create(_directory.pathOf("a.b"), "LTE");
  ASSERT_TRUE(recording.has_value());
  ASSERT_TRUE(recording->setTechnology("IFX"));
  EXPECT_EQ(recording->files().back(), _directory.pathOf("a-2.b"));

  auto plain = PcapRecording::create(_directory.pathOf("plain"), "LTE");
  ASSERT_TRUE(plain.has_value());
  ASSERT_TRUE(plain->setTechnology("IFX"));
  EXPECT_EQ(plain->files().back(), _directory.pathOf("plain-2"));
}

TEST_F(PcapRecordingTest, AMessageTooLongForACaptureIsCountedAndLeftOut) {
  auto recording = PcapRecording::create(_directory.pathOf("drive.pcap"), "LTE");
  ASSERT_TRUE(recording.has_value());
  ASSERT_TRUE(recording->write(Moment(), Bytes(kMaximumPcapMessageSize + 1)));
  ASSERT_TRUE(recording->write(Moment(), Bytes{'a'}));
  EXPECT_EQ(recording->leftOutCount(), 1U);
  EXPECT_EQ(recording->messageCount(), 1U);
  EXPECT_EQ(TemporaryDirectory::read(_directory.pathOf("drive.pcap")),
            joined({captureHeader(150), recordAtZero('a')}));
}

TEST_F(PcapRecordingTest, ATechnologyThatCannotBeRecordedLeavesTheFileBefore) {
  auto recording = PcapRecording::create(_directory.pathOf("drive.pcap"), "LTE");
  ASSERT_TRUE(recording.has_value());
  const auto refused = recording->setTechnology("5G");
  ASSERT_FALSE(refused.has_value());
  EXPECT_THAT(refused.error().message, HasSubstr("drive-2.pcap: \"5G\""));
  ASSERT_TRUE(recording->write(Moment(), Bytes{'a'}));
  EXPECT_EQ(TemporaryDirectory::read(_directory.pathOf("drive.pcap")),
            joined({captureHeader(150), recordAtZero('a')}));
}

}  // namespace
}  // namespace kestro
