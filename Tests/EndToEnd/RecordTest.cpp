// SPDX-License-Identifier: MIT
// Recordings of whole drives: notes from a terminal, and a recorder that is killed.
#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <string>

#include "Tests/EndToEnd/LiveFixture.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;

class RecordTest : public LiveTest {
 protected:
  [[nodiscard]] std::string contents() const { return TemporaryDirectory::text(drive); }
  /// Waits until the recording holds a text.
  [[nodiscard]] bool holds(Process& record, std::string_view text) const {
    return record.waitUntil([&] { return contents().find(text) != std::string::npos; });
  }

  const std::string drive = source.directory() + "/drive.pcapng";
};

TEST_F(RecordTest, ALineTypedOnTheTerminalIsACommentOfTheNextMessage) {
  startServer();
  const auto record = start({"kestro-cli", "record", "-o", drive}, Process::Terminal::Own);
  ASSERT_TRUE(record->waitForOutput("recording IFX to " + drive));
  record->type("tunnel\n");
  // As an option behind a message: number 1, 6 bytes, padded to 8.
  using namespace std::string_view_literals;
  EXPECT_TRUE(holds(*record, "\1\0\6\0tunnel\0\0"sv));
  record->type("\x03");
  EXPECT_EQ(record->wait(), 0);
}

TEST_F(RecordTest, InTheBackgroundItLeavesTheTerminalAloneAndGoesOn) {
  startServer();
  const auto shell =
      start({"/bin/bash", "-c",
             fmt::format("set -m; \"{}\"/kestro-cli record -o {} --duration=2 & wait %1; "
                         "status=$?; read -r line; echo \"ended $status, read $line\"",
                         KESTRO_PROGRAM_DIRECTORY, drive)},
            Process::Terminal::Own);
  ASSERT_TRUE(shell->waitForOutput("recording IFX"));
  shell->type("tunnel\n");
  EXPECT_EQ(shell->wait(), 0);
  EXPECT_THAT(shell->output(), HasSubstr("recorded "));
  EXPECT_THAT(shell->output(), HasSubstr("ended 0, read tunnel"));
  EXPECT_THAT(contents(), Not(HasSubstr("tunnel")));
}

TEST_F(RecordTest, AKilledRecordersFileIsReadToItsLastMessage) {
  startServer();
  const auto record = start({"kestro-cli", "record", "-o", drive});
  ASSERT_TRUE(record->waitUntil([&] { return std::filesystem::exists(drive); }));
  ASSERT_TRUE(eventually([&] { return contents().size() > 5000; }));
  record->signal(SIGKILL);
  EXPECT_EQ(record->wait(), -SIGKILL);
  const Outcome decoded =
      run({"kestro-cli", "decode", drive, "--format=ndjson", "--refresh-every=0"});
  EXPECT_EQ(decoded.status, 0);
  EXPECT_EQ(decoded.errors, "");
  // Every message is a display, and all of them have reached the file.
  const auto lines = std::ranges::count(decoded.output, '\n');
  std::size_t messages = 0;
  const std::string text = contents();
  for (std::size_t at = 0; (at = text.find("</plist>", at)) != std::string::npos; ++at) ++messages;
  EXPECT_EQ(static_cast<std::size_t>(lines), messages);
  EXPECT_GT(messages, 5U);
}

}  // namespace
}  // namespace kestro::testing
