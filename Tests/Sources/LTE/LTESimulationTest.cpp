// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <set>
#include <string>
#include <vector>

#include "Platform/TelephonyService.h"
#include "Sources/LTE/LTESimulation.h"
#include "Tests/Sources/SimulationFixture.h"
#include "Tests/Sources/SourceReading.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsSupersetOf;

constexpr int kStepsOfTenMinutes = 1'200;

class LTESimulationTest : public testing::SimulationFixture<LTESimulation> {
 protected:
  LTESimulationTest() : SimulationFixture(kTqLogChannelTechnology_Ondrel_LTE) {}

  std::string serving(std::string_view key) { return display.text("Serving Cell Info", key); }
  std::string measured(std::string_view key) {
    return display.text("Serving Cell Measurements", key);
  }
};

TEST_F(LTESimulationTest, SaysTheSameInEveryRun) {
  LTESimulation again(display.coding());
  expectSameIn(again, 100);
}

TEST_F(LTESimulationTest, PutsARecordHeaderBehindTheTypeByte) {
  for (const Bytes& packet : step()) {
    const PacketView view(packet);
    EXPECT_EQ(view.u16(1), packet.size() - 1);
    // 2012-03-04 12:00:00 UTC in microseconds: 0x0004BA69'8C98D000
    EXPECT_EQ(view.u32(5), 0x8C98D000U);
    EXPECT_EQ(view.u32(9), 0x0004BA69U);
  }
}

TEST_F(LTESimulationTest, ShowsOneServingCellInAllSections) {
  for (int i = 0; i < kStepsOfTenMinutes; ++i) {
    step();
    const std::string cell = serving("Physical Cell ID");
    ASSERT_EQ(measured("Physical Cell ID"), cell) << "step " << i;
    ASSERT_EQ(measured("E-ARFCN"), serving("Download Frequency"));
    ASSERT_EQ(serving("UARFCN"), serving("Download Frequency"));
    ASSERT_EQ(
        display.text("Connected mode LTE Intra-frequency Measurement", "Serving Physical Cell ID"),
        cell);
    ASSERT_EQ(display.text("Reselection Candidates", "Serving Cell ID"), cell);
    ASSERT_EQ(display.text("Neighbor Measurements", "E-ARFCN"), measured("E-ARFCN"));
  }
}

TEST_F(LTESimulationTest, ShowsTheSameNeighboursInBothLists) {
  for (int i = 0; i < 200; ++i) {
    step();
    const Array neighbours = display.section("Neighbor Cells List").array();
    const Array measuredNeighbours = display.section("Measured Neighbor Cells").array();
    ASSERT_EQ(neighbours.size(), measuredNeighbours.size());
    ASSERT_FALSE(neighbours.empty());
    for (std::size_t row = 0; row < neighbours.size(); ++row) {
      ASSERT_EQ(neighbours[row].dictionary()["Physical Cell ID"],
                measuredNeighbours[row].dictionary()["Physical Cell ID"]);
      ASSERT_NE(neighbours[row].dictionary()["Physical Cell ID"].text(),
                measured("Physical Cell ID"));
    }
  }
}

TEST_F(LTESimulationTest, ChangesCellsAndFrequenciesOnTheWay) {
  std::set<std::string> cells;
  std::set<std::string> frequencies;
  for (int i = 0; i < 4 * kStepsOfTenMinutes; ++i) {
    step();
    cells.insert(serving("Cell Identity"));
    frequencies.insert(serving("Download Frequency"));
  }
  EXPECT_GT(cells.size(), 8U);
  EXPECT_THAT(frequencies, ElementsAre("1300", "6400"));
}

TEST_F(LTESimulationTest, ShowsCandidatesOfSeveralTechnologies) {
  std::set<std::string> technologies;
  for (int i = 0; i < 200; ++i) {
    step();
    technologies.insert(
        std::string(display.row("Reselection Candidates List", 0)["Candidate RAT Type"].text()));
  }
  EXPECT_THAT(technologies, ElementsAre("GERAN", "LTE", "UTRAN"));
}

TEST_F(LTESimulationTest, ShowsSimFilesAndContexts) {
  step();
  EXPECT_EQ(display.section("SIM Info").dictionary().size(), 14U);
  EXPECT_EQ(display.row("PDP Context Info", 0)["APN"], Value("internet"));
  EXPECT_EQ(display.row("PDP Context Info", 1)["APN"], Value("ims"));
}

TEST_F(LTESimulationTest, LooksForTheNeighboursThatItsLevelAsksFor) {
  std::set<std::string> rules;
  for (int i = 0; i < kStepsOfTenMinutes; ++i) {
    step();
    const auto number = [&](std::string_view key) { return std::atoi(measured(key).c_str()); };
    const int level = number("Srxlev");
    const int expected =
        (level < number("S Intra Search") ? 1 : 0) + (level < number("S Non Intra Search") ? 2 : 0);
    ASSERT_EQ(number("Measurement Rules"), expected) << "step " << i;
    rules.insert(measured("Measurement Rules"));
  }
  EXPECT_GT(rules.size(), 1U);
}

TEST_F(LTESimulationTest, SaysTheListsSoonAfterTheBeginningAndAgainLater) {
  constexpr int kStepsOfTwoSeconds = 4;
  constexpr int kStepsOfTwentySeconds = 40;
  step();  // nobody is connected yet
  const auto first = codesOfSteps(kStepsOfTwoSeconds);
  EXPECT_THAT(first, IsSupersetOf({0xFF0000, 0xFF0002}));
  codesOfSteps(200);
  const auto later = codesOfSteps(kStepsOfTwentySeconds);
  EXPECT_THAT(later, IsSupersetOf({0xFF0000, 0xFF0002}));
}

TEST_F(LTESimulationTest, NeverMakesTheDecodersComplain) {
  for (int i = 0; i < 200; ++i) step();
  for (const auto& line : display.systemLog().lines()) {
    // The antennas' packet is reported by its decoder although it is decoded.
    EXPECT_EQ(line.text, "Received an unknown log message: 45249");
  }
}

TEST_F(LTESimulationTest, RunsAsASourceFromTheBeginningAgain) {
  const auto coding = createPropertyListCoding();
  PacketSimulation source([&] { return std::make_unique<LTESimulation>(*coding); });
  EXPECT_EQ(source.technology(), "LTE");
  const ReadEvent first = readEvent(source);
  EXPECT_EQ(first.time, std::chrono::microseconds(0));
  ReadEvent later = first;
  while (later.time == std::chrono::microseconds(0)) later = readEvent(source);
  EXPECT_EQ(later.time, std::chrono::milliseconds(500));
  ASSERT_TRUE(source.restart().has_value());
  EXPECT_EQ(readEvent(source).message, first.message);
}

}  // namespace
}  // namespace kestro
