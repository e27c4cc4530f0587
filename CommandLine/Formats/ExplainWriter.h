// SPDX-License-Identifier: MIT
// What `explain` writes of every packet, one class a format.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

#include "CommandLine/Output.h"
#include "LogGenerator/Packets/Explain.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// What is known of a packet before its values are read.
struct PacketHead {
  std::uint64_t message = 0;  ///< the number of its message
  Moment time;
  std::string_view technology{};
  ByteView packet;                ///< its bytes, valid until the next packet
  std::size_t prefixLength = 0;   ///< bytes in front of it that are no part of it
  std::optional<LogCode> code{};  ///< none for what is too short to have one
  std::string_view name{};        ///< what the packet is; empty when nobody knows
};

/// What is written of every packet.
struct ExplainStyle {
  bool hasTechnology = false;  ///< its technology, too
  bool isList = false;         ///< what it is, and no values: none are given
};

/// Called in the order in which the operations stand here; everything for one packet is called
/// before the next one begins.
class ExplainWriter {
 public:
  ExplainWriter() = default;
  virtual ~ExplainWriter() = default;
  ExplainWriter(const ExplainWriter&) = delete;
  ExplainWriter& operator=(const ExplainWriter&) = delete;

  /// `technology` is that of the first packet.
  virtual void begin(std::string_view technology) = 0;
  virtual void beginPacket(const PacketHead& head) = 0;
  virtual void value(const ExplainedValue& value) = 0;
  /// `remark` says why a packet has no values; else it is empty.
  virtual void endPacket(std::string_view remark) = 0;
  virtual void finish() = 0;
};

/// A format's name on the command line, what the help says of it, and its writer.
struct ExplainFormat {
  std::string_view name;
  std::string_view help;  ///< one line or several
  std::unique_ptr<ExplainWriter> (*makeWriter)(Output& output, const ExplainStyle& style);
};

/// All formats, the default first.
[[nodiscard]] const std::vector<ExplainFormat>& explainFormats();

}  // namespace kestro
