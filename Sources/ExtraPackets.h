// SPDX-License-Identifier: MIT
// The packets that carry property lists: SIM files, cells as the telephony service knows them, and
// packet-data contexts.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "LogGenerator/Packets/PacketKind.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/PropertyList.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {

/// An extra packet with a property list as its payload.
[[nodiscard]] std::optional<Bytes> extraPacket(const PacketKind& packet, const Value& list,
                                               const PropertyListCoding& coding, Moment time);

/// The files of the simulated phone's SIM, as hexadecimal texts.
[[nodiscard]] Dictionary simulatedSimFiles(unsigned areaCode);

/// One packet-data context, as texts.
struct SimulatedContext {
  std::string_view accessPoint;
  std::string_view bearer;
  bool isActive = false;
  double downlinkBytes = 0;
  double uplinkBytes = 0;
};
[[nodiscard]] Dictionary simulatedContext(const SimulatedContext& context);

/// The beginning of a cell's dictionary: its technology and type, constants of CellMonitor.h. Add
/// its numbers with `set(key, Value::integer(…))`.
[[nodiscard]] Dictionary cellOfKind(std::string_view technology, std::string_view type);

}  // namespace kestro
