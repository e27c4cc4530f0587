// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/FrameErrorRate.h"

#include "LogGenerator/C2K/C2KState.h"

namespace kestro {
namespace {

/// One frame counts for 1/64 of the average.
constexpr float kFrameWeight = 0.015625F;
constexpr float kPreviousWeight = 0.984375F;

Value textOf(const NumberFormat& format, const FrameErrorRate& rate) {
  TextBuffer text;
  text.append(format, rate.percent());
  return text.text();
}

/// The average depends on all frames.
constexpr Field kExplainedRate[] = {
    {kFrameErrorRateName, kIsBadFrame, named({}, "(with the packets before)")}};

constexpr Requirement kTrafficFrameRequirements[] = {
    kMinimumLength,
    {.kind = Requirement::Kind::SubPackets,
     .line = "Log code 0x119d: missing traffic demod subpacket.",
     .priority = LogPriority::Warning,
     .subPackets = {&kTrafficDemodulationId, 1}}};

}  // namespace

std::optional<FrameErrorRate> FrameErrorRate::ofState(const Dictionary& state) {
  const Value& rate = state[kStateTrafficFER];
  if (rate.isReal()) return FrameErrorRate(static_cast<float>(rate.realNumber()));
  if (rate.isInteger()) return FrameErrorRate(static_cast<float>(rate.integerBits()));
  return std::nullopt;
}

void FrameErrorRate::removeFrom(Dictionary& state) { state.remove(kStateTrafficFER); }

FrameErrorRate FrameErrorRate::after(const std::optional<FrameErrorRate>& previous,
                                     bool isBadFrame) {
  float rate = (isBadFrame ? 1.0F : 0.0F) * kFrameWeight;
  if (previous) rate += kPreviousWeight * previous->_rate;
  return FrameErrorRate(rate);
}

void FrameErrorRate::keepIn(Dictionary& state) const {
  state.set(kStateTrafficFER, Value::real(double{_rate}));
}

Value FrameErrorRate::text() const { return textOf(kFrameErrorRateFormat, *this); }
Value FrameErrorRate::oldText() const { return textOf("%.02f%% (old)", *this); }

// --- 0x119D --------------------------------------------------------------------------------------

constexpr PacketReading kTrafficFrameReading = {.packet = kOneXTrafficFramePacket};
constexpr PacketRules kTrafficFrameRules = {kTrafficFrameReading, kTrafficFrameRequirements};

bool isBadFrame(const TakenPacket& packet) {
  return readBits(kIsBadFrame, packet.bytes, {.here = packet.subPackets[0]}) != 0;
}

std::vector<std::string_view> TrafficFrame::lookupNames() const { return {kFrameErrorRateName}; }

TrafficFrame::TrafficFrame() : C2KParser(kTrafficFrameRules), _rate(kFrameErrorRateName) {}

void TrafficFrame::take(const TakenPacket& packet, C2KOutput& output) {
  const auto rate =
      FrameErrorRate::after(FrameErrorRate::ofState(output.state), isBadFrame(packet));
  rate.keepIn(output.state);
  output.lookup.store(_rate, rate.text());
}

void TrafficFrame::explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const {
  Explainer(reading().packet.name, packet.bytes, visit)
      .fields(kExplainedRate, {.here = packet.subPackets[0]});
}

void TrafficFrame::outlineTaken(std::vector<OutlinedPart>& parts) const {
  parts.emplace_back(outlinedValue(reading().packet.name, kFrameErrorRateName, kExplainedRate[0],
                                   {.here = kTrafficDemodulationId}));
}

}  // namespace kestro
