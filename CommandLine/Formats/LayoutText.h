// SPDX-License-Identifier: MIT
// A packet's layout in words, for the list of log codes.
#pragma once

#include <span>
#include <string>
#include <vector>

#include "LogGenerator/Packets/Catalogue.h"

namespace kestro {

/// How a log code is written: "0xB17F", "0xFF0001".
[[nodiscard]] std::string logCodeText(LogCode code);

/// A number format as C's printf takes it: "%4.2f dBm".
[[nodiscard]] std::string printfText(const NumberFormat& format);

/// Where a place lies: "u16 at 19, bits 0-8". An offset that counts from a record's beginning has a
/// plus sign when `inRecord`: "s8 at +4".
[[nodiscard]] std::string placeText(const Place& place, bool inRecord);

/// What a packet must have besides the least length: "exactly that long", "only where (u8 at 13) is
/// 2 to 255".
[[nodiscard]] std::vector<std::string> requirementTexts(std::span<const Requirement> requirements);

/// How a raw value x is shown: "0.25x - 140 as %4.2f dBm; 64: Not Present".
[[nodiscard]] std::string ruleText(const TextRule& rule);

/// Every place that a key is read from; for the value of a property list its key there. Empty for
/// what a decoder works out itself, and for a key that is taken out of the section.
[[nodiscard]] std::string sourcesText(const CatalogueKey& key);

/// How a key is shown, with the conditions that choose between its fields. A table of names has no
/// "else" where the packet can hold none but the values with names. Empty for a key without a
/// field.
[[nodiscard]] std::string shownText(const CatalogueKey& key);

/// Which records make rows, and where they lie: "one for each cell; count: u8 at 15; from byte 16,
/// 15 bytes each".
[[nodiscard]] std::string tableText(const RecordTable& table);

/// Which part of its property list a section of this kind shows.
[[nodiscard]] std::string partText(const PropertyListReading& reading, SectionKind kind);

}  // namespace kestro
