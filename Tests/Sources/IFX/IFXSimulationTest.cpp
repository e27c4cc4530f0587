// SPDX-License-Identifier: MIT
// The simulated drive on the IFX channel.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>
#include <memory>
#include <set>
#include <string>

#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Sources/IFX/IFXSimulation.h"
#include "Tests/Sources/SourceReading.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

// Enough to drive out of town, where there is GSM only, and back in.
constexpr int kMessages = 2'400;

class IFXSimulationTest : public ::testing::Test {
 protected:
  /// What the next message holds, as a receiver displays it.
  Dictionary shown() {
    const auto message = ifxMessageOf(_phone);
    _phone.advance(IFXSimulation::kInterval);
    return GSMLogGenerator::processObject(message.propertyList()).dictionary();
  }
  /// A section by the name that the display shows.
  static Value section(const Dictionary& display, std::string_view name) {
    for (const auto& [key, value] : display) {
      const auto text = key.text();
      if (text.size() > 3 && text.substr(3) == name) return value;
    }
    return {};
  }
  static double numberIn(const Dictionary& section, std::string_view key) {
    return std::atof(std::string(section[key].text()).c_str());
  }

  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  IFXSimulation _simulation{*_coding};
  SimulatedPhone _phone{IFXSimulation::kDefaultSeed};
};

TEST_F(IFXSimulationTest, SendsWhatThePhoneShows) {
  for (int i = 0; i < 10; ++i) {
    const auto message = _coding->parse(readEvent(_simulation).message);
    ASSERT_TRUE(message.has_value());
    ASSERT_EQ(*message, Value(ifxMessageOf(_phone).propertyList())) << i;
    _phone.advance(IFXSimulation::kInterval);
  }
}

TEST_F(IFXSimulationTest, IsTheSameInEveryRun) {
  IFXSimulation other(*_coding);
  for (int i = 0; i < 200; ++i) {
    const auto one = readEvent(_simulation);
    const auto two = readEvent(other);
    ASSERT_EQ(one.message, two.message) << i;
    ASSERT_EQ(one.time, two.time) << i;
  }
}

TEST_F(IFXSimulationTest, AnotherSeedIsAnotherDrive) {
  IFXSimulation other(*_coding, 1);
  EXPECT_NE(readEvent(_simulation).message, readEvent(other).message);
}

TEST_F(IFXSimulationTest, StartsAgainAsItBegan) {
  const auto first = readEvent(_simulation);
  readEvent(_simulation);
  ASSERT_TRUE(_simulation.restart());
  const auto again = readEvent(_simulation);
  EXPECT_EQ(again.message, first.message);
  EXPECT_EQ(again.time, milliseconds(0));
}

TEST_F(IFXSimulationTest, SendsTwoMessagesASecond) {
  EXPECT_EQ(readEvent(_simulation).time, milliseconds(0));
  EXPECT_EQ(readEvent(_simulation).time, milliseconds(500));
  EXPECT_EQ(readEvent(_simulation).time, milliseconds(1'000));
}

TEST_F(IFXSimulationTest, AReceiverShowsEverySectionOfBothRadioAccesses) {
  std::set<std::string> sections;
  std::set<std::string> accesses;
  for (int i = 0; i < kMessages; ++i) {
    const auto display = shown();
    for (const auto& [key, value] : display) sections.insert(std::string(key.text()).substr(3));
    accesses.insert(std::string(section(display, "Mode").dictionary()["Radio Access"].text()));
  }
  for (const auto* name : {"Mode", "Serving Cell", "Radio Quality", "Active Set", "Monitored Set",
                           "GSM Neighbours", "Throughput", "Mobility", "Drive"}) {
    EXPECT_TRUE(sections.contains(name)) << name;
  }
  EXPECT_EQ(accesses, (std::set<std::string>{"GSM", "UMTS"}));
}

TEST_F(IFXSimulationTest, TheActiveSetHoldsOneToThreeWholeCells) {
  for (int i = 0; i < 1'000; ++i) {
    const auto display = shown();
    const auto set = section(display, "Active Set").array();
    if (set.isNull()) continue;
    ASSERT_GE(set.size(), 1U);
    ASSERT_LE(set.size(), SoftHandoverSet::kMaximumSize);
    for (const Value& cell : set) {
      ASSERT_EQ(cell.dictionary().size(), 3U);
    }
  }
}

TEST_F(IFXSimulationTest, AServingCellsLevelMovesSmoothly) {
  std::string cell;
  double level = 0;
  int large = 0;
  int steps = 0;
  for (int i = 0; i < kMessages; ++i) {
    const auto display = shown();
    const auto quality = section(display, "Radio Quality").dictionary();
    const bool isUMTS = quality.contains("RSCP");
    const double present = numberIn(quality, isUMTS ? "RSCP" : "RxLev");
    ASSERT_LT(present, -25);
    ASSERT_GT(present, -125);
    const std::string now(section(display, "Serving Cell").dictionary()["Cell ID"].text());
    if (now == cell) {
      ++steps;
      if (std::abs(present - level) > 6) ++large;
    }
    cell = now;
    level = present;
  }
  EXPECT_LT(large * 50, steps);
}

TEST_F(IFXSimulationTest, CellsHandOverAsTheCarDrives) {
  std::set<std::string> cells;
  Dictionary mobility;
  for (int i = 0; i < kMessages; ++i) {
    const auto display = shown();
    cells.insert(std::string(section(display, "Serving Cell").dictionary()["Cell ID"].text()));
    mobility = section(display, "Mobility").dictionary();
  }
  EXPECT_GT(cells.size(), 10U);
  EXPECT_GE(numberIn(mobility, "Cell Changes") + 1, static_cast<double>(cells.size()));
  EXPECT_GE(numberIn(mobility, "Inter-RAT Changes"), 2);
}

TEST_F(IFXSimulationTest, DataFlowsDuringTransfersOnly) {
  double total = 0;
  int transfers = 0;
  for (int i = 0; i < 1'000; ++i) {
    const auto display = shown();
    const auto throughput = section(display, "Throughput").dictionary();
    const auto state = section(display, "Mode").dictionary()["State"];
    const bool isTransfer = state == Value("CELL_DCH") || state == Value("Packet Transfer");
    EXPECT_EQ(numberIn(throughput, "Downlink") > 0, isTransfer);
    EXPECT_GE(numberIn(throughput, "Downlink Total"), total);
    total = numberIn(throughput, "Downlink Total");
    transfers += isTransfer ? 1 : 0;
  }
  EXPECT_GT(transfers, 300);
  EXPECT_LT(transfers, 900);
}

}  // namespace
}  // namespace kestro
