// SPDX-License-Identifier: MIT
// What a packet must be like to be taken, and what is said of one that is not.
#pragma once

#include <fmt/format.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>

#include "LogGenerator/Packets/Field.h"
#include "Platform/SystemLog.h"

namespace kestro {

/// What the line about a refused packet may show, from {0} to {3}.
using RefusalNumbers = std::array<std::size_t, 4>;
using RefusalFormat = fmt::format_string<const std::size_t&, const std::size_t&, const std::size_t&,
                                         const std::size_t&>;

/// One thing that the packets of a reading must have. Without it they are refused: they leave a
/// line in the log, and nothing else.
struct Requirement {
  enum class Kind : std::uint8_t {
    // Lines about the length show the packet's, the reading's minimum, the reading's code, and how
    // many records the packet says that it has.
    MinimumLength,    ///< the reading's minimum length, or more
    ExactLength,      ///< that length and no more
    HoldsRecords,     ///< the records of the reading's first list, or more
    EndsWithRecords,  ///< these records and no more
    Number,           ///< a number for which `condition` holds; the line shows the number
    SubPackets,       ///< sub-packets of these identifiers; the line shows 1 for each that is there
  };

  Kind kind;
  RefusalFormat line;
  LogPriority priority = LogPriority::Error;
  Condition condition{};
  std::span<const std::uint8_t> subPackets{};  ///< at most as many as a line has numbers
};

/// The requirement of most packets.
inline constexpr Requirement kMinimumLength = {
    Requirement::Kind::MinimumLength,
    "Log code 0x{2:04x} is {0} bytes long but must be at least {1} bytes."};

}  // namespace kestro
