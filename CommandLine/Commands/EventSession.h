// SPDX-License-Identifier: MIT
// The events of a log channel, as they happen.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "CommandLine/Output.h"
#include "LogGenerator/Measurer.h"
#include "Measurements/DriveWatch.h"
#include "Model/LogChannelClient.h"
#include "Platform/MainQueue.h"
#include "Platform/Platform.h"

namespace kestro {

/// Writes each event as a line of JSON, with the members that `events --format=json` has. Times are
/// those at which messages arrive. Main thread only.
class EventSession : private LogChannelUser {
 public:
  /// After `limit` events, or when the output has failed, nothing more is written, and `ended` is
  /// called once. `platform` must outlive the session.
  EventSession(Platform& platform, std::vector<Rule> rules, std::optional<std::uint64_t> limit,
               std::function<void()> ended);

  void start();

  /// Why nothing more could be written; empty while all is well.
  [[nodiscard]] const Output& output() const noexcept { return _output; }

 private:
  void technologyAnswered(std::string_view technology) override;
  [[nodiscard]] std::optional<Dictionary> startCommand() override;
  void messageArrived(ByteView message) override;
  void sourceTold(const LogSourceState& source) override;
  void write(const Event& event);

  Platform& _platform;
  std::optional<std::uint64_t> _limit;
  std::function<void()> _ended;
  Output _output = Output::standardOutput();
  Measurer _measurer;
  DriveWatch _watch;
  std::string_view _technology;
  bool _isFromDriveTest = false;
  bool _isOver = false;
  std::uint64_t _messages = 0;
  std::uint64_t _events = 0;
  std::unique_ptr<Timer> _timer;
  LogChannelClient _client;
};

}  // namespace kestro
