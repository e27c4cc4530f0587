// SPDX-License-Identifier: MIT
// What the live display shows in a terminal window.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "CommandLine/Formats/StyledLine.h"
#include "Model/KestroModelNode.h"

namespace kestro {

struct TerminalSize {
  std::size_t columns = 80;
  std::size_t rows = 24;
};

struct TerminalViewContents {
  /// The left end of the title line: where the display comes from, as much of it as fits.
  std::string technology{};
  std::string source{};
  std::string place{};   ///< whose it is: a server's name, or that it is a demo
  std::string status{};  ///< its right end, which has precedence in a narrow window
  std::string notice{};  ///< a line below it; empty: none
  const KestroModelNode* tree = nullptr;      ///< null while there is none
  const KestroModelNode* previous = nullptr;  ///< the tree of the refresh before, or null
  /// Values that are not renewed are drawn faint, so that nobody takes them for live.
  bool isRenewed = true;
};

/// The screen from top to bottom: at most `size.rows` lines, none wider than `size.columns`. The
/// title line comes first, then the notice, the tree below them; where one column is too short for
/// the tree and the window wide enough, in several columns. What has no room is cut and counted in
/// the last line: "… 12 more lines". The result depends on nothing but the arguments.
[[nodiscard]] std::vector<StyledLine> terminalView(const TerminalViewContents& contents,
                                                   TerminalSize size);

}  // namespace kestro
