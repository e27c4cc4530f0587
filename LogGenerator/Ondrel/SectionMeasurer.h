// SPDX-License-Identifier: MIT
// What measures the packets of one section, as its description says.
#pragma once

#include <memory>
#include <vector>

#include "LogGenerator/Ondrel/ListMeasurer.h"
#include "LogGenerator/Packets/Measure.h"
#include "LogGenerator/Packets/Packet.h"

namespace kestro {

/// Measures what a Section describes. What no table says is a function of a derived class.
class SectionMeasurer : protected NumberSupplier {
 public:
  /// `section` must be a constant, `series` outlive the measurer.
  SectionMeasurer(const Section& section, const SectionPlace& place, SeriesTable& series);

  [[nodiscard]] const Section& section() const noexcept { return _section; }

  /// Appends what the packet says to this section.
  void measure(const Packet& packet, LogCode code, const PropertyListCoding& coding,
               MeasuredValues& values);

 protected:
  [[nodiscard]] std::optional<std::int64_t> supply(const Field& field, PacketView packet,
                                                   const RecordPosition& position) const override;

  /// Called with a packet before it is measured by this reading.
  virtual void note(const PacketReading& reading, PacketView packet);

 private:
  struct Reading {
    const PacketReading* reading;
    MeasuredReading measured;
  };

  const Section& _section;
  std::vector<Reading> _readings;
  std::unique_ptr<ListMeasurer> _list;  ///< null when it reads no property list
};

/// A section of a technology, and what measures it.
struct MeasuredSection {
  using Make = std::unique_ptr<SectionMeasurer> (*)(const Section& section,
                                                    const SectionPlace& place, SeriesTable& series);
  template <class Measurer>
  static std::unique_ptr<SectionMeasurer> make(const Section& section, const SectionPlace& place,
                                               SeriesTable& series) {
    return std::make_unique<Measurer>(section, place, series);
  }

  const Section* section;
  Make measurer = make<SectionMeasurer>;
};

}  // namespace kestro
