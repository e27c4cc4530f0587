// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>

#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "Platform/TelephonyService.h"
#include "Tests/LogGenerator/Ondrel/DecoderRows.h"
#include "Tests/Support/DecoderFixture.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

constexpr const char* kLTESections[] = {"Serving Cell Info",
                                        "Connected mode LTE Intra-frequency Measurement",
                                        "Measured Neighbor Cells",
                                        "Detected Cells",
                                        "Serving Cell Measurements",
                                        "Neighbor Measurements",
                                        "Neighbor Cells List",
                                        "Reselection Candidates",
                                        "Reselection Candidates List",
                                        "SIM Info",
                                        "PDP Context Info"};

class LTETest : public ::testing::Test {
 protected:
  LTETest() { addTemplates(platform); }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
};

// --- The index -----------------------------------------------------------------------------------

TEST_F(LTETest, TheIndexHasADecoderForEverySection) {
  const DecoderRow rows[] = {
      {kLTESections[0],
       kDictionary,
       "LTE Serving Cell Info",
       kReported,
       {0xB0C2, 0xB0C1, 0xFF0001}},
      {kLTESections[1], kDictionary, kLTESections[1], kReported, {0xB179}},
      {kLTESections[2], kList, kLTESections[2], kReported, {0xB179}},
      {kLTESections[3], kList, kLTESections[3], kReported, {0xB179}},
      {kLTESections[4], kDictionary, kLTESections[4], kReported, {0xB17F}},
      {kLTESections[5], kDictionary, kLTESections[5], kReported, {0xB180}},
      {kLTESections[6], kList, kLTESections[6], kReported, {0xB180}},
      {kLTESections[7], kDictionary, kLTESections[7], kReported, {0xB186}},
      {kLTESections[8], kList, kLTESections[8], kReported, {0xB186}},
      {kLTESections[9], kDictionary, "SimInfo", kSilent, {0xFF0000}},
      {kLTESections[10], kList, "PDPContextList", kSilent, {0xFF0002}},
  };
  const LTEClassIndex index(generatorServices(platform));
  expectDecoders(index, platform, rows);
}

TEST_F(LTETest, TheIndexLeavesItsLineBeforeTheBasesOne) {
  { const LTEClassIndex index(generatorServices(platform)); }
  EXPECT_THAT(platform.standardOutput().lines(),
              ElementsAre("Deallocing LTEClassIndex", "Deallocing ClassIndex"));
}

// --- The generator -------------------------------------------------------------------------------

class LTELogGeneratorTest : public LTETest {
 protected:
  void receive(const PacketBytes& bytes) { generator->updateStateWithData(state, bytes.bytes()); }

  Dictionary display() { return state[kStateDisplay].dictionary(); }
  Value section(std::string_view group, std::string_view name) {
    return display()[group].dictionary()[name];
  }

  std::unique_ptr<LTELogGenerator> generator =
      LTELogGenerator::generator(generatorServices(platform));
  Dictionary state;
};

TEST_F(LTELogGeneratorTest, IsWhatTheTechnologySelects) {
  const auto selected = LogGenerator::generatorFromTechnology(generatorServices(platform),
                                                              kTqLogChannelTechnology_Ondrel_LTE);
  EXPECT_NE(dynamic_cast<LTELogGenerator*>(selected.get()), nullptr);
}

TEST_F(LTELogGeneratorTest, LogsItsConstructionFirst) {
  const auto lines = platform.systemLog().take();
  ASSERT_FALSE(lines.empty());
  EXPECT_EQ(lines.front(), errorLine("Creating LTELogGenerator object"));
  EXPECT_EQ(lines.back(), errorLine("Class Index: 1"));
}

TEST_F(LTELogGeneratorTest, LogsItsDestructionBeforeItsBases) {
  static_cast<void>(platform.systemLog().take());
  const std::string address = addressText(generator.get());
  generator.reset();
  EXPECT_THAT(platform.systemLog().lines(),
              ElementsAre(warningLine("LTELogGenerator is destructed " + address),
                          warningLine("Ondrel_GSMLogGenerator is destructed " + address)));
}

