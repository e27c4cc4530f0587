// SPDX-License-Identifier: MIT
// Lines of text on one of the process's standard streams.
#pragma once

#include <cstdio>

#include "Platform/TextSink.h"

namespace kestro {

/// Every line is on its way to the system when `writeLine` returns. Failures are not reported: a
/// line that cannot be shown has nowhere to go.
class StdioTextSink final : public TextSink {
 public:
  /// `stream` stays open and its caller's as long as this lives.
  explicit StdioTextSink(std::FILE* stream) : _stream(stream) {}
  void writeLine(std::string_view line) override;

 private:
  std::FILE* _stream;
};

}  // namespace kestro
