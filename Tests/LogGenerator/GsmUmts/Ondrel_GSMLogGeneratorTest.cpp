// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMLogGenerator.h"
#include "Platform/TelephonyService.h"
#include "Tests/LogGenerator/Ondrel/DecoderRows.h"
#include "Tests/Support/CountingPropertyListCoding.h"
#include "Tests/Support/DecoderFixture.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using ::testing::StartsWith;

/// The decoders in the order in which they are made.
const std::vector<DecoderRow>& rows() {
  static const std::vector<DecoderRow> kRows = {
      {"Active Set", kList, "ActiveSet", kReported, {0x417A}},
      {"Coding Scheme", kDictionary, "CodingScheme", kSilent, {}},
      {"GPRS Information",
       kDictionary,
       "GPRSInformation",
       kReported,
       {0x51F5, 0x7135, 0x51F6, 0x51FB, 0x51FD, 0x51F4, 0x5137}},
      {"GSM Serving Cell",
       kDictionary,
       "GSMServingCell",
       kReported,
       {0x5134, 0x5137, 0x5076, 0xFF0001}},
      {"Mobile Allocation", kDictionary, "MobileAllocation", kReported, {0x51F8}},
      {"Neighboring Cells", kList, "NeighboringCells", kReported, {0x5137, 0x51FF, 0xFF0001}},
      {"PDP Context Info", kList, "PDPContextList", kSilent, {0xFF0002}},
      {"Process PS", kDictionary, "ProcessPS", kReported, {0x7130, 0x7132}},
      {"UMTS RR Measurement", kDictionary, "UMTSRRMeasurement", kSilent, {}},
      {"Cell Change Counters", kDictionary, "CellChangeCounters", kSilent, {}},
      {"Detected Set", kList, "DetectedSet", kReported, {0x417A}},
      {"GSM Set", kList, "GSMSet", kReported, {0x4005}},
      {"Non-Ranked GSM Set", kList, "NonRankedGSMSet", kSilent, {}},
      {"Process CO", kDictionary, "ProcessCO", kReported, {0x7131, 0x7132}},
      {"Serving PLMN", kDictionary, "ServingPLMN", kReported, {0x7135, 0x7132, 0xFF0001}},
      {"UMTS Set", kList, "UMTSSet", kReported, {0x4005, 0xFF0001}},
      {"Equivalent PLMN List", kList, "EquivalentPLMNList", kReported, {0x7150}},
      {"GSM RR Info", kDictionary, "GSMRRInfo", kReported, {0x512C, 0x5137, 0x5072, 0x51F6}},
      {"Monitored Set", kList, "MonitoredSet", kReported, {0x417A}},
      {"Non-Ranked UMTS Set", kList, "NonRankedUMTSSet", kSilent, {}},
      {"Process CS", kDictionary, "ProcessCS", kReported, {0x7131, 0x7132}},
      {"UMTS RR Info",
       kDictionary,
       "UMTSRRInfo",
       kReported,
       {0x4125, 0x4031, 0x4127, 0x4157, 0xFF0001}},
      {"BLER", kDictionary, "BLER", kReported, {0x4116}},
      {"Virtual Active Set", kList, "VirtualActiveSet", kReported, {0x417A}},
      {"SIM Info", kDictionary, "SimInfo", kSilent, {0xFF0000}},
      {"HSDPA Info", kDictionary, "HSDPAInformation", kReported, {0x4221}},
  };
  return kRows;
}

class Ondrel_GSMTest : public ::testing::Test {
 protected:
  std::vector<std::string> lines() {
    std::vector<std::string> texts;
    for (Line& line : platform.systemLog().take()) texts.push_back(std::move(line.text));
    return texts;
  }

  CountingPropertyListCoding coding;
  VirtualPlatform platform{coding};
};

// --- The index -----------------------------------------------------------------------------------

TEST_F(Ondrel_GSMTest, TheIndexHasADecoderForEverySection) {
  const Ondrel_GSMClassIndex index(generatorServices(platform));
  expectDecoders(index, platform, rows());
}

