// SPDX-License-Identifier: MIT
#include "Recordings/PcapngComposer.h"

#include <algorithm>
#include <chrono>

#include "Recordings/PcapFormat.h"
#include "Recordings/PcapngFormat.h"

namespace kestro {
namespace {

constexpr std::size_t kLongestOption = 65'535;
constexpr std::uint8_t kMicroseconds = 6;
constexpr std::uint64_t kUnknownLength = ~std::uint64_t{0};

void appendBytes(Bytes& target, ByteView bytes) {
  target.insert(target.end(), bytes.begin(), bytes.end());
  target.resize(target.size() + pcapngPadded(bytes.size()) - bytes.size());
}

void appendOption(Bytes& blocks, PcapngOption code, ByteView value) {
  appendLittleEndian(blocks, static_cast<std::uint16_t>(code));
  appendLittleEndian(blocks, static_cast<std::uint16_t>(value.size()));
  appendBytes(blocks, value);
}

/// The size of the longest beginning that an option can hold and that ends no character's middle.
std::size_t pieceSize(std::string_view text) noexcept {
  if (text.size() <= kLongestOption) return text.size();
  constexpr std::size_t kLongestCharacter = 4;
  const auto continues = [](char byte) { return (static_cast<unsigned char>(byte) >> 6) == 0b10; };
  std::size_t size = kLongestOption;
  while (size > kLongestOption - kLongestCharacter && continues(text[size])) --size;
  return size;
}

void appendText(Bytes& blocks, PcapngOption code, std::string_view text) {
  do {
    const std::size_t size = pieceSize(text);
    appendOption(blocks, code, {reinterpret_cast<const std::uint8_t*>(text.data()), size});
    text.remove_prefix(size);
  } while (!text.empty());
}

void appendComments(Bytes& blocks, std::span<const std::string> comments) {
  for (const std::string& comment : comments) appendText(blocks, PcapngOption::Comment, comment);
  if (!comments.empty()) appendOption(blocks, PcapngOption::End, {});
}

/// The block's type, what `body` appends, and the lengths before and behind that.
template <class Body>
void appendBlock(Bytes& blocks, PcapngBlockType type, const Body& body) {
  const std::size_t begin = blocks.size();
  appendLittleEndian(blocks, static_cast<std::uint32_t>(type));
  const std::size_t lengthAt = blocks.size();
  appendLittleEndian(blocks, std::uint32_t{0});
  body();
  const auto length = static_cast<std::uint32_t>(blocks.size() + kPcapngBlockTail - begin);
  appendLittleEndian(blocks, length);
  storeLittleEndian(blocks, lengthAt, length);
}

}  // namespace

void appendPcapngSection(Bytes& blocks, std::span<const std::string> comments) {
  appendBlock(blocks, PcapngBlockType::SectionHeader, [&] {
    appendLittleEndian(blocks, kPcapngByteOrder);
    appendLittleEndian(blocks, kPcapngMajorVersion);
    appendLittleEndian(blocks, std::uint16_t{0});  // version, minor
    appendLittleEndian(blocks, kUnknownLength);
    appendComments(blocks, comments);
  });
}

void appendPcapngInterface(Bytes& blocks, std::uint16_t linkType, std::string_view name) {
  appendBlock(blocks, PcapngBlockType::Interface, [&] {
    appendLittleEndian(blocks, linkType);
    appendLittleEndian(blocks, std::uint16_t{0});  // not used
    appendLittleEndian(blocks, static_cast<std::uint32_t>(kMaximumPcapMessageSize));
    appendText(blocks, PcapngOption::InterfaceName, name);
    appendOption(blocks, PcapngOption::InterfaceTimeResolution, {&kMicroseconds, 1});
    appendOption(blocks, PcapngOption::End, {});
  });
}

void appendPcapngPacket(Bytes& blocks, std::uint32_t interface, const RecordedMessage& message) {
  const Moment time = std::clamp(message.time, Moment(), kLastPcapngTime);
  const auto microseconds = static_cast<std::uint64_t>(time.time_since_epoch().count());
  appendBlock(blocks, PcapngBlockType::EnhancedPacket, [&] {
    appendLittleEndian(blocks, interface);
    appendLittleEndian(blocks, static_cast<std::uint32_t>(microseconds >> 32));
    appendLittleEndian(blocks, static_cast<std::uint32_t>(microseconds));
    appendLittleEndian(blocks, static_cast<std::uint32_t>(message.bytes.size()));
    appendLittleEndian(
        blocks, static_cast<std::uint32_t>(std::max(message.originalLength, message.bytes.size())));
    appendBytes(blocks, message.bytes);
    appendComments(blocks, message.comments);
  });
}

}  // namespace kestro
