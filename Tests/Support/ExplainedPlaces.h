// SPDX-License-Identifier: MIT
// Where a generator reads the values of a packet, as lines for tests to compare.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/PacketBytes.h"

namespace kestro::testing {

/// A packet of `length` bytes, all bits set behind its header: a value that is read too wide, too
/// narrow or with the wrong sign is another one.
inline PacketBytes allOnes(LogCode code, std::size_t length) {
  return packet(code).length(kPacketHeaderSize).length(length, 0xFF);
}

/// " 16[0-7]=255": the place's offset, its first and last bit there, and what it holds; "^" marks
/// one whose first byte is its highest.
inline std::string textOf(const ExplainedSource& place) {
  return " " + std::to_string(place.offset) + "[" + std::to_string(place.firstBit) + "-" +
         std::to_string(place.firstBit + place.bitCount - 1) + "]=" + std::to_string(place.raw) +
         (place.isBigEndian ? "^" : "");
}

/// "Section: Key place...", for a record "Section: list#index Key place...".
inline std::string textOf(const ExplainedValue& value) {
  std::string line = std::string(value.section) + ": ";
  if (!value.list.empty()) line += value.list;
  if (value.row) line += "#" + std::to_string(*value.row);
  if (!value.list.empty()) line += " ";
  line += value.key;
  for (const ExplainedSource& place : value.sources) line += textOf(place);
  return line;
}

/// A generator of one technology, and where it reads.
class ExplainedPlacesFixture : public ::testing::Test {
 protected:
  explicit ExplainedPlacesFixture(std::string_view technology)
      : generator(LogGenerator::generatorFromTechnology(generatorServices(platform), technology)) {}

  /// What is no record: the sections' own fields, and the counts of their records.
  [[nodiscard]] std::vector<std::string> places(const PacketBytes& packet) const {
    return lines(packet, false);
  }
  /// The records' fields.
  [[nodiscard]] std::vector<std::string> recordPlaces(const PacketBytes& packet) const {
    return lines(packet, true);
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::unique_ptr<LogGenerator> generator;

 private:
  [[nodiscard]] std::vector<std::string> lines(const PacketBytes& packet, bool ofRecords) const {
    std::vector<std::string> lines;
    generator->explainMessage(packet.bytes(), [&](const ExplainedValue& value) {
      if (value.row.has_value() == ofRecords) lines.push_back(textOf(value));
    });
    return lines;
  }
};

}  // namespace kestro::testing
