// SPDX-License-Identifier: MIT
// What measures the packets of each CDMA2000 log code.
#pragma once

#include <memory>
#include <optional>
#include <string_view>
#include <vector>

#include "LogGenerator/C2K/EVDOThroughput.h"
#include "LogGenerator/C2K/FrameErrorRate.h"
#include "LogGenerator/C2K/PacketCheck.h"
#include "LogGenerator/C2K/TemplatePlaces.h"
#include "LogGenerator/Packets/Measure.h"

namespace kestro {

/// Names series by the places at which a template shows their lookup names.
class C2KSeriesNames {
 public:
  /// A null handle shows nothing.
  C2KSeriesNames(const Dictionary& displayTemplate, SeriesTable& table)
      : _places(displayTemplate), _table(table) {}

  [[nodiscard]] SeriesTable& table() const noexcept { return _table; }
  /// The place of a list.
  [[nodiscard]] SectionPlace placeOfList(const PacketKind& packet,
                                         std::string_view lookupName) const;
  /// Names the group whose key is a lookup name; without a place it belongs to the packet.
  void name(SeriesGroup& group, const PacketKind& packet) const;
  /// The series of one number.
  [[nodiscard]] const Series* numberSeries(const PacketKind& packet, std::string_view lookupName,
                                           std::string_view unit) const;

 private:
  TemplatePlaces _places;
  SeriesTable& _table;
};

/// Measures the packets of one log code, in their order.
class C2KPacketMeasurer {
 public:
  virtual ~C2KPacketMeasurer() = default;
  C2KPacketMeasurer(const C2KPacketMeasurer&) = delete;
  C2KPacketMeasurer& operator=(const C2KPacketMeasurer&) = delete;

  [[nodiscard]] LogCode code() const noexcept { return _rules.reading.packet.code; }

  /// Appends what the packet says; nothing for one that is refused.
  void measure(PacketView packet, MeasuredValues& values);

 protected:
  explicit C2KPacketMeasurer(const PacketRules& rules) : _rules(rules) {}

  [[nodiscard]] const PacketKind& packet() const noexcept { return _rules.reading.packet; }
  virtual void take(const TakenPacket& packet, MeasuredValues& values) = 0;

 private:
  PacketRules _rules;
};

/// The frame error rate of 1x traffic so far, which two packets share.
using KeptErrorRate = std::optional<FrameErrorRate>;

/// One for each log code. `errorRate` and the names' table must outlive them.
[[nodiscard]] std::vector<std::unique_ptr<C2KPacketMeasurer>> makeC2KPacketMeasurers(
    const C2KSeriesNames& names, KeptErrorRate& errorRate);

}  // namespace kestro
