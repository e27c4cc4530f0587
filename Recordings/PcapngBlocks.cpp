// SPDX-License-Identifier: MIT
#include "Recordings/PcapngBlocks.h"

#include <fmt/format.h>

#include <utility>

namespace kestro {
namespace {

constexpr std::size_t kShortestBlock = kPcapngBlockHead + kPcapngBlockTail;

bool isRead(PcapngBlockType type) noexcept {
  switch (type) {
    case PcapngBlockType::SectionHeader:
    case PcapngBlockType::Interface:
    case PcapngBlockType::Packet:
    case PcapngBlockType::SimplePacket:
    case PcapngBlockType::EnhancedPacket:
      return true;
  }
  return false;
}

}  // namespace

struct PcapngBlocks::Head {
  PcapngBlockType type;
  std::uint32_t length;  ///< of the whole block
};

Result<std::optional<PcapngBlock>> PcapngBlocks::next() {
  while (true) {
    const auto head = nextHead();
    if (!head) return tl::unexpected(head.error());
    if (!*head) return std::nullopt;
    if (isRead((*head)->type)) return read(**head);
    if (auto passed = passOver(**head); !passed) return tl::unexpected(passed.error());
  }
}

Result<std::optional<PcapngBlocks::Head>> PcapngBlocks::nextHead() {
  _offset = _file.position();
  const auto ahead = _file.ahead(kShortestBlock);
  if (!ahead) return tl::unexpected(ahead.error());
  if (ahead->empty()) return std::nullopt;
  if (ahead->size() < kShortestBlock) return cut(kShortestBlock, ahead->size());
  // A section header's type reads the same in both byte orders; what follows its length tells them.
  const auto type = PcapngBlockType{PcapngBytes(*ahead, _isBigEndian).u32(0)};
  if (_offset == 0 && type != PcapngBlockType::SectionHeader) return damaged("no section header");
  if (type == PcapngBlockType::SectionHeader) {
    _isBigEndian = loadBigEndian<std::uint32_t>(*ahead, kPcapngBlockHead) == kPcapngByteOrder;
    if (PcapngBytes(*ahead, _isBigEndian).u32(kPcapngBlockHead) != kPcapngByteOrder) {
      return damaged("a section header of no known byte order");
    }
  }
  const std::uint32_t length = PcapngBytes(*ahead, _isBigEndian).u32(4);
  if (length < kShortestBlock || length % kPcapngAlignment != 0) {
    return damaged(fmt::format("a block of {} bytes, which is no length of one", length));
  }
  return Head{.type = type, .length = length};
}

Result<PcapngBlock> PcapngBlocks::read(const Head& head) {
  if (head.length > kLongestPcapngBlock) {
    return damaged(
        fmt::format("a block of {} bytes; the longest is {}", head.length, kLongestPcapngBlock));
  }
  const auto ahead = _file.ahead(head.length);
  if (!ahead) return tl::unexpected(ahead.error());
  if (ahead->size() < head.length) return cut(head.length, ahead->size());
  const ByteView body = ahead->subspan(kPcapngBlockHead, head.length - kShortestBlock);
  const ByteView tail = ahead->subspan(head.length - kPcapngBlockTail, kPcapngBlockTail);
  if (auto checked = checkTail(head, tail); !checked) return tl::unexpected(checked.error());
  _file.take(head.length);
  return PcapngBlock{.type = head.type, .body = {body, _isBigEndian}};
}

Result<void> PcapngBlocks::passOver(const Head& head) {
  const auto passed = _file.passOver(head.length - kPcapngBlockTail);
  if (!passed) return tl::unexpected(passed.error());
  const auto tail = _file.ahead(kPcapngBlockTail);
  if (!tail) return tl::unexpected(tail.error());
  if (tail->size() < kPcapngBlockTail) return cut(head.length, *passed + tail->size());
  if (auto checked = checkTail(head, *tail); !checked) return checked;
  _file.take(kPcapngBlockTail);
  return {};
}

Result<void> PcapngBlocks::checkTail(const Head& head, ByteView tail) const {
  const std::uint32_t length = PcapngBytes(tail, _isBigEndian).u32(0);
  if (length == head.length) return {};
  return damaged(fmt::format("a block of {} bytes that ends as one of {}", head.length, length));
}

tl::unexpected<Error> PcapngBlocks::cut(std::uint64_t length, std::uint64_t present) const {
  return damaged(
      fmt::format("truncated: a block of {} bytes, of which {} are there", length, present));
}

tl::unexpected<Error> PcapngBlocks::damaged(std::string_view reason) const {
  return failure(fmt::format("{}: offset {}: {}", _file.path(), _offset, reason));
}

}  // namespace kestro
