// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/LogGenerator/Ondrel/DecoderRows.h"
#include "Tests/Support/PacketBytes.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;

const Value kSections = Dictionary{{"RRC Info", Dictionary()},
                                   {"Serving Cell Info", Dictionary()},
                                   {"TRCH BLER", Array()},
                                   {"CCTRCH SIR", Array()},
                                   {"PDP Context Info", Array()}};

class UTRANLogGeneratorTest : public ::testing::Test {
 protected:
  void setTemplate(std::string path, const Value& contents = kSections) {
    platform.bundle().setResource(std::move(path), *coding->xml(contents));
  }

  void make() { generator = UTRANLogGenerator::generator(generatorServices(platform)); }

  void receive(const PacketBytes& packet) { generator->updateStateWithData(state, packet.bytes()); }

  std::vector<std::string> takeTexts() {
    std::vector<std::string> texts;
    for (const Line& line : platform.systemLog().take()) texts.push_back(line.text);
    return texts;
  }

  Dictionary display() { return state["Display"].dictionary(); }

  /// Whether a template of this path is found: then its one leaf shows.
  bool uses(const std::string& path) {
    setTemplate(path, Dictionary{{"Found", "yes"}});
    make();
    state.clear();
    generator->getDisplayFromState(state);
    return display()["Found"] == Value("yes");
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::unique_ptr<UTRANLogGenerator> generator;
  Dictionary state;
};

TEST_F(UTRANLogGeneratorTest, TheIndexHasADecoderForEverySection) {
  const DecoderRow rows[] = {
      {"RRC Info", kDictionary, "RRC Info", kSilent, {0xD0E0}},
      {"Serving Cell Info", kDictionary, "Serving Cell Info", kSilent, {0xD0E2, 0xFF0001}},
      {"Neighbor Cell List", kList, "NeighbhorMeasurements List", kSilent, {0xD00A}},
      {"GSM Neighbor Cell List", kList, "GSM Neighbor Cell List", kSilent, {0xD00E}},
      {"TRCH BLER", kList, "TRCH BLER Measurement", kSilent, {0xD00C}, LogPriority::Notice},
      {"CCTRCH SIR", kList, "CCTRCH SIR Measurement", kSilent, {0xD00C}},
      {"PDP Context Info", kList, "PDPContextList", kSilent, {0xFF0002}},
      {"SIM Info", kDictionary, "SimInfo", kSilent, {0xFF0000}},
  };
  const UTRANClassIndex index(generatorServices(platform));
  expectDecoders(index, platform, rows);
}

TEST_F(UTRANLogGeneratorTest, LogsItsConstructionInOrder) {
  setTemplate("UTRAN.plist");
  make();
  const std::vector<Line> lines = platform.systemLog().take();
  ASSERT_EQ(lines.size(), 12U);
  const char* const counts[] = {"1", "2", "1", "1", "1", "1", "1", "1"};
  for (std::size_t i = 0; i < 8; ++i) {
    EXPECT_EQ(lines[i], (Line{LogPriority::Warning, std::string("Array Count: ") + counts[i]}));
  }
  EXPECT_THAT(lines[8].text,
              ::testing::MatchesRegex("Creating OndrelLogGenerator2 object with 0x[0-9a-f]+"));
  EXPECT_EQ(lines[9],
            (Line{LogPriority::Warning, "Creating Log object: " + addressText(generator.get())}));
  EXPECT_EQ(lines[10], (Line{LogPriority::Error, "Class Index: 1"}));
  EXPECT_EQ(lines[11], (Line{LogPriority::Error, "Created UTRANLogGenerator object"}));
}

TEST_F(UTRANLogGeneratorTest, LogsItsDestructionOnce) {
  setTemplate("UTRAN.plist");
  make();
  const std::string self = addressText(generator.get());
  takeTexts();
  generator.reset();
  EXPECT_THAT(takeTexts(), ElementsAre("Ondrel_GSMLogGenerator is destructed " + self));
  EXPECT_THAT(platform.standardOutput().lines(), ElementsAre("Deallocing ClassIndex"));
}

TEST_F(UTRANLogGeneratorTest, AsksForTheCodesOfItsDecoders) {
  setTemplate("UTRAN.plist");
  make();
  const auto numbers = [](std::initializer_list<std::int64_t> list) {
    Array array;
    for (const std::int64_t number : list) array.append(Value::integer(number));
    return array;
  };
  EXPECT_EQ(
      Value(generator->getStartCommand()),
      Value(Dictionary{{"SetState", "Streaming"},
                       {"SetOndrelLogCodes", numbers({0xD0E0, 0xD0E2, 0xD00A, 0xD00E, 0xD00C})},
                       {"SetTqExtraCodes", numbers({1, 2, 0})}}));
}

TEST_F(UTRANLogGeneratorTest, FindsItsTemplateInAnyCase) {
  EXPECT_TRUE(uses("My utran display.plist"));
}

TEST_F(UTRANLogGeneratorTest, TakesTheFirstOfSeveralTemplates) {
  setTemplate("a UTRAN.plist", Dictionary{{"First", "yes"}});
  setTemplate("UTRAN.plist", Dictionary{{"Second", "yes"}});
  setTemplate("LTE.plist", Dictionary{{"Other", "yes"}});
  make();
  generator->getDisplayFromState(state);
  EXPECT_EQ(display()["Second"], Value("yes"));  // capitals come first in name order
}

TEST_F(UTRANLogGeneratorTest, LooksForTheWordInTheWholePath) {
  setTemplate("UTRAN/Display.plist");
  setTemplate("Display.plist", Dictionary{{"Found", "yes"}});
  make();
  generator->getDisplayFromState(state);
  // The name alone is left of the path.
  EXPECT_EQ(display()["Found"], Value("yes"));
}

TEST_F(UTRANLogGeneratorTest, SharedPacketsReachBothDecodersInOrder) {
  setTemplate("UTRAN.plist");
  make();
  generator->getDisplayFromState(state);
  takeTexts();
  receive(packet(0xD00C).u8(14, 0x40).u8(15, 0x10).u8(17, 3).u8(323, 4));
  EXPECT_THAT(takeTexts(), ElementsAre("TRCH BLER Measurement", "CCTRCH SIR Measurement"));
  EXPECT_EQ(display()["TRCH BLER"].array()[0].dictionary()["TRCH ID"], Value("3"));
  EXPECT_EQ(display()["CCTRCH SIR"].array()[0].dictionary()["CCTRCH ID"], Value("4"));
}

TEST_F(UTRANLogGeneratorTest, ListsItsCodes) {
  setTemplate("UTRAN.plist");
  make();
  std::vector<std::pair<LogCode, std::string>> entries;
  generator->catalogue([&](const CatalogueEntry& entry) {
    entries.emplace_back(entry.code, std::string(entry.section));
  });
  EXPECT_THAT(entries,
              ElementsAre(Pair(0xD0E0U, "RRC Info"), Pair(0xD0E2U, "Serving Cell Info"),
                          Pair(0xFF0001U, "Serving Cell Info"), Pair(0xD00AU, "Neighbor Cell List"),
                          Pair(0xD00EU, "GSM Neighbor Cell List"), Pair(0xD00CU, "TRCH BLER"),
                          Pair(0xD00CU, "CCTRCH SIR"), Pair(0xFF0002U, "PDP Context Info"),
                          Pair(0xFF0000U, "SIM Info")));
}

class UTRANLogGeneratorWithoutTemplateTest : public UTRANLogGeneratorTest {
 protected:
  UTRANLogGeneratorWithoutTemplateTest() { make(); }
};

TEST_F(UTRANLogGeneratorWithoutTemplateTest, LogsNothingWhenItIsMade) {
  EXPECT_THAT(takeTexts(), IsEmpty());
}

TEST_F(UTRANLogGeneratorWithoutTemplateTest, AsksForNoCodes) {
  EXPECT_EQ(Value(generator->getStartCommand()), Value(Dictionary{{"SetState", "Streaming"},
                                                                  {"SetOndrelLogCodes", Array{}},
                                                                  {"SetTqExtraCodes", Array{}}}));
}

TEST_F(UTRANLogGeneratorWithoutTemplateTest, DropsPackets) {
  receive(packet(0xD0E0).u8(13, 1).u8(14, 3));
  EXPECT_THAT(takeTexts(), ElementsAre("Cannot load template for display"));
  generator->generateLogUsingState(state);
  EXPECT_THAT(state["DisplayState"].bytes(), IsEmpty());
  EXPECT_THAT(platform.consoleLog().lines(), IsEmpty());
}

TEST_F(UTRANLogGeneratorWithoutTemplateTest, ShowsNothing) {
  for (int refresh = 0; refresh < 2; ++refresh) {
    EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
    EXPECT_THAT(takeTexts(), ElementsAre("Cannot load template for display"));
  }
}

TEST_F(UTRANLogGeneratorWithoutTemplateTest, OtherTemplatesAreNotItsOwn) {
  EXPECT_FALSE(uses("UTRA.plist"));
}

TEST_F(UTRANLogGeneratorWithoutTemplateTest, OtherResourcesAreNoTemplates) {
  EXPECT_FALSE(uses("UTRAN.txt"));
}

}  // namespace
}  // namespace kestro::testing
