// SPDX-License-Identifier: MIT
// The EV-DO status packet, 0x1183.
#pragma once

#include "LogGenerator/C2K/C2KParser.h"

namespace kestro {

inline constexpr PacketKind kEVDOStatusPacket = {
    .code = 0x1183, .name = "EV-DO status", .minimumLength = 50};

extern const PacketReading kEVDOStatusReading;

/// Shows where the phone's EV-DO receiver is tuned to and what state it is in.
class EVDOStatus : public C2KParser {
 public:
  EVDOStatus() : C2KParser(kEVDOStatusReading), _fields(reading().fields) {}

  void parse(PacketView packet, C2KOutput& output) override;
  void explain(PacketView packet, const ExplainVisitor& visit) const override;

 private:
  /// A packet that is longer is none of these either.
  [[nodiscard]] bool hasRightLength(PacketView packet) const noexcept {
    return packet.size() == reading().packet.minimumLength;
  }

  StoredFields _fields;
};

}  // namespace kestro
