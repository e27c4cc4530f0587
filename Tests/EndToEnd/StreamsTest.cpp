// SPDX-License-Identifier: MIT
// Standard streams that are closed or full, and outputs that are inputs.
#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {
namespace {

using namespace std::chrono_literals;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

std::string contentsOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

class StreamsTest : public ::testing::Test {
 protected:
  StreamsTest() { writeCapture(capture.path(), {ifxMessage("1"), "garbage"}, 800ms); }

  /// Runs `kestro-cli` as a shell does that is given `command` behind the program's name.
  static Outcome shell(const std::string& command) {
    return run({"/bin/sh", "-c",
                fmt::format("exec \"{}\"/kestro-cli {}", KESTRO_PROGRAM_DIRECTORY, command)});
  }

  [[nodiscard]] std::string fileBeside(const std::string& name) const {
    return capture.directory() + "/" + name;
  }

  TemporaryFile capture{"a.pcap"};
};

class BadStandardErrorTest : public StreamsTest,
                             public ::testing::WithParamInterface<const char*> {};

TEST_P(BadStandardErrorTest, CostsOnlyTheMessages) {
  for (const std::string& command : std::vector<std::string>{
           "decode " + capture.path(), "explain " + capture.path(), std::string("codes"),
           "snapshot show " + capture.path(), std::string("bogus")}) {
    const Outcome usual = shell(command);
    const Outcome outcome = shell(command + " " + GetParam());
    EXPECT_EQ(outcome.status, usual.status) << command;
    EXPECT_EQ(outcome.output, usual.output) << command;
  }
}

TEST_P(BadStandardErrorTest, CostsNoRecording) {
  const std::string recording = fileBeside("drive.pcap");
  const Outcome outcome = shell("record --demo --duration=1 -o " + recording + " " + GetParam());
  EXPECT_EQ(outcome.status, 0);
  const Outcome decoded = shell("decode --format=json " + recording);
  EXPECT_EQ(decoded.status, 0);
  EXPECT_THAT(decoded.output, Not(HasSubstr(R"("messages":0)")));
}

INSTANTIATE_TEST_SUITE_P(Redirections, BadStandardErrorTest,
                         ::testing::Values("2>/dev/full", "2>&-", "<&- 2>&-"));

// A file that is opened while descriptor 2 is closed would become descriptor 2.
TEST_F(StreamsTest, NoMessageGetsIntoAnOutputFile) {
  const std::string log = fileBeside("log.json");
  const Outcome outcome =
      shell("decode " + capture.path() + " --log-json=" + log + " <&- >&- 2>&-");
  EXPECT_EQ(outcome.status, 3);
  EXPECT_THAT(contentsOf(log), Not(HasSubstr("kestro-cli: ")));
  EXPECT_THAT(contentsOf(log), HasSubstr(R"({"priority":)"));
}

TEST_F(StreamsTest, NoCommandWritesOverItsInput) {
  const std::string before = contentsOf(capture.path());
  std::filesystem::create_symlink(capture.path(), fileBeside("link.pcap"));
  for (const std::string& command : std::vector<std::string>{
           "decode " + capture.path() + " --log-json=" + capture.path(),
           "decode " + fileBeside("link.pcap") + " --log-json=" + capture.path(),
           "snapshot save " + capture.path() + " --description=x -o " + fileBeside("link.pcap"),
           "record --demo=capture:" + capture.path() + " -o " + capture.path(),
           "record --demo=capture:" + fileBeside("link.pcap") + " -o " + capture.path()}) {
    const Outcome outcome = shell(command);
    EXPECT_EQ(outcome.status, 1) << command;
    EXPECT_THAT(outcome.errors, HasSubstr("the output would replace the input")) << command;
    EXPECT_EQ(contentsOf(capture.path()), before) << command;
  }
}

// The shell's limit counts blocks of 512 bytes.
TEST_F(StreamsTest, AFileThatMayNotGrowIsAFullDisk) {
  const std::string log = fileBeside("log.json");
  const Outcome outcome =
      run({"/bin/sh", "-c",
           fmt::format("ulimit -f 0; exec \"{}\"/kestro-cli decode {} --log-json={}",
                       KESTRO_PROGRAM_DIRECTORY, capture.path(), log)});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_THAT(outcome.errors, HasSubstr(log + ": File too large"));
}

}  // namespace
}  // namespace kestro::testing
