// SPDX-License-Identifier: MIT
// How events name the packet that told them.
#pragma once

#include <fmt/format.h>

#include <string>

#include "LogGenerator/Packets/PacketKind.h"

namespace kestro {

/// "0xB0C2"; of a message without a log code "message".
[[nodiscard]] inline std::string packetText(LogCode code) {
  return code == 0 ? "message" : fmt::format("0x{:04X}", code);
}

}  // namespace kestro
