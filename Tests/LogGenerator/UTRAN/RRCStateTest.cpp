// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/RRCState.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

class RRCStateTest : public DecoderFixture<RRC_State> {
 protected:
  static PacketBytes state(unsigned valid, unsigned mode) {
    return packet(0xD0E0).u8(13, valid).u8(14, mode);
  }

  [[nodiscard]] const std::vector<std::string>& consoleLines() {
    return platform.consoleLog().lines();
  }
};

TEST_F(RRCStateTest, ShowsTheMode) {
  decode(state(1, 3));
  EXPECT_THAT(entries(), ElementsAre(Pair("State", "Cell DCH")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("RRC Info")));
  EXPECT_THAT(consoleLines(),
              ElementsAre("Display Dict = { State = \"Cell DCH\"; }, rrc mode = 3 Cell DCH"));
}

TEST_F(RRCStateTest, NamesEveryMode) {
  const char* const names[] = {"Disconnected", "Connecting",   "Cell Fach",       "Cell DCH",
                               "Cell PCH",     "Cell URA PCH", "Unknown RRC Mode"};
  for (unsigned mode = 0; mode < std::size(names); ++mode) {
    decode(state(1, mode));
    EXPECT_EQ(text("State"), names[mode]) << mode;
  }
  decode(state(1, 255));
  EXPECT_EQ(text("State"), "Unknown RRC Mode");
}

TEST_F(RRCStateTest, WritesASingleWordWithoutQuotes) {
  decode(state(1, 0));
  EXPECT_THAT(consoleLines(),
              ElementsAre("Display Dict = { State = Disconnected; }, rrc mode = 0 Disconnected"));
}

TEST_F(RRCStateTest, KnowsNoModeUnlessTheFlagIsOne) {
  for (const unsigned flag : {0U, 2U, 3U, 255U}) {
    decode(state(flag, 3));
    EXPECT_EQ(text("State"), "Unknown RRC Mode") << flag;
    EXPECT_EQ(consoleLines().back(),
              "Display Dict = { State = \"Unknown RRC Mode\"; }, rrc mode = 255 Unknown RRC Mode");
  }
}

TEST_F(RRCStateTest, ShowsAModeOfItsOwnNumber) {
  decode(state(1, 6));
  EXPECT_EQ(consoleLines().back(),
            "Display Dict = { State = \"Unknown RRC Mode\"; }, rrc mode = 6 Unknown RRC Mode");
}

TEST_F(RRCStateTest, ReadsEightBitsOfTheMode) {
  decode(state(1, 254).length(17, 0xFF));
  EXPECT_EQ(consoleLines().back(),
            "Display Dict = { State = \"Unknown RRC Mode\"; }, rrc mode = 254 Unknown RRC Mode");
}

TEST_F(RRCStateTest, APacketWithoutItsModeIsReportedAndShown) {
  decode(state(1, 3));
  takeLines();
  decode(state(1, 0).length(14));
  EXPECT_THAT(entries(), ElementsAre(Pair("State", "Unknown RRC Mode")));
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("RRC Info"),
                          warningLine("LogCode_0xD0E0 is length is 14 expected size 15")));
  EXPECT_EQ(consoleLines().back(),
            "Display Dict = { State = \"Unknown RRC Mode\"; }, rrc mode = 255 Unknown RRC Mode");
}

TEST_F(RRCStateTest, NoLengthIsTooShort) {
  for (std::size_t length = 0; length < 15; ++length) {
    section().set("State", "before");
    takeLines();
    decode(state(1, 3).length(length).bytes(), 0xD0E0);
    EXPECT_EQ(text("State"), "Unknown RRC Mode") << length;
    EXPECT_THAT(takeLines(),
                ElementsAre(warningLine("RRC Info"),
                            warningLine("LogCode_0xD0E0 is length is " + std::to_string(length) +
                                        " expected size 15")));
  }
}

TEST_F(RRCStateTest, TakesLongerPackets) {
  decode(state(1, 4).length(40, 0xFF));
  EXPECT_EQ(text("State"), "Cell PCH");
  EXPECT_THAT(takeLines(), SizeIs(1));
}

TEST_F(RRCStateTest, IgnoresOtherCodesSilently) {
  decode(state(1, 3).bytes(), 0xD0E1);
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("RRC Info")));
  EXPECT_THAT(consoleLines(), IsEmpty());
}

TEST_F(RRCStateTest, WritesTheConsoleLineWithoutASectionToo) {
  RRC_State unbound(generatorServices(platform));
  unbound.updateWithDataLogCode(state(1, 3).bytes(), 0xD0E0);
  EXPECT_EQ(consoleLines().back(), "Display Dict = (null), rrc mode = 3 Cell DCH");
}

TEST_F(RRCStateTest, ExplainsWhereTheModeComesFrom) {
  std::vector<std::string> explained;
  const ExplainVisitor visit = [&](const ExplainedValue& value) {
    explained.push_back(std::string(value.key) + "@" + std::to_string(value.sources[0].offset) +
                        (value.sources[0].isPastEnd ? "!" : "") + "=" +
                        std::string(value.text.text()));
  };
  decoder.explainPacket(state(1, 3).bytes(), 0xD0E0, visit);
  EXPECT_THAT(explained, ElementsAre("Mode Valid@13=", "State@14=Cell DCH"));
  explained.clear();
  decoder.explainPacket(state(1, 3).length(14).bytes(), 0xD0E0, visit);
  EXPECT_THAT(explained, ElementsAre("State@14!=Unknown RRC Mode"));
}

}  // namespace
}  // namespace kestro::testing
