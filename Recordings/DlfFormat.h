// SPDX-License-Identifier: MIT
// What of a DLF log's records its reader needs. Documentation/snapshots.md describes them.
#pragma once

#include <cstddef>
#include <cstdint>

namespace kestro {

/// A record: its length in 16 bits, log code, time in µs since 1970 in 64 bits, payload.
inline constexpr std::size_t kDlfCodeOffset = 2;
inline constexpr std::size_t kDlfTimeOffset = 4;
inline constexpr std::size_t kShortestDlfRecord = 12;

/// The code of the record that a log begins with, and where in it the seconds since 1970 stand at
/// which the log was made.
inline constexpr std::uint16_t kDlfVersionReport = 0x1FFD;
inline constexpr std::size_t kDlfVersionReportSeconds = 97;

/// What stands in front of a record on a log channel, and in the packets of a history's entry: an
/// optional prefix, then the type byte.
inline constexpr std::uint8_t kDlfPrefixMark = 0x81;
inline constexpr std::size_t kDlfPrefixSize = 2;
inline constexpr std::uint8_t kDlfBasebandType = 1;
inline constexpr std::uint8_t kDlfExtraType = 0xFF;

/// Where no type byte tells, extra packets are known by their codes: 0 to this.
inline constexpr std::uint16_t kLastDlfExtraCode = 2;

}  // namespace kestro
