// SPDX-License-Identifier: MIT
// The EV-DO packets that count what was sent at each rate: 0x1192 (forward link) and 0x127E
// (reverse link).
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

#include "LogGenerator/C2K/C2KParser.h"
#include "LogGenerator/C2K/C2KState.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Packets/PlacedKey.h"

namespace kestro {

inline constexpr PacketKind kEVDOForwardThroughputPacket = {
    .code = 0x1192, .name = "EV-DO forward throughput", .minimumLength = 241};
inline constexpr PacketKind kEVDOReverseThroughputPacket = {
    .code = 0x127E, .name = "EV-DO reverse throughput", .minimumLength = 1750};

/// One of a packet's counters, and how many bits each of its counts stands for.
struct SentCounter {
  std::uint16_t offset;
  std::uint16_t bits;

  [[nodiscard]] constexpr Place place() const { return u32(offset); }
};

/// One direction's packet.
struct ThroughputLayout {
  PacketReading reading;
  Place sequenceNumber;
  std::span<const SentCounter> counters;
  std::string_view rateName;          ///< the lookup name of the data rate
  std::string_view sequenceStateKey;  ///< where the state keeps the last packet's number
  std::string_view sentStateKey;      ///< and what had been sent by then
};

/// What a packet says: its number, and what its counters add up to, in bits.
struct ThroughputSample {
  std::int64_t sequence = 0;
  std::int64_t sent = 0;
};

/// What a packet that is long enough says.
[[nodiscard]] ThroughputSample sampleOf(const ThroughputLayout& layout, PacketView packet) noexcept;

/// The data rate between two packets, in kbit/s of 1024; nothing when the second's number is not
/// above the first's.
[[nodiscard]] std::optional<double> rateBetween(const ThroughputSample& previous,
                                                const ThroughputSample& current) noexcept;

inline constexpr NumberFormat kDataRateFormat = "%.2f kbps";

extern const ThroughputLayout kForwardThroughput;
extern const ThroughputLayout kReverseThroughput;

/// Shows the data rate between one packet and the next. The first packet only gives the numbers to
/// count from; a packet whose number is not above the last one's leaves the rate that is shown.
class EVDOThroughput : public C2KParser {
 public:
  /// `layout` must be a constant.
  explicit EVDOThroughput(const ThroughputLayout& layout);

  [[nodiscard]] std::vector<std::string_view> lookupNames() const override;

  /// What the packet's counters add up to, in bits; 0 for a packet that is too short.
  [[nodiscard]] std::int64_t sentIn(PacketView packet) const noexcept;

 protected:
  void take(const TakenPacket& packet, C2KOutput& output) override;
  void explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const override;
  void outlineTaken(std::vector<OutlinedPart>& parts) const override;

 private:
  /// One value of a packet: its keys in the state, and in the extra information as the newest and
  /// as the one before.
  struct Keys {
    explicit Keys(std::string_view stateKey);

    PlacedKey kept;
    PlacedKey newest;
    PlacedKey previous;
  };
  struct Sample {
    Value sequence;
    Value sent;
  };

  [[nodiscard]] Sample keptIn(const Dictionary& state);
  void keep(const Sample& sample, Dictionary& state, Dictionary& extraInfo);
  void storeRate(const Sample& previous, const Sample& current, const LookupTable& lookup);

  const ThroughputLayout& _layout;
  LookupName _rate;
  Keys _sequence;
  Keys _sent;
  PlacedKey _extraInfo{kStateExtraInfo};
};

}  // namespace kestro
