// SPDX-License-Identifier: MIT
// The frame error rate of 1x traffic: a running average over the frames, kept in the generator
// state, and the packet that brings each frame, 0x119D.
#pragma once

#include <optional>
#include <string_view>

#include "LogGenerator/C2K/C2KParser.h"

namespace kestro {

inline constexpr std::string_view kFrameErrorRateName = "k1xTrafficFER";
inline constexpr NumberFormat kFrameErrorRateFormat = "%.02f%%";

/// A rate from 0 to 1, in single precision throughout.
class FrameErrorRate {
 public:
  /// The rate that the state keeps; absent when it keeps no number.
  [[nodiscard]] static std::optional<FrameErrorRate> ofState(const Dictionary& state);
  static void removeFrom(Dictionary& state);

  /// The rate after one more frame; the first one follows on no rate.
  [[nodiscard]] static FrameErrorRate after(const std::optional<FrameErrorRate>& previous,
                                            bool isBadFrame);
  void keepIn(Dictionary& state) const;

  [[nodiscard]] double percent() const noexcept { return double{_rate * 100.0F}; }
  /// In per cent; the old text says that the traffic is over.
  [[nodiscard]] Value text() const;
  [[nodiscard]] Value oldText() const;

 private:
  explicit FrameErrorRate(float rate) : _rate(rate) {}

  float _rate;
};

inline constexpr PacketKind kOneXTrafficFramePacket = {
    .code = 0x119D, .name = "1x traffic frame", .minimumLength = 17};

extern const PacketReading kTrafficFrameReading;
extern const PacketRules kTrafficFrameRules;

/// The identifier of its sub-packet, and where that says whether a frame was bad.
inline constexpr std::uint8_t kTrafficDemodulationId = 11;
inline constexpr Place kIsBadFrame = u8(24);  ///< 0 for a good frame
[[nodiscard]] bool isBadFrame(const TakenPacket& packet);

class TrafficFrame : public C2KParser {
 public:
  TrafficFrame();

  [[nodiscard]] std::vector<std::string_view> lookupNames() const override;

 protected:
  void take(const TakenPacket& packet, C2KOutput& output) override;
  void explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const override;
  void outlineTaken(std::vector<OutlinedPart>& parts) const override;

 private:
  LookupName _rate;
};

}  // namespace kestro
