// SPDX-License-Identifier: MIT
// One decoder, bound to a section of its own.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "LogGenerator/Ondrel/Base.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/PacketBytes.h"
#include "Tests/Support/RecordedLines.h"

namespace kestro::testing {

using Entries = std::vector<std::pair<std::string, std::string>>;

/// The keys and texts of a dictionary in their order; "(no text)" for other values.
inline Entries entriesOf(const Dictionary& dictionary) {
  Entries entries;
  for (const auto& [key, value] : dictionary) {
    entries.emplace_back(key.text(), value.isText() ? std::string(value.text()) : "(no text)");
  }
  return entries;
}

/// The keys of a dictionary in their order.
inline std::vector<std::string> keysOf(const Dictionary& dictionary) {
  std::vector<std::string> keys;
  for (const auto& [key, value] : dictionary) keys.emplace_back(key.text());
  return keys;
}

/// `Decoder` on the virtual platform. Its section is a dictionary or a list, as the decoder says.
template <class Decoder>
class DecoderFixture : public ::testing::Test {
 protected:
  DecoderFixture() {
    if (decoder.sectionKind() == SectionKind::List) {
      _section = Array();
    } else {
      _section = Dictionary();
    }
    decoder.updateSectionRef(_section);
    takeLines();
  }

  /// Hands over a packet whose memory ends with its last byte.
  void decode(ByteView bytes, LogCode code) {
    const auto memory = std::make_unique<std::uint8_t[]>(bytes.size());
    std::ranges::copy(bytes, memory.get());
    decoder.updateWithDataLogCode(ByteView(memory.get(), bytes.size()), code);
  }
  void decode(const PacketBytes& bytes) { decode(bytes.bytes(), bytes.code()); }
  /// Hands over an extra packet that carries a property list.
  void decodeList(LogCode code, const Value& root) {
    decode(packet(code).append(*coding->binary(root)));
  }

  [[nodiscard]] Dictionary section() const { return _section.dictionary(); }
  [[nodiscard]] Array list() const { return _section.array(); }
  [[nodiscard]] Entries entries() const { return entriesOf(section()); }
  [[nodiscard]] std::string text(std::string_view key) const {
    return std::string(section()[key].text());
  }
  [[nodiscard]] Entries row(std::size_t index) const {
    return entriesOf(index < list().size() ? list()[index].dictionary() : Dictionary());
  }
  /// The text under `key` of every row, in order.
  [[nodiscard]] std::vector<std::string> column(std::string_view key) const {
    std::vector<std::string> texts;
    for (const Value& element : list()) texts.emplace_back(element.dictionary()[key].text());
    return texts;
  }

  /// The log lines since the last call.
  std::vector<Line> takeLines() { return platform.systemLog().take(); }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  Decoder decoder{generatorServices(platform)};

 private:
  Value _section;
};

}  // namespace kestro::testing
