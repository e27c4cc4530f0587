// SPDX-License-Identifier: MIT
// Sources by name.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Sources/SourceCatalogue.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Sources/SourceReading.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::Contains;
using ::testing::HasSubstr;
using ::testing::Not;
using testing::TemporaryDirectory;

class SourceCatalogueTest : public ::testing::Test {
 protected:
  Result<std::unique_ptr<LogSource>> open(std::string_view text, std::string_view technology = "") {
    const auto request = parseSource(text, technology);
    if (!request) return tl::unexpected(request.error());
    return openSource(*request, sourceServices(platform), report);
  }

  TemporaryDirectory directory;
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::vector<std::string> reports;
  SourceReporter report = [this](std::string_view line) { reports.emplace_back(line); };
};

TEST_F(SourceCatalogueTest, TheKindEndsAtTheFirstColon) {
  const auto request = parseSource("capture:a:b.pcap", "LTE");
  ASSERT_TRUE(request.has_value());
  EXPECT_EQ(request->kind, "capture");
  EXPECT_EQ(request->argument, "a:b.pcap");
  EXPECT_EQ(request->technology, "LTE");
}

TEST_F(SourceCatalogueTest, UnknownKindsAndMissingArgumentsAreWrongUsage) {
  for (const auto* text : {"capture", "capture:", "drive-test", "stream:", "simulation:5G"}) {
    EXPECT_FALSE(parseSource(text, "").has_value()) << text;
  }
  EXPECT_EQ(parseSource("capture", "").error().message,
            "\"capture\" is no source; the form is [capture:]FILE");
}

TEST_F(SourceCatalogueTest, WhatBeginsWithNoKindIsAFile) {
  for (const std::string text : {"a.pcap", "film:x", ":x", "./capture:x", "Simulation"}) {
    EXPECT_EQ(parseSource(text, "")->kind, "capture") << text;
    EXPECT_EQ(parseSource(text, "")->argument, text);
  }
  const auto capture = directory.write("a:b", captureHeader(151));
  EXPECT_EQ((*open(capture))->technology(), "UTRAN2");
  EXPECT_EQ(open("film").error().message,
            "film: No such file or directory (nor is it one of the sources simulation, capture, "
            "drive-test, stream, modem)");
  EXPECT_EQ(open("/film").error().message, "/film: No such file or directory");
}

TEST_F(SourceCatalogueTest, AGpsdHasAHostAndAPort) {
  const auto parsed = [](std::string_view text) {
    const auto server = parseGps(text);
    return server ? server->host + " " + server->port : "refused";
  };
  EXPECT_EQ(parsed("gpsd"), "localhost 2947");
  EXPECT_EQ(parsed("gpsd:car"), "car 2947");
  EXPECT_EQ(parsed("gpsd:car:1234"), "car 1234");
  EXPECT_EQ(parsed("gpsd:[::1]"), "::1 2947");
  EXPECT_EQ(parsed("gpsd:[::1]:65535"), "::1 65535");
  for (const std::string text :
       {"", "gps", "gpsdx", "gpsd:", "gpsd::1", "gpsd:car:", "gpsd:car:0", "gpsd:car:65536",
        "gpsd:car:x", "gpsd:[::1", "gpsd:[]", "gpsd:[a]b"}) {
    EXPECT_EQ(parsed(text), "refused") << text;
  }
}

TEST_F(SourceCatalogueTest, WithoutAMainQueueThereIsNoModem) {
  const auto request = parseSource("modem", "");
  ASSERT_TRUE(request);
  const SourceServices services{.propertyListCoding = platform.propertyListCoding(),
                                .clock = platform.clock()};
  const auto source = openSource(*request, services, [](std::string_view) {});
  ASSERT_FALSE(source);
  EXPECT_EQ(source.error().message, "a modem is live: kestro-telephonyd plays it");
}

