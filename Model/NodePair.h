// SPDX-License-Identifier: MIT
// A display node beside the one that stood in its place at the last refresh.
#pragma once

#include <cstddef>
#include <optional>
#include <string_view>

#include "Model/KestroModelNode.h"

namespace kestro {

/// The place of the child of `parent` with this name: `index` if that child has it, else the first
/// one that does. Absent without such a child; a parent may be null or a leaf.
[[nodiscard]] std::optional<std::size_t> childPlace(const KestroModelNode* parent,
                                                    std::size_t index,
                                                    std::string_view name) noexcept;

/// Compares a display tree with its predecessor, node by node. Refers to both trees, which must
/// outlive it.
class NodePair {
 public:
  /// Without a previous tree no value counts as new or changed.
  NodePair(const KestroModelNode& node, const KestroModelNode* previous)
      : NodePair(node, previous, previous != nullptr) {}

  [[nodiscard]] const KestroModelNode& node() const noexcept { return *_node; }
  [[nodiscard]] bool isLeaf() const noexcept { return _node->childNodes() == nullptr; }

  /// The number of children; 0 for a leaf.
  [[nodiscard]] std::size_t childCount() const noexcept;
  /// A child, whose `index` is less than `childCount()`, beside the previous node's child of the
  /// same name (see `childPlace`).
  [[nodiscard]] NodePair child(std::size_t index) const noexcept;

  /// Whether this is a leaf in whose place there was none: nothing, or a section.
  [[nodiscard]] bool isNew() const noexcept;
  /// Whether this is a leaf in whose place there was one with another value.
  [[nodiscard]] bool isChanged() const noexcept;
  [[nodiscard]] bool isNewOrChanged() const noexcept { return isNew() || isChanged(); }

 private:
  NodePair(const KestroModelNode& node, const KestroModelNode* previous, bool compares)
      : _node(&node), _previous(previous), _compares(compares) {}

  /// The value of the previous node; a null pointer when it has none.
  [[nodiscard]] const std::string* previousValue() const noexcept {
    return _previous == nullptr ? nullptr : _previous->value();
  }

  const KestroModelNode* _node;
  const KestroModelNode* _previous;
  bool _compares;
};

}  // namespace kestro
