// SPDX-License-Identifier: MIT
// Streams of framed messages, in pieces of any size.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <variant>
#include <vector>

#include "Platform/Virtual/VirtualServices.h"
#include "Sources/StreamSource.h"
#include "Tests/Sources/SourceReading.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;

class StreamSourceTest : public ::testing::Test {
 protected:
  void SetUp() override {
    _streams.allow("-");
    auto source = StreamSource::open(_streams, "-", "LTE");
    ASSERT_TRUE(source.has_value());
    _source = std::move(*source);
    _source->setReadyHandler([this] { drain(); });
  }

  void drain() {
    while (true) {
      const auto step = _source->next();
      if (!step.has_value()) {
        _outcome = step.error().message;
        return;
      }
      const auto* event = std::get_if<SourceEvent>(&*step);
      if (event == nullptr) {
        _outcome = std::holds_alternative<SourceWaits>(*step) ? "waits" : "ended";
        return;
      }
      EXPECT_FALSE(event->time.has_value());
      EXPECT_EQ(event->technology, "LTE");
      _messages.emplace_back(event->message.begin(), event->message.end());
    }
  }

  VirtualInputStreams _streams;
  std::unique_ptr<StreamSource> _source;
  std::vector<std::string> _messages;
  std::string _outcome;
};

const Bytes kTwoMessages = {3, 0, 0, 0, 'a', 'b', 'c', 2, 0, 0, 0, 'd', 'e'};

TEST_F(StreamSourceTest, YieldsEachMessageAsSoonAsItIsWhole) {
  _streams.receive(Bytes{3, 0, 0, 0, 'a', 'b'});
  EXPECT_TRUE(_messages.empty());
  _streams.receive(Bytes{'c', 2});
  EXPECT_THAT(_messages, ElementsAre("abc"));
  EXPECT_EQ(_outcome, "waits");
  _streams.receive(Bytes{0, 0, 0, 'd', 'e'});
  EXPECT_THAT(_messages, ElementsAre("abc", "de"));
}

TEST_F(StreamSourceTest, ThePiecesInWhichBytesArriveDoNotMatter) {
  _streams.receive(kTwoMessages);
  for (const auto byte : kTwoMessages) _streams.receive(Bytes{byte});
  EXPECT_THAT(_messages, ElementsAre("abc", "de", "abc", "de"));
  _streams.end("");
  EXPECT_EQ(_outcome, "ended");
}

TEST_F(StreamSourceTest, ALengthOfZeroYieldsNothing) {
  _streams.receive(Bytes{0, 0, 0, 0, 1, 0, 0, 0, 'x', 0, 0, 0, 0});
  EXPECT_THAT(_messages, ElementsAre("x"));
  EXPECT_EQ(_outcome, "waits");
}

TEST_F(StreamSourceTest, AnEndWithinAMessageSaysWhereAtEveryCut) {
  for (std::size_t length = 1; length < kTwoMessages.size(); ++length) {
    SetUp();
    _messages.clear();
    _streams.receive(ByteView(kTwoMessages).first(length));
    _streams.end("");
    const bool isBetween = length == 7;
    EXPECT_EQ(_messages.size(), length < 7 ? 0U : 1U) << length;
    const std::size_t begin = length < 7 ? 0 : 7;
    EXPECT_EQ(_outcome, isBetween
                            ? "ended"
                            : "standard input: the stream ends " + std::to_string(length - begin) +
                                  " bytes into the message at byte " + std::to_string(begin))
        << length;
  }
}

TEST_F(StreamSourceTest, ALengthAboveTheLongestMessageEndsIt) {
  _streams.receive(Bytes{1, 0, 0, 0, 'x', 0x01, 0x00, 0x00, 0x01, 'y'});
  EXPECT_THAT(_messages, ElementsAre("x"));
  EXPECT_EQ(_outcome,
            "standard input: the message at byte 5 would have 16777217 bytes, more than the "
            "16777216 of any message");
  _streams.receive(kTwoMessages);
  EXPECT_THAT(_messages, ElementsAre("x"));
}

TEST_F(StreamSourceTest, TheLongestMessageIsTaken) {
  _streams.receive(Bytes{0x00, 0x00, 0x00, 0x01});
  const Bytes piece(1024 * 1024, 'z');
  for (int i = 0; i < 16; ++i) _streams.receive(piece);
  ASSERT_EQ(_messages.size(), 1U);
  EXPECT_EQ(_messages[0].size(), 16U * 1024 * 1024);
}

TEST_F(StreamSourceTest, AReadErrorIsPassedOn) {
  _streams.end("Input/output error");
  EXPECT_EQ(_outcome, "standard input: Input/output error");
}

TEST_F(StreamSourceTest, StandardInputCannotStartAgain) {
  _streams.end("");
  EXPECT_FALSE(_source->restart().has_value());
}

TEST_F(StreamSourceTest, APathStartsAgainWithAFreshFrame) {
  _streams.allow("pipe");
  auto source = StreamSource::open(_streams, "pipe", "LTE");
  ASSERT_TRUE(source.has_value());
  _source = std::move(*source);
  _source->setReadyHandler([this] { drain(); });
  _streams.receive(Bytes{9, 0});
  _streams.end("");
  ASSERT_TRUE(_source->restart());
  _streams.receive(kTwoMessages);
  EXPECT_THAT(_messages, ElementsAre("abc", "de"));
}

TEST_F(StreamSourceTest, WhatCannotBeOpenedIsAnError) {
  EXPECT_FALSE(StreamSource::open(_streams, "/none", "LTE").has_value());
}

}  // namespace
}  // namespace kestro
