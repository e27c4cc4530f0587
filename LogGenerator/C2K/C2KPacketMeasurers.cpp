// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/C2KPacketMeasurers.h"

#include <string>
#include <utility>

#include "LogGenerator/C2K/EVDOPilots.h"
#include "LogGenerator/C2K/EVDOStatus.h"
#include "LogGenerator/C2K/OneXActiveSet.h"
#include "LogGenerator/C2K/OneXStatus.h"
#include "LogGenerator/C2K/OneXSystemParameters.h"
#include "Platform/TelephonyService.h"

namespace kestro {

// --- Names ---------------------------------------------------------------------------------------

SectionPlace C2KSeriesNames::placeOfList(const PacketKind& packet,
                                         std::string_view lookupName) const {
  SeriesGroup group{.key = std::string(lookupName)};
  name(group, packet);
  SectionPlace place{.technology = std::string(kTqLogChannelTechnology_Ondrel_CDMA),
                     .section = group.name(),
                     .container = std::move(group.path.container)};
  if (!group.path.key.empty()) place.container.push_back(std::move(group.path.key));
  return place;
}

void C2KSeriesNames::name(SeriesGroup& group, const PacketKind& packet) const {
  const auto places = _places.of(group.key);
  group.path = {};
  if (places.empty()) {
    group.section = packet.name;
    return;
  }
  const DisplayPlace& place = places.front();
  group.section = place.section;
  group.key = place.key;
  group.path = {.container = {place.path.begin(), place.path.end() - 1}, .key = place.path.back()};
}

const Series* C2KSeriesNames::numberSeries(const PacketKind& packet, std::string_view lookupName,
                                           std::string_view unit) const {
  SeriesGroup group{.technology = std::string(kTqLogChannelTechnology_Ondrel_CDMA),
                    .key = std::string(lookupName),
                    .unit = std::string(unit)};
  name(group, packet);
  const SeriesGroup* known = _table.group(std::move(group));
  return known == nullptr ? nullptr : _table.series(*known, nullptr);
}

void C2KPacketMeasurer::measure(PacketView packet, MeasuredValues& values) {
  TakenPacket taken{.bytes = packet};
  if (isTaken(_rules, taken)) take(taken, values);
}

namespace {

// --- Fields that stand alone ---------------------------------------------------------------------

/// The fields of a layout whose keys are lookup names.
class NamedFields {
 public:
  NamedFields(std::span<const Field> fields, const PacketKind& packet, const C2KSeriesNames& names)
      : _fields(fields, {.technology = std::string(kTqLogChannelTechnology_Ondrel_CDMA)},
                names.table(), [&](SeriesGroup& group) { names.name(group, packet); }) {
    for (const SeriesGroup* group : _fields.groups()) {
      _series.push_back(group == nullptr ? nullptr : names.table().series(*group, nullptr));
    }
  }

  void measure(PacketView packet, const RecordPosition& position, MeasuredValues& values) const {
    _fields.measure(packet, position, _series, MeasuredValue::kNoRow, nullptr, values);
  }

 private:
  MeasuredFields _fields;
  std::vector<const Series*> _series;
};

class FieldsMeasurer : public C2KPacketMeasurer {
 public:
  FieldsMeasurer(const PacketRules& rules, const C2KSeriesNames& names)
      : C2KPacketMeasurer(rules), _fields(rules.reading.fields, packet(), names) {}

 protected:
  void take(const TakenPacket& packet, MeasuredValues& values) override {
    _fields.measure(packet.bytes, {}, values);
  }

 private:
  NamedFields _fields;
};

// --- EV-DO ---------------------------------------------------------------------------------------

/// The display shows a pilot's energy under a key that is its number and its PN offset.
ListReading energiesOf(const ListReading& pilots) {
  ListReading energies = pilots;
  energies.key = {};
  energies.table.fields = pilots.table.fields.last(1);
  return energies;
}

SectionPlace placeOfPilots(const PacketKind& packet, std::string_view lookupName,
                           const C2KSeriesNames& names) {
  SectionPlace place = names.placeOfList(packet, lookupName);
  place.rowsAreEntries = true;
  return place;
}

class PilotsMeasurer : public C2KPacketMeasurer {
 public:
  PilotsMeasurer(const PacketRules& rules, const C2KSeriesNames& names)
      : C2KPacketMeasurer(rules),
        _energies(energiesOf(rules.reading.lists[0])),
        _table(_energies, placeOfPilots(packet(), rules.reading.lists[0].key, names),
               names.table()) {}

 protected:
  void take(const TakenPacket& packet, MeasuredValues& values) override {
    _table.measure(packet.bytes, nullptr, values);
  }

