// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

class C2KLogGeneratorTest : public C2KFixture {
 protected:
  /// A frame that is good, or bad.
  static PacketBytes frame(unsigned errors) {
    return packetOf(0x119D, {SubPacketBytes(11, 25).u8(24, errors)});
  }

  Bytes collected() {
    generator->generateLogUsingState(state);
    const ByteView bytes = state[kStateDisplayState].bytes();
    return {bytes.begin(), bytes.end()};
  }

  /// The messages of the template's processing since the last call.
  long templateLines() {
    return std::ranges::count(platform.systemLog().take(), warningLine("Processing the template"));
  }
};

TEST_F(C2KLogGeneratorTest, LogsItsCreationAndNotItsEnd) {
  auto made = C2KLogGenerator::generator(generatorServices(platform));
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("Creating Log object: " + addressText(made.get()))));
  made.reset();
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, AsksForItsCodesInOrder) {
  Array codes;
  for (const int code : {4234, 4483, 4498, 4790, 4508, 4509, 4734, 4943}) {
    codes.append(Value::integer(code));
  }
  EXPECT_EQ(Value(generator->getStartCommand()),
            Value(Dictionary{{"SetState", "Streaming"}, {"SetOndrelLogCodes", codes}}));
}

TEST_F(C2KLogGeneratorTest, NamesItsStateKeys) {
  EXPECT_THAT(generator->stateKeys(),
              ElementsAre("Display", "ExtraInfo", "Template", "Lookup", "TrafficFER",
                          "FLDataSeqNum", "FLDataSent", "RLDataSeqNum", "RLDataSent"));
}

// --- Template ------------------------------------------------------------------------------------

TEST_F(C2KLogGeneratorTest, GivesTheDisplayTheTemplatesShape) {
  setTemplate(Dictionary{
      {"_sorted", "_sorted"},
      {"1;Radio", Dictionary{{"Channel", "kChannel"}, {"Deeper", Dictionary{{"AGC", "kRxAGC0"}}}}},
      {"2;Rate", "kFLDataRate"},
      {"Empty", Dictionary()}});
  EXPECT_EQ(generator->getDisplayFromState(state),
            Value(Dictionary{
                {"_sorted", "_sorted"},
                {"1;Radio", Dictionary{{"Channel", ""}, {"Deeper", Dictionary{{"AGC", ""}}}}},
                {"2;Rate", ""},
                {"Empty", Dictionary()}}));
  EXPECT_EQ(templateLines(), 4);  // one for each dictionary
}

TEST_F(C2KLogGeneratorTest, LeavesOtherValuesOfTheTemplateOut) {
  setTemplate(Dictionary{
      {"Array", Array{"kChannel"}}, {"Number", Value::integer(1)}, {"Channel", "kChannel"}});
  EXPECT_EQ(generator->getDisplayFromState(state), Value(Dictionary{{"Channel", ""}}));
}

TEST_F(C2KLogGeneratorTest, FillsTheLookupTable) {
  setTemplate(Dictionary{{"A", "kChannel"}, {"Group", Dictionary{{"B", "kChannel"}, {"C", "x"}}}});
  generator->getDisplayFromState(state);
  const Dictionary lookup = state["Lookup"].dictionary();
  const Dictionary group = display()["Group"].dictionary();
  EXPECT_EQ(Value(lookup),
            Value(Dictionary{{"kChannel", Array{Dictionary{{"key", "A"}, {"dict", display()}},
                                                Dictionary{{"key", "B"}, {"dict", group}}}},
                             {"x", Array{Dictionary{{"key", "C"}, {"dict", group}}}}}));
  const Dictionary target = lookup["kChannel"].array()[1].dictionary();
  EXPECT_TRUE(target["dict"].dictionary().isSame(group));
}

TEST_F(C2KLogGeneratorTest, StoresWhatTheTemplateMade) {
  const Value shown = generator->getDisplayFromState(state);
  EXPECT_TRUE(shown.dictionary().isSame(display()));
  EXPECT_EQ(state["ExtraInfo"], Value(Dictionary()));
  EXPECT_TRUE(state["Template"].isDictionary());
  EXPECT_EQ(templateLines(), 1);
  EXPECT_TRUE(generator->getDisplayFromState(state).dictionary().isSame(display()));
  EXPECT_EQ(templateLines(), 0);
}

