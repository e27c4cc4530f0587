// SPDX-License-Identifier: MIT
// Pcapng files as bytes written by hand, in both byte orders.
#pragma once

#include <cstdint>
#include <string_view>

#include "Platform/Bytes.h"

namespace kestro {

enum class ByteOrder : std::uint8_t { Little, Big };

/// Bytes that grow by numbers of the order that they were made with.
class PcapngText {
 public:
  explicit PcapngText(ByteOrder order = ByteOrder::Little) : _order(order) {}

  PcapngText& number(std::uint64_t value, unsigned width) {
    for (unsigned i = 0; i < width; ++i) {
      const unsigned place = _order == ByteOrder::Little ? i : width - 1 - i;
      _bytes.push_back(static_cast<std::uint8_t>(value >> (8 * place)));
    }
    return *this;
  }
  PcapngText& u16(std::uint64_t value) { return number(value, 2); }
  PcapngText& u32(std::uint64_t value) { return number(value, 4); }
  PcapngText& bytes(ByteView more) {
    _bytes.insert(_bytes.end(), more.begin(), more.end());
    return *this;
  }
  /// With the zeros up to the next multiple of four.
  PcapngText& padded(std::string_view text) {
    _bytes.insert(_bytes.end(), text.begin(), text.end());
    while (_bytes.size() % 4 != 0) _bytes.push_back(0);
    return *this;
  }
  PcapngText& option(unsigned code, std::string_view value) {
    return u16(code).u16(value.size()).padded(value);
  }
  PcapngText& end() { return u32(0); }

  /// A block of this order.
  PcapngText& block(std::uint32_t type, const PcapngText& body) {
    const std::size_t length = 12 + body._bytes.size();
    return u32(type).u32(length).bytes(body._bytes).u32(length);
  }
  PcapngText& section(const PcapngText& options) {
    PcapngText body(_order);
    body.u32(0x1A2B3C4D).u16(1).u16(0).number(~std::uint64_t{0}, 8).bytes(options._bytes);
    return block(0x0A0D0D0A, body);
  }
  PcapngText& section() { return section(PcapngText(_order)); }
  PcapngText& interface(unsigned linkType, const PcapngText& options, std::uint32_t longest = 0) {
    PcapngText body(_order);
    body.u16(linkType).u16(0).u32(longest).bytes(options._bytes);
    return block(1, body);
  }
  PcapngText& interface(unsigned linkType) { return interface(linkType, PcapngText(_order)); }
  PcapngText& packet(std::uint32_t interface, std::uint64_t time, std::string_view data,
                     const PcapngText& options) {
    PcapngText body(_order);
    body.u32(interface).u32(time >> 32).u32(time & 0xFFFFFFFF).u32(data.size()).u32(data.size());
    body.padded(data).bytes(options._bytes);
    return block(6, body);
  }
  PcapngText& packet(std::uint32_t interface, std::uint64_t time, std::string_view data) {
    return packet(interface, time, data, PcapngText(_order));
  }

  [[nodiscard]] const Bytes& get() const noexcept { return _bytes; }

 private:
  ByteOrder _order;
  Bytes _bytes;
};

/// As a recorder makes it: one interface "LTE" of this link type, one packet "abc" at
/// 2012-03-04 12:05:09.000250 UTC (1,330,862,709,000,250 µs) with the note "hi".
inline Bytes smallestPcapng(std::uint8_t linkType = 150) {
  return {// section header: 28 bytes, byte order, version 1.0, length unknown
          0x0A, 0x0D, 0x0D, 0x0A, 28, 0, 0, 0, 0x4D, 0x3C, 0x2B, 0x1A, 1, 0, 0, 0, 0xFF, 0xFF, 0xFF,
          0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 28, 0, 0, 0,
          // interface: 40 bytes, link type, packets of up to 262,144 bytes
          1, 0, 0, 0, 40, 0, 0, 0, linkType, 0, 0, 0, 0, 0, 4, 0,
          // if_name "LTE", if_tsresol 6, end
          2, 0, 3, 0, 'L', 'T', 'E', 0, 9, 0, 1, 0, 6, 0, 0, 0, 0, 0, 0, 0, 40, 0, 0, 0,
          // packet: 48 bytes, interface 0, time 0x0004BA699F03C83A, 3 bytes of 3
          6, 0, 0, 0, 48, 0, 0, 0, 0, 0, 0, 0, 0x69, 0xBA, 0x04, 0, 0x3A, 0xC8, 0x03, 0x9F, 3, 0, 0,
          0, 3, 0, 0, 0, 'a', 'b', 'c', 0,
          // comment "hi", end
          1, 0, 2, 0, 'h', 'i', 0, 0, 0, 0, 0, 0, 48, 0, 0, 0};
}

}  // namespace kestro
