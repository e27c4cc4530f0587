// SPDX-License-Identifier: MIT
// Inputs: what they name, how they are merged and narrowed.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Sources/Inputs.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using testing::TemporaryDirectory;

constexpr std::uint8_t kIFX = 147;
constexpr std::uint8_t kLTE = 150;

/// A record of a capture, so many seconds after 1970.
struct Record {
  std::uint32_t second;
  std::string message;
};

Bytes captureOf(std::uint8_t linkType, const std::vector<Record>& records) {
  Bytes bytes = captureHeader(linkType);
  for (const auto& [second, message] : records) {
    appendLittleEndian<std::uint32_t>(bytes, second);
    appendLittleEndian<std::uint32_t>(bytes, 0);
    appendLittleEndian(bytes, static_cast<std::uint32_t>(message.size()));
    appendLittleEndian(bytes, static_cast<std::uint32_t>(message.size()));
    bytes.insert(bytes.end(), message.begin(), message.end());
  }
  return bytes;
}

/// A packet without a payload.
std::string packetOf(std::uint8_t type, std::uint16_t code) {
  return {static_cast<char>(type),
          12,
          0,
          static_cast<char>(code & 0xFF),
          static_cast<char>(code >> 8),
          0,
          0,
          0,
          0,
          0,
          0,
          0,
          0};
}

class InputsTest : public ::testing::Test {
 protected:
  std::string write(std::string_view name, std::uint8_t linkType,
                    const std::vector<Record>& records) {
    return _directory.write(name, captureOf(linkType, records));
  }

  static std::vector<SourceRequest> requestsOf(const std::vector<std::string>& texts,
                                               std::string_view technology = "") {
    std::vector<SourceRequest> requests;
    for (const auto& text : texts) requests.push_back(*parseInput(text, technology));
    return requests;
  }

  Result<Inputs> open(const std::vector<std::string>& texts, const InputNarrowing& narrowing = {}) {
    return Inputs::open(requestsOf(texts), narrowing, _services,
                        [this](std::string_view line) { _lines.emplace_back(line); });
  }

  /// Everything that is wanted, "number technology message"; an error is a line, too.
  std::vector<std::string> read(const std::vector<std::string>& texts,
                                const InputNarrowing& narrowing = {}) {
    auto inputs = open(texts, narrowing);
    if (!inputs) return {inputs.error().message};
    std::vector<std::string> lines;
    while (true) {
      const auto next = inputs->next();
      if (!next) {
        lines.push_back("error");
        continue;
      }
      if (!next->has_value()) return lines;
      const InputMessage& message = **next;
      lines.push_back(std::to_string(message.number) + " " + std::string(message.technology) + " " +
                      std::string(message.bytes.begin(), message.bytes.end()));
    }
  }

  /// The numbers of those wanted of the first 60 messages of a simulation.
  std::vector<std::uint64_t> numbers(const InputNarrowing& narrowing) {
    auto inputs = open({_five}, narrowing);
    std::vector<std::uint64_t> result;
    while (const auto message = *inputs->next()) result.push_back(message->number);
    return result;
  }

  TemporaryDirectory _directory;
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  VirtualPlatform _platform{*_coding};
  SourceServices _services{.propertyListCoding = *_coding, .clock = _platform.clock()};
  std::vector<std::string> _lines;
  /// Seconds 100 to 104.
  std::string _five =
      write("five", kIFX, {{100, "1"}, {101, "2"}, {102, "3"}, {103, "4"}, {104, "5"}});
};

// --- What an input names

TEST_F(InputsTest, WhatStandsBeforeAColonAndIsAKindIsTheKind) {
  const auto request = parseInput("capture:a:b.pcap", "LTE");
  ASSERT_TRUE(request.has_value());
  EXPECT_EQ(request->kind, "capture");
  EXPECT_EQ(request->argument, "a:b.pcap");
  EXPECT_EQ(request->technology, "LTE");
  EXPECT_EQ(parseInput("stream:-", "")->kind, "stream");
  EXPECT_EQ(parseInput("drive-test:a.csv", "")->kind, "drive-test");
  EXPECT_EQ(parseInput("simulation:IFX", "")->argument, "IFX");
}

TEST_F(InputsTest, AllElseIsAFile) {
  for (const std::string text : {"a.pcap", "-", "./capture:x", "film:x", "simulation", "Capture:x",
                                 ":x", "a b", "", "/x/capture:y"}) {
    const auto request = parseInput(text, "");
    ASSERT_TRUE(request.has_value()) << text;
    EXPECT_EQ(request->kind, "capture") << text;
    EXPECT_EQ(request->argument, text);
  }
}

