// SPDX-License-Identifier: MIT
// The version report, the record at the start of every DLF log.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

namespace kestro {

/// The size of a version report in bytes.
inline constexpr std::uint32_t kVersionReportSize = 161;

/// Status of QbxDLFAddVersionReport.
inline constexpr int kVersionReportWritten = 0;
inline constexpr int kVersionReportBufferTooShort = 3;

/// Packs the time fields of a version report: seconds since 1970 in bits 0 to 31, the zone's offset
/// from GMT in minutes in bits 32 to 47 and the daylight-saving flag in bits 48 to 55.
[[nodiscard]] std::uint64_t packedReportTime(std::uint32_t seconds, std::int16_t zoneMinutes,
                                             bool daylightSaving) noexcept;

/// Writes a version report to the start of `buffer`, of which `bufferLength` bytes may be used. The
/// texts are cut to 6, 15 and 17 bytes. `writtenLength` becomes 161, or 0 when the buffer is too
/// short; the result says which.
int QbxDLFAddVersionReport(std::span<std::uint8_t> buffer, std::uint32_t bufferLength,
                           std::uint32_t& writtenLength, std::uint16_t firstVersion,
                           std::uint16_t secondVersion, std::string_view version,
                           std::string_view executableName, std::string_view buildDate,
                           std::uint64_t packedTime);

}  // namespace kestro
