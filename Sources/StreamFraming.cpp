// SPDX-License-Identifier: MIT
#include "Sources/StreamFraming.h"

#include <fmt/format.h>

#include <algorithm>

#include "Platform/MessagePort.h"

namespace kestro {
namespace {

constexpr std::size_t kLengthSize = 4;

}  // namespace

void StreamFraming::receive(ByteView bytes) {
  while (!bytes.empty() && !_error) {
    if (!_length) {
      takeLengthByte(bytes.front());
      bytes = bytes.subspan(1);
      continue;
    }
    const auto count = std::min(bytes.size(), *_length - _arriving.size());
    _arriving.insert(_arriving.end(), bytes.begin(),
                     bytes.begin() + static_cast<std::ptrdiff_t>(count));
    bytes = bytes.subspan(count);
    if (_arriving.size() < *_length) continue;
    _frameOffset += kLengthSize + *_length;
    _messages.push_back(std::exchange(_arriving, {}));
    _length.reset();
  }
}

void StreamFraming::takeLengthByte(std::uint8_t byte) {
  _lengthBytes.push_back(byte);
  if (_lengthBytes.size() < kLengthSize) return;
  const auto length = loadLittleEndian<std::uint32_t>(_lengthBytes, 0);
  _lengthBytes.clear();
  if (length > kMaximumMessageSize) {
    _error =
        fmt::format("the message at byte {} would have {} bytes, more than the {} of any message",
                    _frameOffset, length, kMaximumMessageSize);
  } else if (length == 0) {
    _frameOffset += kLengthSize;
  } else {
    _length = length;
  }
}

void StreamFraming::end() {
  const auto arrived = _length ? kLengthSize + _arriving.size() : _lengthBytes.size();
  if (_error || arrived == 0) return;
  _error =
      fmt::format("the stream ends {} bytes into the message at byte {}", arrived, _frameOffset);
}

Bytes StreamFraming::take() {
  Bytes message = std::move(_messages.front());
  _messages.pop_front();
  return message;
}

}  // namespace kestro
