// SPDX-License-Identifier: MIT
// Drives by hand: packets at times, through the measurer and the watch.
#pragma once

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Measurements/DriveWatch.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/PacketBytes.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::testing {

/// Takes packets and keeps the events in short: "1.5 reselection LTE: 7 -> 8".
class DriveFixture : public ::testing::Test {
 public:
  explicit DriveFixture(std::string_view technologyOfPackets) : technology(technologyOfPackets) {
    addTemplates(platform);
    watch.emplace(std::vector<Rule>(), [this](const Event& event) { keep(event); });
  }

  void watchWith(std::string_view rules) {
    auto parsed = parseRules(rules, "rules");
    ASSERT_TRUE(parsed);
    watch.emplace(std::move(*parsed), [this](const Event& event) { keep(event); });
  }

  /// The time at which the next packets come, in milliseconds after the drive's beginning.
  DriveFixture& at(std::int64_t milliseconds) {
    now = kBegin + std::chrono::milliseconds(milliseconds);
    return *this;
  }

  DriveFixture& take(const PacketBytes& packet) { return takeBytes(packet.bytes()); }
  DriveFixture& takeBytes(ByteView bytes) {
    watch->take({.time = now,
                 .number = ++number,
                 .technology = technology,
                 .isFromDriveTest = isFromDriveTest,
                 .measured = measurer.measure(technology, bytes)});
    return *this;
  }

  /// A cell's row by the name that events have for it.
  [[nodiscard]] const Cell* cell(std::string_view name) const {
    for (const Cell& row : watch->cells().all()) {
      if (textOf(row.name) == name) return &row;
    }
    return nullptr;
  }
  [[nodiscard]] std::vector<std::string> cellNames() const {
    std::vector<std::string> names;
    for (const Cell& row : watch->cells().all()) names.push_back(textOf(row.name));
    return names;
  }

  static constexpr Moment kBegin{std::chrono::seconds(1'700'000'000)};

  std::string_view technology;
  bool isFromDriveTest = false;
  Moment now = kBegin;
  std::uint64_t number = 0;
  std::vector<Event> events;
  std::vector<std::string> lines;  ///< of the events, without the states
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  Measurer measurer{{platform.bundle(), *coding}};
  std::optional<DriveWatch> watch;

 private:
  void keep(const Event& event) {
    events.push_back(event);
    if (event.kind == EventKind::State) return;
    const double seconds = std::chrono::duration<double>(event.time - kBegin).count();
    std::string line = fmt::format("{} {} {}:", seconds, nameOfEvent(event.kind), event.technology);
    if (!event.subject.empty()) line += fmt::format(" {}", event.subject);
    if (!event.from.empty()) line += fmt::format(" {} ->", event.from);
    if (!event.to.empty()) line += fmt::format(" {}", event.to);
    lines.push_back(line);
  }
};

}  // namespace kestro::testing
