// SPDX-License-Identifier: MIT
// What one decoder shows of which packets: the description that decoding, encoding, explaining and
// listing all walk.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/Field.h"
#include "LogGenerator/Packets/PacketKind.h"
#include "LogGenerator/Packets/PropertyListReading.h"
#include "Platform/SystemLog.h"

namespace kestro {

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
  const PacketKind& packet;  ///< a constant
  std::span<const Field> fields{};
  std::span<const ListReading> lists{};

  /// Whether the section wants the packet and takes nothing from it.
  [[nodiscard]] constexpr bool isEmpty() const noexcept { return fields.empty() && lists.empty(); }
};

/// One decoder: its section and everything it reads.
struct Section {
  std::string_view name;            ///< the section's name in the display
  std::string_view logLine = name;  ///< what it writes to the system log for every packet
  SectionKind kind = SectionKind::Dictionary;
  /// Of several readings of one code, the first whose minimum length a packet has.
  std::span<const PacketReading> readings{};
  LogPriority logPriority = LogPriority::Warning;
  bool reportsUnknownCodes = true;
  const PropertyListReading* propertyList = nullptr;  ///< null when it reads no property list
};

/// What the section takes from packets of this code and length; null when nothing that a layout
/// describes.
[[nodiscard]] constexpr const PacketReading* readingOf(const Section& section, LogCode code,
                                                       std::size_t length = SIZE_MAX) noexcept {
  for (const PacketReading& reading : section.readings) {
    if (reading.packet.code == code && length >= reading.packet.minimumLength) return &reading;
  }
  return nullptr;
}

/// The codes that the section wants: those of its readings in their order, each once, and that of
/// its property list.
[[nodiscard]] std::vector<LogCode> codesOf(const Section& section);

}  // namespace kestro
