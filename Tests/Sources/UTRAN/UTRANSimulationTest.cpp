// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "Platform/TelephonyService.h"
#include "Sources/UTRAN/UTRANSimulation.h"
#include "Tests/Sources/SimulationFixture.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::IsSupersetOf;

constexpr int kStepsInTenMinutes = 1'200;

/// As the display has it.
std::string_view nameOf(UTRANMode mode) {
  constexpr std::string_view kNames[] = {"Disconnected", "Connecting", "Cell Fach",
                                         "Cell DCH",     "Cell PCH",   "Cell URA PCH"};
  return kNames[static_cast<std::size_t>(mode)];
}

class UTRANSimulationTest : public testing::SimulationFixture<UTRANSimulation> {
 protected:
  UTRANSimulationTest() : SimulationFixture(kTqLogChannelTechnology_Ondrel_UTRAN2) {}

  std::string serving(std::string_view key) { return display.text("Serving Cell Info", key); }
  Array list(std::string_view name) { return display.section(name).array(); }
  const UTRANPhone& phone() { return simulation.phone(); }
};

TEST_F(UTRANSimulationTest, SaysTheSameInEveryRun) {
  UTRANSimulation again(display.coding());
  expectSameIn(again, 100);
}

TEST_F(UTRANSimulationTest, SaysTheListsSoonAfterTheBeginningAndAgainLater) {
  step();  // nobody is connected yet
  EXPECT_THAT(codesOfSteps(4), IsSupersetOf({0xFF0000, 0xFF0002}));
  codesOfSteps(200);
  EXPECT_THAT(codesOfSteps(40), IsSupersetOf({0xFF0000, 0xFF0002}));
}

TEST_F(UTRANSimulationTest, ShowsTheServingCellOfThePhone) {
  for (int i = 0; i < kStepsInTenMinutes; ++i) {
    step();
    const UTRANCell cell = phone().serving();
    ASSERT_EQ(serving("Cell ID"), std::to_string(cell.cellIdentity)) << "step " << i;
    ASSERT_EQ(serving("Downlink UARFCN"), std::to_string(cell.uarfcn));
    ASSERT_EQ(serving("Uplink UARFCN"), std::to_string(cell.uarfcn));
    ASSERT_EQ(serving("Cell Scrambling Code"), std::to_string(cell.parameterId));
    ASSERT_EQ(serving("Local Area Code"), std::to_string(cell.locationArea));
    ASSERT_EQ(serving("URA ID"), std::to_string(cell.registrationArea));
    ASSERT_EQ(serving("Freq Band Indicator"), "34");
    ASSERT_EQ(serving("Allowed Access"), "All Calls");
    ASSERT_EQ(display.text("RRC Info", "State"), nameOf(phone().mode()));
  }
}

TEST_F(UTRANSimulationTest, ShowsTheServingCellFirstAndTheOthersBehindIt) {
  for (int i = 0; i < kStepsInTenMinutes; ++i) {
    step();
    const Array rows = list("Neighbor Cell List");
    const std::vector<UTRANCellReport> cells = phone().cells();
    ASSERT_EQ(rows.size(), cells.size()) << "step " << i;
    ASSERT_GE(rows.size(), 2U);
    for (std::size_t row = 0; row < cells.size(); ++row) {
      const Dictionary shown = rows[row].dictionary();
      ASSERT_EQ(shown["UARFCN"].text(), std::to_string(cells[row].uarfcn));
      ASSERT_EQ(shown["Cell ID"].text(), std::to_string(cells[row].parameterId));
      ASSERT_EQ(shown["Status"] == Value("ASET"), row == 0);
      // What is on another frequency cannot be detected jointly.
      if (shown["inJDCS"] == Value("TRUE")) {
        ASSERT_EQ(cells[row].uarfcn, cells[0].uarfcn);
      }
    }
  }
}

