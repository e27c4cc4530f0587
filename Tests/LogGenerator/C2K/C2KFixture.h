// SPDX-License-Identifier: MIT
// The CDMA2000 generator with a template that shows every value under its own lookup name.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/PacketBytes.h"
#include "Tests/Support/RecordedLines.h"

namespace kestro::testing {

inline constexpr const char* kLookupNames[] = {"kChannel",         "k1xEVDODeviceState",
                                               "kBandClass",       "kRxAGC0",
                                               "kRxAGC1",          "kTxAGC",
                                               "kServingPNOffset", "kSessionState",
                                               "kUATI24",          "kColorCode",
                                               "kActiveSetPilots", "kFingerC2I",
                                               "k1xDeviceState",   "k1xRx0BandClass",
                                               "k1xRx0ChanNum",    "k1xRxAGC0",
                                               "k1xRx1BandClass",  "k1xRx1ChanNum",
                                               "k1xRxAGC1",        "k1xTxAGC",
                                               "k1xActiveSetInfo", "k1xTrafficFER",
                                               "k1xRoamingHome",   "kSystemId",
                                               "kNetworkId",       "kPacketZoneId",
                                               "kBaseId",          "kProtocolRevision",
                                               "kFLDataRate",      "kRLDataRate"};

/// What is shown of the band classes 0 to 12, and of one that is none.
inline constexpr const char* kBandClassTexts[] = {"800 MHz cellular band [0]",
                                                  "1.8 to 2.0GHz PCS band [1]",
                                                  "872 to 960MHz TACS band [2]",
                                                  "832 to 925MHz JTACS band [3]",
                                                  "1.75 to 1.87GHz Korean PCS band [4]",
                                                  "450MHz band [5]",
                                                  "2GHz band [6]",
                                                  "700MHz band [7]",
                                                  "1800 MHz band [8]",
                                                  "900 MHzband [9]",
                                                  "Secondary 800 MHz band [10]",
                                                  "400 MHz European PAMR band [11]",
                                                  "800 MHz European PAMR band [12]",
                                                  "[Bad Value 13]"};

/// A sub-packet: what is not written is 0, its size stands where it says itself.
class SubPacketBytes {
 public:
  SubPacketBytes(unsigned id, std::size_t size) : _bytes(size, 0) {
    u8(0, id).u16(2, static_cast<unsigned>(size));
  }

  SubPacketBytes& u8(std::size_t offset, unsigned value) {
    _bytes.at(offset) = static_cast<std::uint8_t>(value);
    return *this;
  }
  SubPacketBytes& u16(std::size_t offset, unsigned value) {
    return u8(offset, value & 0xFF).u8(offset + 1, value >> 8);
  }

  [[nodiscard]] const Bytes& bytes() const noexcept { return _bytes; }

 private:
  Bytes _bytes;
};

/// A packet that is made of sub-packets, in this order.
inline PacketBytes packetOf(LogCode code, const std::vector<SubPacketBytes>& parts) {
  PacketBytes whole = packet(code);
  whole.length(17).u8(14, static_cast<unsigned>(parts.size()));
  for (const SubPacketBytes& part : parts) whole.append(part.bytes());
  return whole;
}

class C2KFixture : public ::testing::Test {
 protected:
  C2KFixture() {
    Dictionary displayTemplate;
    for (const char* name : kLookupNames) displayTemplate.set(name, name);
    setTemplate(displayTemplate);
    takeLines();
  }

  void setTemplate(const Value& displayTemplate) {
    platform.bundle().setResource("C2KTemplate.plist", *coding->xml(displayTemplate));
  }

  /// Hands over a message whose memory ends with its last byte.
  void receive(ByteView message) {
    const auto memory = std::make_unique<std::uint8_t[]>(message.size());
    std::ranges::copy(message, memory.get());
    generator->updateStateWithData(state, {memory.get(), message.size()});
  }
  void receive(const PacketBytes& packet) { receive(packet.bytes()); }

  [[nodiscard]] Dictionary display() const { return state[kStateDisplay].dictionary(); }
  [[nodiscard]] Dictionary extraInfo() const { return state[kStateExtraInfo].dictionary(); }
  [[nodiscard]] std::string text(std::string_view name) const {
    const Value& value = display()[name];
    return value.isText() ? std::string(value.text()) : "(no text)";
  }
  /// The keys and texts of the list that is shown under a name.
  [[nodiscard]] std::vector<std::pair<std::string, std::string>> pilots(
      std::string_view name) const {
    std::vector<std::pair<std::string, std::string>> entries;
    for (const auto& [key, value] : display()[name].dictionary()) {
      entries.emplace_back(key.text(), value.text());
    }
    return entries;
  }

  /// The names under which something is shown.
  [[nodiscard]] std::vector<std::string> shownNames() const {
    std::vector<std::string> names;
    for (const auto& [key, value] : display()) {
      if (value != Value("")) names.emplace_back(key.text());
    }
    return names;
  }

  /// The lines since the last call, without the template's.
  std::vector<Line> takeLines() {
    std::vector<Line> lines = platform.systemLog().take();
    std::erase(lines, Line{LogPriority::Warning, "Processing the template"});
    return lines;
  }

  /// "key=text <offset of each source>" of every value of a message.
  [[nodiscard]] std::vector<std::string> explained(const PacketBytes& packet) const {
    std::vector<std::string> lines;
    generator->explainMessage(packet.bytes(), [&](const ExplainedValue& value) {
      std::string line(value.list);
      if (value.row) line += "[" + std::to_string(*value.row) + "]";
      line += (line.empty() ? "" : " ") + std::string(value.key) + "=";
      line += value.text.isText() ? std::string(value.text.text()) : "";
      for (const ExplainedSource& source : value.sources) {
        line += " " + std::to_string(source.offset);
      }
      lines.push_back(std::move(line));
    });
    return lines;
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::unique_ptr<C2KLogGenerator> generator =
      C2KLogGenerator::generator(generatorServices(platform));
  Dictionary state;
};

}  // namespace kestro::testing
