// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"
#include "LogGenerator/Ondrel/SectionDecoder.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using Line = RecordingSystemLog::Line;

constexpr Field kLevelFields[] = {{"Level", u8(13), decimal()}};
constexpr PacketKind kLevelPacket = {0x4179, "level", 14};
constexpr PacketKind kExtraPacket = {.code = 0xFF0001};
constexpr PacketKind kUnreadPacket = {.code = 0x0005};

constexpr PacketReading kLevelReadings[] = {{kLevelPacket, kLevelFields}};
// A plain SectionDecoder asks for its property list and cannot read it.
constexpr PropertyListReading kUnreadList = {.packet = kExtraPacket, .part = ListedPart::Root};
constexpr Section kLevelSection = {.name = "Level",
                                   .logLine = "LevelDecoder",
                                   .readings = kLevelReadings,
                                   .propertyList = &kUnreadList};

constexpr Field kCellFields[] = {{"Cell", u8(0), decimal()}};
constexpr ListReading kCellLists[] = {
    {.table = {.name = "cell", .count = u8(13), .base = 14, .stride = 1, .fields = kCellFields}}};
constexpr PacketReading kCellReadings[] = {{kLevelPacket, {}, kCellLists}, {kUnreadPacket}};
constexpr Section kCellSection = {.name = "Cells",
                                  .logLine = "CellDecoder",
                                  .kind = SectionKind::List,
                                  .readings = kCellReadings};

class TestIndex : public ClassIndex {
 public:
  explicit TestIndex(const GeneratorServices& services) : ClassIndex(services) {}

 private:
  std::unique_ptr<TableDecoder<kLevelSection>> _level = make<TableDecoder<kLevelSection>>();
  std::unique_ptr<TableDecoder<kCellSection>> _cells = make<TableDecoder<kCellSection>>();
};

class TestGenerator : public OndrelLogGenerator2 {
 public:
  explicit TestGenerator(const GeneratorServices& services) : OndrelLogGenerator2(services) {
    initWithPListNameCIndexObj("Test", std::make_unique<TestIndex>(services));
  }
};

class OndrelLogGenerator2Test : public ::testing::Test {
 protected:
  OndrelLogGenerator2Test() {
    setTemplate(Dictionary{{"Title", "Static"},
                           {"Group", Dictionary{{"Level", Dictionary()}, {"Cells", Array()}}}});
  }

  void setTemplate(const Value& displayTemplate) {
    platform.bundle().setResource("Test.plist", *coding->xml(displayTemplate));
  }

  void receive(const Bytes& message) { generator->updateStateWithData(state, message); }

  /// A packet of code 0x4179 whose payload is `payload`.
  static Bytes levelPacket(const Bytes& payload) {
    Bytes packet = {1, 0, 0, 0x79, 0x41, 0, 0, 0, 0, 0, 0, 0, 0};
    packet.insert(packet.end(), payload.begin(), payload.end());
    return packet;
  }

  /// "section.key" of every value.
  std::vector<std::string> explained(const Bytes& message) const {
    std::vector<std::string> result;
    generator->explainMessage(message, [&](const ExplainedValue& value) {
      result.push_back(std::string(value.section) + "." + std::string(value.key));
    });
    return result;
  }

  Dictionary group() { return state["Display"].dictionary()["Group"].dictionary(); }
  Value level() { return group()["Level"].dictionary()["Level"]; }

  std::vector<Line> takeLines() { return platform.systemLog().take(); }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::unique_ptr<TestGenerator> generator =
      std::make_unique<TestGenerator>(generatorServices(platform));
  Dictionary state;
};

TEST_F(OndrelLogGenerator2Test, LogsItsConstructionInOrder) {
  const std::string self = addressText(generator.get());
  std::vector<Line> lines = takeLines();
  ASSERT_THAT(lines, SizeIs(5));
  EXPECT_EQ(lines[0], (Line{LogPriority::Warning, "Array Count: 2"}));
  EXPECT_EQ(lines[1], (Line{LogPriority::Warning, "Array Count: 2"}));
  EXPECT_EQ(lines[2].priority, LogPriority::Error);
  EXPECT_THAT(lines[2].text,
              ::testing::MatchesRegex("Creating OndrelLogGenerator2 object with 0x[0-9a-f]+"));
  EXPECT_EQ(lines[3], (Line{LogPriority::Warning, "Creating Log object: " + self}));
  EXPECT_EQ(lines[4], (Line{LogPriority::Error, "Class Index: 1"}));
}

TEST_F(OndrelLogGenerator2Test, LogsItsDestructionAndThenItsIndexs) {
  const std::string self = addressText(generator.get());
  takeLines();
  generator.reset();
  EXPECT_THAT(takeLines(), ElementsAre(Line{LogPriority::Warning,
                                            "Ondrel_GSMLogGenerator is destructed " + self}));
  EXPECT_THAT(platform.standardOutput().lines(), ElementsAre("Deallocing ClassIndex"));
}

