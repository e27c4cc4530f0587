// SPDX-License-Identifier: MIT
// The EV-DO packets that list pilots: 0x12B6 (active set) and 0x108A (finger carrier to
// interference).
#pragma once

#include "LogGenerator/C2K/C2KParser.h"
#include "LogGenerator/C2K/PilotList.h"

namespace kestro {

inline constexpr PacketKind kEVDOActiveSetPacket = {
    .code = 0x12B6, .name = "EV-DO active set", .minimumLength = 25};
inline constexpr PacketKind kEVDOFingersPacket = {
    .code = 0x108A, .name = "EV-DO finger C/I", .minimumLength = 23};

extern const PacketReading kEVDOActiveSetReading;
extern const PacketReading kEVDOFingersReading;
extern const PacketRules kEVDOActiveSetRules;
extern const PacketRules kEVDOFingersRules;

/// Shows one list of pilots. The code decides how long a packet with so many pilots has to be.
class EVDOPilots : public C2KParser {
 protected:
  explicit EVDOPilots(const PacketRules& pilotsRules);

  void take(const TakenPacket& packet, C2KOutput& output) override;

 private:
  [[nodiscard]] const RecordTable& table() const { return reading().lists[0].table; }

  BoundField _energy;
  LookupName _name;
  PilotList _pilots;  ///< empty between packets
};

class EVDOActiveSet : public EVDOPilots {
 public:
  EVDOActiveSet();
};

class EVDOFingers : public EVDOPilots {
 public:
  EVDOFingers();
};

}  // namespace kestro
