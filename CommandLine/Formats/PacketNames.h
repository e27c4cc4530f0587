// SPDX-License-Identifier: MIT
// What a technology's packets are, and why nothing may be read from one.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>

#include "CommandLine/Formats/CodeList.h"
#include "LogGenerator/Packets/PacketView.h"

namespace kestro {

// Why nothing is read from a packet. {} is the log type, or the least length.
inline constexpr const char* kRemarkUnknownType = "dropped: 0x{:02x} is no log type";
inline constexpr const char* kRemarkUnknownCode = "no section takes this log code";
inline constexpr const char* kRemarkUnknownContents = "what this packet contains is not known";
inline constexpr const char* kRemarkTooShort =
    "too short: sections read this packet from {} bytes on";
inline constexpr const char* kRemarkNoValue = "no section reads a value from it";
[[nodiscard]] std::string remarkTooShortForAPacket();

/// The log codes of one generator. Its names live as long as the generator, which must outlive it.
class PacketNames {
 public:
  explicit PacketNames(const LogGenerator& generator);

  /// Whether the channel has no packets at all.
  [[nodiscard]] bool isEmpty() const noexcept { return _codes.empty(); }

  /// What packets of the code are; empty when nobody knows.
  [[nodiscard]] std::string_view nameOf(LogCode code) const;

  /// Why no section reads a value from this message.
  [[nodiscard]] std::string reasonForNothing(ByteView message) const;

 private:
  struct KnownCode {
    std::string_view name;
    std::size_t minimumLength;
  };

  std::unordered_map<LogCode, KnownCode> _codes;
};

}  // namespace kestro