TEST_F(OndrelLogGenerator2Test, AsksForBasebandAndExtraCodes) {
  EXPECT_EQ(Value(generator->getStartCommand()),
            Value(Dictionary{{"SetState", "Streaming"},
                             {"SetOndrelLogCodes", Array{Value::integer(16761), Value::integer(5)}},
                             {"SetTqExtraCodes", Array{Value::integer(1)}}}));
}

TEST_F(OndrelLogGenerator2Test, ReturnsNoDisplayOnTheFirstRefreshButStoresIt) {
  EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
  for (const char* key : {"Display", "Template", "ExtraInfo", "DisplayState"}) {
    EXPECT_FALSE(state[key].isNull()) << key;
  }
  EXPECT_TRUE(
      state["Display"].dictionary().isSame(generator->generateLogUsingState(state).dictionary()));
}

TEST_F(OndrelLogGenerator2Test, BuildsTheDisplayBeforeTheFirstPacketIsDecoded) {
  receive(levelPacket({7}));
  EXPECT_EQ(level(), Value("7"));
  EXPECT_FALSE(generator->generateLogUsingState(state).isNull());
}

TEST_F(OndrelLogGenerator2Test, LogsTheBuildingOfTheDisplay) {
  takeLines();
  generator->generateLogUsingState(state);
  const std::vector<Line> lines = takeLines();
  ASSERT_THAT(lines, SizeIs(5));
  EXPECT_THAT(lines[0].text,
              ::testing::MatchesRegex("Initialized class index: 0x[0-9a-f]+, Self: 0x[0-9a-f]+"));
  EXPECT_EQ(lines[0].priority, LogPriority::Warning);
  EXPECT_EQ(lines[1], (Line{LogPriority::Warning, "Dictionary = 1"}));
  EXPECT_EQ(lines[2], (Line{LogPriority::Warning, "String = 0"}));
  EXPECT_EQ(lines[3], (Line{LogPriority::Warning, "Level"}));
  EXPECT_EQ(lines[4], (Line{LogPriority::Warning, "Cells"}));
}

TEST_F(OndrelLogGenerator2Test, DispatchesInConstructionOrder) {
  receive(levelPacket({1, 9}));
  const std::vector<Line> lines = takeLines();
  ASSERT_GE(lines.size(), 2U);
  EXPECT_EQ(lines[lines.size() - 2].text, "LevelDecoder");
  EXPECT_EQ(lines[lines.size() - 1].text, "CellDecoder");
  EXPECT_EQ(group()["Cells"], Value(Array{Dictionary{{"Cell", "9"}}}));
}

TEST_F(OndrelLogGenerator2Test, IgnoresMessagesOfTwelveBytesButCollectsThem) {
  generator->generateLogUsingState(state);
  takeLines();
  receive(Bytes(12, 0x81));
  EXPECT_THAT(takeLines(), IsEmpty());
  generator->generateLogUsingState(state);
  EXPECT_EQ(state["DisplayState"].bytes().size(), 12U);
}

TEST_F(OndrelLogGenerator2Test, TakesAPrefixedMessageOfThirteenBytesAsAPacketOfEleven) {
  generator->generateLogUsingState(state);
  takeLines();
  receive({0x81, 0, 1, 0, 0, 0x79, 0x41, 0, 0, 0, 0, 0, 0});
  EXPECT_THAT(takeLines(), ElementsAre(Line{LogPriority::Warning, "LevelDecoder"},
                                       Line{LogPriority::Warning, "CellDecoder"}));
  EXPECT_TRUE(level().isNull());
}

TEST_F(OndrelLogGenerator2Test, StripsThePrefixForDecodersAndCollectsIt) {
  const Bytes message = {0x81, 0x55, 1, 0, 0, 0x79, 0x41, 0, 0, 0, 0, 0, 0, 0, 0, 7};
  receive(message);
  EXPECT_EQ(level(), Value("7"));
  generator->generateLogUsingState(state);
  EXPECT_EQ(state["DisplayState"], Value::data(message));
}

TEST_F(OndrelLogGenerator2Test, DropsMessagesOfAnotherTypeWithALine) {
  generator->generateLogUsingState(state);
  takeLines();
  Bytes message = levelPacket({7});
  message[0] = 2;
  receive(message);
  EXPECT_THAT(takeLines(), ElementsAre(Line{LogPriority::Error, "Invalid log type: 2. Dropping."}));
  message[0] = 0xAB;
  receive(message);
  EXPECT_THAT(takeLines(),
              ElementsAre(Line{LogPriority::Error, "Invalid log type: ab. Dropping."}));
  EXPECT_TRUE(level().isNull());
}

