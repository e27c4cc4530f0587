// SPDX-License-Identifier: MIT
// What a measurer says of messages, as lines for tests to compare.
#pragma once

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Measurer.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/PacketBytes.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::testing {

/// "Section/Key [item] number unit|text": without the parts that the value has not.
inline std::string lineOf(const MeasuredValue& value) {
  const SeriesGroup& group = *value.series->group;
  std::string line = group.name();
  if (value.series->item != nullptr) line += fmt::format(" [{}]", value.series->itemText());
  if (value.hasNumber()) line += fmt::format(" {}", value.number);
  if (!group.unit.empty()) line += " " + group.unit;
  TextBuffer text;
  writeShown(value, text);
  return line.append("|").append(text.text());
}

/// A measurer for messages of one technology.
class MeasureFixture : public ::testing::Test {
 protected:
  explicit MeasureFixture(std::string_view technology) : _technology(technology) {
    addTemplates(platform);
  }

  [[nodiscard]] std::vector<std::string> lines(ByteView message) {
    // Its memory ends with it.
    const auto memory = std::make_unique<std::uint8_t[]>(message.size());
    std::ranges::copy(message, memory.get());
    std::vector<std::string> lines;
    for (const MeasuredValue& value :
         measurer.measure(_technology, {memory.get(), message.size()}).values) {
      lines.push_back(lineOf(value));
    }
    return lines;
  }
  [[nodiscard]] std::vector<std::string> lines(const PacketBytes& packet) {
    return lines(packet.bytes());
  }
  /// Of an extra packet that carries a property list.
  [[nodiscard]] std::vector<std::string> linesOfList(LogCode code, const Value& root) {
    return lines(packet(code).append(*coding->binary(root)));
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  Measurer measurer{{platform.bundle(), *coding}};

 private:
  std::string_view _technology;
};

}  // namespace kestro::testing
