// SPDX-License-Identifier: MIT
// A virtual platform for runs so long that nothing may be kept.
#pragma once

#include <string_view>

#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {

/// The virtual platform with a console that forgets its lines.
class QuietPlatform : public VirtualPlatform {
 public:
  using VirtualPlatform::VirtualPlatform;

  [[nodiscard]] RecordingTextSink& consoleLog() override { return _console; }

 private:
  class ForgetfulTextSink : public RecordingTextSink {
   public:
    void writeLine(std::string_view) override {}
  };
  ForgetfulTextSink _console;
};

}  // namespace kestro
