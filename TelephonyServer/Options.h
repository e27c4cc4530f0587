// SPDX-License-Identifier: MIT
// The command line of kestro-telephonyd.
#pragma once

#include <optional>
#include <string>
#include <variant>

#include "Options/ArgumentParser.h"
#include "Options/CommandRow.h"
#include "Platform/Bundle.h"
#include "Platform/SystemLog.h"
#include "Sources/SourceCatalogue.h"
#include "TelephonyServer/Playback.h"

namespace kestro {

struct ServerOptions {
  SourceRequest source;
  PlaybackOptions playback;
  /// Whether the modems are listed, and nothing else is done.
  bool listsModems = false;
  std::string portName = "TelephonyServer";
  LogPriority logThreshold = LogPriority::Notice;
  /// Whether the server ends with the process that started it.
  bool exitsWithParent = false;
  /// The process that started it, where it was said: should another one be the parent by now, that
  /// process has ended already.
  std::optional<int> parent;
  /// The temporary port directory that goes when that process is gone; empty: none.
  std::string demoDirectory;
};

/// What stands on the command line, before it is understood.
struct ServerArguments {
  ServerOptions options;
  std::string source;
  std::string technology;
  std::string gps;
  bool isPersonal = false;
  std::optional<int> parent;
};

/// The program's rows, which fill `arguments` when they are parsed; both must live until then.
[[nodiscard]] CommandRow serverProgram(const Bundle& bundle, ServerArguments& arguments);

/// Reads the command line; the version is the bundle's. Prints nothing.
[[nodiscard]] std::variant<ServerOptions, OptionsText> parseServerOptions(
    const Bundle& bundle, int argumentCount, const char* const* arguments);

}  // namespace kestro
