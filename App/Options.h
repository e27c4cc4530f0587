// SPDX-License-Identifier: MIT
// What the window's program is told on its command line.
#pragma once

#include <QSize>
#include <optional>
#include <string>

#include "App/Toolkit/SystemColours.h"
#include "Options/CommandRow.h"
#include "Options/ProgramOptions.h"

namespace kestro {

struct Options {
  LiveOptions live;
  std::string size;  ///< as in "390x780"; empty: the screen's
  bool plain = false;
  std::string style;       ///< "light" or "dark"; empty: the desktop's
  std::string screenshot;  ///< the file of a picture to take before ending; empty: none
  double after = 5;        ///< seconds until then

  [[nodiscard]] std::optional<QSize> windowSize() const;
  [[nodiscard]] ColourStyle colourStyle() const;

  /// The program's rows, which fill `options` when they are parsed; both must live until then.
  [[nodiscard]] static CommandRow program(const Bundle& bundle, Options& options);

  /// Reads the arguments; the version is the bundle's. An exit status instead, when help or the
  /// version was asked for (0) or they are wrong (2); what there is to say about it has been said.
  [[nodiscard]] static std::optional<int> parse(const Bundle& bundle, int argumentCount,
                                                char** arguments, Options& options);
};

}  // namespace kestro
