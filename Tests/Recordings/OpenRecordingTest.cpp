// SPDX-License-Identifier: MIT
// A recording's form is told by its content.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Recordings/OpenRecording.h"
#include "Tests/Recordings/DlfBytes.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Recordings/PcapngBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using testing::TemporaryDirectory;

class OpenRecordingTest : public ::testing::Test {
 protected:
  /// Opens what looks by its name like something else.
  Result<std::unique_ptr<RecordingReader>> open(ByteView contents) {
    _path = _directory.write("log.csv", contents);
    return openRecording(_path, {.coding = *_coding});
  }

  TemporaryDirectory _directory;
  std::string _path;
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
};

TEST_F(OpenRecordingTest, PcapIsKnownByEachOfItsFirstFourBytes) {
  const std::vector<Bytes> magics = {{0xD4, 0xC3, 0xB2, 0xA1}, {0xA1, 0xB2, 0xC3, 0xD4},
                                     {0x4D, 0x3C, 0xB2, 0xA1}, {0xA1, 0xB2, 0x3C, 0x4D},
                                     {0x34, 0xCD, 0xB2, 0xA1}, {0xA1, 0xB2, 0xCD, 0x34}};
  for (Bytes magic : magics) {
    EXPECT_EQ(formOfRecording(magic), RecordingForm::Pcap);
    magic[3] ^= 1;
    EXPECT_EQ(formOfRecording(magic), std::nullopt);
  }
}

TEST_F(OpenRecordingTest, PcapIsReadWithItsTechnology) {
  const auto reader = open(joined({captureHeader(150), twoRecords()}));
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  EXPECT_EQ(reader.value()->form(), RecordingForm::Pcap);
  EXPECT_THAT(reader.value()->technologies(), ::testing::ElementsAre("LTE"));
  const auto message = reader.value()->next().value().value();
  EXPECT_EQ(message.technology, "LTE");
  EXPECT_EQ(message.number, 1U);
  EXPECT_THAT(message.bytes, ::testing::ElementsAre('a', 'b', 'c'));
  EXPECT_TRUE(message.comments.empty());
}

TEST_F(OpenRecordingTest, PcapngIsKnownByItsFirstFourBytesAndRead) {
  EXPECT_EQ(formOfRecording(Bytes{0x0A, 0x0D, 0x0D, 0x0A}), RecordingForm::Pcapng);
  EXPECT_EQ(formOfRecording(Bytes{0x0A, 0x0D, 0x0D, 0x0B}), std::nullopt);
  const auto reader = open(smallestPcapng());
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  EXPECT_EQ(reader.value()->form(), RecordingForm::Pcapng);
  EXPECT_EQ(reader.value()->next().value().value().technology, "LTE");
}

TEST_F(OpenRecordingTest, ADlfLogIsKnownByItsVersionReport) {
  Bytes log = dlfVersionReport();
  const auto reader = open(log);
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  EXPECT_EQ(reader.value()->form(), RecordingForm::Dlf);
  log[3] ^= 1;
  EXPECT_EQ(formOfRecording(log), std::nullopt);
}

TEST_F(OpenRecordingTest, ASnapshotIsKnownAsAPropertyList) {
  using namespace std::string_view_literals;
  for (const std::string_view head :
       {"<?xml version"sv, "<plist>"sv, "\n <!-- c --><plist>"sv, "\xEF\xBB\xBF<?xml"sv,
        "bplist00"sv, "<\0?\0"sv, "\xFF\xFE<\0?\0"sv, "\xFE\xFF\0<\0?"sv}) {
    EXPECT_EQ(formOfRecording(Bytes(head.begin(), head.end())), RecordingForm::Snapshot) << head;
  }
  for (const std::string_view head : {"\xEF\xBB\xBFTimestamp,"sv, "<html>"sv, "  "sv}) {
    EXPECT_EQ(formOfRecording(Bytes(head.begin(), head.end())), std::nullopt) << head;
  }
  const Dictionary snapshot{{"Timestamp", "2012-03-04 13:05:09 +0100"}};
  const auto reader = open(_coding->xml(snapshot).value());
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  EXPECT_EQ(reader.value()->form(), RecordingForm::Snapshot);
}

TEST_F(OpenRecordingTest, WhatIsOfNoFormIsRefused) {
  for (const std::string_view contents : {"Timestamp,Longitude\n", "x"}) {
    const auto reader = open(Bytes(contents.begin(), contents.end()));
    ASSERT_FALSE(reader.has_value());
    EXPECT_EQ(reader.error().message, _path + ": unknown file format");
  }
}

TEST_F(OpenRecordingTest, AnEmptyFileIsCalledEmpty) {
  const auto reader = open({});
  ASSERT_FALSE(reader.has_value());
  EXPECT_EQ(reader.error().message, _path + ": the file is empty");
}

TEST_F(OpenRecordingTest, AMissingFileIsNamedOnce) {
  const auto path = _directory.pathOf("none.pcap");
  const auto reader = openRecording(path, {.coding = *_coding});
  ASSERT_FALSE(reader.has_value());
  EXPECT_EQ(reader.error().message, path + ": No such file or directory");
}

}  // namespace
}  // namespace kestro
