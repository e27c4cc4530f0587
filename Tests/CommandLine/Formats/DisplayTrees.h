// SPDX-License-Identifier: MIT
// Display trees and screens as tests write them.
#pragma once

#include <string>
#include <vector>

#include "CommandLine/Formats/StyledLine.h"
#include "Model/KestroModelNode.h"

namespace kestro::testing {

inline NodePointer treeOf(const Value& display) {
  NodesByPath nodesByPath;
  return KestroModelNode::makeTreeFromObjectWithPathDictionary(display, nodesByPath);
}

/// The lines' texts, each with a newline.
inline std::string screenOf(const std::vector<StyledLine>& lines) {
  std::string result;
  for (const StyledLine& line : lines) result += line.plainText() + "\n";
  return result;
}

/// The texts of one style, in order.
inline std::vector<std::string> textsInStyle(const std::vector<StyledLine>& lines,
                                             TextStyle style) {
  std::vector<std::string> result;
  for (const StyledLine& line : lines) {
    for (const StyledLine::Piece& piece : line.pieces()) {
      if (piece.style == style) result.push_back(piece.text);
    }
  }
  return result;
}

}  // namespace kestro::testing
