// SPDX-License-Identifier: MIT
// What a technology's index must have: its decoders, row by row.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Ondrel/ClassIndex.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/PacketBytes.h"
#include "Tests/Support/RecordedLines.h"

namespace kestro::testing {

enum class OtherCodes { Reported, Silent };

inline constexpr SectionKind kList = SectionKind::List;
inline constexpr SectionKind kDictionary = SectionKind::Dictionary;
inline constexpr OtherCodes kReported = OtherCodes::Reported;
inline constexpr OtherCodes kSilent = OtherCodes::Silent;

/// One decoder of an index.
struct DecoderRow {
  std::string_view section;
  SectionKind kind;
  std::string_view line;  ///< what it leaves for every packet
  OtherCodes otherCodes;
  std::vector<LogCode> codes;
  LogPriority priority = LogPriority::Warning;  ///< of that line
};

/// A packet whose code nobody knows leaves the decoder's line and, if it reports such packets, one
/// more; its section stays as it is.
inline void expectOtherCodeIsLeft(Base& decoder, const DecoderRow& row, RecordingSystemLog& log) {
  constexpr LogCode kNobodysCode = 0x1FFF;
  const Array list{"kept"};
  const Dictionary dictionary{{"kept", "text"}};
  decoder.updateSectionRef(row.kind == SectionKind::List ? Value(list) : Value(dictionary));
  static_cast<void>(log.take());
  decoder.updateWithDataLogCode(packet(kNobodysCode).length(300, 0xFF).bytes(), kNobodysCode);
  std::vector<Line> expected = {{row.priority, std::string(row.line)}};
  if (row.otherCodes == OtherCodes::Reported) {
    expected.push_back(errorLine("Received an unknown log message: 8191"));
  }
  EXPECT_EQ(log.take(), expected);
  EXPECT_EQ(Value(list), Value(Array{"kept"}));
  EXPECT_EQ(Value(dictionary), Value(Dictionary{{"kept", "text"}}));
}

/// Expects that an index that was just made has these decoders and no others, made in this order,
/// which is the order in which the subscribers of one code are called.
inline void expectDecoders(const ClassIndex& index, VirtualPlatform& platform,
                           std::span<const DecoderRow> rows) {
  std::vector<Line> made;
  std::map<LogCode, std::vector<std::string_view>> subscribers;
  for (const DecoderRow& row : rows) {
    made.push_back(warningLine("Array Count: " + std::to_string(row.codes.size())));
    for (const LogCode code : row.codes) subscribers[code].push_back(row.section);
  }
  EXPECT_EQ(platform.systemLog().take(), made);
  for (const DecoderRow& row : rows) {
    SCOPED_TRACE(row.section);
    Base* decoder = index.getClass(row.section);
    ASSERT_NE(decoder, nullptr);
    EXPECT_EQ(decoder->getSectionName(), row.section);
    EXPECT_EQ(decoder->sectionKind(), row.kind);
    EXPECT_THAT(decoder->getLogCodeArray(), ::testing::ElementsAreArray(row.codes));
    expectOtherCodeIsLeft(*decoder, row, platform.systemLog());
  }
  for (const auto& [code, sections] : subscribers) {
    SCOPED_TRACE(code);
    ASSERT_NE(index.getSubscribers(code), nullptr);
    std::vector<std::string_view> called;
    for (const Base* decoder : *index.getSubscribers(code)) {
      called.push_back(decoder->getSectionName());
    }
    EXPECT_EQ(called, sections);
  }
  EXPECT_EQ(index.getAllLogCodes().size(), subscribers.size());
  EXPECT_EQ(index.getSubscribers(0x1FFF), nullptr);
}

}  // namespace kestro::testing
