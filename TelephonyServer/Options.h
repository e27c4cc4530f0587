// SPDX-License-Identifier: MIT
// The command line of kestro-telephonyd.
#pragma once

#include <optional>
#include <string>
#include <variant>

#include "Platform/Bundle.h"
#include "Platform/SystemLog.h"
#include "Sources/SourceCatalogue.h"
#include "TelephonyServer/Playback.h"

namespace kestro {

struct ServerOptions {
  SourceRequest source;
  PlaybackOptions playback;
  std::string portName = "TelephonyServer";
  LogPriority logThreshold = LogPriority::Notice;
  /// Whether the server ends with the process that started it.
  bool exitsWithParent = false;
  /// The process that started it, where it was said: should another one be the parent by now, that
  /// process has ended already.
  std::optional<int> parent;
};

/// What the program has to say instead of running: a help text, its version, or what is wrong with
/// its command line.
struct OptionsText {
  std::string text;
  /// 0 for help or the version that was asked for, 2 for wrong usage.
  int exitStatus = 0;
};

/// Reads the command line; the version is the bundle's. Prints nothing.
[[nodiscard]] std::variant<ServerOptions, OptionsText> parseServerOptions(
    const Bundle& bundle, int argumentCount, const char* const* arguments);

}  // namespace kestro
