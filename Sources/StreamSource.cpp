// SPDX-License-Identifier: MIT
#include "Sources/StreamSource.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Platform/MessagePort.h"

namespace kestro {
namespace {

constexpr std::size_t kLengthSize = 4;
constexpr std::string_view kStandardInput = "-";

}  // namespace

Result<std::unique_ptr<StreamSource>> StreamSource::open(InputStreams& streams, std::string path,
                                                         std::string_view technology) {
  std::unique_ptr<StreamSource> source(new StreamSource(streams, std::move(path), technology));
  if (auto opened = source->openStream(); !opened) return tl::unexpected(opened.error());
  return source;
}

StreamSource::StreamSource(InputStreams& streams, std::string path, std::string_view technology)
    : _streams(streams), _path(std::move(path)), _technology(technology) {}

Result<void> StreamSource::openStream() {
  auto stream = _streams.open(
      _path, [this](ByteView bytes) { receive(bytes); },
      [this](std::string_view reason) { end(reason); });
  if (!stream) return tl::unexpected(stream.error());
  _stream = std::move(*stream);
  return {};
}

Result<SourceStep> StreamSource::next() {
  if (!_messages.empty()) {
    _message = std::move(_messages.front());
    _messages.pop_front();
    return SourceEvent{.time = std::nullopt, .technology = _technology, .message = _message};
  }
  if (_error) return tl::unexpected(*_error);
  if (_ended) return SourceEnded{};
  return SourceWaits{};
}

Result<void> StreamSource::restart() {
  if (_path == kStandardInput) return failure("standard input cannot be read twice");
  _stream.reset();
  _messages.clear();
  _lengthBytes.clear();
  _length.reset();
  _arriving.clear();
  _frameOffset = 0;
  _ended = false;
  _error.reset();
  return openStream();
}

void StreamSource::receive(ByteView bytes) {
  while (!bytes.empty() && !isStopped()) {
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
  if (_ready) _ready();
}

void StreamSource::takeLengthByte(std::uint8_t byte) {
  _lengthBytes.push_back(byte);
  if (_lengthBytes.size() < kLengthSize) return;
  const auto length = loadLittleEndian<std::uint32_t>(_lengthBytes, 0);
  _lengthBytes.clear();
  if (length > kMaximumMessageSize) {
    fail(fmt::format("the message at byte {} would have {} bytes, more than the {} of any message",
                     _frameOffset, length, kMaximumMessageSize));
  } else if (length == 0) {
    _frameOffset += kLengthSize;
  } else {
    _length = length;
  }
}

void StreamSource::end(std::string_view reason) {
  if (isStopped()) return;
  const auto arrived = _length ? kLengthSize + _arriving.size() : _lengthBytes.size();
  if (!reason.empty()) {
    fail(std::string(reason));
  } else if (arrived > 0) {
    fail(
        fmt::format("the stream ends {} bytes into the message at byte {}", arrived, _frameOffset));
  }
  _ended = true;
  if (_ready) _ready();
}

void StreamSource::fail(std::string message) {
  _error = Error{fmt::format("{}: {}", _path == kStandardInput ? "standard input" : _path,
                             std::move(message))};
}

}  // namespace kestro
