// SPDX-License-Identifier: MIT
// What measures the property lists of one section.
#pragma once

#include <string_view>
#include <vector>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Packets/Measure.h"
#include "Platform/PropertyList.h"
#include "Platform/Result.h"

namespace kestro {

/// Measures what a section's property list describes: numbers of cells; values that are passed on
/// as they are, where they are texts.
class ListMeasurer {
 public:
  /// `section` must be a constant that has a property list, `series` outlive the measurer.
  ListMeasurer(const Section& section, const SectionPlace& place, SeriesTable& series);

  /// Appends what the property list says. Its texts must stay as long as the values.
  void measure(const Result<Value>& root, MeasuredValues& values);

 private:
  void measureCells(const Array& list, MeasuredValues& values);
  /// In a dictionary the last cell's value stands.
  void measureLast(const std::vector<Dictionary>& cells, MeasuredValues& values);
  void measureNumber(std::size_t index, const Dictionary& cell, const Item* item, std::uint32_t row,
                     MeasuredValues& values);
  void measureFiles(const Dictionary& files, MeasuredValues& values);
  void measureElements(const Array& elements, MeasuredValues& values);

  [[nodiscard]] bool isList() const noexcept { return _section.kind == SectionKind::List; }
  [[nodiscard]] const Item* itemOf(const Dictionary& cell, std::size_t row);
  [[nodiscard]] const Series* textSeries(std::string_view key, const Item* item);

  const Section& _section;
  const PropertyListReading& _reading;
  SectionPlace _place;
  SeriesTable& _series;
  std::vector<const SeriesGroup*> _groups;  ///< of the reading's values
};

}  // namespace kestro
