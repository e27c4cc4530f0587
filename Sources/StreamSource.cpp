// SPDX-License-Identifier: MIT
#include "Sources/StreamSource.h"

#include <fmt/format.h>

#include <utility>

namespace kestro {
namespace {

constexpr std::string_view kStandardInput = "-";

}  // namespace

tl::unexpected<Error> streamFailure(const std::string& path, std::string_view what) {
  return failure(fmt::format("{}: {}", path == kStandardInput ? "standard input" : path, what));
}

tl::unexpected<Error> cannotBeReadTwice() { return failure("standard input cannot be read twice"); }

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
  if (_framing.hasMessage()) {
    _message = _framing.take();
    return SourceEvent{.time = std::nullopt, .technology = _technology, .message = _message};
  }
  if (_framing.error()) return streamFailure(_path, *_framing.error());
  if (!_reason.empty()) return streamFailure(_path, _reason);
  if (_ended) return SourceEnded{};
  return SourceWaits{};
}

Result<void> StreamSource::restart() {
  if (_path == kStandardInput) return cannotBeReadTwice();
  _stream.reset();
  _framing = {};
  _ended = false;
  _reason.clear();
  return openStream();
}

void StreamSource::receive(ByteView bytes) {
  if (!isStopped()) _framing.receive(bytes);
  if (_ready) _ready();
}

void StreamSource::end(std::string_view reason) {
  if (isStopped()) return;
  if (reason.empty()) _framing.end();
  _reason = reason;
  _ended = true;
  if (_ready) _ready();
}

}  // namespace kestro
