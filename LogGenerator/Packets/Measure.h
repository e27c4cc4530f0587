// SPDX-License-Identifier: MIT
// What a packet says as typed values, straight from its bytes: no texts are made, nothing is
// displayed, and nothing is shared, so that several threads can measure several recordings.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <span>
#include <vector>

#include "LogGenerator/Packets/MeasuredField.h"
#include "LogGenerator/Packets/RowSeries.h"
#include "LogGenerator/Packets/Section.h"

namespace kestro {

/// The measured fields of a layout. An array's elements are fields of their own.
class MeasuredFields {
 public:
  /// Changes what a group is named, before it is looked up.
  using Naming = std::function<void(SeriesGroup& group)>;

  /// `place.section` already names the list that the fields are the rows of.
  MeasuredFields(std::span<const Field> fields, const SectionPlace& place, SeriesTable& series,
                 const Naming& naming = {});
  MeasuredFields(MeasuredFields&&) = default;

  /// Those of the measured fields, in their order; null where there are too many.
  [[nodiscard]] std::span<const SeriesGroup* const> groups() const noexcept { return _groups; }

  /// Appends what the packet says under these series, one a group; null leaves the value out.
  void measure(PacketView packet, const RecordPosition& position,
               std::span<const Series* const> series, std::uint32_t row,
               const NumberSupplier* supplier, MeasuredValues& values) const;

 private:
  std::deque<Field> _elements;  ///< of arrays, each as a field
  std::vector<MeasuredField> _fields;
  std::vector<const SeriesGroup*> _groups;
};

/// A record table made ready for measuring.
class MeasuredTable {
 public:
  MeasuredTable(const ListReading& list, const SectionPlace& section, SeriesTable& series);

  /// Appends what the rows of the packet say. Nothing when a record lies past the table's bound.
  void measure(PacketView packet, const NumberSupplier* supplier, MeasuredValues& values);

 private:
  const RecordTable& _table;
  bool _rowsAreEntries;  ///< whether the display counts the records that it leaves out, too
  MeasuredFields _fields;
  RowSeries _rows;
};

/// Everything that a section reads from one packet, made ready for measuring.
class MeasuredReading {
 public:
  MeasuredReading(const PacketReading& reading, const SectionPlace& section, SeriesTable& series);

  [[nodiscard]] const PacketKind& packet() const noexcept { return _packet; }
  void measure(PacketView packet, const NumberSupplier* supplier, MeasuredValues& values);

 private:
  const PacketKind& _packet;
  MeasuredFields _fields;
  std::vector<const Series*> _series;  ///< of the fields
  std::deque<MeasuredTable> _tables;
};

}  // namespace kestro
