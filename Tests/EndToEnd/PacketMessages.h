// SPDX-License-Identifier: MIT
// Packets written byte by byte, as messages of a capture.
#pragma once

#include <string>

#include "Tests/Support/PacketBytes.h"

namespace kestro::testing {

inline std::string messageOf(const PacketBytes& packet) {
  return {packet.bytes().begin(), packet.bytes().end()};
}

}  // namespace kestro::testing
