// SPDX-License-Identifier: MIT
// A telephony server process with a source of known messages, on a port directory of its own.
#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {

class LiveTest : public ::testing::Test {
 protected:
  /// How many messages the source has, ten a second; message n shows the count n.
  static constexpr int kMessages = 2000;

  LiveTest() {
    std::vector<std::string> messages;
    for (int i = 1; i <= kMessages; ++i) messages.push_back(ifxMessage(std::to_string(i)));
    writeCapture(source.path(), messages, std::chrono::milliseconds(100));
  }

  [[nodiscard]] Process::Options options(Process::Terminal terminal = Process::Terminal::None) {
    return {.environment = {{"KESTRO_PORT_DIR", source.directory() + "/ports"},
                            {"TMPDIR", source.directory()},
                            {"TERM", "xterm"},
                            {"NO_COLOR", ""}},
            .terminal = terminal};
  }

  /// Starts the server and waits until it can be connected to.
  void startServer(const std::string& sourceArgument) {
    server = std::make_unique<Process>(
        std::vector<std::string>{"kestro-telephonyd", "--source=" + sourceArgument}, options());
    ASSERT_TRUE(eventually(
        [&] { return std::filesystem::exists(source.directory() + "/ports/TelephonyServer"); }));
  }
  void startServer() { startServer("capture:" + source.path()); }

  /// Starts the server with a source of messages that are no property lists.
  void startGarbageServer() {
    const std::string garbage = source.directory() + "/garbage.pcap";
    const std::vector<std::string> messages(kMessages, "garbage");
    writeCapture(garbage, messages, std::chrono::milliseconds(100));
    startServer("capture:" + garbage);
  }

  std::unique_ptr<Process> start(const std::vector<std::string>& arguments,
                                 Process::Terminal terminal = Process::Terminal::None) {
    return std::make_unique<Process>(arguments, options(terminal));
  }

  /// What lies beside the source, as a process that has ended should leave it.
  [[nodiscard]] std::vector<std::string> filesBesideTheSource() const {
    std::vector<std::string> result;
    for (const auto& entry : std::filesystem::directory_iterator(source.directory())) {
      if (entry.path() != source.path()) result.push_back(entry.path());
    }
    return result;
  }

  TemporaryFile source{"source.pcap"};
  std::unique_ptr<Process> server;
};

}  // namespace kestro::testing
