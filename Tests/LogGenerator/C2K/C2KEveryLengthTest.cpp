// SPDX-License-Identifier: MIT
// Packets that their parsers take whole, cut at every length and with their counts at the limit.
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

std::vector<SubPacketBytes> statusParts() {
  return {SubPacketBytes(1, 6).u8(4, 8), SubPacketBytes(2, 14),
          SubPacketBytes(3, 300).u16(4, 8).u8(6, 2).u8(7, 2).u8(8, 255).u8(9, 255),
          SubPacketBytes(4, 8)};
}

std::vector<PacketBytes> wholePackets() {
  return {packet(0x108A).u8(22, 5).length(23 + 14 * 5),
          packet(0x1183).length(50, 0x5A),
          packet(0x1192).length(241, 0x5A),
          packet(0x12B6).u8(15, 7).length(25 + 12 * 7),
          packetOf(0x119C, statusParts()),
          packetOf(0x119D, {{3, 9}, SubPacketBytes(11, 25).u8(24, 1)}),
          packet(0x127E).length(1750, 0x5A),
          packet(0x134F).u8(13, 3).length(186, 0x5A)};
}

class C2KEveryLengthTest : public C2KFixture, public ::testing::WithParamInterface<std::size_t> {
 protected:
  [[nodiscard]] static Bytes message() { return wholePackets()[GetParam()].bytes(); }

  /// Whether a packet was taken: something is shown, or a rate waits for the next packet.
  [[nodiscard]] bool hasTakenOne() const {
    return !shownNames().empty() || state.contains("FLDataSent") || state.contains("RLDataSent");
  }
};

TEST_P(C2KEveryLengthTest, DecodesEveryPrefixOfAPacket) {
  const Bytes whole = message();
  for (std::size_t length = 0; length <= whole.size(); ++length) {
    receive(ByteView(whole).first(length));
    if (length % 100 == 0) generator->generateLogUsingState(state);
  }
  EXPECT_TRUE(hasTakenOne());
}

TEST_P(C2KEveryLengthTest, ExplainsEveryPrefixWithinThePacketOrMarksIt) {
  const Bytes whole = message();
  for (std::size_t length = 0; length <= whole.size(); ++length) {
    const auto memory = std::make_unique<std::uint8_t[]>(length);
    std::copy_n(whole.begin(), length, memory.get());
    generator->explainMessage({memory.get(), length}, [&](const ExplainedValue& value) {
      EXPECT_FALSE(value.key.empty());
      for (const ExplainedSource& source : value.sources) {
        EXPECT_EQ(source.isPastEnd, source.offset + source.width > length);
      }
    });
  }
}

TEST_P(C2KEveryLengthTest, ExplainsAPrefixUnlessTheLogSaysWhyItIsRefused) {
  const Bytes whole = message();
  for (std::size_t length = kPacketHeaderSize; length <= whole.size(); ++length) {
    const ByteView prefix = ByteView(whole).first(length);
    receive(prefix);
    std::size_t count = 0;
    generator->explainMessage(prefix, [&](const ExplainedValue&) { ++count; });
    ASSERT_EQ(takeLines().empty(), count != 0) << length;
  }
}

TEST_P(C2KEveryLengthTest, TakesEveryByteAtItsHighest) {
  Bytes whole = message();
  for (std::size_t i = 13; i < whole.size(); ++i) {
    const std::uint8_t byte = std::exchange(whole[i], 0xFF);
    receive(whole);
    whole[i] = byte;
    if (i % 100 == 0) generator->generateLogUsingState(state);
  }
  EXPECT_TRUE(hasTakenOne());
}

INSTANTIATE_TEST_SUITE_P(AllCodes, C2KEveryLengthTest, ::testing::Range<std::size_t>(0, 8));

}  // namespace
}  // namespace kestro::testing
