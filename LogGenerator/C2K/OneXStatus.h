// SPDX-License-Identifier: MIT
// The 1x status packet, 0x119C, and its four sub-packets.
#pragma once

#include <cstdint>
#include <span>

#include "LogGenerator/C2K/C2KParser.h"
#include "LogGenerator/C2K/PilotList.h"

namespace kestro {

inline constexpr PacketKind kOneXStatusPacket = {
    .code = 0x119C, .name = "1x status", .minimumLength = 17};

extern const PacketReading kOneXStatusReading;
extern const PacketRules kOneXStatusRules;

/// The identifiers of its sub-packets.
inline constexpr std::uint8_t kOneXStateId = 1;
inline constexpr std::uint8_t kOneXRadioId = 2;
inline constexpr std::uint8_t kOneXActiveSetId = 3;
inline constexpr std::uint8_t kOneXFingersId = 4;

/// The fields of the radio sub-packet, with the state sub-packet as its twin.
extern const std::span<const Field> kOneXStatusFields;

/// Where these fields lie in a packet that is taken, where its active set begins, and whether it
/// says that the phone is in traffic.
[[nodiscard]] RecordPosition oneXStatusFieldsIn(const TakenPacket& packet);
[[nodiscard]] std::size_t oneXActiveSetIn(const TakenPacket& packet);
[[nodiscard]] bool isInTraffic(const TakenPacket& packet);

/// The lookup name of the active set.
inline constexpr std::string_view kOneXActiveSetName = "k1xActiveSetInfo";

/// Shows the state of 1x call processing, its receivers and its active set. When the state leaves
/// traffic, the frame error rate of the traffic is shown once more, as an old one.
class OneXStatus : public C2KParser {
 public:
  OneXStatus();

  [[nodiscard]] std::vector<std::string_view> lookupNames() const override;

 protected:
  void take(const TakenPacket& packet, C2KOutput& output) override;
  void explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const override;
  void outlineTaken(std::vector<OutlinedPart>& parts) const override;

 private:
  void storeOldErrorRate(C2KOutput& output);

  StoredFields _fields;
  LookupName _activeSet;
  LookupName _errorRate;
  PilotList _pilots;  ///< empty between packets
};

}  // namespace kestro