TEST_F(Ondrel_GSMTest, TheIndexLeavesItsLineBeforeTheBasesOne) {
  { const Ondrel_GSMClassIndex index(generatorServices(platform)); }
  EXPECT_THAT(platform.standardOutput().lines(),
              ElementsAre("Deallocing Ondrel_GSMClassIndex", "Deallocing ClassIndex"));
}

// --- The generator -------------------------------------------------------------------------------

class Ondrel_GSMLogGeneratorTest : public Ondrel_GSMTest {
 protected:
  Ondrel_GSMLogGeneratorTest() { addTemplates(platform); }

  void receive(const PacketBytes& bytes) { generator->updateStateWithData(state, bytes.bytes()); }

  /// The section, in whatever group it stands.
  Value section(std::string_view name) {
    for (const auto& group : state["Display"].dictionary()) {
      const Value& found = group.value.dictionary()[name];
      if (!found.isNull()) return found;
    }
    return {};
  }
  Entries entries(std::string_view name) { return entriesOf(section(name).dictionary()); }

  std::unique_ptr<Ondrel_GSMLogGenerator> generator =
      Ondrel_GSMLogGenerator::generator(generatorServices(platform));
  Dictionary state;
};

TEST_F(Ondrel_GSMLogGeneratorTest, SpeaksItsTechnology) {
  const auto found =
      LogGenerator::generatorFromTechnology(generatorServices(platform), "Ondrel_GSM");
  EXPECT_NE(dynamic_cast<Ondrel_GSMLogGenerator*>(found.get()), nullptr);
}

TEST_F(Ondrel_GSMLogGeneratorTest, LeavesALineBeforeItsIndexIsMade) {
  const auto log = platform.systemLog().take();
  EXPECT_EQ(log.front(), errorLine("Creating Ondrel_GSMLogGenerator object"));
  EXPECT_EQ(log[1], warningLine("Array Count: 1"));
  EXPECT_THAT(log[1 + rows().size()].text,
              StartsWith("Creating OndrelLogGenerator2 object with 0x"));
}

TEST_F(Ondrel_GSMLogGeneratorTest, LeavesItsDestructionLineTwice) {
  const std::string line = "Ondrel_GSMLogGenerator is destructed " + addressText(generator.get());
  lines();
  generator.reset();
  EXPECT_THAT(platform.systemLog().take(), ElementsAre(warningLine(line), warningLine(line)));
}

TEST_F(Ondrel_GSMLogGeneratorTest, AsksForTheCodesOfAllDecoders) {
  const auto numbers = [&](const char* key) {
    std::vector<std::int64_t> codes;
    const Array list = generator->getStartCommand()[key].array();
    for (const Value& code : list) codes.push_back(code.integerBits());
    return codes;
  };
  EXPECT_THAT(numbers("SetOndrelLogCodes"),
              ElementsAre(0x417A, 0x51F5, 0x7135, 0x51F6, 0x51FB, 0x51FD, 0x51F4, 0x5137, 0x5134,
                          0x5076, 0x51F8, 0x51FF, 0x7130, 0x7132, 0x4005, 0x7131, 0x7150, 0x512C,
                          0x5072, 0x4125, 0x4031, 0x4127, 0x4157, 0x4116, 0x4221));
  EXPECT_THAT(numbers("SetTqExtraCodes"), ElementsAre(1, 2, 0));
}

TEST_F(Ondrel_GSMLogGeneratorTest, OnePacketFillsEverySectionThatWantsIt) {
  receive(packet(0x5137).u8(28, 1).u16(29, 77).length(43));
  EXPECT_THAT(section("Neighboring Cells").array(), SizeIs(1));
  lines();
  receive(packet(0x5137).u8(15, 0x3F).u32(16, 0x10001).u32(20, 2).u8(28, 0));
  EXPECT_THAT(lines(),
              ElementsAre("GPRSInformation", "GSMServingCell", "NeighboringCells", "GSMRRInfo"));
  EXPECT_EQ(entries("GSM Serving Cell"),
            (Entries{{"RSSI", "63 dBm"}, {"C1 Value", "1"}, {"C2 Value", "2"}}));
  EXPECT_EQ(
      entries("GSM RR Info"),
      (Entries{{"Serving Rx Level", "63"}, {"Rx Quality Full", "65537"}, {"Rx Quality Sub", "2"}}));
  EXPECT_THAT(section("Neighboring Cells").array(), IsEmpty());
  EXPECT_THAT(entries("GPRS Information"), IsEmpty());
}

