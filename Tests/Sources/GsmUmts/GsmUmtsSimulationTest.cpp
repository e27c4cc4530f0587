// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "Platform/TelephonyService.h"
#include "Sources/GsmUmts/GsmUmtsSimulation.h"
#include "Tests/Sources/SimulationFixture.h"

namespace kestro {
namespace {

using ::testing::IsEmpty;
using ::testing::IsSupersetOf;

constexpr int kStepsOfTwentyMinutes = 2'400;

class GsmUmtsSimulationTest : public testing::SimulationFixture<GsmUmtsSimulation> {
 protected:
  GsmUmtsSimulationTest() : SimulationFixture(kTqLogChannelTechnology_Ondrel_GSM) {}
};

TEST_F(GsmUmtsSimulationTest, SaysTheSameInEveryRun) {
  GsmUmtsSimulation again(display.coding());
  expectSameIn(again, 100);
}

TEST_F(GsmUmtsSimulationTest, SaysTheListsSoonAfterTheBeginningAndAgainLater) {
  constexpr int kStepsOfTwoSeconds = 4;
  constexpr int kStepsOfTwentySeconds = 40;
  step();  // nobody is connected yet
  const auto first = codesOfSteps(kStepsOfTwoSeconds);
  EXPECT_THAT(first, IsSupersetOf({0xFF0000, 0xFF0002}));
  codesOfSteps(200);
  const auto later = codesOfSteps(kStepsOfTwentySeconds);
  EXPECT_THAT(later, IsSupersetOf({0xFF0000, 0xFF0002}));
}

TEST_F(GsmUmtsSimulationTest, MovesThroughMobilityManagement) {
  EXPECT_THAT(shown("Process CS", "MM State", kStepsOfTwentyMinutes),
              IsSupersetOf({"MM_NULL", "MM_LOCATION_UPDATE_INITIATED", "MM_IDLE",
                            "MM_WAIT_FOR_OUTGOING_MM_CONNECTION", "MM_CONNECTION_ACTIVE",
                            "MM_WAIT_FOR_RR_CONNECTION_LU"}));
}

TEST_F(GsmUmtsSimulationTest, MovesBetweenUMTSAndGSM) {
  EXPECT_THAT(shown("GSM RR Info", "RR State", kStepsOfTwentyMinutes),
              IsSupersetOf({"RR_INACTIVE", "RR_W2G_INTERRAT_RESELECTION_PROGRESS", "RR_IDLE",
                            "RR_G2W_INTERRAT_RESELECTION_PROGRESS"}));
}

TEST_F(GsmUmtsSimulationTest, ShowsOneNetworkByBothWays) {
  for (int i = 0; i < 100; ++i) {
    step();
    ASSERT_EQ(display.text("Serving PLMN", "Mobile Country Code"), "999");
    ASSERT_EQ(display.text("Serving PLMN", "Mobile Network Code"), "990");
    ASSERT_EQ(display.text("Process CO", "MM State"), display.text("Process CS", "MM State"));
  }
  EXPECT_EQ(display.row("Equivalent PLMN List", 0)["Mobile Network Code"], Value("991"));
}

TEST_F(GsmUmtsSimulationTest, ShowsCellsOfBothTechnologiesAllTheTime) {
  for (int i = 0; i < kStepsOfTwentyMinutes; ++i) {
    step();
    ASSERT_FALSE(display.section("UMTS Set").array().empty()) << "step " << i;
    ASSERT_FALSE(display.section("Neighboring Cells").array().empty()) << "step " << i;
  }
}

TEST_F(GsmUmtsSimulationTest, NeverMakesTheDecodersComplain) {
  for (int i = 0; i < kStepsOfTwentyMinutes; ++i) step();
  EXPECT_THAT(display.systemLog().lines(), IsEmpty());
}

}  // namespace
}  // namespace kestro
