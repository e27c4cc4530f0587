// SPDX-License-Identifier: MIT
// kestro-cli on recordings in a directory of a test's own.
#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {

class RecordingFixture : public ::testing::Test {
 protected:
  static Outcome cli(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), "kestro-cli");
    return run(std::move(arguments));
  }

  /// A capture of these messages, 800 ms apart; its path.
  std::string capture(std::string_view name, const std::vector<std::string>& messages,
                      std::string_view technology = "IFX") {
    const auto path = directory.pathOf(name);
    writeCapture(path, messages, std::chrono::milliseconds(800), technology);
    return path;
  }

  TemporaryDirectory directory;
};

}  // namespace kestro::testing
