// SPDX-License-Identifier: MIT
// Every simulation sends what its generator asks for.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/PacketHeader.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Sources/SourceCatalogue.h"
#include "Tests/Sources/SourceReading.h"
#include "Tests/Support/ProgramTemplates.h"
#include "Tests/Support/SubscribedCodes.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::SizeIs;

/// A log code that a generator asks for and the simulation of its technology does not send.
struct NotSimulated {
  std::string_view technology;
  LogCode code;
  std::string_view reason;
};

/// Whatever is asked for and not sent must stand here, and nothing else may.
const std::vector<NotSimulated> kNotSimulated = {};

constexpr auto kDrive = std::chrono::minutes(20);

/// What the technology's generator asks for.
std::set<LogCode> askedForBy(std::string_view technology) {
  const auto coding = createPropertyListCoding();
  VirtualPlatform platform(*coding);
  addTemplates(platform);
  return subscribedCodes(
      *LogGenerator::generatorFromTechnology(generatorServices(platform), technology));
}

/// The technologies whose generators ask for codes.
std::vector<std::string_view> technologiesWithCodes() {
  std::vector<std::string_view> found;
  for (const std::string_view technology : LogGenerator::technologies()) {
    if (!askedForBy(technology).empty()) found.push_back(technology);
  }
  return found;
}

class SimulatedCodesTest : public ::testing::TestWithParam<std::string_view> {
 protected:
  /// The codes of the simulation's messages in the course of a drive.
  [[nodiscard]] std::set<LogCode> sent() {
    const auto source = openSource({.kind = "simulation", .argument = {}, .technology = GetParam()},
                                   sourceServices(platform), ignore);
    std::set<LogCode> codes;
    for (ReadEvent event = readEvent(**source); event.time < kDrive; event = readEvent(**source)) {
      codes.insert(logCodeOf(PacketView(event.message)));
    }
    return codes;
  }

  const SourceReporter ignore = [](std::string_view) {};
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
};

TEST_P(SimulatedCodesTest, AreThoseThatTheGeneratorAsksForSaveTheListed) {
  std::set<LogCode> expected = askedForBy(GetParam());
  for (const NotSimulated& row : kNotSimulated) {
    if (row.technology != GetParam()) continue;
    EXPECT_EQ(expected.erase(row.code), 1U) << "listed, but nobody asks for it: " << row.code;
    EXPECT_FALSE(row.reason.empty()) << row.code;
  }
  EXPECT_EQ(sent(), expected);
}

std::string nameOf(const ::testing::TestParamInfo<std::string_view>& info) {
  return std::string(info.param);
}

INSTANTIATE_TEST_SUITE_P(AllTechnologies, SimulatedCodesTest,
                         ::testing::ValuesIn(technologiesWithCodes()), nameOf);

TEST(NotSimulatedTest, NamesTechnologiesWithCodes) {
  EXPECT_THAT(technologiesWithCodes(), SizeIs(4));
  for (const NotSimulated& row : kNotSimulated) {
    EXPECT_THAT(technologiesWithCodes(), Contains(row.technology));
  }
}

}  // namespace
}  // namespace kestro::testing
