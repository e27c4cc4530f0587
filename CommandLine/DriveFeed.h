// SPDX-License-Identifier: MIT
// The drives in a command's INPUTs, each measured and watched by itself.
#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "CommandLine/InputFeed.h"
#include "CommandLine/OfflineServices.h"
#include "LogGenerator/Measurer.h"
#include "Measurements/DriveWatch.h"

namespace kestro {

/// Hands every message of the inputs to its drive's watch. What cannot be read is named on standard
/// error, as InputFeed does.
class DriveFeed {
 public:
  /// Takes an event of the drive in the input with this number.
  using Sink = std::function<void(std::size_t input, const Event& event)>;

  DriveFeed(InputFeed feed, const std::vector<Rule>& rules, Sink sink);

  /// Watches the next message; false at the end of all inputs.
  bool takeNext();

  /// Names on standard error what came of nothing: rules that no series was meant by, cells for
  /// which there was no room. To be called once, at the end.
  void tellWhatWasMissed() const;

  /// How it went so far.
  [[nodiscard]] ExitStatus status() const noexcept { return _feed.status(); }
  [[nodiscard]] std::size_t inputCount() const noexcept { return _drives.size(); }
  /// What rows call an input; empty where it is the only one.
  [[nodiscard]] std::string_view nameOf(std::size_t input) const;
  [[nodiscard]] const DriveWatch& watchOf(std::size_t input) const { return _drives[input]->watch; }

 private:
  struct Drive {
    Drive(const MeasurerServices& services, const std::vector<Rule>& rules, const EventSink& sink)
        : measurer(services), watch(rules, sink) {}

    Measurer measurer;
    DriveWatch watch;
  };

  void take(const InputMessage& message);

  InputFeed _feed;
  std::unique_ptr<OfflineServices> _services;
  std::vector<std::unique_ptr<Drive>> _drives;
};

}  // namespace kestro
