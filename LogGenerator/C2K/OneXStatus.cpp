// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/OneXStatus.h"

#include "LogGenerator/C2K/BandClass.h"
#include "LogGenerator/C2K/FrameErrorRate.h"
#include "LogGenerator/C2K/OneXActiveSet.h"

namespace kestro {
namespace {

constexpr NamedValue kStateNames[] = {
    {0, "Inactive [0]"},
    {1, "Deep sleep in start state [1]"},
    {2, "Initial state for CDMA operation [2]"},
    {3, "Acquisition [3]"},
    {4, "Sync [4]"},
    {5, "Slew [5]"},
    {6, "Paging [6]"},
    {7, "Slotted mode sleep state [7]"},
    {8, "Traffic [8]"},
    {9, "UnSlew [9]"},
    {10, "Operation in PCG state [10]"},
    {11, "Powerup state [11]"},
};

constexpr Place kOneXState = u8(4).ofTwin();
constexpr Condition kInTraffic = equals(kOneXState, 8);

constexpr TextRule receivePower() { return scaled("%+.2f dBm", -63.248, 0.334); }

constexpr Field kOneXFields[] = {
    {"k1xDeviceState", kOneXState, namedElse(kStateNames, "[Bad Value %d]")},
    {"k1xRx0BandClass", u8(4), bandClass()},
    {"k1xRx0ChanNum", u16(6), decimal()},
    {"k1xRxAGC0", s8(10), receivePower()},
    {"k1xRx1BandClass", u8(5), bandClass(), when(kInTraffic).elseText(kNotAvailable)},
    {"k1xRx1ChanNum", u16(8), decimal(), when(kInTraffic).elseText(kNotAvailable)},
    {"k1xRxAGC1", s8(11), receivePower(), when(kInTraffic).elseText(kNotAvailable)},
    {"k1xTxAGC", s16(12), scaled("%+.2f dBm", 0, 0.1), when(kInTraffic).elseText(kNotAvailable)},
};
static_assert(isLayout(kOneXFields));

/// What was in the traffic that ended is not in this packet. One of these fields, or none, is
/// shown: in traffic there is no such rate.
constexpr TextRule kFromEarlierPackets = named({}, "(from the packets before)");
constexpr Field kOldErrorRate[] = {
    {kFrameErrorRateName, kOneXState, kFromEarlierPackets, when(between(kOneXState, 0, 7))},
    {kFrameErrorRateName, kOneXState, kFromEarlierPackets, when(between(kOneXState, 9, 255))},
};
static_assert(isLayout(kOldErrorRate) && excludeEachOther(kInTraffic, kOldErrorRate[0].condition) &&
              excludeEachOther(kInTraffic, kOldErrorRate[1].condition));

constexpr std::uint8_t kOneXSubPackets[] = {kOneXStateId, kOneXRadioId, kOneXActiveSetId,
                                            kOneXFingersId};
constexpr Requirement kOneXStatusRequirements[] = {
    kMinimumLength,
    {.kind = Requirement::Kind::SubPackets,
     .line = "Log code 0x119c: missing subpacket (ss={},rf={},ai={},fi={}).",
     .priority = LogPriority::Warning,
     .subPackets = kOneXSubPackets}};

}  // namespace

constexpr PacketReading kOneXStatusReading = {.packet = kOneXStatusPacket};

constexpr PacketRules kOneXStatusRules = {kOneXStatusReading, kOneXStatusRequirements};

constinit const std::span<const Field> kOneXStatusFields = kOneXFields;

RecordPosition oneXStatusFieldsIn(const TakenPacket& packet) {
  return {.here = packet.subPackets[1], .twin = packet.subPackets[0]};
}
std::size_t oneXActiveSetIn(const TakenPacket& packet) { return packet.subPackets[2]; }
bool isInTraffic(const TakenPacket& packet) {
  return holds(kInTraffic, packet.bytes, oneXStatusFieldsIn(packet));
}

OneXStatus::OneXStatus()
    : C2KParser(kOneXStatusRules),
      _fields(kOneXFields),
      _activeSet(kOneXActiveSetName),
      _errorRate(kFrameErrorRateName) {}

std::vector<std::string_view> OneXStatus::lookupNames() const {
  std::vector<std::string_view> names;
  for (const Field& field : kOneXFields) names.push_back(field.key);
  names.push_back(kOneXActiveSetName);
  names.push_back(kFrameErrorRateName);
  return names;
}

void OneXStatus::take(const TakenPacket& packet, C2KOutput& output) {
  _fields.store(packet.bytes, oneXStatusFieldsIn(packet), output.lookup);
  OneXActiveSet(packet.bytes, oneXActiveSetIn(packet)).addTo(_pilots);
  _pilots.store(_activeSet, output.lookup);
  if (!isInTraffic(packet)) storeOldErrorRate(output);
}

void OneXStatus::storeOldErrorRate(C2KOutput& output) {
  const auto rate = FrameErrorRate::ofState(output.state);
  if (!rate) return;
  output.lookup.store(_errorRate, rate->oldText());
  FrameErrorRate::removeFrom(output.state);
}

void OneXStatus::explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const {
  const std::string_view section = reading().packet.name;
  const Explainer explainer(section, packet.bytes, visit);
  explainer.fields(kOneXFields, oneXStatusFieldsIn(packet));
  OneXActiveSet(packet.bytes, oneXActiveSetIn(packet)).explain(section, kOneXActiveSetName, visit);
  for (const Field& rate : kOldErrorRate) {
    if (!holds(rate.condition, packet.bytes, oneXStatusFieldsIn(packet))) continue;
    explainer.fields({&rate, 1}, oneXStatusFieldsIn(packet));
  }
}

void OneXStatus::outlineTaken(std::vector<OutlinedPart>& parts) const {
  const std::string_view section = reading().packet.name;
  const OutlineAnchor radioAndState{.here = kOneXRadioId, .twin = kOneXStateId};
  const auto append = [&](std::span<const Field> fields, const OutlineAnchor& anchor) {
    for (const Field& field : fields) {
      parts.emplace_back(outlinedValue(section, field.key, field, anchor));
    }
  };
  append(kOneXFields, radioAndState);
  append(kOneXActiveSetFields, {.here = kOneXActiveSetId});
  parts.emplace_back(OutlinedSizedRecords{.section = section,
                                          .list = kOneXActiveSetName,
                                          .records = &kOneXPilots,
                                          .subPacket = kOneXActiveSetId});
  append(kOldErrorRate, radioAndState);
}

}  // namespace kestro
