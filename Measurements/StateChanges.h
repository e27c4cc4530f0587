// SPDX-License-Identifier: MIT
// Changes of the states that have a name.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "Measurements/CellSection.h"
#include "Measurements/Event.h"
#include "Measurements/MeasuredMessage.h"

namespace kestro {

/// Tells when a state of `namedStates` is another than the message before said. The states of a
/// drive-test log's packets are made up, and not told.
class StateChanges {
 public:
  explicit StateChanges(EventSink sink);

  void take(const MeasuredMessage& message);

 private:
  [[nodiscard]] std::optional<std::size_t> stateOf(const SeriesGroup& group);
  void takeValue(const MeasuredMessage& message, const MeasuredValue& value,
                 std::optional<std::string>& last);

  EventSink _sink;
  std::vector<std::optional<std::string>> _last;  ///< of each named state
  std::unordered_map<const SeriesGroup*, std::optional<std::size_t>> _states;
};

}  // namespace kestro