TEST_F(C2KLogGeneratorTest, PrefersTheStatesTemplate) {
  state.set("Template", Dictionary{{"Own", "kChannel"}});
  EXPECT_EQ(generator->getDisplayFromState(state), Value(Dictionary{{"Own", ""}}));
}

TEST_F(C2KLogGeneratorTest, ShowsEveryPlaceOfALookupName) {
  setTemplate(Dictionary{{"A", "k1xTrafficFER"}, {"Group", Dictionary{{"B", "k1xTrafficFER"}}}});
  receive(frame(1));
  EXPECT_EQ(Value(display()),
            Value(Dictionary{{"A", "1.56%"}, {"Group", Dictionary{{"B", "1.56%"}}}}));
}

TEST_F(C2KLogGeneratorTest, ALeafOfAnUnknownNameStaysEmpty) {
  setTemplate(Dictionary{{"A", "kNobody"}, {"B", "k1xTrafficFER"}});
  receive(frame(1));
  EXPECT_EQ(Value(display()), Value(Dictionary{{"A", ""}, {"B", "1.56%"}}));
}

TEST_F(C2KLogGeneratorTest, DropsValuesThatTheTemplateDoesNotShow) {
  setTemplate(Dictionary{{"A", "kChannel"}});
  receive(frame(1));
  EXPECT_EQ(Value(display()), Value(Dictionary{{"A", ""}}));
  EXPECT_THAT(takeLines(), IsEmpty());
}

class C2KLogGeneratorWithoutTemplateTest : public C2KLogGeneratorTest {
 protected:
  C2KLogGeneratorWithoutTemplateTest() {
    platform.bundle().setResource("C2KTemplate.plist", {0x00, 0x01});
  }
};

TEST_F(C2KLogGeneratorWithoutTemplateTest, ShowsNothingAndTriesAgain) {
  const Line failure = errorLine("Cannot load C2K template for display");
  EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
  receive(frame(1));
  EXPECT_THAT(takeLines(), ElementsAre(failure, failure));
  EXPECT_FALSE(state.contains("Display"));
  setTemplate(Dictionary{{"A", "k1xTrafficFER"}});
  EXPECT_EQ(generator->generateLogUsingState(state), Value(Dictionary{{"A", ""}}));
}

TEST_F(C2KLogGeneratorWithoutTemplateTest, GoesOnTakingPackets) {
  receive(frame(1));
  EXPECT_EQ(state["TrafficFER"], Value::real(0.015625));
  EXPECT_EQ(collected(), frame(1).bytes());
}

TEST_F(C2KLogGeneratorWithoutTemplateTest, ATemplateMustBeADictionary) {
  setTemplate(Array{"kChannel"});
  EXPECT_TRUE(generator->getDisplayFromState(state).isNull());
  EXPECT_FALSE(state.contains("Template"));
}

// --- Packets -------------------------------------------------------------------------------------

TEST_F(C2KLogGeneratorTest, IgnoresMessagesOfFewerThanThirteenBytes) {
  Bytes message = frame(1).bytes();
  message.resize(12);
  receive(message);
  message[0] = 0x81;
  receive(message);
  EXPECT_THAT(takeLines(), IsEmpty());
  EXPECT_THAT(collected(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, RemovesThePrefixFirst) {
  Bytes message = {0x81, 0x7F};
  const Bytes packet = frame(1).bytes();
  message.insert(message.end(), packet.begin(), packet.end());
  receive(message);
  EXPECT_EQ(text("k1xTrafficFER"), "1.56%");
  EXPECT_EQ(collected(), packet);
}

TEST_F(C2KLogGeneratorTest, AThirteenByteMessageWithAPrefixGoesOnAsElevenBytes) {
  receive(Bytes{0x81, 0, 1, 0, 0, 0x9D, 0x11, 0, 0, 0, 0, 0, 0});
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x119d is 11 bytes long but must be at "
                                                 "least 17 bytes.")));
  EXPECT_THAT(collected(), SizeIs(11));
}

