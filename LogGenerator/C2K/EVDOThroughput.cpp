// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/EVDOThroughput.h"

#include <algorithm>
#include <array>
#include <string>
#include <utility>

namespace kestro {
namespace {

constexpr bool lieWithin(std::span<const SentCounter> counters, const PacketKind& packet) {
  return std::ranges::all_of(counters, [&packet](const SentCounter& counter) {
    return counter.offset + sizeof(std::uint32_t) <= packet.minimumLength;
  });
}

// --- 0x1192: forward link: 56 counters in a row --------------------------------------------------

constexpr std::uint16_t kForwardBits[] = {
    128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
    0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
    0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
    1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0,
};

constexpr auto forwardCounters() {
  std::array<SentCounter, std::size(kForwardBits)> counters{};
  for (std::size_t i = 0; i < counters.size(); ++i) {
    counters[i] = {.offset = static_cast<std::uint16_t>(17 + 4 * i), .bits = kForwardBits[i]};
  }
  return counters;
}
constexpr auto kForwardCounters = forwardCounters();
static_assert(kForwardCounters.size() == 56 &&
              lieWithin(kForwardCounters, kEVDOForwardThroughputPacket));

// --- 0x127E: reverse link: three blocks of counters for twelve rates -----------------------------

constexpr std::uint16_t kReverseBits[] = {128,  256,  512,  768,  1024, 1536,
                                          2048, 3072, 4096, 6144, 8192, 12288};
constexpr std::uint16_t kReverseOffsets[] = {18, 22, 26, 30, 306, 310, 314, 318};
constexpr std::size_t kReverseRateSize = 24;
constexpr std::size_t kReverseBlockSize = 576;
constexpr std::size_t kReverseBlocks = 3;

constexpr auto reverseCounters() {
  std::array<SentCounter, std::size(kReverseBits) * kReverseBlocks * std::size(kReverseOffsets)>
      counters{};
  std::size_t i = 0;
  for (std::size_t block = 0; block < kReverseBlocks; ++block) {
    for (std::size_t rate = 0; rate < std::size(kReverseBits); ++rate) {
      for (const std::size_t offset : kReverseOffsets) {
        counters[i++] = {.offset = static_cast<std::uint16_t>(offset + kReverseRateSize * rate +
                                                              kReverseBlockSize * block),
                         .bits = kReverseBits[rate]};
      }
    }
  }
  return counters;
}
constexpr auto kReverseCounters = reverseCounters();
static_assert(lieWithin(kReverseCounters, kEVDOReverseThroughputPacket));

/// A rate depends on two packets.
constexpr std::string_view kSinceLastPacket = "(since the packet before)";

}  // namespace

constexpr ThroughputLayout kForwardThroughput = {
    .reading = {.packet = kEVDOForwardThroughputPacket},
    .sequenceNumber = u32(13),
    .counters = kForwardCounters,
    .rateName = "kFLDataRate",
    .sequenceStateKey = kStateFLDataSeqNum,
    .sentStateKey = kStateFLDataSent};

constexpr ThroughputLayout kReverseThroughput = {
    .reading = {.packet = kEVDOReverseThroughputPacket},
    .sequenceNumber = u32(14),
    .counters = kReverseCounters,
    .rateName = "kRLDataRate",
    .sequenceStateKey = kStateRLDataSeqNum,
    .sentStateKey = kStateRLDataSent};

EVDOThroughput::Keys::Keys(std::string_view stateKey)
    : kept(stateKey),
      newest(std::string(stateKey).append("1")),
      previous(std::string(stateKey).append("2")) {}

EVDOThroughput::EVDOThroughput(const ThroughputLayout& layout)
    : C2KParser({layout.reading}),
      _layout(layout),
      _rate(layout.rateName),
      _sequence(layout.sequenceStateKey),
      _sent(layout.sentStateKey) {}

std::vector<std::string_view> EVDOThroughput::lookupNames() const { return {_layout.rateName}; }

ThroughputSample sampleOf(const ThroughputLayout& layout, PacketView packet) noexcept {
  ThroughputSample sample{.sequence = readNumber(layout.sequenceNumber, packet, {})};
  for (const SentCounter& counter : layout.counters) {
    // All of them lie in a packet that is long enough: a view of just four bytes need not look.
    const PacketView count(packet.bytes().subspan(counter.offset, sizeof(std::uint32_t)));
    sample.sent += std::int64_t{count.u32(0)} * counter.bits;
  }
  return sample;
}

std::optional<double> rateBetween(const ThroughputSample& previous,
                                  const ThroughputSample& current) noexcept {
  // The numbers wrap at 32 bits; their distance is signed all the same.
  const auto distance =
      static_cast<std::int32_t>(static_cast<std::uint32_t>(current.sequence - previous.sequence));
  if (distance < 1) return std::nullopt;
  return static_cast<double>(current.sent - previous.sent) /
         static_cast<double>(std::int64_t{distance} * 1024);
}

std::int64_t EVDOThroughput::sentIn(PacketView packet) const noexcept {
  return packet.size() < reading().packet.minimumLength ? 0 : sampleOf(_layout, packet).sent;
}

EVDOThroughput::Sample EVDOThroughput::keptIn(const Dictionary& state) {
  return {_sequence.kept.in(state), _sent.kept.in(state)};
}

void EVDOThroughput::keep(const Sample& sample, Dictionary& state, Dictionary& extraInfo) {
  _sequence.kept.set(state, sample.sequence);
  _sent.kept.set(state, sample.sent);
  _sequence.newest.set(extraInfo, sample.sequence);
  _sent.newest.set(extraInfo, sample.sent);
}

void EVDOThroughput::take(const TakenPacket& packet, C2KOutput& output) {
  const Sample previous = keptIn(output.state);
  const ThroughputSample said = sampleOf(_layout, packet.bytes);
  const Sample current{Value::integer(said.sequence), Value::integer(said.sent)};
  Dictionary extraInfo = _extraInfo.in(output.state).dictionary();
  if (previous.sequence.isInteger() && previous.sent.isInteger()) {
    storeRate(previous, current, output.lookup);
    _sequence.previous.set(extraInfo, previous.sequence);
    _sent.previous.set(extraInfo, previous.sent);
  } else {
    output.lookup.store(_rate, "");
  }
  keep(current, output.state, extraInfo);
}

void EVDOThroughput::storeRate(const Sample& previous, const Sample& current,
                               const LookupTable& lookup) {
  const auto rate = rateBetween({previous.sequence.integerBits(), previous.sent.integerBits()},
                                {current.sequence.integerBits(), current.sent.integerBits()});
  if (!rate) return;
  TextBuffer text;
  text.append(kDataRateFormat, *rate);
  lookup.store(_rate, text.text());
}

void EVDOThroughput::explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const {
  const Explainer explainer(reading().packet.name, packet.bytes, visit);
  ExplainedValue rate{.section = reading().packet.name, .key = _layout.rateName};
  rate.sources.push_back(explainer.source(_layout.sequenceNumber, {}));
  for (const SentCounter& counter : _layout.counters) {
    rate.sources.push_back(explainer.source(counter.place(), {}));
  }
  rate.text = kSinceLastPacket;
  visit(rate);
}

void EVDOThroughput::outlineTaken(std::vector<OutlinedPart>& parts) const {
  const Field rate(_layout.rateName, _layout.sequenceNumber, named({}, kSinceLastPacket));
  OutlinedValue value = outlinedValue(reading().packet.name, rate.key, rate);
  for (const SentCounter& counter : _layout.counters) value.places.push_back(counter.place());
  parts.emplace_back(std::move(value));
}

}  // namespace kestro