TEST_F(LTELogGeneratorTest, AsksForItsCodes) {
  const Dictionary command = generator->getStartCommand();
  EXPECT_EQ(command["SetState"], Value("Streaming"));
  EXPECT_EQ(command["SetOndrelLogCodes"],
            Value(Array{Value::integer(0xB0C2), Value::integer(0xB0C1), Value::integer(0xB179),
                        Value::integer(0xB17F), Value::integer(0xB180), Value::integer(0xB186)}));
  EXPECT_EQ(command["SetTqExtraCodes"],
            Value(Array{Value::integer(1), Value::integer(0), Value::integer(2)}));
}

TEST_F(LTELogGeneratorTest, OnePacketUpdatesAllSectionsThatReadIt) {
  receive(packet(0xB179).u16(17, 1300).u8(27, 1).u8(28, 1).u16(29, 5).u16(35, 6));
  EXPECT_EQ(section("01;Serving Cell", kLTESections[1]).dictionary()["E-ARFCN"], Value("1300"));
  EXPECT_THAT(section("02;Neighbors", kLTESections[2]).array(), SizeIs(1));
  EXPECT_THAT(section("02;Neighbors", kLTESections[3]).array(), SizeIs(1));
}

TEST_F(LTELogGeneratorTest, AnIntraFrequencyPacketWithoutCellsEmptiesBothLists) {
  receive(packet(0xB179).u16(17, 1300).u8(27, 1).u8(28, 1).u16(29, 5).u16(35, 6));
  receive(packet(0xB179).u16(17, 6300).length(29));
  EXPECT_EQ(section("01;Serving Cell", kLTESections[1]).dictionary()["E-ARFCN"], Value("6300"));
  EXPECT_THAT(section("02;Neighbors", kLTESections[2]).array(), IsEmpty());
  EXPECT_THAT(section("02;Neighbors", kLTESections[3]).array(), IsEmpty());
}

TEST_F(LTELogGeneratorTest, NeighborAndReselectionPacketsUpdateTwoSectionsInOrder) {
  static_cast<void>(generator->generateLogUsingState(state));
  static_cast<void>(platform.systemLog().take());
  receive(packet(0xB180).u8(13, 2).u16(21, 301).length(41));
  EXPECT_EQ(section("02;Neighbors", kLTESections[5]).dictionary()["Version"], Value("2"));
  EXPECT_THAT(section("02;Neighbors", kLTESections[6]).array(), SizeIs(1));
  const auto neighborLines = platform.systemLog().take();
  ASSERT_THAT(neighborLines, SizeIs(9));  // the list's own lines follow: a count, a cell, 5 levels
  EXPECT_EQ(neighborLines[0], warningLine("Neighbor Measurements"));
  EXPECT_EQ(neighborLines[1], warningLine("Neighbor Cells List"));

  receive(packet(0xB186).u8(13, 3).u16(19, 1).u16(21, 6).length(29));
  EXPECT_EQ(section("03;Reselection", kLTESections[7]).dictionary()["Version"], Value("3"));
  EXPECT_THAT(section("03;Reselection", kLTESections[8]).array(), SizeIs(1));
  EXPECT_THAT(platform.systemLog().take(), ElementsAre(warningLine("Reselection Candidates"),
                                                       warningLine("Reselection Candidates List")));
}

TEST_F(LTELogGeneratorTest, CodesOfNoDecoderAreCollectedInSilence) {
  static_cast<void>(generator->generateLogUsingState(state));
  static_cast<void>(platform.systemLog().take());
  receive(packet(0xB178).length(60));
  EXPECT_THAT(platform.systemLog().take(), IsEmpty());
  static_cast<void>(generator->generateLogUsingState(state));
  EXPECT_EQ(state[kStateDisplayState].bytes().size(), 60U);
}