TEST_F(InputsTest, AKindsArgumentIsChecked) {
  for (const auto* text : {"capture:", "stream:", "drive-test:", "simulation:5G"}) {
    EXPECT_FALSE(parseInput(text, "").has_value()) << text;
  }
  EXPECT_TRUE(parseInput("simulation:", "").has_value());
}

TEST_F(InputsTest, WhatCannotBeOpenedIsNamed) {
  EXPECT_EQ(open({_five, "/none"}).error().message, "/none: No such file or directory");
  EXPECT_THAT(open({"capture:/none"}).error().message, HasSubstr("/none: "));
  EXPECT_THAT(open({"drive-test:/none"}).error().message, HasSubstr("/none: "));
  EXPECT_THAT(open({"stream:/none"}).error().message, HasSubstr("/none: "));
  EXPECT_THAT(open({_directory.path().string()}).error().message, HasSubstr("directory"));
}

TEST_F(InputsTest, StandardInputIsReadOnce) {
  EXPECT_EQ(open({"-", "stream:-"}).error().message, "standard input cannot be read twice");
}

// --- Kinds

TEST_F(InputsTest, ARecordingYieldsItsMessagesAtItsTimes) {
  auto inputs = open({_directory.write("a", joined({captureHeader(kLTE), twoRecords()}))});
  ASSERT_TRUE(inputs.has_value()) << inputs.error().message;
  EXPECT_EQ(inputs->technology(), "LTE");
  EXPECT_EQ(inputs->reader(0).form(), "pcap");
  const auto first = *inputs->next();
  ASSERT_TRUE(first.has_value());
  EXPECT_EQ(first->number, 1U);
  EXPECT_EQ(first->time, Moment(1'330'862'709'000'250us));
  EXPECT_EQ(first->technology, "LTE");
  EXPECT_EQ(first->madeUp, "");
  EXPECT_EQ((*inputs->next())->number, 2U);
  EXPECT_FALSE((*inputs->next()).has_value());
  EXPECT_EQ(inputs->messageCount(), 2U);
  EXPECT_EQ(inputs->fractionRead(), 1);
}

TEST_F(InputsTest, ADriveTestLogIsKnownByItsFirstLineAndFollowed) {
  const auto log = _directory.write(
      "log.bin", std::string_view("NetworkMode,Latitude,Longitude,Timestamp,RSRP,LACHEX,CELLHEX\n"
                                  "EDGE,51.5,-8.25,2019.11.21_15.38.36,-70,1A,2B\n"
                                  "LTE,51.6,-8.50,2019.11.21_15.38.37,-90,1A,2B\n"));
  auto inputs = open({log});
  ASSERT_TRUE(inputs.has_value()) << inputs.error().message;
  EXPECT_EQ(inputs->reader(0).form(), "drive-test log");
  EXPECT_EQ(inputs->technology(), "Ondrel_GSM");
  std::vector<std::pair<std::string, std::string>> found;
  while (const auto message = *inputs->next()) {
    EXPECT_EQ(message->madeUp, "drive-test");
    ASSERT_THAT(message->comments, SizeIs(1));
    const std::pair<std::string, std::string> pair{message->technology, message->comments[0]};
    if (found.empty() || found.back() != pair) found.push_back(pair);
    EXPECT_EQ(message->time,
              Moment(message->technology == "LTE" ? 1'574'350'717s : 1'574'350'716s));
  }
  EXPECT_THAT(found, ElementsAre(std::pair("Ondrel_GSM", "position: 51.5, -8.25"),
                                 std::pair("LTE", "position: 51.6, -8.50")));
  EXPECT_THAT(_lines, ElementsAre(HasSubstr("no columns RSRQ, ")));
}

TEST_F(InputsTest, TheTechnologyAskedForIsWhatADriveTestLogIsMadeOf) {
  const auto log = _directory.write("log.csv", std::string_view("NetworkMode,Timestamp,RSRP\n"
                                                                "LTE,2019.11.21_15.38.36,-70\n"));
  auto inputs = Inputs::open(requestsOf({log, "drive-test:" + log}, "IFX"), {}, _services,
                             [](std::string_view) {});
  ASSERT_TRUE(inputs.has_value()) << inputs.error().message;
  EXPECT_EQ((*inputs->next())->technology, "IFX");
  EXPECT_EQ((*inputs->next())->technology, "IFX");
  EXPECT_FALSE(inputs->next()->has_value());
}

TEST_F(InputsTest, ASimulationPlaysWithoutWaitingUntilItsEnd) {
  auto inputs = open({"simulation:IFX"}, {.to = InputBound(60s)});
  ASSERT_TRUE(inputs.has_value());
  std::uint64_t count = 0;
  while (const auto message = *inputs->next()) {
    EXPECT_EQ(message->time, Moment(1'330'862'400s) + ++count * 500ms - 500ms);
    EXPECT_EQ(message->madeUp, "simulation");
  }
  EXPECT_EQ(count, 120U);  // two a second
}

TEST_F(InputsTest, ASimulationKeepsTheTechnologyThatItNames) {
  auto inputs = Inputs::open(requestsOf({"simulation:UTRAN2", "simulation:"}, "IFX"),
                             {.to = MessageNumber{2}}, _services, [](std::string_view) {});
  ASSERT_TRUE(inputs.has_value());
  EXPECT_EQ(inputs->reader(0).technology(), "UTRAN2");
  EXPECT_EQ(inputs->reader(1).technology(), "IFX");
}

TEST_F(InputsTest, AStreamIsReadToItsEndAtTheTimeOfReading) {
  const auto path =
      _directory.write("s", Bytes{3, 0, 0, 0, 'a', 'b', 'c', 0, 0, 0, 0, 1, 0, 0, 0, 'd'});
  _platform.clock().setNow(Moment(7s));
  EXPECT_THAT(read({"stream:" + path}), ElementsAre("1 IFX abc", "2 IFX d"));
  EXPECT_EQ((*open({"stream:" + path})->next())->time, Moment(7s));
}

TEST_F(InputsTest, AStreamThatEndsWithinAMessageYieldsWhatIsWhole) {
  const auto path = _directory.write("s", Bytes{1, 0, 0, 0, 'a', 2, 0, 0, 0, 'b'});
  auto inputs = open({"stream:" + path});
  EXPECT_EQ((*inputs->next())->number, 1U);
  EXPECT_EQ(inputs->next().error().message,
            path + ": the stream ends 5 bytes into the message at byte 5");
  EXPECT_FALSE(inputs->next()->has_value());
}

// --- Merging

TEST_F(InputsTest, TheEarliestNextMessageComesFirst) {
  const auto a = write("a", kIFX, {{100, "a1"}, {103, "a2"}, {105, "a3"}});
  const auto b = write("b", kLTE, {{101, "b1"}, {104, "b2"}});
  EXPECT_THAT(read({a, b}),
              ElementsAre("1 IFX a1", "2 LTE b1", "3 IFX a2", "4 LTE b2", "5 IFX a3"));
}

TEST_F(InputsTest, OnATieTheFirstNamedComesFirst) {
  const auto a = write("a", kIFX, {{100, "a1"}, {100, "a2"}});
  const auto b = write("b", kLTE, {{100, "b1"}, {100, "b2"}});
  EXPECT_THAT(read({a, b}), ElementsAre("1 IFX a1", "2 IFX a2", "3 LTE b1", "4 LTE b2"));
  EXPECT_THAT(read({b, a}), ElementsAre("1 LTE b1", "2 LTE b2", "3 IFX a1", "4 IFX a2"));
}

TEST_F(InputsTest, AnInputKeepsItsOrderWhateverItsTimes) {
  const auto a = write("a", kIFX, {{200, "a1"}, {100, "a2"}, {150, "a3"}});
  const auto b = write("b", kLTE, {{120, "b1"}, {210, "b2"}});
  EXPECT_THAT(read({a, b}),
              ElementsAre("1 LTE b1", "2 IFX a1", "3 IFX a2", "4 IFX a3", "5 LTE b2"));
}

TEST_F(InputsTest, OneFileMayBeNamedTwice) {
  const auto a = write("a", kIFX, {{1, "x"}});
  EXPECT_THAT(read({a, a}), ElementsAre("1 IFX x", "2 IFX x"));
}

TEST_F(InputsTest, WhatEachMessageIsOfIsTold) {
  const auto a = write("a", kIFX, {{101, "a"}});
  const auto b = write("b", kLTE, {{100, "b"}});
  auto inputs = open({a, b});
  EXPECT_EQ(inputs->nameOf((*inputs->next())->input), b);
  EXPECT_EQ(inputs->nameOf((*inputs->next())->input), a);
}

TEST_F(InputsTest, WhereOneIsDamagedTheOthersGoOn) {
  Bytes damaged = captureOf(kIFX, {{100, "a1"}, {101, "a2"}});
  damaged.pop_back();
  const auto a = _directory.write("a", damaged);
  const auto b = write("b", kLTE, {{100, "b1"}, {200, "b2"}});
  EXPECT_THAT(read({a, b}), ElementsAre("1 IFX a1", "error", "2 LTE b1", "3 LTE b2"));
}

// --- Narrowing

TEST_F(InputsTest, FromIsInclusiveAndToExclusive) {
  EXPECT_THAT(numbers({.from = Moment(101s), .to = Moment(103s)}), ElementsAre(2, 3));
  EXPECT_THAT(numbers({.from = Moment(104s)}), ElementsAre(5));
  EXPECT_THAT(numbers({.to = Moment(100s)}), IsEmpty());
  EXPECT_THAT(numbers({.from = Moment(100s + 1us)}), ElementsAre(2, 3, 4, 5));
}

TEST_F(InputsTest, APlusCountsFromTheFirstMessageOfAll) {
  EXPECT_THAT(numbers({.from = InputBound(1s), .to = InputBound(3s)}), ElementsAre(2, 3));
  const auto late = write("late", kLTE, {{102, "l"}});
  EXPECT_THAT(read({late, _five}, {.from = InputBound(2s), .to = InputBound(3s)}),
              ElementsAre("3 LTE l", "4 IFX 3"));
}

TEST_F(InputsTest, ANumberEndsBehindItsMessage) {
  EXPECT_THAT(numbers({.to = MessageNumber{3}}), ElementsAre(1, 2, 3));
  EXPECT_THAT(numbers({.from = MessageNumber{2}, .to = MessageNumber{3}}), ElementsAre(2, 3));
  EXPECT_THAT(numbers({.to = MessageNumber{99}}), SizeIs(5));
}

TEST_F(InputsTest, BehindTheLastNumberNothingIsRead) {
  Bytes damaged = captureOf(kIFX, {{100, "1"}, {101, "2"}});
  damaged.pop_back();
  EXPECT_THAT(read({_directory.write("a", damaged)}, {.to = MessageNumber{1}}),
              ElementsAre("1 IFX 1"));
}

TEST_F(InputsTest, ARecordingIsReadBehindTheEndBecauseItsTimesMayGoBack) {
  const auto back = write("back", kIFX, {{100, "1"}, {200, "2"}, {101, "3"}});
  EXPECT_THAT(read({back}, {.to = Moment(150s)}), ElementsAre("1 IFX 1", "3 IFX 3"));
}

TEST_F(InputsTest, PacketsOfACodeAreThoseOfNoPropertyList) {
  const auto lte = write("lte", kLTE,
                         {{1, packetOf(1, 0xB0C2)},
                          {2, packetOf(1, 0xB17F)},
                          {3, packetOf(0xFF, 2)},
                          {4, packetOf(1, 2)},
                          {5, "short"},
                          {6, std::string("\x81\x00", 2) + packetOf(1, 0xB0C2)}});
  const auto ifx = write("ifx", kIFX, {{1, packetOf(1, 0xB0C2)}});
  const auto numbersOf = [&](LogCode code) {
    std::vector<std::uint64_t> result;
    auto inputs = open({lte, ifx}, {.code = code});
    while (const auto message = *inputs->next()) result.push_back(message->number);
    return result;
  };
  EXPECT_THAT(numbersOf(0xB0C2), ElementsAre(1, 7));
  EXPECT_THAT(numbersOf(0xB17F), ElementsAre(3));
  EXPECT_THAT(numbersOf(0xFF0002), ElementsAre(4));
  EXPECT_THAT(numbersOf(2), ElementsAre(5));
}

TEST_F(InputsTest, ATechnologyNarrows) {
  const auto lte = write("lte", kLTE, {{101, "l"}});
  EXPECT_THAT(read({_five, lte}, {.technology = "LTE"}), ElementsAre("3 LTE l"));
}

// --- Several technologies

TEST_F(InputsTest, TechnologiesAreSeveralWhenTheMessagesAre) {
  const auto lte = write("lte", kLTE, {{101, "l"}});
  const auto one = _directory.write("one", std::string_view("NetworkMode,Timestamp,RSRP\n"
                                                            "LTE,2019.11.21_15.38.36,-70\n"));
  const auto two = _directory.write("two", std::string_view("NetworkMode,Timestamp,RSRP,CELLHEX\n"
                                                            "LTE,2019.11.21_15.38.36,-70,1\n"
                                                            "GSM,2019.11.21_15.38.37,-70,1\n"));
  const auto several = [&](const std::vector<std::string>& texts,
                           const InputNarrowing& narrowing = {}) {
    return haveSeveralTechnologies(requestsOf(texts), narrowing, _services);
  };
  EXPECT_FALSE(several({_five}));
  EXPECT_FALSE(several({_five, _five}));
  EXPECT_TRUE(several({_five, lte}));
  EXPECT_FALSE(several({_five, lte}, {.technology = "LTE"}));
  EXPECT_FALSE(several({_five, lte}, {.to = MessageNumber{1}}));
  EXPECT_FALSE(several({one}));
  EXPECT_TRUE(several({two}));
  EXPECT_TRUE(several({"-"}));
}

}  // namespace
}  // namespace kestro
