// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <set>
#include <string>
#include <vector>

#include "Platform/TelephonyService.h"
#include "Sources/C2K/C2KSimulation.h"
#include "Tests/Sources/SimulationFixture.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::IsEmpty;

constexpr int kC2KStepsOfTwentyMinutes = 2'400;

// Where the display shows what.
using Path = std::vector<std::string_view>;
const Path kOneXState = {"01;1x", "01;State"};
const Path kOneXActiveSet = {"01;1x", "04;Active Set"};
const Path kErrorRate = {"01;1x", "05;Traffic FER"};
const Path kEVDOState = {"02;EV-DO", "01;State"};
const Path kSession = {"02;EV-DO", "02;Session", "01;Session State"};
const Path kServingPN = {"02;EV-DO", "03;Radio", "03;Serving PN Offset"};
const Path kEVDOActiveSet = {"02;EV-DO", "04;Active Set"};
const Path kFingers = {"02;EV-DO", "05;Finger C/I"};
const Path kForwardRate = {"02;EV-DO", "06;Data Rate", "01;Forward Link"};
const Path kReverseRate = {"02;EV-DO", "06;Data Rate", "02;Reverse Link"};

/// As the display has it.
std::string_view nameOf(OneXState state) {
  switch (state) {
    case OneXState::PowerUp:
      return "Powerup state [11]";
    case OneXState::Initial:
      return "Initial state for CDMA operation [2]";
    case OneXState::Acquisition:
      return "Acquisition [3]";
    case OneXState::Sync:
      return "Sync [4]";
    case OneXState::Paging:
      return "Paging [6]";
    case OneXState::Sleep:
      return "Slotted mode sleep state [7]";
    case OneXState::Traffic:
      break;
  }
  return "Traffic [8]";
}

std::string_view nameOf(EVDOState state) {
  constexpr std::string_view kNames[] = {"Inactive [0]", "Acquisition [1]", "Sync [2]",
                                         "Idle [3]",     "Access [4]",      "Connected [5]"};
  return kNames[static_cast<std::size_t>(state)];
}

class C2KSimulationTest : public testing::SimulationFixture<C2KSimulation> {
 protected:
  C2KSimulationTest() : SimulationFixture(kTqLogChannelTechnology_Ondrel_CDMA) {}

  Value value(const Path& path) const {
    Value value = display.display();
    for (const std::string_view key : path) value = value.dictionary()[key];
    return value;
  }
  std::string text(const Path& path) const {
    const Value shown = value(path);
    return shown.isText() ? std::string(shown.text()) : "(no text)";
  }
  double number(const Path& path) const { return std::atof(text(path).c_str()); }

  /// A list of pilots without the marker in front.
  std::vector<std::pair<std::string, std::string>> pilots(const Path& path) const {
    std::vector<std::pair<std::string, std::string>> entries;
    for (const auto& [key, energy] : value(path).dictionary()) {
      if (key != Value("_sorted")) entries.emplace_back(key.text(), energy.text());
    }
    return entries;
  }
  std::set<std::string> textsIn(const Path& path) {
    std::set<std::string> texts;
    for (int i = 0; i < kC2KStepsOfTwentyMinutes; ++i) {
      step();
      texts.insert(text(path));
    }
    return texts;
  }
  /// How many pilots a list has in the course of the drive.
  std::set<std::size_t> sizesOf(const Path& path) {
    std::set<std::size_t> sizes;
    for (int i = 0; i < kC2KStepsOfTwentyMinutes; ++i) {
      step();
      sizes.insert(pilots(path).size());
    }
    return sizes;
  }
  static void expectFilled(const Value& shown) {
    for (const auto& [key, inner] : shown.dictionary()) {
      EXPECT_NE(inner, Value("")) << key.text();
      if (inner.isDictionary()) expectFilled(inner);
    }
  }

  const C2KPhone& phone() { return simulation.phone(); }
};

TEST_F(C2KSimulationTest, SaysTheSameInEveryRun) {
  C2KSimulation again;
  expectSameIn(again, 200);
}

TEST_F(C2KSimulationTest, FillsEveryPlaceOfTheDisplayFromTheFirstCallOn) {
  while (!phone().oneX().isInTraffic()) step();
  expectFilled(display.display());
}

TEST_F(C2KSimulationTest, MovesThroughTheStatesOfOneX) {
  EXPECT_THAT(
      textsIn(kOneXState),
      ElementsAre("Acquisition [3]", "Initial state for CDMA operation [2]", "Paging [6]",
                  "Powerup state [11]", "Slotted mode sleep state [7]", "Sync [4]", "Traffic [8]"));
}

TEST_F(C2KSimulationTest, MovesThroughTheStatesOfEVDO) {
  EXPECT_THAT(textsIn(kEVDOState), ElementsAre("Access [4]", "Acquisition [1]", "Connected [5]",
                                               "Idle [3]", "Inactive [0]", "Sync [2]"));
}

TEST_F(C2KSimulationTest, SetsUpASession) {
  EXPECT_THAT(textsIn(kSession), ElementsAre("AMP setup [1]", "AT-initiated neg [2]", "Closed [0]",
                                             "Initiated neg [3]", "Open [4]"));
}

TEST_F(C2KSimulationTest, ShowsTheStatesOfThePhoneAndOneReceiverForBoth) {
  for (int i = 0; i < kC2KStepsOfTwentyMinutes; ++i) {
    step();
    ASSERT_EQ(text(kOneXState), nameOf(phone().oneX().state())) << "step " << i;
    ASSERT_EQ(text(kEVDOState), nameOf(phone().evdo().state()));
    if (phone().oneX().isInTraffic()) {
      ASSERT_EQ(text(kEVDOState), "Inactive [0]");
      ASSERT_EQ(text(kEVDOActiveSet), "(none)");
      ASSERT_EQ(text(kFingers), "(none)");
      ASSERT_EQ(text(kServingPN), "Invalid Value");
    }
  }
}