TEST_F(Ondrel_GSMLogGeneratorTest, OnePacketWithoutCellsEmptiesFourSets) {
  receive(packet(0x417A).u8(15, 1).length(75));
  EXPECT_THAT(section("Active Set").array(), SizeIs(1));
  lines();
  receive(packet(0x417A).length(16));
  for (const char* name : {"Active Set", "Detected Set", "Monitored Set", "Virtual Active Set"}) {
    EXPECT_TRUE(section(name).isArray()) << name;
    EXPECT_THAT(section(name).array(), IsEmpty()) << name;
  }
  EXPECT_THAT(lines(), ElementsAre("ActiveSet", "DetectedSet", "MonitoredSet", "VirtualActiveSet"));
}

TEST_F(Ondrel_GSMLogGeneratorTest, OneRegistrationPacketFillsFourSections) {
  receive(packet(0x7132).u8(13, 1).length(16));
  for (const char* name : {"Process PS", "Process CO", "Process CS"}) {
    EXPECT_EQ(entries(name), (Entries{{"MM Service State", "REG_STATE_IDLE"}})) << name;
  }
  EXPECT_EQ(entries("Serving PLMN"), (Entries{{"PLMN Sel Mod", "Automatic"}}));
}

TEST_F(Ondrel_GSMLogGeneratorTest, EveryDecoderReportsOneBadCellList) {
  receive(packet(0x7132));
  lines();
  receive(packet(0xFF0001));
  const char* bad = "Cell Info Array data could not be constructed";
  const char* missing = "Failed to get Cell Array\n";
  EXPECT_THAT(lines(),
              ElementsAre("GSMServingCell", bad, missing, "NeighboringCells", bad, missing,
                          "ServingPLMN", bad, missing, "UMTSSet", bad, missing, "UMTSRRInfo"));
}

TEST_F(Ondrel_GSMLogGeneratorTest, AllDecodersShareOneParsedCellList) {
  Dictionary cell{
      {"kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyGSM"},
      {"kTqCellMonitorCellType", "kTqCellMonitorCellTypeServing"},
      {"kTqCellMonitorCellId", Value::integer(4711)},
      {"kTqCellMonitorLAC", Value::integer(601)}};
  receive(packet(0x7132));
  const int before = coding.parsed();
  receive(packet(0xFF0001).append(*coding.binary(Array{cell})));
  EXPECT_EQ(coding.parsed(), before + 1);
  EXPECT_EQ(section("GSM Serving Cell").dictionary()["Cell ID"], Value("4711"));
  EXPECT_EQ(section("Serving PLMN").dictionary()["Location Area Code"], Value("601"));
}

// --- The template --------------------------------------------------------------------------------

TEST_F(Ondrel_GSMLogGeneratorTest, TheTemplateHasEverySectionOnceAndOfItsKind) {
  receive(packet(0x7132));
  std::vector<std::string> found;
  for (const auto& group : state["Display"].dictionary()) {
    for (const auto& entry : group.value.dictionary()) found.emplace_back(entry.key.text());
  }
  std::vector<std::string> expected;
  for (const DecoderRow& row : rows()) {
    expected.emplace_back(row.section);
    EXPECT_EQ(section(row.section).isArray(), row.kind == kList) << row.section;
    EXPECT_EQ(section(row.section).isDictionary(), row.kind == kDictionary) << row.section;
  }
  EXPECT_THAT(found, ::testing::UnorderedElementsAreArray(expected));
}

TEST_F(Ondrel_GSMLogGeneratorTest, TheTemplateGroupsTheSections) {
  receive(packet(0x7132));
  const Dictionary display = state["Display"].dictionary();
  EXPECT_EQ(display["_sorted"], Value("_sorted"));
  EXPECT_THAT(keysOf(display),
              ElementsAre("_sorted", "01;Network", "02;UMTS Cells", "03;UMTS Link", "04;GSM Cells",
                          "05;GSM Link", "06;SIM and Packet Data"));
  for (const auto& group : display) EXPECT_FALSE(group.value.dictionary().contains("_sorted"));
}

}  // namespace
}  // namespace kestro::testing
