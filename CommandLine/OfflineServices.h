// SPDX-License-Identifier: MIT
// What commands that work on recordings give to generators: the recording's time, no system log.
#pragma once

#include <memory>
#include <optional>

#include "CommandLine/Output.h"
#include "LogGenerator/GeneratorServices.h"
#include "Model/Replay.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"
#include "Sources/SourceCatalogue.h"

namespace kestro {

/// Nothing of it touches the running system. Time stands still until the clock is set.
class OfflineServices {
 public:
  /// With `logFile`, every line of the system log becomes a line {"priority","message"} there; with
  /// `shown`, those up to this priority go to the process's standard error. With either, so do the
  /// lines that decoders have for the console and their standard output. Without both nothing is
  /// logged.
  explicit OfflineServices(std::optional<Output> logFile = std::nullopt,
                           std::optional<LogPriority> shown = std::nullopt);
  OfflineServices(const OfflineServices&) = delete;
  OfflineServices& operator=(const OfflineServices&) = delete;
  ~OfflineServices();

  [[nodiscard]] SystemLog& systemLog() noexcept;
  [[nodiscard]] ReplayClock& clock() noexcept;
  [[nodiscard]] const PropertyListCoding& propertyListCoding() const noexcept;

  /// All that a generator needs; valid as long as this object.
  [[nodiscard]] GeneratorServices forGenerator() noexcept;

  /// What inputs are read with; valid as long as this object. What has no time of its own has that
  /// of the system's clock.
  [[nodiscard]] SourceServices forSources();

  /// Hands all log lines to the system; the error says why they could not be written.
  [[nodiscard]] Result<void> finishLog();

 private:
  struct Services;
  std::unique_ptr<Services> _services;
};

}  // namespace kestro