TEST_F(C2KSimulationTest, ShowsThePilotsOfOneXAsStrongAsTheyAre) {
  for (int i = 0; i < kC2KStepsOfTwentyMinutes; ++i) {
    step();
    const std::vector<C2KPilot> measured = phone().oneXPilots();
    const auto shown = pilots(kOneXActiveSet);
    ASSERT_EQ(shown.size(), measured.size()) << "step " << i;
    for (std::size_t n = 0; n < shown.size(); ++n) {
      const auto& [key, energy] = shown[n];
      ASSERT_EQ(key, std::to_string(n) + ";" + std::to_string(measured[n].pnOffset));
      // The first one is the reference.
      const std::string mark = "(ref pilot) ";
      ASSERT_EQ(energy.starts_with(mark), n == 0);
      const double decibels = std::atof(energy.substr(n == 0 ? mark.size() : 0).c_str());
      ASSERT_NEAR(decibels, measured[n].energy, 0.02);
    }
  }
}

TEST_F(C2KSimulationTest, ShowsThePilotsOfEVDOAsStrongAsTheyAre) {
  for (int i = 0; i < kC2KStepsOfTwentyMinutes; ++i) {
    step();
    const std::vector<C2KPilot> measured = phone().evdoPilots();
    const auto shown = pilots(kEVDOActiveSet);
    ASSERT_EQ(shown.size(), measured.size()) << "step " << i;
    for (std::size_t n = 0; n < shown.size(); ++n) {
      ASSERT_EQ(shown[n].first, std::to_string(n) + ";" + std::to_string(measured[n].pnOffset));
      ASSERT_NEAR(std::atof(shown[n].second.c_str()), measured[n].energy, 0.05);
    }
    if (measured.empty()) continue;
    ASSERT_EQ(text(kServingPN), std::to_string(measured[0].pnOffset) + " × 64chips");
    ASSERT_EQ(pilots(kFingers)[0].first, shown[0].first);
  }
}

TEST_F(C2KSimulationTest, PilotsEnterAndLeaveTheOneXActiveSet) {
  EXPECT_THAT(sizesOf(kOneXActiveSet), ElementsAre(0, 1, 2, 3));
}

TEST_F(C2KSimulationTest, PilotsEnterAndLeaveTheEVDOActiveSet) {
  EXPECT_THAT(sizesOf(kEVDOActiveSet), ElementsAre(0, 1, 2, 3));
}

TEST_F(C2KSimulationTest, ChangesItsServingPilotAndItsOperatorOnTheWay) {
  std::set<std::string> servingPilots;
  std::set<std::string> stations;
  std::set<std::string> systems;
  for (int i = 0; i < 2 * kC2KStepsOfTwentyMinutes; ++i) {
    step();
    servingPilots.insert(text(kServingPN));
    stations.insert(text({"01;1x", "02;System", "03;Base Station ID"}));
    systems.insert(text({"01;1x", "02;System", "01;System ID"}) + " roaming " +
                   text({"01;1x", "02;System", "06;Roaming"}));
  }
  EXPECT_GT(servingPilots.size(), 10U);
  EXPECT_GT(stations.size(), 10U);
  EXPECT_THAT(systems, ElementsAre("4139 roaming OFF [0]", "4160 roaming ON [1]"));
}

TEST_F(C2KSimulationTest, ShowsTheRatesOfThePhone) {
  constexpr double kBitsPerKilobit = 1024;
  // A counter counts whole packets, and keeps the rest for the next one.
  constexpr double kLargestPacket = 12'288;
  double forward = 0;
  double reverse = 0;
  double highest = 0;
  step();
  for (int i = 1; i < kC2KStepsOfTwentyMinutes; ++i) {
    step();
    forward += phone().forwardRate() / 2;
    reverse += phone().reverseRate() / 2;
    if (i % 2 != 0) continue;
    ASSERT_THAT(text(kForwardRate), EndsWith(" kbps"));
    ASSERT_NEAR(number(kForwardRate) * kBitsPerKilobit, forward, kLargestPacket) << "step " << i;
    ASSERT_NEAR(number(kReverseRate) * kBitsPerKilobit, reverse, kLargestPacket);
    highest = std::max(highest, forward);
    forward = 0;
    reverse = 0;
  }
  EXPECT_GT(highest, 1e6);
  EXPECT_LE(highest, 3.072e6);
}

TEST_F(C2KSimulationTest, ShowsTheErrorRateOfACallAndThenThatItIsOld) {
  double highest = 0;
  bool wasInTraffic = false;
  for (int i = 0; i < kC2KStepsOfTwentyMinutes; ++i) {
    step();
    const std::string shown = text(kErrorRate);
    wasInTraffic = wasInTraffic || phone().oneX().isInTraffic();
    if (!wasInTraffic) {
      ASSERT_EQ(shown, "") << "step " << i;
    } else if (phone().oneX().isInTraffic()) {
      ASSERT_THAT(shown, EndsWith("%")) << "step " << i;
      highest = std::max(highest, number(kErrorRate));
    } else {
      ASSERT_THAT(shown, EndsWith("% (old)")) << "step " << i;
    }
  }
  EXPECT_GT(highest, 1);
  EXPECT_LT(highest, 40);
}

TEST_F(C2KSimulationTest, NeverMakesTheParsersComplain) {
  display.systemLog().setThreshold(LogPriority::Notice);
  for (int i = 0; i < 400; ++i) step();
  EXPECT_THAT(display.systemLog().lines(), IsEmpty());
}

}  // namespace
}  // namespace kestro