TEST_F(SourceCatalogueTest, ADriveTestLogAsAFileIsFollowedFromTechnologyToTechnology) {
  const auto log =
      directory.write("a", std::string_view("Timestamp,NetworkMode,RSRP,CELLHEX,LACHEX\n"
                                            "2020.01.02_03.04.05,EDGE,-90,1,1\n"
                                            "2020.01.02_03.04.06,LTE,-91,1,1\n"));
  const auto source = open("capture:" + log);
  ASSERT_TRUE(source.has_value());
  EXPECT_EQ((*source)->technology(), "Ondrel_GSM");
  EXPECT_EQ(readToEnd(**source).back().technology, "LTE");
  EXPECT_EQ((*open(log, "IFX"))->technology(), "IFX");
  EXPECT_TRUE(*stateOf(*parseSource(log, ""), **source).isSimulated);
  EXPECT_THAT(open(log, "UTRAN2").error().message, HasSubstr("cannot make UTRAN2 messages"));
}

TEST_F(SourceCatalogueTest, OpensEveryKind) {
  const auto capture = directory.write("a.pcap", captureHeader(151));
  const auto log = directory.write("a.csv", std::string_view("Timestamp,NetworkMode,RSRP\n"));
  platform.inputStreams().allow("pipe");
  EXPECT_EQ((*open("simulation"))->technology(), "LTE");
  EXPECT_EQ((*open("simulation:IFX"))->technology(), "IFX");
  EXPECT_EQ((*open("capture:" + capture))->technology(), "UTRAN2");
  EXPECT_EQ((*open("drive-test:" + log))->technology(), "IFX");
  EXPECT_EQ((*open("stream:pipe"))->technology(), "IFX");
}

TEST_F(SourceCatalogueTest, TellsWhatASourceIs) {
  const auto told = [](std::string_view text) { return stateOf(*parseSource(text, "")); };
  EXPECT_EQ(told("simulation"), (LogSourceState{.kind = "simulation", .isSimulated = true}));
  EXPECT_EQ(told("capture:/a.pcap"),
            (LogSourceState{.kind = "capture", .name = "/a.pcap", .isSimulated = false}));
  EXPECT_EQ(told("drive-test:a.csv"),
            (LogSourceState{.kind = "drive-test", .name = "a.csv", .isSimulated = true}));
  EXPECT_EQ(told("stream:-"),
            (LogSourceState{.kind = "stream", .name = "-", .isSimulated = false}));
}

