// SPDX-License-Identifier: MIT
// What the reader and the writer of pcapng share: numbers of blocks and options, and limits. The
// format is described in Documentation/recordings.md.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "Platform/Clock.h"

namespace kestro {

enum class PcapngBlockType : std::uint32_t {
  SectionHeader = 0x0A0D0D0A,  ///< the same in both byte orders
  Interface = 1,
  Packet = 2,  ///< what came before the enhanced one; only read
  SimplePacket = 3,
  EnhancedPacket = 6,
};

enum class PcapngOption : std::uint16_t {
  End = 0,
  Comment = 1,
  InterfaceName = 2,
  InterfaceTimeResolution = 9,
  InterfaceTimeOffset = 14,
};

/// Behind a section header's type and length; tells the byte order of the section.
inline constexpr std::uint32_t kPcapngByteOrder = 0x1A2B3C4D;
inline constexpr std::uint16_t kPcapngMajorVersion = 1;

/// Type and length in front of a block's body, and the length once more behind it.
inline constexpr std::size_t kPcapngBlockHead = 8;
inline constexpr std::size_t kPcapngBlockTail = 4;

/// A block's body, and each option in it, is filled up to a multiple of this.
inline constexpr std::size_t kPcapngAlignment = 4;
[[nodiscard]] constexpr std::size_t pcapngPadded(std::size_t size) noexcept {
  return (size + kPcapngAlignment - 1) / kPcapngAlignment * kPcapngAlignment;
}

/// The longest block that is read; one that is passed over may be longer.
inline constexpr std::size_t kLongestPcapngBlock = std::size_t{16} * 1024 * 1024;
/// The most interfaces of a section.
inline constexpr std::size_t kMostPcapngInterfaces = 65'536;
/// The most comments that wait for a message, or that one message has, and their bytes: so many
/// that they and the message fit into a block that is read.
inline constexpr std::size_t kMostPcapngComments = 10'000;
inline constexpr std::size_t kLongestPcapngComments = kLongestPcapngBlock / 2;

/// Times outside the years 1 to 9999, which are those of texts and property lists, are not read;
/// what is written lies between 1970 and the last of them.
inline constexpr Moment kFirstPcapngTime = std::chrono::sys_days(std::chrono::year(1) / 1 / 1);
inline constexpr Moment kLastPcapngTime =
    Moment(std::chrono::sys_days(std::chrono::year(10'000) / 1 / 1)) - std::chrono::microseconds(1);

/// Begins the comment of a section that says what in the recording is made up.
inline constexpr std::string_view kMadeUpComment = "made-up: ";

}  // namespace kestro
