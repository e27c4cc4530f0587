// SPDX-License-Identifier: MIT
// What the window's program is told on its command line.
#pragma once

#include <QSize>
#include <chrono>
#include <optional>
#include <string>

namespace kestro {

struct Options {
  std::string serverName;
  std::string demoSource;  ///< empty: no demo
  std::optional<QSize> windowSize;
  bool plain = false;
  int logPriority = 0;     ///< the number of a LogPriority
  std::string screenshot;  ///< the file of a picture to take before ending; empty: none
  double after = 0;        ///< seconds until then

  /// Reads the arguments. An exit status instead, when help was asked for (0) or they are wrong
  /// (2); what there is to say about it has been said.
  [[nodiscard]] static std::optional<int> parse(int argumentCount, char** arguments,
                                                Options& options);
};

}  // namespace kestro
