// SPDX-License-Identifier: MIT
// The platform of commands that work on recordings: the recording's time, no server, no system log.
#pragma once

#include <memory>
#include <optional>

#include "CommandLine/Output.h"
#include "Model/Replay.h"
#include "Platform/Platform.h"
#include "Platform/SystemLog.h"
#include "Platform/TextSink.h"

namespace kestro {

/// Nothing of it touches the running system, except that texts of the console and of the decoders'
/// standard output go to the process's standard error. Time stands still until the clock is set.
class OfflinePlatform : public Platform {
 public:
  /// With `logFile`, every line of the system log becomes a line {"priority","message"} there;
  /// without, nothing is logged.
  explicit OfflinePlatform(std::optional<Output> logFile = std::nullopt);
  ~OfflinePlatform() override;

  [[nodiscard]] SystemLog& systemLog() override;
  [[nodiscard]] TextSink& consoleLog() override;
  [[nodiscard]] TextSink& standardOutput() override;
  [[nodiscard]] ReplayClock& clock() override;
  [[nodiscard]] Bundle& bundle() override;
  [[nodiscard]] PropertyListCoding& propertyListCoding() override;
  [[nodiscard]] MainQueue& mainQueue() override;
  [[nodiscard]] MessagePorts& messagePorts() override;
  [[nodiscard]] TelephonyService& telephonyService() override;
  [[nodiscard]] InputStreams& inputStreams() override;
  [[nodiscard]] Uuids& uuids() override;
  [[nodiscard]] Preferences& preferences() override;
  [[nodiscard]] DeviceRoot& deviceRoot() override;

  /// Hands all log lines to the system; the error says why they could not be written.
  [[nodiscard]] Result<void> finishLog();

 private:
  struct Services;
  std::unique_ptr<Services> _services;
};

}  // namespace kestro