TEST_F(OndrelLogGenerator2Test, ExplainsWhatItDispatches) {
  EXPECT_THAT(explained(levelPacket({7})),
              ElementsAre("Level.Level", "Cells.count", "Cells.Cell", "Cells.Cell", "Cells.Cell",
                          "Cells.Cell", "Cells.Cell", "Cells.Cell", "Cells.Cell"));
  Bytes dropped = levelPacket({7});
  dropped[0] = 2;
  EXPECT_THAT(explained(dropped), IsEmpty());
  EXPECT_THAT(explained(Bytes(12, 1)), IsEmpty());
}

TEST_F(OndrelLogGenerator2Test, KnowsNoGroupsWithoutATemplate) {
  setTemplate("no dictionary");
  std::vector<std::string_view> groups;
  generator->catalogue([&](const CatalogueEntry& entry) { groups.push_back(entry.group); });
  EXPECT_THAT(groups, ElementsAre("", "", "", ""));
}

TEST_F(OndrelLogGenerator2Test, AddsTheOffsetToExtraCodes) {
  generator->generateLogUsingState(state);
  takeLines();
  receive({0xFF, 0, 0, 0x01, 0x00, 0, 0, 0, 0, 0, 0, 0, 0});
  EXPECT_THAT(takeLines(),
              ElementsAre(Line{LogPriority::Warning, "LevelDecoder"},
                          Line{LogPriority::Error, "Received an unknown log message: 16711681"}));
}

