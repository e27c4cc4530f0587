// SPDX-License-Identifier: MIT
// The bytes of a packet that was made, from an offset on.
#pragma once

#include <gtest/gtest.h>

#include <cstddef>
#include <optional>
#include <vector>

#include "Platform/Bytes.h"

namespace kestro::testing {

/// `count` bytes of the packet; empty, and a failure, when it does not have them.
inline std::vector<unsigned> bytesAt(const std::optional<Bytes>& packet, std::size_t offset,
                                     std::size_t count) {
  if (!packet || packet->size() < offset + count) {
    ADD_FAILURE() << "no packet with " << count << " bytes at " << offset;
    return {};
  }
  const auto begin = packet->begin() + static_cast<std::ptrdiff_t>(offset);
  return {begin, begin + static_cast<std::ptrdiff_t>(count)};
}

}  // namespace kestro::testing
