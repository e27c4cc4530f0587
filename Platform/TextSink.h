// SPDX-License-Identifier: MIT
// A place for whole lines of text: the console log, or the decoders' standard output.
#pragma once

#include <string_view>

namespace kestro {

class TextSink {
 public:
  TextSink() = default;
  virtual ~TextSink() = default;
  TextSink(const TextSink&) = delete;
  TextSink& operator=(const TextSink&) = delete;

  /// Writes one line; the sink adds the newline.
  virtual void writeLine(std::string_view line) = 0;
};

}  // namespace kestro
