// SPDX-License-Identifier: MIT
// kestro-cli info.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Recordings/PcapngWriter.h"
#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/PacketMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {
namespace {

using namespace std::chrono_literals;
using ::testing::HasSubstr;
using ::testing::StartsWith;

class InfoTest : public ::testing::Test {
 protected:
  static Outcome info(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"kestro-cli", "info"});
    return run(std::move(arguments));
  }

  /// Two LTE packets of 41 bytes, 5 s apart, with notes; a property list 4.999999 s later, and a
  /// note that nothing follows.
  [[nodiscard]] std::string drive() const {
    const auto path = directory.pathOf("drive.pcapng");
    auto writer = PcapngWriter::create(path, "simulation").value();
    const PacketBytes lte = packet(0xB0C2).u8(40, 0);
    const std::string list = "abc";
    const std::vector<std::string> note = {"tunnel"};
    const std::vector<std::string> position = {"position: 51.5, -8.5"};
    const auto write = [&](Moment time, std::string_view technology, ByteView bytes,
                           std::span<const std::string> comments) {
      ASSERT_TRUE(writer.write({.time = time,
                                .technology = technology,
                                .bytes = bytes,
                                .originalLength = bytes.size(),
                                .comments = comments}));
    };
    write(kCaptureStart, "LTE", lte.bytes(), note);
    write(kCaptureStart + 5s, "LTE", lte.bytes(), position);
    write(kCaptureStart + 10s - 1us, "IFX", Bytes(list.begin(), list.end()), {});
    EXPECT_TRUE(writer.writeClosingNotes(std::vector<std::string>{"home"}));
    return path;
  }

  TemporaryDirectory directory;
};

TEST_F(InfoTest, ATableTellsWhatThereIs) {
  const auto path = drive();
  const auto outcome = info({path});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(outcome.errors, "");
  EXPECT_EQ(outcome.output,
            path +
                "\n"
                "  Form          pcapng\n"
                "  Span          2012-03-04T12:05:09.000000Z to 2012-03-04T12:05:18.999999Z, 0:09\n"
                "  Messages      3, 85 bytes\n"
                "  Made up       simulation\n"
                "  Positions     1 messages\n"
                "  Technology    Code       Messages        Bytes  Name\n"
                "  IFX                             1            3\n"
                "  LTE                             2           82\n"
                "                0xB0C2            2           82  LTE serving-cell system "
                "information\n"
                "  Gaps of 5 s and more\n"
                "    2012-03-04T12:05:09.000000Z  5.0 s, before message 2\n"
                "  Notes\n"
                "    2012-03-04T12:05:09.000000Z  message 1  tunnel\n"
                "    at the end  home\n");
}

TEST_F(InfoTest, JsonHasTheSameForPrograms) {
  const auto outcome = info({drive(), "--format=json"});
  auto json = nlohmann::ordered_json::parse(outcome.output)["inputs"][0];
  json.erase("input");
  EXPECT_EQ(json.dump(),
            R"({"form":"pcapng","first":"2012-03-04T12:05:09.000000Z",)"
            R"("last":"2012-03-04T12:05:18.999999Z","messages":3,"bytes":85,)"
            R"("madeUp":["simulation"],"technologies":[)"
            R"({"technology":"IFX","messages":1,"bytes":3,"codes":[]},)"
            R"({"technology":"LTE","messages":2,"bytes":82,"codes":[{"code":"0xB0C2",)"
            R"("name":"LTE serving-cell system information","messages":2,"bytes":82}]}],)"
            R"("gapCount":1,"gaps":[{"from":"2012-03-04T12:05:09.000000Z",)"
            R"("to":"2012-03-04T12:05:14.000000Z","message":2}],"noteCount":2,"notes":[)"
            R"({"time":"2012-03-04T12:05:09.000000Z","message":1,"text":"tunnel"},)"
            R"({"text":"home"}],"positions":1,"cut":0,"passedOver":0,"timesBack":0,"damaged":[]})");
}

TEST_F(InfoTest, EveryInputIsToldOfByItself) {
  const auto path = directory.pathOf("a.pcap");
  writeCapture(path, {ifxMessage("1")}, 1s);
  const auto outcome = info({path, "simulation:IFX", "--to=#4", "--format=json"});
  const auto inputs = nlohmann::json::parse(outcome.output)["inputs"];
  ASSERT_EQ(inputs.size(), 2U);
  EXPECT_EQ(inputs[0]["form"], "pcap");
  EXPECT_EQ(inputs[0]["messages"], 1);
  EXPECT_EQ(inputs[1]["form"], "simulation");
  EXPECT_EQ(inputs[1]["input"], "simulation:IFX");
  EXPECT_EQ(inputs[1]["messages"], 4);
}

TEST_F(InfoTest, DamageAndClocksThatWereSetBackAreTold) {
  const auto path = directory.pathOf("a.pcap");
  writeCapture(path, {"a", "b", "c"}, -1s);
  std::filesystem::resize_file(path, std::filesystem::file_size(path) - 1);
  const auto outcome = info({path});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_THAT(outcome.output, HasSubstr("  Messages      2, 2 bytes\n"));
  EXPECT_THAT(outcome.output, HasSubstr("  Times go back 1 times\n"));
  EXPECT_THAT(outcome.output, HasSubstr("  Damaged       " + path + ": record 3: "));
  EXPECT_THAT(outcome.errors, StartsWith("kestro-cli: " + path + ": record 3: "));
}

TEST_F(InfoTest, AMissingInputIsStatusOneAndTheOthersAreTold) {
  const auto outcome = info({"/none", drive()});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: /none: No such file or directory\n");
  EXPECT_THAT(outcome.output, HasSubstr("Messages      3"));
  EXPECT_EQ(info({"/none"}).output, "");
  EXPECT_EQ(info({"simulation:LTE"}).status, 2);
}

TEST_F(InfoTest, ControlCharactersInNotesDoNotReachTheTerminal) {
  const auto path = directory.pathOf("drive.pcapng");
  {
    auto writer = PcapngWriter::create(path).value();
    ASSERT_TRUE(writer.writeClosingNotes(std::vector<std::string>{"a\x1B[2Jb"}));
  }
  const auto outcome = info({path});
  EXPECT_EQ(outcome.output.find('\x1B'), std::string::npos);
  EXPECT_THAT(outcome.output, HasSubstr("at the end  a"));
}

}  // namespace
}  // namespace kestro::testing
