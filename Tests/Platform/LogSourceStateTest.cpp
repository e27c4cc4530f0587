// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <string>

#include "Platform/LogSourceState.h"

namespace kestro {
namespace {

TEST(SourceTextTest, NamesTheKindAndTheFile) {
  EXPECT_EQ(sourceText({.kind = "simulation", .isSimulated = true}), "simulation");
  EXPECT_EQ(sourceText({.kind = "capture", .name = "/a/b.pcap", .isSimulated = false}),
            "capture b.pcap");
  EXPECT_EQ(sourceText({.kind = "stream", .name = "-", .isSimulated = false}), "stream");
  EXPECT_EQ(sourceText({}), "");
}

TEST(SourceTextTest, WhatNoBasebandHasSentIsMarked) {
  EXPECT_EQ(sourceText({.kind = "drive-test", .name = "a.csv", .isSimulated = true}),
            "drive-test a.csv, simulated");
  EXPECT_EQ(sourceText({.isSimulated = true}), "simulated");
}

TEST(SourceTextTest, AnEndlessNameIsCutBetweenCharacters) {
  std::string name(119, 'a');
  for (int i = 0; i < 1000; ++i) name += "é";
  EXPECT_EQ(sourceText({.name = name}), std::string(119, 'a') + "…");
}

TEST(SourceEndedTextTest, SaysWhatHasEnded) {
  EXPECT_EQ(sourceEndedText({.kind = "capture"}), "the recording has ended");
  EXPECT_EQ(sourceEndedText({.kind = "drive-test"}), "the drive-test log has ended");
  EXPECT_EQ(sourceEndedText({.kind = "stream"}), "the stream has ended");
  EXPECT_EQ(sourceEndedText({}), "the source has ended");
}

}  // namespace
}  // namespace kestro
