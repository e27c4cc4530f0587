// SPDX-License-Identifier: MIT
// Files, pipes and standard input, read by the event loop.
#pragma once

#include "Platform/InputStream.h"

namespace kestro {

/// Needs a QCoreApplication. One piece of at most 64 KiB is read in each turn of the event loop, so
/// that a long file never keeps it from its other work.
class FileInputStreams final : public InputStreams {
 public:
  [[nodiscard]] Result<std::unique_ptr<InputStream>> open(
      std::string_view path, std::function<void(ByteView)> received,
      std::function<void(std::string_view reason)> ended) override;
};

}  // namespace kestro
