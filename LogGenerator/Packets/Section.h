// SPDX-License-Identifier: MIT
// What one decoder shows of which packets: the description that decoding, encoding, explaining and
// listing all walk.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

#include "LogGenerator/Packets/Field.h"
#include "LogGenerator/Packets/PropertyListReading.h"
#include "Platform/SystemLog.h"

namespace kestro {

/// A log code: 16 bits, or for an extra packet 16 bits plus 0xFF0000.
using LogCode = std::uint32_t;

inline constexpr LogCode kExtraCodes = 0xFF0000;
inline constexpr LogCode kSimFilesCode = 0xFF0000;
inline constexpr LogCode kCellMonitorCode = 0xFF0001;
inline constexpr LogCode kPacketDataContextsCode = 0xFF0002;

/// The bytes at the start of every packet, before its payload.
inline constexpr std::size_t kPacketHeaderSize = 13;

enum class SectionKind : std::uint8_t { Dictionary, List };

/// What becomes of the rows that a table's records make.
enum class RowsUse : std::uint8_t {
  Shown,    ///< they are the new list
  Dropped,  ///< the list is emptied and stays so
  Noted,    ///< the decoder takes them for later; the section stays as it is
};

/// A table of records as a list of the display.
struct ListReading {
  RecordTable table;
  /// The key under which the list stands in the section; empty: the list is the section.
  std::string_view key{};
  /// Whether a count of 0 leaves an earlier list under the key in place.
  bool keepsOldWhenEmpty = false;
  /// Whether each record is shown as the text of its one field rather than as a row.
  bool isPlain = false;
  RowsUse use = RowsUse::Shown;
};

/// What a section takes from one packet.
struct PacketReading {
  LogCode code;
  std::string_view packetName;  ///< what the packet is, for people
  std::size_t minimumLength;    ///< shorter packets change nothing
  std::span<const Field> fields{};
  std::span<const ListReading> lists{};
};

/// One decoder: its section and everything it reads.
struct Section {
  std::string_view name;     ///< the section's name in the display
  std::string_view logLine;  ///< what it writes to the system log for every packet
  SectionKind kind;
  /// Of several readings of one code, the first whose minimum length a packet has.
  std::span<const PacketReading> readings{};
  std::span<const LogCode> codes{};  ///< what it subscribes to, in order
  LogPriority logPriority = LogPriority::Warning;
  bool reportsUnknownCodes = true;
  const PropertyListReading* propertyList = nullptr;  ///< null when it reads no property list
};

/// A section that is filled from one packet and logs its own name. `reading` must be a constant.
[[nodiscard]] constexpr Section sectionOf(std::string_view name, SectionKind kind,
                                          const PacketReading& reading) noexcept {
  return {.name = name,
          .logLine = name,
          .kind = kind,
          .readings = {&reading, 1},
          .codes = {&reading.code, 1}};
}

/// What the section takes from packets of this code and length; null when nothing that a layout
/// describes.
[[nodiscard]] constexpr const PacketReading* readingOf(const Section& section, LogCode code,
                                                       std::size_t length = SIZE_MAX) noexcept {
  for (const PacketReading& reading : section.readings) {
    if (reading.code == code && length >= reading.minimumLength) return &reading;
  }
  return nullptr;
}

/// The codes of the readings in their order, and after them those that no layout describes.
template <std::size_t Count, class... Others>
[[nodiscard]] constexpr std::array<LogCode, Count + sizeof...(Others)> codesOf(
    const PacketReading (&readings)[Count], Others... others) {
  std::array<LogCode, Count + sizeof...(Others)> codes{};
  std::size_t size = 0;
  for (const PacketReading& reading : readings) codes[size++] = reading.code;
  ((codes[size++] = others), ...);
  return codes;
}

}  // namespace kestro
