// SPDX-License-Identifier: MIT
// Rules that are broken, and kept again.
#pragma once

#include <cstdint>
#include <optional>
#include <unordered_map>
#include <vector>

#include "Measurements/Event.h"
#include "Measurements/MeasuredMessage.h"
#include "Measurements/Rule.h"

namespace kestro {

/// Watches every item of every series that a rule means by itself. The time is the messages' own:
/// an alarm begins with the first value at which the rule has been broken for its duration, all
/// values since having broken it, and is over with the first value that keeps the rule. What is
/// made up in a drive-test log's packets is no value.
class Alarms {
 public:
  /// So many series are watched, each for every rule that means it; further ones are not, and are
  /// counted.
  static constexpr std::size_t kMaximumWatched = 100'000;

  Alarms(std::vector<Rule> rules, EventSink sink);

  void take(const MeasuredMessage& message);

  [[nodiscard]] const std::vector<Rule>& rules() const noexcept { return _rules; }
  /// Whether the rule has met a value of a series that it means.
  [[nodiscard]] bool hasMet(std::size_t rule) const { return _hasMet[rule]; }
  [[nodiscard]] std::uint64_t notWatchedCount() const noexcept { return _notWatched; }

 private:
  struct Broken {
    Moment since;
    bool isAlarm = false;
  };
  /// The rules that mean a series, and where each of them is broken at present.
  struct Watched {
    std::uint32_t rule;
    bool isOfLog;  ///< a drive-test log says its values: they are not made up
    std::optional<Broken> broken{};
  };
  [[nodiscard]] std::vector<Watched>& watchedOf(const Series& series);
  void takeValue(const MeasuredMessage& message, const MeasuredValue& value, Watched& watched);
  void tell(EventKind kind, const MeasuredMessage& message, const MeasuredValue& value,
            const Watched& watched) const;

  std::vector<Rule> _rules;
  EventSink _sink;
  std::vector<bool> _hasMet;
  std::unordered_map<const SeriesGroup*, std::vector<std::uint32_t>> _rulesOfGroup;
  std::unordered_map<const Series*, std::vector<Watched>> _watched;
  std::size_t _watchedCount = 0;
  std::uint64_t _notWatched = 0;
};

}  // namespace kestro