TEST_F(UTRANSimulationTest, MeetsCellsOfEverySet) {
  std::set<std::string> states;
  std::set<std::string> joint;
  for (int i = 0; i < kStepsInTenMinutes; ++i) {
    step();
    for (const Value& row : list("Neighbor Cell List")) {
      states.emplace(row.dictionary()["Status"].text());
      joint.emplace(row.dictionary()["inJDCS"].text());
    }
  }
  EXPECT_THAT(states, ElementsAre("ASET", "DSET", "MSET"));
  EXPECT_THAT(joint, ElementsAre("FALSE", "TRUE"));
}

TEST_F(UTRANSimulationTest, ShowsTheChannelsOfTheMode) {
  for (int i = 0; i < kStepsInTenMinutes; ++i) {
    step();
    const bool isDedicated = display.text("RRC Info", "State") == "Cell DCH";
    const Array transport = list("TRCH BLER");
    const Array coded = list("CCTRCH SIR");
    ASSERT_EQ(coded.size(), isDedicated ? 2U : 1U) << "step " << i;
    ASSERT_EQ(transport.size(), phone().transportChannels().size());
    ASSERT_FALSE(transport.empty());
    // The first timeslot is the cell's common one.
    for (const Value& row : coded) {
      ASSERT_EQ(row.dictionary()["TSNUM"] == Value("0"), !isDedicated);
      ASSERT_EQ(row.dictionary()["SIR"].array().size(), 6U);
    }
  }
}

TEST_F(UTRANSimulationTest, MeasuresWhatChanges) {
  std::set<std::string> sir;
  std::set<std::string> errors;
  for (int i = 0; i < 200; ++i) {
    step();
    sir.emplace(display.row("CCTRCH SIR", 0)["SIR"].array()[0].text());
    errors.emplace(display.row("TRCH BLER", 0)["TRCH BLER Measurement"].text());
  }
  EXPECT_GT(sir.size(), 8U);
  EXPECT_GT(errors.size(), 8U);
}

TEST_F(UTRANSimulationTest, MovesThroughEveryMode) {
  EXPECT_THAT(shown("RRC Info", "State", kStepsInTenMinutes),
              ElementsAre("Cell DCH", "Cell Fach", "Cell PCH", "Cell URA PCH", "Connecting",
                          "Disconnected"));
}

TEST_F(UTRANSimulationTest, ChangesCellsFrequenciesAndAreasOnTheWay) {
  std::set<std::string> cells;
  std::set<std::string> frequencies;
  std::set<std::string> areas;
  for (int i = 0; i < 2 * kStepsInTenMinutes; ++i) {
    step();
    cells.insert(serving("Cell ID"));
    frequencies.insert(serving("Downlink UARFCN"));
    areas.insert(serving("Local Area Code"));
  }
  EXPECT_GT(cells.size(), 8U);
  EXPECT_THAT(frequencies, ElementsAre("10055", "10063", "10071"));
  EXPECT_THAT(areas, ElementsAre("601", "602"));
}

TEST_F(UTRANSimulationTest, FillsEverySectionSaveTheOneThatStaysEmpty) {
  for (int i = 0; i < 100; ++i) {
    step();
    ASSERT_EQ(display.section("SIM Info").dictionary().size(), 14U) << "step " << i;
    ASSERT_EQ(display.section("Serving Cell Info").dictionary().size(), 9U);
    ASSERT_EQ(display.row("PDP Context Info", 0)["APN"], Value("internet"));
    ASSERT_TRUE(list("GSM Neighbor Cell List").empty());
  }
}

TEST_F(UTRANSimulationTest, TransfersDataOnDedicatedChannelsOnly) {
  double before = 0;
  for (int i = 0; i < kStepsInTenMinutes; ++i) {
    step();
    const double bytes = phone().downlinkBytes();
    ASSERT_EQ(bytes > before, phone().mode() == UTRANMode::Dch) << "step " << i;
    before = bytes;
  }
}

TEST_F(UTRANSimulationTest, NeverMakesTheDecodersComplain) {
  for (int i = 0; i < kStepsInTenMinutes; ++i) step();
  EXPECT_THAT(display.systemLog().lines(), IsEmpty());
}

}  // namespace
}  // namespace kestro
