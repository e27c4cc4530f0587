// SPDX-License-Identifier: MIT
// Drives of all simulations: what is measured is what the display shows, value for value.
#include <gtest/gtest.h>

#include <chrono>
#include <cmath>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Measurer.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/QuietPlatform.h"
#include "Sources/SourceCatalogue.h"
#include "Tests/Sources/SourceReading.h"
#include "Tests/Support/DisplayPlaces.h"
#include "Tests/Support/MeasureFixture.h"

namespace kestro::testing {
namespace {

using namespace std::chrono_literals;

constexpr auto kMeasuredDrive = 10min;

/// The messages of a simulated drive.
std::vector<Bytes> drive(std::string_view technology) {
  const auto coding = createPropertyListCoding();
  QuietPlatform platform(*coding);
  const auto source = openSource({.kind = "simulation", .argument = {}, .technology = technology},
                                 sourceServices(platform), [](std::string_view) {});
  std::vector<Bytes> messages;
  while (true) {
    ReadEvent event = readEvent(**source);
    if (event.time >= kMeasuredDrive) return messages;
    messages.push_back(std::move(event.message));
  }
}

/// A display and a measurer that get the same messages.
class MeasuredDrivesTest : public ::testing::TestWithParam<std::string_view> {
 protected:
  MeasuredDrivesTest() {
    addTemplates(platform);
    generator = LogGenerator::generatorFromTechnology(generatorServices(platform), GetParam());
  }

  void receive(ByteView message) {
    _before = std::move(_shown);
    generator->updateStateWithData(state, message);
    _shown = placesOf(state[kStateDisplay]);
    measured = measurer.measure(GetParam(), message);
  }

  /// Every value stands in the display where its series says.
  void expectShown() {
    _measuredPlaces.clear();
    for (const MeasuredValue& value : measured.values) {
      const std::string place = placeOf(value);
      _measuredPlaces.insert(place);
      const auto shown = _shown.find(place);
      ASSERT_NE(shown, _shown.end()) << lineOf(value) << " has no place " << place;
      expectSame(value, shown->second);
    }
  }

  /// Every number that the message changed in the display is measured.
  void expectMeasured() {
    for (const auto& [place, text] : _shown) {
      const auto before = _before.find(place);
      if (before != _before.end() && before->second == text) continue;
      if (_measuredPlaces.contains(place) || !hasNumber(text)) continue;
      ADD_FAILURE() << place << " shows " << text << " and is not measured";
    }
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  QuietPlatform platform{*coding};
  std::unique_ptr<LogGenerator> generator;
  Measurer measurer{{platform.bundle(), *coding}};
  Measured measured;
  Dictionary state;

 private:
  /// The number is the one in the text, to the text's last digit; the rest of the text is the unit.
  static void expectSame(const MeasuredValue& value, const std::string& shown) {
    TextBuffer text;
    writeShown(value, text);
    ASSERT_EQ(text.text(), shown) << lineOf(value);
    if (value.series->group->kind != SeriesKind::Number) return;
    const ShownNumber number = numberIn(shown);
    ASSERT_TRUE(number.isThere) << shown;
    ASSERT_NEAR(value.number, number.value, 0.5000001 * number.lastDigit) << shown;
    ASSERT_TRUE(number.unit.starts_with(value.series->group->unit)) << lineOf(value);
    ASSERT_EQ(number.unit.empty(), value.series->group->unit.empty()) << lineOf(value);
  }

  Places _before;
  Places _shown;
  std::set<std::string> _measuredPlaces;
};

TEST_P(MeasuredDrivesTest, ShowEveryNumberThatIsMeasuredAndHaveMeasuredEveryNumberShown) {
  std::size_t count = 0;
  for (const Bytes& message : drive(GetParam())) {
    receive(message);
    expectShown();
    expectMeasured();
    if (HasFailure()) return;
    count += measured.values.size();
  }
  EXPECT_GT(count, 1000U);
}

/// All that is measured in a drive, as lines.
std::vector<std::string> linesOfDrive(std::string_view technology,
                                      const std::vector<Bytes>& messages) {
  const auto coding = createPropertyListCoding();
  const auto bundle = createBundle();
  Measurer measurer({*bundle, *coding});
  std::vector<std::string> lines;
  for (const Bytes& message : messages) {
    for (const MeasuredValue& value : measurer.measure(technology, message).values) {
      lines.push_back(lineOf(value));
    }
  }
  return lines;
}

TEST_P(MeasuredDrivesTest, SayTheSameInSeveralThreads) {
  std::vector<Bytes> messages = drive(GetParam());
  messages.resize(std::min<std::size_t>(messages.size(), 500));
  const std::vector<std::string> expected = linesOfDrive(GetParam(), messages);
  std::vector<std::vector<std::string>> found(3);
  std::vector<std::jthread> threads;
  for (auto& lines : found) {
    threads.emplace_back([&, technology = GetParam()] {
      for (int i = 0; i < 5; ++i) lines = linesOfDrive(technology, messages);
    });
  }
  threads.clear();
  for (const auto& lines : found) EXPECT_EQ(lines, expected);
}

INSTANTIATE_TEST_SUITE_P(AllTechnologies, MeasuredDrivesTest,
                         ::testing::ValuesIn(LogGenerator::technologies()),
                         [](const auto& test) { return std::string(test.param); });

}  // namespace
}  // namespace kestro::testing
