// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/TreeLayout.h"

#include <algorithm>
#include <iterator>
#include <optional>
#include <utility>

#include "CommandLine/Formats/DisplayText.h"
#include "CommandLine/Formats/TableLayout.h"
#include "Model/NodePair.h"

namespace kestro {
namespace {

constexpr std::size_t kIndentation = 2;
constexpr std::size_t kValueGap = 2;

/// A key longer than this, in an unlimited width, does not push the values of its section aside.
constexpr std::size_t kMaximumAlignedKey = 32;

class Layout {
 public:
  explicit Layout(std::size_t width) : _width(width) {}

  std::vector<LineBlock> blocks(const NodePair& root) {
    if (root.isLeaf()) return {{StyledLine().append(valueText(root)).fitted(_width)}};
    std::vector<LineBlock> result;
    const std::size_t keyWidth = alignedKeyWidth(root, 0);
    bool inValues = false;
    for (std::size_t i = 0; i < root.childCount(); ++i) {
      const NodePair child = root.child(i);
      if (!inValues || !child.isLeaf()) result.emplace_back();
      inValues = child.isLeaf();
      appendNode(result.back(), child, 0, keyWidth);
    }
    return result;
  }

 private:
  void appendNode(LineBlock& block, const NodePair& node, std::size_t indent,
                  std::size_t keyWidth) {
    if (node.isLeaf()) {
      appendValue(block, node, indent, keyWidth);
    } else {
      appendSection(block, node, indent);
    }
  }

  void appendValue(LineBlock& block, const NodePair& leaf, std::size_t indent,
                   std::size_t keyWidth) {
    StyledLine line;
    line.padTo(indent).append(displayText(leaf.node().displayName()), TextStyle::Key);
    line.padTo(std::max(indent + keyWidth, line.width()) + kValueGap);
    line.append(valueText(leaf), leaf.isNewOrChanged() ? TextStyle::Changed : TextStyle::Plain);
    appendLine(block, line);
  }

  void appendSection(LineBlock& block, const NodePair& section, std::size_t indent) {
    StyledLine heading;
    heading.padTo(indent).append(displayText(section.node().displayName()), TextStyle::Section);
    if (section.childCount() == 0) heading.append("  (empty)", TextStyle::Faint);
    appendLine(block, heading);
    const std::size_t inner = indent + kIndentation;
    if (std::optional<LineBlock> table = layoutTable(section, inner, _width)) {
      std::ranges::move(*table, std::back_inserter(block));
      return;
    }
    const std::size_t keyWidth = alignedKeyWidth(section, inner);
    for (std::size_t i = 0; i < section.childCount(); ++i) {
      appendNode(block, section.child(i), inner, keyWidth);
    }
  }

  /// How wide the keys of a section's values are, long ones left out.
  [[nodiscard]] std::size_t alignedKeyWidth(const NodePair& section, std::size_t indent) const {
    const std::size_t limit =
        std::min(kMaximumAlignedKey, indent < _width ? (_width - indent) / 2 : 0);
    std::size_t result = 0;
    for (const NodePointer& child : *section.node().childNodes()) {
      if (child->childNodes() != nullptr) continue;
      const std::size_t keyWidth = textWidth(displayText(child->displayName()));
      if (keyWidth <= limit) result = std::max(result, keyWidth);
    }
    return result;
  }

  static std::string valueText(const NodePair& leaf) { return displayText(*leaf.node().value()); }

  void appendLine(LineBlock& block, const StyledLine& line) {
    block.push_back(line.fitted(_width));
  }

  std::size_t _width;
};

}  // namespace

std::vector<LineBlock> layoutTree(const KestroModelNode& root, const KestroModelNode* previous,
                                  std::size_t width) {
  return Layout(width).blocks(NodePair(root, previous));
}

}  // namespace kestro