TEST_F(OndrelLogGenerator2Test, IgnoresCodesThatNobodyWants) {
  generator->generateLogUsingState(state);
  takeLines();
  receive({1, 0, 0, 0x34, 0x12, 0, 0, 0, 0, 0, 0, 0, 0});
  receive({0xFF, 0, 0, 0x79, 0x41, 0, 0, 0, 0, 0, 0, 0, 0});
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(OndrelLogGenerator2Test, RebindsEveryDecoderToARebuiltDisplay) {
  receive(levelPacket({7}));
  const Value old = level();
  state.remove("Display");
  receive(levelPacket({8}));
  EXPECT_EQ(old, Value("7"));
  EXPECT_EQ(level(), Value("8"));
}

TEST_F(OndrelLogGenerator2Test, ReportsATemplateThatCannotBeLoadedAndTriesAgain) {
  for (const Bytes& contents :
       {Bytes{'x'}, *coding->xml(Value("no dictionary")), *coding->xml(Array{})}) {
    platform.bundle().setResource("Test.plist", contents);
    takeLines();
    EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
    EXPECT_THAT(takeLines(),
                ElementsAre(Line{LogPriority::Error, "Cannot load template for display"}));
    EXPECT_FALSE(state.contains("Display"));
  }
  setTemplate(Dictionary{{"Level", Dictionary()}});
  receive(levelPacket({7}));
  EXPECT_EQ(state["Display"], Value(Dictionary{{"Level", Dictionary{{"Level", "7"}}}}));
}

TEST_F(OndrelLogGenerator2Test, DispatchesAndCollectsWithoutATemplate) {
  platform.bundle().setResource("Test.plist", {});
  takeLines();
  receive(levelPacket({7}));
  EXPECT_THAT(takeLines(), ElementsAre(Line{LogPriority::Error, "Cannot load template for display"},
                                       Line{LogPriority::Warning, "LevelDecoder"},
                                       Line{LogPriority::Warning, "CellDecoder"}));
  generator->generateLogUsingState(state);
  EXPECT_EQ(state["DisplayState"].bytes().size(), 14U);
}

TEST_F(OndrelLogGenerator2Test, LeavesTheCachedTemplateAlone) {
  receive(levelPacket({7}));
  EXPECT_TRUE(state["Template"].dictionary()["Group"].dictionary()["Level"].dictionary().empty());
}

TEST_F(OndrelLogGenerator2Test, PrefersTheStatesTemplateToTheResource) {
  state.set("Template", Dictionary{{"Own", "text"}});
  generator->generateLogUsingState(state);
  EXPECT_EQ(state["Display"], Value(Dictionary{{"Own", "text"}}));
}

TEST_F(OndrelLogGenerator2Test, LeavesOutKeysThatAreNoTexts) {
  Dictionary odd{{"A", "1"}};
  odd.set(Value::integer(3), "three");
  takeLines();
  EXPECT_EQ(generator->processTemplate(odd), Value(Dictionary{{"A", "1"}}));
  EXPECT_THAT(takeLines(),
              ElementsAre(Line{LogPriority::Error, "Dictionary Key is not a string?"}));
}

TEST_F(OndrelLogGenerator2Test, ReportsObjectsOfUnknownTypeInTheTemplate) {
  takeLines();
  const Value processed = generator->processTemplate(Dictionary{{"A", Value::integer(1)}});
  EXPECT_TRUE(processed.dictionary()["A"].isNull());
  EXPECT_THAT(takeLines(),
              ElementsAre(Line{LogPriority::Error, "Received an object of unknown type"},
                          Line{LogPriority::Warning, "Processing the template"}));
}

TEST_F(OndrelLogGenerator2Test, DecodesWhatTheHistoryDoesNotKeep) {
  const Bytes large(kMaximumEntryBytes, 1);
  receive(large);
  receive(levelPacket({7}));
  EXPECT_EQ(level(), Value("7"));
  generator->generateLogUsingState(state);
  EXPECT_EQ(state["DisplayState"], Value::data(large));
}

TEST_F(OndrelLogGenerator2Test, ReportsEachUnknownObjectOnceWhenTheDisplayIsBuilt) {
  setTemplate(Dictionary{{"Title", Value::integer(1)}, {"List", Array{"a", Value::real(0.5)}}});
  takeLines();
  generator->generateLogUsingState(state);
  EXPECT_THAT(takeLines(),
              Contains(Line{LogPriority::Error, "Received an object of unknown type"}).Times(2));
}

TEST_F(OndrelLogGenerator2Test, ProcessesArraysElementByElement) {
  const Array original{"a", Dictionary{{"b", "c"}}};
  const Value processed = generator->processTemplate(original);
  EXPECT_EQ(processed, Value(original));
  EXPECT_FALSE(processed.array().isSame(original));
  EXPECT_FALSE(processed.array()[1].dictionary().isSame(original[1].dictionary()));
}

TEST_F(OndrelLogGenerator2Test, WalksADisplayForObjectsOfUnknownType) {
  takeLines();
  generator->printDict(Dictionary{{"A", Array{"x", Value::real(1)}}, {"B", Dictionary()}});
  EXPECT_THAT(takeLines(),
              ElementsAre(Line{LogPriority::Error, "Received an object of unknown type"}));
}

TEST_F(OndrelLogGenerator2Test, ContinuesOnTheDisplayOfAnEarlierGenerator) {
  receive(levelPacket({1, 9}));
  const Dictionary display = state["Display"].dictionary();
  generator = std::make_unique<TestGenerator>(generatorServices(platform));
  takeLines();

  receive(levelPacket({2, 8, 7}));

  EXPECT_TRUE(state["Display"].dictionary().isSame(display));
  EXPECT_EQ(level(), Value("2"));
  EXPECT_EQ(group()["Cells"], Value(Array{Dictionary{{"Cell", "8"}}, Dictionary{{"Cell", "7"}}}));
  EXPECT_THAT(takeLines(),
              ElementsAre(Line{LogPriority::Warning, "Level"}, Line{LogPriority::Warning, "Cells"},
                          Line{LogPriority::Warning, "LevelDecoder"},
                          Line{LogPriority::Warning, "CellDecoder"}));
}

TEST_F(OndrelLogGenerator2Test, BindsAnEarlierDisplayOnce) {
  generator->generateLogUsingState(state);
  generator = std::make_unique<TestGenerator>(generatorServices(platform));
  generator->generateLogUsingState(state);
  takeLines();
  generator->generateLogUsingState(state);
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(OndrelLogGenerator2Test, PassesOverContainersOfTheWrongKind) {
  state.set("Display", Dictionary{{"Level", Array()}, {"Cells", "text"}});
  takeLines();
  receive(levelPacket({1, 9}));
  EXPECT_EQ(state["Display"], Value(Dictionary{{"Level", Array()}, {"Cells", "text"}}));
  EXPECT_THAT(takeLines(), ElementsAre(Line{LogPriority::Warning, "LevelDecoder"},
                                       Line{LogPriority::Warning, "CellDecoder"}));
}

TEST_F(OndrelLogGenerator2Test, DoesNotDescendIntoABoundSection) {
  state.set("Display", Dictionary{{"Level", Dictionary{{"Cells", Array()}}}});
  receive(levelPacket({1, 9}));
  EXPECT_EQ(state["Display"],
            Value(Dictionary{{"Level", Dictionary{{"Cells", Array()}, {"Level", "1"}}}}));
}

TEST_F(OndrelLogGenerator2Test, WritesNowhereOnceTheDisplayIsGone) {
  receive(levelPacket({1, 9}));
  state.remove("Display");
  state.remove("Template");
  platform.bundle().setResource("Test.plist", {});
  receive(levelPacket({2, 8, 7}));
  EXPECT_FALSE(state.contains("Display"));
}

TEST_F(OndrelLogGenerator2Test, NamesTheKeysOfItsDisplay) {
  EXPECT_THAT(generator->stateKeys(), ElementsAre("Display", "ExtraInfo", "Template"));
}

}  // namespace
}  // namespace kestro