 private:
  ListReading _energies;
  MeasuredTable _table;
};

class ThroughputMeasurer : public C2KPacketMeasurer {
 public:
  ThroughputMeasurer(const ThroughputLayout& layout, const C2KSeriesNames& names)
      : C2KPacketMeasurer({layout.reading}),
        _layout(layout),
        _series(names.numberSeries(packet(), layout.rateName, unitOf(kDataRateFormat))) {}

 protected:
  void take(const TakenPacket& packet, MeasuredValues& values) override {
    const ThroughputSample current = sampleOf(_layout, packet.bytes);
    const auto rate = _previous ? rateBetween(*_previous, current) : std::nullopt;
    _previous = current;
    if (!rate || _series == nullptr) return;
    values.add({.series = _series, .number = *rate, .format = &kDataRateFormat});
  }

 private:
  const ThroughputLayout& _layout;
  const Series* _series;
  std::optional<ThroughputSample> _previous;
};

// --- 1x ------------------------------------------------------------------------------------------

class FrameErrorMeasurer : public C2KPacketMeasurer {
 public:
  FrameErrorMeasurer(const C2KSeriesNames& names, KeptErrorRate& rate)
      : C2KPacketMeasurer(kTrafficFrameRules),
        _series(names.numberSeries(packet(), kFrameErrorRateName, unitOf(kFrameErrorRateFormat))),
        _rate(rate) {}

 protected:
  void take(const TakenPacket& packet, MeasuredValues& values) override {
    _rate = FrameErrorRate::after(_rate, isBadFrame(packet));
    if (_series == nullptr) return;
    values.add({.series = _series, .number = _rate->percent(), .format = &kFrameErrorRateFormat});
  }

 private:
  const Series* _series;
  KeptErrorRate& _rate;
};

class OneXStatusMeasurer : public C2KPacketMeasurer {
 public:
  OneXStatusMeasurer(const C2KSeriesNames& names, KeptErrorRate& rate)
      : C2KPacketMeasurer(kOneXStatusRules),
        _fields(kOneXStatusFields, packet(), names),
        _energy(energyGroup(packet(), names)),
        _pilots(kIdentity, {&_energy, 1}, names.table()),
        _rate(rate) {}

 protected:
  void take(const TakenPacket& packet, MeasuredValues& values) override {
    _fields.measure(packet.bytes, oneXStatusFieldsIn(packet), values);
    measurePilots(OneXActiveSet(packet.bytes, oneXActiveSetIn(packet)), packet.bytes, values);
    // The rate that is shown once more is no measurement.
    if (!isInTraffic(packet)) _rate.reset();
  }

 private:
  static constexpr Field kIdentity[] = {{kPilotPNOffset, kOneXPilotPN, decimal()}};

  static const SeriesGroup* energyGroup(const PacketKind& packet, const C2KSeriesNames& names) {
    SectionPlace place = placeOfPilots(packet, kOneXActiveSetName, names);
    return names.table().group(
        {.technology = std::move(place.technology),
         .section = std::move(place.section),
         .key = std::string(kPilotEnergy),
         .unit = std::string(unitOf(kOneXEnergyFormat)),
         .path = {.container = std::move(place.container), .rowsAreEntries = true}});
  }

  void measurePilots(const OneXActiveSet& set, PacketView packet, MeasuredValues& values) {
    _pilots.beginPacket();
    for (std::uint32_t row = 0; row < set.pilotCount(); ++row) {
      const Series* series =
          _pilots.of(row, _pilots.identityOf(row, packet, set.pilotAt(row), nullptr))[0];
      if (series == nullptr) continue;
      const ComputedValue energy = set.energyOf(row);
      values.add({.series = series, .number = energy.number, .format = energy.format, .row = row});
    }
  }

  NamedFields _fields;
  const SeriesGroup* _energy;
  RowSeries _pilots;
  KeptErrorRate& _rate;
};

}  // namespace

std::vector<std::unique_ptr<C2KPacketMeasurer>> makeC2KPacketMeasurers(const C2KSeriesNames& names,
                                                                       KeptErrorRate& errorRate) {
  std::vector<std::unique_ptr<C2KPacketMeasurer>> measurers;
  measurers.push_back(std::make_unique<PilotsMeasurer>(kEVDOFingersRules, names));
  measurers.push_back(std::make_unique<FieldsMeasurer>(kEVDOStatusRules, names));
  measurers.push_back(std::make_unique<ThroughputMeasurer>(kForwardThroughput, names));
  measurers.push_back(std::make_unique<PilotsMeasurer>(kEVDOActiveSetRules, names));
  measurers.push_back(std::make_unique<OneXStatusMeasurer>(names, errorRate));
  measurers.push_back(std::make_unique<FrameErrorMeasurer>(names, errorRate));
  measurers.push_back(std::make_unique<ThroughputMeasurer>(kReverseThroughput, names));
  measurers.push_back(std::make_unique<FieldsMeasurer>(kOneXSystemParametersRules, names));
  return measurers;
}

}  // namespace kestro