TEST_F(C2KLogGeneratorTest, ReportsAWrongLogTypeAndDecodesThePacketAllTheSame) {
  for (const auto& [type, line] : {std::pair(2U, "Invalid log type: 2. Dropping."),
                                   {0U, "Invalid log type: 0. Dropping."},
                                   {0xABU, "Invalid log type: ab. Dropping."}}) {
    state.remove("TrafficFER");
    receive(frame(1).u8(0, type));
    EXPECT_THAT(takeLines(), ElementsAre(errorLine(line)));
    EXPECT_EQ(text("k1xTrafficFER"), "1.56%");
  }
  EXPECT_THAT(collected(), SizeIs(3 * 42));
}

TEST_F(C2KLogGeneratorTest, AnExtraPacketHasAnUnknownCode) {
  receive(frame(1).u8(0, 0xFF));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Invalid log type: ff. Dropping.")));
  EXPECT_FALSE(state.contains("TrafficFER"));
  EXPECT_THAT(collected(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, IgnoresUnknownCodesSilently) {
  receive(frame(1).u16(3, 0x119E));
  receive(frame(1).u16(3, 0x9D11));
  EXPECT_THAT(takeLines(), IsEmpty());
  EXPECT_THAT(collected(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, CollectsPacketsThatTheirParserRejects) {
  const Bytes first = packet(0x1183).length(20, 0xAA).bytes();
  const Bytes second = frame(0).bytes();
  receive(first);
  receive(second);
  Bytes both = first;
  both.insert(both.end(), second.begin(), second.end());
  EXPECT_EQ(collected(), both);
  EXPECT_THAT(collected(), IsEmpty());
}

// --- Refresh and reconnection --------------------------------------------------------------------

TEST_F(C2KLogGeneratorTest, TheFirstRefreshReturnsTheDisplay) {
  EXPECT_TRUE(generator->generateLogUsingState(state).dictionary().isSame(display()));
  EXPECT_TRUE(state["DisplayState"].isData());
}

TEST_F(C2KLogGeneratorTest, ARefreshKeepsTheDisplayInTheHistory) {
  receive(frame(1));
  generator->generateLogUsingState(state);
  receive(frame(0));
  generator->generateLogUsingState(state);
  const Array history = state["History"].array();
  ASSERT_THAT(history, SizeIs(2));
  const auto shownIn = [&](std::size_t entry) {
    return history[entry].dictionary()["Display"].dictionary()["k1xTrafficFER"];
  };
  EXPECT_EQ(shownIn(0), Value("1.56%"));
  EXPECT_EQ(shownIn(1), Value("1.54%"));
}

TEST_F(C2KLogGeneratorTest, ANewGeneratorGoesOnWithTheOldState) {
  receive(frame(1));
  generator = C2KLogGenerator::generator(generatorServices(platform));
  receive(frame(0));
  EXPECT_EQ(text("k1xTrafficFER"), "1.54%");
}

TEST_F(C2KLogGeneratorTest, ExportsPacketsWithoutTheirFirstByte) {
  receive(frame(1));
  generator->generateLogUsingState(state);
  const auto dlf = generator->generateDlfFromState(state);
  ASSERT_TRUE(dlf);
  EXPECT_THAT(*dlf, SizeIs(161 + 42 - 1));
}

// --- Explaining and listing ----------------------------------------------------------------------

TEST_F(C2KLogGeneratorTest, ExplainsValuesAtTheirPlacesInTheDisplay) {
  setTemplate(Dictionary{
      {"_sorted", "_sorted"},
      {"1;1x",
       Dictionary{{"_sorted", "_sorted"}, {"7;Errors", Dictionary{{"1;Rate", "k1xTrafficFER"}}}}},
      {"Rate", "k1xTrafficFER"}});
  std::vector<std::string> lines;
  generator->explainMessage(frame(1).bytes(), [&](const ExplainedValue& value) {
    lines.push_back(std::string(value.section) + "|" + std::string(value.key));
  });
  EXPECT_THAT(lines, ElementsAre("1x/Errors|1;Rate", "|Rate"));
}

TEST_F(C2KLogGeneratorTest, ExplainsValuesThatAreNotShownUnderTheirPacket) {
  setTemplate(Dictionary());
  std::vector<std::string> lines;
  generator->explainMessage(frame(1).bytes(), [&](const ExplainedValue& value) {
    lines.push_back(std::string(value.section) + "|" + std::string(value.key));
  });
  EXPECT_THAT(lines, ElementsAre("1x traffic frame|k1xTrafficFER"));
}

TEST_F(C2KLogGeneratorTest, ExplainsNothingOfOtherMessages) {
  EXPECT_THAT(explained(frame(1).u16(3, 0x119E)), IsEmpty());
  EXPECT_THAT(explained(frame(1).length(12)), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, ListsWhatEachSectionTakesFromEachCode) {
  setTemplate(Dictionary{{"Radio", Dictionary{{"Channel", "kChannel"}, {"Tx", "kTxAGC"}}},
                         {"State", "k1xEVDODeviceState"},
                         {"Fingers", "kFingerC2I"}});
  std::vector<std::string> lines;
  generator->catalogue([&](const CatalogueEntry& entry) {
    std::string line = std::to_string(entry.code) + " " + std::string(entry.packetName) + " " +
                       std::to_string(entry.minimumLength) + " " + std::string(entry.group) + "/" +
                       std::string(entry.section);
    for (const CatalogueKey& key : entry.keys) line += "," + std::string(key.key);
    lines.push_back(line);
  });
  ASSERT_THAT(lines, SizeIs(10));
  EXPECT_EQ(lines[0], "4234 EV-DO finger C/I 23 /,PN Offset,Energy");
  EXPECT_EQ(lines[1], "4483 EV-DO status 50 Radio/Radio,Channel,Tx");
  EXPECT_EQ(lines[2], "4483 EV-DO status 50 /,State");
  EXPECT_EQ(lines[3],
            "4483 EV-DO status 50 /EV-DO status,kBandClass,kRxAGC0,kRxAGC1,kServingPNOffset,"
            "kSessionState,kUATI24,kColorCode");
  EXPECT_EQ(lines[4], "4498 EV-DO forward throughput 241 /EV-DO forward throughput,kFLDataRate");
  EXPECT_EQ(lines[6],
            "4508 1x status 17 /1x status,k1xDeviceState,k1xRx0BandClass,k1xRx0ChanNum,k1xRxAGC0,"
            "k1xRx1BandClass,k1xRx1ChanNum,k1xRxAGC1,k1xTxAGC,k1xActiveSetInfo,k1xTrafficFER");
}

// --- The program's own template ------------------------------------------------------------------

class C2KTemplateTest : public C2KFixture {
 protected:
  C2KTemplateTest() { addTemplates(platform); }
};

TEST_F(C2KTemplateTest, ShowsEveryLookupNameOnce) {
  generator->getDisplayFromState(state);
  const Dictionary lookup = state["Lookup"].dictionary();
  for (const char* name : kLookupNames) EXPECT_THAT(lookup[name].array(), SizeIs(1)) << name;
  EXPECT_THAT(lookup, SizeIs(std::size(kLookupNames)));
}

TEST_F(C2KTemplateTest, PutsOneXBeforeEVDO) {
  const Dictionary shown = generator->getDisplayFromState(state).dictionary();
  EXPECT_EQ(shown["_sorted"], Value("_sorted"));
  EXPECT_TRUE(shown["01;1x"].isDictionary());
  EXPECT_TRUE(shown["02;EV-DO"].isDictionary());
}

TEST_F(C2KTemplateTest, EveryGroupIsOrdered) {
  const auto isOrdered = [](const auto& self, const Dictionary& group) -> void {
    EXPECT_EQ(group["_sorted"], Value("_sorted"));
    for (const auto& [key, value] : group) {
      if (key != Value("_sorted")) {
        EXPECT_THAT(std::string(key.text()), ::testing::MatchesRegex("[0-9][0-9];.+"));
      }
      if (value.isDictionary()) self(self, value.dictionary());
    }
  };
  isOrdered(isOrdered, generator->getDisplayFromState(state).dictionary());
}

TEST_F(C2KLogGeneratorTest, DecodesWhatTheHistoryDoesNotKeep) {
  setTemplate(Dictionary{{"FER", "kTrafficFER"}});
  Bytes large = frame(0).bytes();
  large.resize(kMaximumEntryBytes);
  receive(large);
  const Value before = state[kStateTrafficFER];
  receive(frame(1));
  EXPECT_NE(state[kStateTrafficFER], before);
  EXPECT_EQ(collected(), large);
}

}  // namespace
}  // namespace kestro::testing
