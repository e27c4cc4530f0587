// SPDX-License-Identifier: MIT
#include "Sources/StoredStream.h"

#include <utility>

#include "Sources/StreamSource.h"

namespace kestro {

Result<std::unique_ptr<StoredStream>> StoredStream::open(const std::string& path,
                                                         std::string_view technology) {
  auto file = RecordedFile::open(path);
  if (!file) return tl::unexpected(file.error());
  return std::unique_ptr<StoredStream>(new StoredStream(*std::move(file), technology));
}

Result<SourceStep> StoredStream::next() {
  while (!_framing.hasMessage()) {
    if (_framing.error()) return streamFailure(_file.path(), *_framing.error());
    const auto more = readMore();
    if (!more) return tl::unexpected(more.error());
    if (!*more && !_framing.error()) return SourceEnded{};
  }
  _message = _framing.take();
  return SourceEvent{.time = std::nullopt, .technology = _technology, .message = _message};
}

Result<bool> StoredStream::readMore() {
  const auto bytes = _file.ahead(1);
  if (!bytes) return tl::unexpected(bytes.error());
  if (bytes->empty()) {
    _framing.end();
    return false;
  }
  _framing.receive(*bytes);
  _file.take(bytes->size());
  return true;
}

Result<void> StoredStream::restart() {
  if (_file.path() == RecordedFile::kStandardInput) return cannotBeReadTwice();
  auto file = RecordedFile::open(_file.path());
  if (!file) return tl::unexpected(file.error());
  _file = *std::move(file);
  _framing = {};
  return {};
}

}  // namespace kestro
