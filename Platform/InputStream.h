// SPDX-License-Identifier: MIT
// Bytes that arrive by themselves: a file, a pipe or standard input, read without blocking.
#pragma once

#include <functional>
#include <memory>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// An open stream. Destroying it closes it; its handlers do not run after that.
class InputStream {
 public:
  InputStream() = default;
  virtual ~InputStream() = default;
  InputStream(const InputStream&) = delete;
  InputStream& operator=(const InputStream&) = delete;
};

class InputStreams {
 public:
  InputStreams() = default;
  virtual ~InputStreams() = default;
  InputStreams(const InputStreams&) = delete;
  InputStreams& operator=(const InputStreams&) = delete;

  /// Opens `path` ("-" is standard input) for reading. `received` runs on the main thread for each
  /// piece of bytes as it arrives (valid during the call); `ended` runs once, with an empty text at
  /// the end of the stream or with the reason why it can be read no further.
  [[nodiscard]] virtual Result<std::unique_ptr<InputStream>> open(
      std::string_view path, std::function<void(ByteView)> received,
      std::function<void(std::string_view reason)> ended) = 0;
};

}  // namespace kestro