TEST_F(SourceCatalogueTest, SimulationsSayWhenTheirDriveIs) {
  for (const auto* text : {"simulation:IFX", "simulation:LTE"}) {
    const auto source = open(text);
    ASSERT_TRUE(source.has_value());
    for (int i = 0; i < 100; ++i) {
      const auto event = readEvent(**source);
      EXPECT_EQ(event.moment, Moment(std::chrono::seconds(1'330'862'400)) + *event.time) << text;
    }
  }
}

TEST_F(SourceCatalogueTest, TheTechnologyAskedForWins) {
  const auto capture = directory.write("a.pcap", captureHeader(151));
  platform.inputStreams().allow("pipe");
  EXPECT_EQ((*open("capture:" + capture, "LTE"))->technology(), "LTE");
  EXPECT_EQ((*open("stream:pipe", "Ondrel_GSM"))->technology(), "Ondrel_GSM");
  EXPECT_EQ((*open("simulation:LTE", "IFX"))->technology(), "IFX");
}

TEST_F(SourceCatalogueTest, SimulationsAndDriveTestsSpeakSeveralTechnologies) {
  const auto log = directory.write("a.csv", std::string_view("Timestamp,NetworkMode,RSRP\n"
                                                             "2020.01.02_03.04.05,EDGE,-90\n"));
  for (const std::string technology : {"LTE", "Ondrel_GSM"}) {
    EXPECT_EQ((*open("drive-test:" + log, technology))->technology(), technology);
  }
  for (const auto technology : technologyNames()) {
    EXPECT_EQ((*open("simulation:" + std::string(technology)))->technology(), technology);
  }
  EXPECT_THAT(open("drive-test:" + log, "UTRAN2").error().message,
              HasSubstr("cannot make UTRAN2 messages, only IFX, Ondrel_GSM, LTE, auto"));
}

TEST_F(SourceCatalogueTest, AnAutomaticDriveTestBeginsWithItsFirstRow) {
  const auto gsm = directory.write("a.csv", std::string_view("Timestamp,NetworkMode,RSRP\n"
                                                             "2020.01.02_03.04.05,EDGE,-90\n"));
  const auto lte = directory.write("b.csv", std::string_view("Timestamp,NetworkMode,RSRP\n"
                                                             "2020.01.02_03.04.05,5G,-90\n"));
  EXPECT_EQ((*open("drive-test:" + gsm, kAutomaticTechnology))->technology(), "Ondrel_GSM");
  EXPECT_EQ((*open("drive-test:" + lte, kAutomaticTechnology))->technology(), "LTE");
}

TEST_F(SourceCatalogueTest, AutomaticMeansWhatASourceSaysItself) {
  const auto capture = directory.write("a.pcap", captureHeader(151));
  platform.inputStreams().allow("pipe");
  EXPECT_EQ((*open("capture:" + capture, kAutomaticTechnology))->technology(), "UTRAN2");
  EXPECT_FALSE(open("stream:pipe", kAutomaticTechnology).has_value());
  EXPECT_FALSE(open("simulation", kAutomaticTechnology).has_value());
}

TEST_F(SourceCatalogueTest, ATechnologyThatAKindCannotSpeakIsWrongUsage) {
  EXPECT_EQ(parseSource("simulation", kAutomaticTechnology).error().message,
            "the source \"simulation\" cannot make auto messages, only IFX, Ondrel_GSM, "
            "Ondrel_CDMA, LTE, UTRAN2");
  EXPECT_EQ(parseSource("drive-test:x", "UTRAN2").error().message,
            "the source \"drive-test\" cannot make UTRAN2 messages, only IFX, Ondrel_GSM, LTE, "
            "auto");
  EXPECT_EQ(parseSource("stream:-", kAutomaticTechnology).error().message,
            "a stream does not say what it speaks; --technology must");
  EXPECT_TRUE(parseSource("capture:x", kAutomaticTechnology));
}

TEST_F(SourceCatalogueTest, ADriveTestOfAnotherTechnologySaysSoAtOnce) {
  const auto log = directory.write("a.csv", std::string_view("Timestamp,NetworkMode,RSRP\n"
                                                             "2020.01.02_03.04.05,EDGE,-90\n"));
  const std::string rest = "(with --technology=auto each row is what it was measured in)";
  ASSERT_TRUE(open("drive-test:" + log, "LTE"));
  EXPECT_THAT(reports, Contains(log +
                                ": it begins with GSM rows, which are passed over: they are no "
                                "LTE messages " +
                                rest));
  reports.clear();
  for (const auto* technology : {"Ondrel_GSM", "IFX", "auto"}) {
    ASSERT_TRUE(open("drive-test:" + log, technology));
    EXPECT_THAT(reports, Not(Contains(HasSubstr("it begins with")))) << technology;
  }
}

TEST_F(SourceCatalogueTest, FilesThatCannotBeUsedAreNamed) {
  EXPECT_THAT(open("capture:/none").error().message, HasSubstr("/none"));
  EXPECT_THAT(open("drive-test:/none").error().message, HasSubstr("/none"));
}

TEST_F(SourceCatalogueTest, TechnologiesAreFoundByTheirNames) {
  for (const auto name : technologyNames()) EXPECT_EQ(technologyNamed(name), name);
  EXPECT_EQ(technologyNames().size(), 5U);
  EXPECT_EQ(technologyNamed("5G"), "");
  EXPECT_EQ(technologyNamed("auto"), "");
  for (const auto name : technologyChoices()) EXPECT_EQ(technologyChosen(name), name);
  EXPECT_EQ(technologyChoices().size(), 6U);
}

}  // namespace
}  // namespace kestro
