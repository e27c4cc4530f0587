// SPDX-License-Identifier: MIT
// A simulated baseband, and what a display makes of its packets.
#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <set>
#include <string>
#include <vector>

#include "LogGenerator/Packets/PacketHeader.h"
#include "Sources/PacketSimulation.h"
#include "Tests/Support/DisplayReader.h"

namespace kestro::testing {

template <class Simulation>
class SimulationFixture : public ::testing::Test {
 protected:
  explicit SimulationFixture(std::string_view technology) : display(technology) {}

  /// The packets of the next step, shown.
  std::vector<Bytes> step() {
    std::vector<Bytes> packets = simulation.step(_elapsed, _now);
    _elapsed = kSimulationStep;
    _now += kSimulationStep;
    for (const Bytes& packet : packets) display.receive(packet);
    return packets;
  }

  /// The codes of the packets of so many steps.
  std::set<LogCode> codesOfSteps(int steps) {
    std::set<LogCode> codes;
    for (int i = 0; i < steps; ++i) {
      for (const Bytes& packet : step()) codes.insert(logCodeOf(PacketView(packet)));
    }
    return codes;
  }

  /// What a key of a section shows in the course of so many steps.
  std::set<std::string> shown(std::string_view section, std::string_view key, int steps) {
    std::set<std::string> texts;
    for (int i = 0; i < steps; ++i) {
      step();
      texts.insert(display.text(section, key));
    }
    return texts;
  }

  /// Whether a second simulation says the same for so many steps.
  void expectSameIn(Simulation& other, int steps) {
    for (int i = 0; i < steps; ++i) {
      const Moment now = _now;
      const std::chrono::milliseconds elapsed = _elapsed;
      ASSERT_EQ(step(), other.step(elapsed, now)) << "step " << i;
    }
  }

  DisplayReader display;
  Simulation simulation{display.coding()};

 private:
  std::chrono::milliseconds _elapsed{0};
  Moment _now = kSimulationBegin;
};

}  // namespace kestro::testing
