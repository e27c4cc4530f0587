// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMLogGenerator.h"
#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TelephonyService.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;

class LogGeneratorTest : public ::testing::Test {
 protected:
  LogGeneratorTest() {
    // 2012-03-04 12:05:09 UTC
    platform.clock().setNow(Moment(std::chrono::seconds(1330862709)));
    platform.clock().setTimeZone(std::chrono::hours(1), false);
  }

  /// Whether the technology's generator is of this class.
  template <class Generator>
  [[nodiscard]] bool makes(std::string_view technology) {
    const auto made =
        LogGenerator::generatorFromTechnology(generatorServices(platform), technology);
    return dynamic_cast<Generator*>(made.get()) != nullptr;
  }

  void update() { LogGenerator::updateHistoryInState(state, platform.clock()); }

  Dictionary entry(std::size_t index) { return state["History"].array()[index].dictionary(); }

  static std::vector<std::string> keys(const Dictionary& dictionary) {
    std::vector<std::string> result;
    for (const auto& [key, value] : dictionary) result.emplace_back(key.text());
    return result;
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  Dictionary state;
};

TEST_F(LogGeneratorTest, KnowsNoGeneratorForAnotherTechnology) {
  EXPECT_FALSE(LogGenerator::generatorFromTechnology(generatorServices(platform), "Semaphore"));
  EXPECT_FALSE(LogGenerator::generatorFromTechnology(generatorServices(platform), ""));
  EXPECT_FALSE(LogGenerator::generatorFromTechnology(generatorServices(platform), "ifx"));
}

TEST_F(LogGeneratorTest, NamesTheTechnologiesInTheOrderOfTheSearch) {
  EXPECT_THAT(LogGenerator::technologies(),
              ElementsAre("IFX", "Ondrel_GSM", "Ondrel_CDMA", "LTE", "UTRAN2"));
}

TEST_F(LogGeneratorTest, EveryTechnologyHasItsGenerator) {
  EXPECT_TRUE(makes<GSMLogGenerator>(kTqLogChannelTechnology_IFX));
  EXPECT_TRUE(makes<Ondrel_GSMLogGenerator>(kTqLogChannelTechnology_Ondrel_GSM));
  EXPECT_TRUE(makes<C2KLogGenerator>(kTqLogChannelTechnology_Ondrel_CDMA));
  EXPECT_TRUE(makes<LTELogGenerator>(kTqLogChannelTechnology_Ondrel_LTE));
  EXPECT_TRUE(makes<UTRANLogGenerator>(kTqLogChannelTechnology_Ondrel_UTRAN2));
}

TEST_F(LogGeneratorTest, LogsTheAddressOfANewGenerator) {
  const auto generator = LogGenerator::generatorFromTechnology(generatorServices(platform),
                                                               kTqLogChannelTechnology_IFX);
  ASSERT_TRUE(generator);
  EXPECT_THAT(platform.systemLog().lines(),
              ElementsAre(RecordingSystemLog::Line{
                  LogPriority::Warning, "Creating Log object: " + addressText(generator.get())}));
}

TEST_F(LogGeneratorTest, CreatesTheHistoryWithOneEntry) {
  state.set("DisplayState", "raw");
  state.set("Display", Dictionary{{"A", "1"}});
  state.set("ExtraInfo", Dictionary());
  update();

  ASSERT_EQ(state["History"].array().size(), 1U);
  EXPECT_THAT(keys(entry(0)),
              ElementsAre("DisplayState", "Display", "ExtraInfo", "Date", "Description"));
  EXPECT_EQ(entry(0)["DisplayState"], Value("raw"));
  EXPECT_EQ(entry(0)["Date"], Value("2012-03-04 13:05:09 +0100"));
  EXPECT_EQ(entry(0)["Description"], Value("Snapshot (2012-03-04 13:05:09 +0100)"));
}

TEST_F(LogGeneratorTest, AddsAnEmptyEntryWithoutADisplayState) {
  state.set("Display", Dictionary());
  state.set("ExtraInfo", Dictionary());
  update();
  EXPECT_TRUE(entry(0).empty());
}

TEST_F(LogGeneratorTest, EndsTheEntryAtTheFirstMissingValue) {
  state.set("DisplayState", "raw");
  state.set("ExtraInfo", Dictionary());
  update();
  EXPECT_THAT(keys(entry(0)), ElementsAre("DisplayState"));

  state.set("Display", "shown");
  state.remove("ExtraInfo");
  update();
  EXPECT_THAT(keys(entry(1)), ElementsAre("DisplayState", "Display"));
}

TEST_F(LogGeneratorTest, KeepsTheNewestFiveEntries) {
  for (const char* text : {"1", "2", "3", "4", "5", "6"}) {
    state.set("DisplayState", text);
    update();
  }
  ASSERT_EQ(state["History"].array().size(), 5U);
  EXPECT_EQ(entry(0)["DisplayState"], Value("2"));
  EXPECT_EQ(entry(4)["DisplayState"], Value("6"));
}

TEST_F(LogGeneratorTest, CutsALongerHistoryOfAnotherWriterToFive) {
  Array history;
  for (const char* text : {"1", "2", "3", "4", "5", "6", "7"}) {
    history.append(Dictionary{{"DisplayState", text}});
  }
  state.set("History", history);
  update();
  ASSERT_EQ(state["History"].array().size(), 5U);
  EXPECT_EQ(entry(0)["DisplayState"], Value("4"));
  EXPECT_TRUE(entry(4).empty());
}

TEST_F(LogGeneratorTest, KeepsTheDisplayAsItWas) {
  const Dictionary section{{"RSRP", "-90 dBm"}};
  state.set("DisplayState", "raw");
  state.set("Display", Dictionary{{"Cell", section}, {"Rows", Array{section}}});
  update();

  Dictionary(section).set("RSRP", "-50 dBm");

  const Dictionary kept = entry(0)["Display"].dictionary();
  EXPECT_EQ(kept["Cell"].dictionary()["RSRP"], Value("-90 dBm"));
  EXPECT_EQ(kept["Rows"].array()[0].dictionary()["RSRP"], Value("-90 dBm"));
}

TEST_F(LogGeneratorTest, KeepsTheExtraInformationAsItWas) {
  Dictionary extra{{"newest", "1"}};
  state.set("DisplayState", "raw");
  state.set("Display", "shown");
  state.set("ExtraInfo", extra);
  update();
  extra.set("newest", "2");
  update();
  EXPECT_EQ(entry(0)["ExtraInfo"].dictionary()["newest"], Value("1"));
  EXPECT_EQ(entry(1)["ExtraInfo"].dictionary()["newest"], Value("2"));
}

}  // namespace
}  // namespace kestro
