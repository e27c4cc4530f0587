// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/OneXActiveSet.h"

#include <cmath>
#include <utility>

#include "LogGenerator/Packets/NumberFormat.h"

namespace kestro {
namespace {

constexpr Place kAccumulationLength = u16(4);
constexpr Place kFactor = u8(6);
constexpr Place kExponent = u8(7);
constexpr Place kPilotCount = u8(8);
constexpr Place kPerPilotCount = u8(9);
constexpr Place kReferencePN = u16(10);

constexpr Field kActiveSetFields[] = {
    {"Accumulation Length", kAccumulationLength, hidden()},
    {"Energy Factor", kFactor, hidden()},
    {"Energy Exponent", kExponent, hidden()},
    {"Pilots", kPilotCount, hidden()},
    {"Values per Pilot", kPerPilotCount, hidden()},
    {"Reference PN Offset", kReferencePN, hidden()},
};
static_assert(isLayout(kActiveSetFields));

constexpr Field kPilot[] = {
    {kPilotPNOffset, kOneXPilotPN, decimal()},
    {kPilotEnergy,
     {kOneXPilotEnergy.ofTwin(), kOneXPilotPN.shared(), kAccumulationLength.ofPacket(),
      kFactor.ofPacket(), kExponent.ofPacket(), kReferencePN.ofPacket()},
     computed(nullptr, "energyText")},
};
static_assert(isLayout(kPilot));

/// Whatever is weaker, or no number at all, shows as this: -50 dB.
constexpr double kWeakestEnergy = 0.00001;

constexpr NumberFormat kReferenceEnergyFormat = "(ref pilot) %+.2f dB";

}  // namespace

constinit const std::span<const Field> kOneXActiveSetFields = kActiveSetFields;

constexpr SizedRecords kOneXPilots = {.count = kPilotCount,
                                      .valueCount = kPerPilotCount,
                                      .fixedSize = 12,
                                      .sizePerValue = 6,
                                      .shiftPerValue = 4,
                                      .alignment = 4,
                                      .fields = kPilot};

OneXActiveSet::OneXActiveSet(PacketView packet, std::size_t start)
    : _packet(packet),
      _position{.here = start},
      _pilotCount(readBits(kPilotCount, packet, _position)),
      _referencePN(readBits(kReferencePN, packet, _position)) {
  const std::size_t values = readBits(kPerPilotCount, packet, _position);
  _variableSize = kOneXPilots.shiftPerValue * values;
  const std::size_t size = kOneXPilots.fixedSize + kOneXPilots.sizePerValue * values;
  _stride = (size + kOneXPilots.alignment - 1) / kOneXPilots.alignment * kOneXPilots.alignment;
  const double length = readBits(kAccumulationLength, packet, _position);
  const double factor = readBits(kFactor, packet, _position);
  const int exponent = static_cast<int>(readBits(kExponent, packet, _position));
  _factor = std::ldexp(1, 2 * exponent - 3);
  _divisor = 9 * length * length * factor;
  _noise = 1 / length;
}

RecordPosition OneXActiveSet::pilotAt(std::size_t index) const noexcept {
  return {.here = _position.here + _stride * index};
}

RecordPosition OneXActiveSet::pilotEnergyAt(std::size_t index) const noexcept {
  return {.here = pilotAt(index).here + _variableSize};
}

std::uint32_t OneXActiveSet::pnOffset(std::size_t index) const noexcept {
  return readBits(kOneXPilotPN, _packet, pilotAt(index));
}

double OneXActiveSet::energy(std::size_t index) const noexcept {
  const double sum = readBits(kOneXPilotEnergy, _packet, pilotEnergyAt(index));
  // Without a length or a factor this is infinite, or no number.
  const double energy = _factor * sum / _divisor - _noise;
  return energy >= kWeakestEnergy ? energy : kWeakestEnergy;
}

ComputedValue OneXActiveSet::energyOf(std::size_t index) const noexcept {
  const bool isReference = pnOffset(index) == _referencePN;
  return {.number = 10 * std::log10(energy(index)),
          .format = isReference ? &kReferenceEnergyFormat : &kOneXEnergyFormat};
}

Value OneXActiveSet::energyText(std::size_t index) const {
  const ComputedValue energy = energyOf(index);
  TextBuffer text;
  text.append(*energy.format, energy.number);
  return text.text();
}

void OneXActiveSet::addTo(PilotList& list) const {
  for (std::size_t i = 0; i < _pilotCount; ++i) list.add(i, pnOffset(i), energyText(i));
}

void OneXActiveSet::explain(std::string_view section, std::string_view list,
                            const ExplainVisitor& visit) const {
  const Explainer explainer(section, _packet, visit);
  explainer.fields(kActiveSetFields, _position);
  for (std::size_t i = 0; i < _pilotCount; ++i) {
    explainPilot(explainer, {.section = section, .list = list, .row = i, .key = {}}, visit);
  }
}

void OneXActiveSet::explainPilot(const Explainer& explainer, ExplainedValue value,
                                 const ExplainVisitor& visit) const {
  const std::size_t index = *value.row;
  value.key = kPilotPNOffset;
  value.sources = sources(explainer, kPilot[0], index);
  value.text = std::to_string(pnOffset(index));
  visit(value);
  value.key = kPilotEnergy;
  value.sources = sources(explainer, kPilot[1], index);
  value.text = energyText(index);
  visit(value);
}

std::vector<ExplainedSource> OneXActiveSet::sources(const Explainer& explainer, const Field& field,
                                                    std::size_t index) const {
  std::vector<ExplainedSource> sources;
  for (Place place : field.allPlaces()) {
    const RecordPosition origins[] = {pilotAt(index), _position, pilotEnergyAt(index)};
    const auto origin = static_cast<std::size_t>(std::exchange(place.origin, Origin::Here));
    sources.push_back(explainer.source(place, origins[origin]));
  }
  return sources;
}

}  // namespace kestro
