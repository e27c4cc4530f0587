// SPDX-License-Identifier: MIT
// The terminal while it shows the live display.
#pragma once

#include <vector>

#include "CommandLine/Formats/StyledLine.h"
#include "CommandLine/Terminal/TerminalView.h"

namespace kestro {

/// Takes the terminal that standard output is, and gives it back as it was: the display stands on
/// the alternate screen, the cursor is hidden, keys are not echoed, and what is typed meanwhile is
/// forgotten. Where standard error is the terminal too, lines written to it would tear the display;
/// they are dropped until the end. At most one exists at a time.
class FullScreen {
 public:
  /// Whether standard output is a terminal that can show a display.
  [[nodiscard]] static bool isPossible();

  FullScreen();
  ~FullScreen();
  FullScreen(const FullScreen&) = delete;
  FullScreen& operator=(const FullScreen&) = delete;

  /// The window's size as it is now; 80 by 24 when the terminal does not tell.
  [[nodiscard]] TerminalSize size() const;

  /// Replaces the screen's contents; the lines must fit into `size`.
  void draw(const std::vector<StyledLine>& lines);

  /// Gives the terminal back at once, if a FullScreen has it. For those who end the process without
  /// destroying that object. Safe in a signal handler.
  static void restore() noexcept;

 private:
  bool _colour;
};

}  // namespace kestro
