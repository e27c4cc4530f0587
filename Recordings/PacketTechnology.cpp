// SPDX-License-Identifier: MIT
#include "Recordings/PacketTechnology.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>

#include "Recordings/DlfFormat.h"

namespace kestro {

void PacketTechnology::add(ByteView packet) {
  _hasPackets = true;
  if (packet.front() == kDlfExtraType) return;
  const auto code = loadLittleEndian<std::uint16_t>(packet, 1 + kDlfCodeOffset);
  if (_seen.test(code)) return;
  _seen.set(code);
  std::vector<std::string_view> technologies;
  if (_context.technologiesOfCode) technologies = _context.technologiesOfCode(code);
  if (!_left) {
    _left = std::move(technologies);
    return;
  }
  std::erase_if(*_left, [&](std::string_view technology) {
    return std::ranges::find(technologies, technology) == technologies.end();
  });
}

Result<std::string_view> PacketTechnology::decided(const std::string& path) const {
  if (!_context.technology.empty()) return _context.technology;
  if (!_hasPackets) return std::string_view();
  if (_left && _left->size() == 1) return _left->front();
  constexpr std::string_view kAsk = "--technology must say which it is";
  if (!_left) return failure(fmt::format("{}: no packet tells its technology; {}", path, kAsk));
  if (_left->empty()) {
    return failure(fmt::format("{}: no technology has the codes of all packets; {}", path, kAsk));
  }
  return failure(fmt::format("{}: {} have the codes of all packets; {}", path,
                             fmt::join(*_left, " and "), kAsk));
}

}  // namespace kestro
