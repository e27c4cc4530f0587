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

constexpr TextRule receivePower() { return scaled(0.334, -63.248, "%+.2f dBm"); }

constexpr Field kOneXFields[] = {
    {"k1xDeviceState", kOneXState, namedElse(kStateNames, "[Bad Value %d]")},
    {"k1xRx0BandClass", u8(4), bandClass()},
    {"k1xRx0ChanNum", u16(6), decimal()},
    {"k1xRxAGC0", s8(10), receivePower()},
    Field("k1xRx1BandClass", u8(5), bandClass()).when(kInTraffic).elseText(kNotAvailable),
    Field("k1xRx1ChanNum", u16(8), decimal()).when(kInTraffic).elseText(kNotAvailable),
    Field("k1xRxAGC1", s8(11), receivePower()).when(kInTraffic).elseText(kNotAvailable),
    Field("k1xTxAGC", s16(12), scaled(0.1, 0, "%+.2f dBm"))
        .when(kInTraffic)
        .elseText(kNotAvailable),
};
static_assert(isLayout(kOneXFields));

constexpr std::string_view kActiveSetName = "k1xActiveSetInfo";

/// What was in the traffic that ended is not in this packet.
constexpr std::string_view kFromEarlierPackets = "(from the packets before)";

}  // namespace

constexpr PacketReading kOneXStatusReading = {.packet = kOneXStatusPacket};

constinit const std::span<const Field> kOneXStatusFields = kOneXFields;

OneXStatus::OneXStatus()
    : C2KParser(kOneXStatusReading),
      _fields(kOneXFields),
      _activeSet(kActiveSetName),
      _errorRate(kFrameErrorRateName) {}

std::vector<std::string_view> OneXStatus::lookupNames() const {
  std::vector<std::string_view> names;
  for (const Field& field : kOneXFields) names.push_back(field.key);
  names.push_back(kActiveSetName);
  names.push_back(kFrameErrorRateName);
  return names;
}

void OneXStatus::parse(PacketView packet, C2KOutput& output) {
  if (!isLongEnough(packet, output.log)) return;
  const SubPackets found{findSubPacket(packet, kOneXStateId, output.log),
                         findSubPacket(packet, kOneXRadioId, output.log),
                         findSubPacket(packet, kOneXActiveSetId, output.log),
                         findSubPacket(packet, kOneXFingersId, output.log)};
  if (!found.areComplete()) {
    output.log.log(LogPriority::Warning,
                   "Log code 0x119c: missing subpacket (ss={:d},rf={:d},ai={:d},fi={:d}).",
                   found.state.has_value(), found.radio.has_value(), found.activeSet.has_value(),
                   found.fingers.has_value());
    return;
  }
  _fields.store(packet, found.position(), output.lookup);
  OneXActiveSet(packet, *found.activeSet).addTo(_pilots);
  _pilots.store(_activeSet, output.lookup);
  if (!holds(kInTraffic, packet, found.position())) storeOldErrorRate(output);
}

void OneXStatus::storeOldErrorRate(C2KOutput& output) {
  const auto rate = FrameErrorRate::ofState(output.state);
  if (!rate) return;
  output.lookup.store(_errorRate, rate->oldText());
  FrameErrorRate::removeFrom(output.state);
}

void OneXStatus::explain(PacketView packet, const ExplainVisitor& visit) const {
  if (!isLongEnough(packet)) return;
  const SubPackets found{searchSubPacket(packet, kOneXStateId).start,
                         searchSubPacket(packet, kOneXRadioId).start,
                         searchSubPacket(packet, kOneXActiveSetId).start,
                         searchSubPacket(packet, kOneXFingersId).start};
  if (!found.areComplete()) return;
  const std::string_view section = reading().packet.name;
  const Explainer explainer(section, packet, visit);
  explainer.fields(kOneXFields, found.position());
  OneXActiveSet(packet, *found.activeSet).explain(section, kActiveSetName, visit);
  if (holds(kInTraffic, packet, found.position())) return;
  visit({.section = section,
         .key = kFrameErrorRateName,
         .sources = {explainer.source(kOneXState, found.position())},
         .text = kFromEarlierPackets});
}

}  // namespace kestro
