// SPDX-License-Identifier: MIT
// Which technology the packets of a form are that does not name it.
#pragma once

#include <bitset>
#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Result.h"
#include "Recordings/RecordingContext.h"

namespace kestro {

/// Decides by the log codes of all packets. Codes of extra packets decide nothing.
class PacketTechnology {
 public:
  explicit PacketTechnology(const RecordingContext& context) : _context(context) {}

  /// A packet: a message without prefix, its type byte first.
  void add(ByteView packet);

  /// The technology that the context names, else the only one that has all codes; empty when there
  /// was no packet. The error says, behind the path, that it must be named.
  [[nodiscard]] Result<std::string_view> decided(const std::string& path) const;

 private:
  using Codes = std::bitset<std::numeric_limits<std::uint16_t>::max() + std::size_t{1}>;

  RecordingContext _context;
  bool _hasPackets = false;
  Codes _seen;
  std::optional<std::vector<std::string_view>> _left;  ///< that have all codes so far
};

}  // namespace kestro
