// SPDX-License-Identifier: MIT
// What the window's program is told on its command line.
#pragma once

#include <QSize>
#include <chrono>
#include <optional>
#include <string>

#include "Options/ProgramOptions.h"

namespace kestro {

struct Options {
  LiveOptions live;
  std::optional<QSize> windowSize;
  bool plain = false;
  std::string screenshot;  ///< the file of a picture to take before ending; empty: none
  double after = 0;        ///< seconds until then

  /// Reads the arguments; the version is the bundle's. An exit status instead, when help or the
  /// version was asked for (0) or they are wrong (2); what there is to say about it has been said.
  [[nodiscard]] static std::optional<int> parse(const Bundle& bundle, int argumentCount,
                                                char** arguments, Options& options);
};

}  // namespace kestro
