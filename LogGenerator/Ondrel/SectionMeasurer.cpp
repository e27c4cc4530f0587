// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/SectionMeasurer.h"

namespace kestro {

SectionMeasurer::SectionMeasurer(const Section& section, const SectionPlace& place,
                                 SeriesTable& series)
    : _section(section) {
  _readings.reserve(section.readings.size());
  for (const PacketReading& reading : section.readings) {
    _readings.push_back({&reading, MeasuredReading(reading, place, series)});
  }
  if (section.propertyList != nullptr) {
    _list = std::make_unique<ListMeasurer>(section, place, series);
  }
}

void SectionMeasurer::measure(const Packet& packet, LogCode code, const PropertyListCoding& coding,
                              MeasuredValues& values) {
  const PacketView view(packet.bytes());
  bool isDescribed = false;
  for (auto& [reading, measured] : _readings) {
    if (reading->packet.code != code) continue;
    if (view.size() >= reading->packet.minimumLength) {
      note(*reading, view);
      measured.measure(view, this, values);
      return;
    }
    isDescribed = true;
  }
  if (isDescribed || _list == nullptr) return;
  if (code == _section.propertyList->packet.code) {
    _list->measure(packet.propertyList(coding), values);
  }
}

std::optional<std::int64_t> SectionMeasurer::supply(const Field& /*field*/, PacketView /*packet*/,
                                                    const RecordPosition& /*position*/) const {
  return std::nullopt;
}

void SectionMeasurer::note(const PacketReading& /*reading*/, PacketView /*packet*/) {}

}  // namespace kestro
