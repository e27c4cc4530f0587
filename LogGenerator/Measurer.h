// SPDX-License-Identifier: MIT
// What the messages of a recording say as numbers, states and texts over time.
#pragma once

#include <cstddef>
#include <memory>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/TechnologyMeasurer.h"

namespace kestro {

/// What one message says.
struct Measured {
  LogCode code = 0;  ///< 0 for a message without one
  /// In the order of the display's sections and keys; the values of one row of a list follow each
  /// other and have the same item. Valid until the next message.
  std::span<const MeasuredValue> values{};
};

/// Measures one recording, message by message in their order. It uses nothing that another measurer
/// changes: several threads may each have their own. Series are valid as long as the measurer.
class Measurer {
 public:
  explicit Measurer(const MeasurerServices& services);
  ~Measurer();
  Measurer(const Measurer&) = delete;
  Measurer& operator=(const Measurer&) = delete;

  /// What a message of this technology (a name as the log channel has it) says. Nothing of a
  /// technology that no generator speaks. Never throws for a message's contents.
  [[nodiscard]] Measured measure(std::string_view technology, ByteView message);

  /// The recording's series so far. Beyond its limits new ones are not made, and their values are
  /// left out.
  [[nodiscard]] const SeriesTable& series() const noexcept { return _series; }

 private:
  struct Known;

  [[nodiscard]] TechnologyMeasurer* measurerOf(std::string_view technology);

  MeasurerServices _services;
  SeriesTable _series;
  std::vector<Known> _known;  ///< the technologies that came up
  MeasuredValues _values;
};

}  // namespace kestro
