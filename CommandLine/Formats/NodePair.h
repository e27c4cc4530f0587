// SPDX-License-Identifier: MIT
// A display node beside the one that stood in its place at the last refresh.
#pragma once

#include <cstddef>

#include "Model/KestroModelNode.h"

namespace kestro {

/// Refers to two trees that must outlive it.
class NodePair {
 public:
  /// Without a previous tree no value counts as changed.
  NodePair(const KestroModelNode& node, const KestroModelNode* previous)
      : NodePair(node, previous, previous != nullptr) {}

  [[nodiscard]] const KestroModelNode& node() const noexcept { return *_node; }
  [[nodiscard]] bool isLeaf() const noexcept { return _node->childNodes() == nullptr; }

  /// The number of children; 0 for a leaf.
  [[nodiscard]] std::size_t childCount() const noexcept;
  /// A child, beside the previous node's child of the same name.
  [[nodiscard]] NodePair child(std::size_t index) const noexcept;

  /// Whether a leaf's value is new or differs from the previous one.
  [[nodiscard]] bool isChanged() const noexcept;

 private:
  NodePair(const KestroModelNode& node, const KestroModelNode* previous, bool compares)
      : _node(&node), _previous(previous), _compares(compares) {}

  const KestroModelNode* _node;
  const KestroModelNode* _previous;
  bool _compares;
};

}  // namespace kestro
