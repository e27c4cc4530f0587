// SPDX-License-Identifier: MIT
// The frames on a message port's connection. Documentation/message-ports.md describes them.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// What a frame is: its first byte.
enum class PortFrameKind : std::uint8_t {
  Message = 1,
  Request = 2,
  Reply = 3,
  ReplyWithoutData = 4,
};

/// Which way frames travel: from who connected to who listens, or back.
enum class PortDirection { ToReceiver, ToSender };

struct PortFrameHeader {
  // Where the fields stand; all little-endian.
  static constexpr std::size_t kKindOffset = 0;
  static constexpr std::size_t kReservedOffset = 1;
  static constexpr std::size_t kReservedWidth = 3;
  static constexpr std::size_t kMessageIdOffset = 4;
  static constexpr std::size_t kSequenceOffset = 8;
  static constexpr std::size_t kLengthOffset = 12;
  static constexpr std::size_t kSize = 16;

  PortFrameKind kind = PortFrameKind::Message;
  std::int32_t messageId = 0;
  std::uint32_t sequence = 0;  ///< 0 for one-way messages, else not 0
  std::uint32_t length = 0;    ///< of the body that follows

  friend bool operator==(const PortFrameHeader&, const PortFrameHeader&) = default;
};

using PortFrameHeaderBytes = std::array<std::uint8_t, PortFrameHeader::kSize>;

[[nodiscard]] PortFrameHeaderBytes encodePortFrameHeader(const PortFrameHeader& header) noexcept;

/// Reads the header at the start of `bytes`, which must hold all of it. The error says how a frame
/// that travels in `direction` is malformed.
[[nodiscard]] Result<PortFrameHeader> decodePortFrameHeader(ByteView bytes,
                                                            PortDirection direction);

}  // namespace kestro
