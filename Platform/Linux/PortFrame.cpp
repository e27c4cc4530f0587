// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortFrame.h"

#include <fmt/format.h>

#include <algorithm>

#include "Platform/MessagePort.h"

namespace kestro {
namespace {

using Header = PortFrameHeader;

bool travels(std::uint8_t kind, PortDirection direction) {
  const bool toReceiver = direction == PortDirection::ToReceiver;
  switch (static_cast<PortFrameKind>(kind)) {
    case PortFrameKind::Message:
    case PortFrameKind::Request:
      return toReceiver;
    case PortFrameKind::Reply:
    case PortFrameKind::ReplyWithoutData:
      return !toReceiver;
  }
  return false;
}

}  // namespace

PortFrameHeaderBytes encodePortFrameHeader(const PortFrameHeader& header) noexcept {
  PortFrameHeaderBytes bytes{};
  bytes[Header::kKindOffset] = static_cast<std::uint8_t>(header.kind);
  storeLittleEndian(bytes, Header::kMessageIdOffset, static_cast<std::uint32_t>(header.messageId));
  storeLittleEndian(bytes, Header::kSequenceOffset, header.sequence);
  storeLittleEndian(bytes, Header::kLengthOffset, header.length);
  return bytes;
}

Result<PortFrameHeader> decodePortFrameHeader(ByteView bytes, PortDirection direction) {
  const std::uint8_t kind = bytes[Header::kKindOffset];
  if (!travels(kind, direction)) {
    return failure(fmt::format("a frame of kind {}, which does not travel here", kind));
  }
  const ByteView reserved = bytes.subspan(Header::kReservedOffset, Header::kReservedWidth);
  if (!std::ranges::all_of(reserved, [](std::uint8_t byte) { return byte == 0; })) {
    return failure("a frame whose reserved bytes are not 0");
  }
  const Header header{.kind = static_cast<PortFrameKind>(kind),
                      .messageId = static_cast<std::int32_t>(
                          loadLittleEndian<std::uint32_t>(bytes, Header::kMessageIdOffset)),
                      .sequence = loadLittleEndian<std::uint32_t>(bytes, Header::kSequenceOffset),
                      .length = loadLittleEndian<std::uint32_t>(bytes, Header::kLengthOffset)};
  if ((header.kind == PortFrameKind::Message) != (header.sequence == 0)) {
    return failure(fmt::format("a frame of kind {} with sequence {}", kind, header.sequence));
  }
  if (header.length > kMaximumMessageSize) {
    return failure(fmt::format("a frame of {} bytes, at most {} are allowed", header.length,
                               kMaximumMessageSize));
  }
  if (header.kind == PortFrameKind::ReplyWithoutData && header.length != 0) {
    return failure(fmt::format("a reply without data that has {} bytes", header.length));
  }
  return header;
}

}  // namespace kestro
