// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/FrameErrorRate.h"

#include "LogGenerator/C2K/C2KState.h"
#include "LogGenerator/C2K/SubPackets.h"

namespace kestro {
namespace {

/// One frame counts for 1/64 of the average.
constexpr float kFrameWeight = 0.015625F;
constexpr float kPreviousWeight = 0.984375F;

Value percentText(const NumberFormat& format, float rate) {
  const float percent = rate * 100.0F;
  TextBuffer text;
  text.append(format, double{percent});
  return text.text();
}

/// The average depends on all frames.
constexpr std::string_view kWithEarlierPackets = "(with the packets before)";

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

Value FrameErrorRate::text() const { return percentText("%.02f%%", _rate); }
Value FrameErrorRate::oldText() const { return percentText("%.02f%% (old)", _rate); }

// --- 0x119D --------------------------------------------------------------------------------------

constexpr PacketReading kTrafficFrameReading = {.packet = kOneXTrafficFramePacket};

std::vector<std::string_view> TrafficFrame::lookupNames() const { return {kFrameErrorRateName}; }

void TrafficFrame::parse(PacketView packet, C2KOutput& output) {
  if (!isLongEnough(packet, output.log)) return;
  const auto demodulation = findSubPacket(packet, kTrafficDemodulationId, output.log);
  if (!demodulation) {
    output.log.write(LogPriority::Warning, "Log code 0x119d: missing traffic demod subpacket.");
    return;
  }
  const bool isBad = readBits(kIsBadFrame, packet, {.here = *demodulation}) != 0;
  const auto rate = FrameErrorRate::after(FrameErrorRate::ofState(output.state), isBad);
  rate.keepIn(output.state);
  output.lookup.store(_rate, rate.text());
}

void TrafficFrame::explain(PacketView packet, const ExplainVisitor& visit) const {
  const auto demodulation = searchSubPacket(packet, kTrafficDemodulationId).start;
  if (!isLongEnough(packet) || !demodulation) return;
  const std::string_view section = reading().packet.name;
  visit(
      {.section = section,
       .key = kFrameErrorRateName,
       .sources = {Explainer(section, packet, visit).source(kIsBadFrame, {.here = *demodulation})},
       .text = kWithEarlierPackets});
}

}  // namespace kestro
