// SPDX-License-Identifier: MIT
// The 1x status packet, 0x119C, and its four sub-packets.
#pragma once

#include <cstdint>
#include <optional>
#include <span>

#include "LogGenerator/C2K/C2KParser.h"
#include "LogGenerator/C2K/PilotList.h"
#include "LogGenerator/C2K/SubPackets.h"

namespace kestro {

inline constexpr PacketKind kOneXStatusPacket = {
    .code = 0x119C, .name = "1x status", .minimumLength = 17};

extern const PacketReading kOneXStatusReading;

/// The identifiers of its sub-packets.
inline constexpr std::uint8_t kOneXStateId = 1;
inline constexpr std::uint8_t kOneXRadioId = 2;
inline constexpr std::uint8_t kOneXActiveSetId = 3;
inline constexpr std::uint8_t kOneXFingersId = 4;

/// The fields of the radio sub-packet, with the state sub-packet as its twin.
extern const std::span<const Field> kOneXStatusFields;

/// Shows the state of 1x call processing, its receivers and its active set. When the state leaves
/// traffic, the frame error rate of the traffic is shown once more, as an old one.
class OneXStatus : public C2KParser {
 public:
  OneXStatus();

  void parse(PacketView packet, C2KOutput& output) override;
  void explain(PacketView packet, const ExplainVisitor& visit) const override;
  [[nodiscard]] std::vector<std::string_view> lookupNames() const override;

 private:
  /// Where the sub-packets begin, as far as they were found.
  struct SubPackets {
    std::optional<std::size_t> state;
    std::optional<std::size_t> radio;
    std::optional<std::size_t> activeSet;
    std::optional<std::size_t> fingers;

    [[nodiscard]] bool areComplete() const { return state && radio && activeSet && fingers; }
    /// For `kOneXStatusFields`.
    [[nodiscard]] RecordPosition position() const { return {.here = *radio, .twin = *state}; }
  };

  void storeOldErrorRate(C2KOutput& output);

  StoredFields _fields;
  LookupName _activeSet;
  LookupName _errorRate;
  PilotList _pilots;  ///< empty between packets
};

}  // namespace kestro