TEST_F(LTELogGeneratorTest, AnExtraPacketOfCodeTwoCarriesThePacketDataContexts) {
  Bytes message = {0xFF, 0, 0, 0x02, 0x00, 0, 0, 0, 0, 0, 0, 0, 0};
  for (const char byte : std::string_view("<plist><array><string>up</string></array></plist>")) {
    message.push_back(static_cast<std::uint8_t>(byte));
  }
  generator->updateStateWithData(state, message);
  EXPECT_EQ(section("05;Packet Data", kLTESections[10]), Value(Array{"up"}));
}

// --- The template --------------------------------------------------------------------------------

/// "Group/Section: list" or "Group/Section: dictionary" for every section.
std::vector<std::string> placedSections(const Dictionary& display) {
  std::vector<std::string> placed;
  for (const auto& [group, contents] : display) {
    for (const auto& [name, section] : contents.dictionary()) {
      const char* kind = section.isArray() ? "list" : section.isDictionary() ? "dictionary" : "?";
      placed.push_back(fmt::format("{}/{}: {}", group.text(), name.text(), kind));
    }
  }
  return placed;
}

TEST_F(LTELogGeneratorTest, TheTemplateHoldsEverySectionWhereAnEngineerLooksForIt) {
  EXPECT_FALSE(generator->generateLogUsingState(state).isDictionary());
  EXPECT_EQ(display()["_sorted"], Value("_sorted"));
  EXPECT_THAT(
      placedSections(display()),
      ElementsAre("01;Serving Cell/Serving Cell Info: dictionary",
                  "01;Serving Cell/Serving Cell Measurements: dictionary",
                  "01;Serving Cell/Connected mode LTE Intra-frequency Measurement: dictionary",
                  "02;Neighbors/Measured Neighbor Cells: list", "02;Neighbors/Detected Cells: list",
                  "02;Neighbors/Neighbor Measurements: dictionary",
                  "02;Neighbors/Neighbor Cells List: list",
                  "03;Reselection/Reselection Candidates: dictionary",
                  "03;Reselection/Reselection Candidates List: list", "04;SIM/SIM Info: dictionary",
                  "05;Packet Data/PDP Context Info: list"));
}

TEST_F(LTELogGeneratorTest, CataloguesEveryCodeOfEverySection) {
  std::vector<std::string> entries;
  generator->catalogue([&](const CatalogueEntry& entry) {
    entries.push_back(fmt::format("{:X} {} {}", entry.code, entry.section, entry.keys.size()));
  });
  EXPECT_THAT(entries,
              ElementsAre("B0C2 Serving Cell Info 9", "B0C1 Serving Cell Info 1",
                          "FF0001 Serving Cell Info 5",
                          "B179 Connected mode LTE Intra-frequency Measurement 5",
                          "B179 Measured Neighbor Cells 3", "B179 Detected Cells 1",
                          "B17F Serving Cell Measurements 18", "B180 Neighbor Measurements 3",
                          "B180 Neighbor Cells List 12", "B186 Reselection Candidates 3",
                          "B186 Reselection Candidates List 11", "FF0000 SIM Info 14",
                          "FF0002 PDP Context Info 0"));
}

TEST_F(LTELogGeneratorTest, CataloguesTheGroupOfEverySection) {
  std::map<std::string_view, std::string_view> groups;
  generator->catalogue([&](const CatalogueEntry& entry) { groups[entry.section] = entry.group; });
  EXPECT_THAT(groups, SizeIs(11));
  EXPECT_EQ(groups["Serving Cell Info"], "01;Serving Cell");
  EXPECT_EQ(groups["Neighbor Cells List"], "02;Neighbors");
  EXPECT_EQ(groups["PDP Context Info"], "05;Packet Data");
}

}  // namespace
}  // namespace kestro::testing
