// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/NodePair.h"

#include <algorithm>

namespace kestro {
namespace {

/// The child of `parent` with this name; the one at `index` when several have it.
const KestroModelNode* counterpart(const KestroModelNode* parent, std::size_t index,
                                   const std::string& name) noexcept {
  const auto* children = parent == nullptr ? nullptr : parent->childNodes();
  if (children == nullptr) return nullptr;
  if (index < children->size() && (*children)[index]->displayName() == name) {
    return (*children)[index].get();
  }
  const auto found = std::ranges::find_if(
      *children, [&](const NodePointer& child) { return child->displayName() == name; });
  return found == children->end() ? nullptr : found->get();
}

}  // namespace

std::size_t NodePair::childCount() const noexcept {
  return isLeaf() ? 0 : _node->childNodes()->size();
}

NodePair NodePair::child(std::size_t index) const noexcept {
  const KestroModelNode& node = *(*_node->childNodes())[index];
  return {node, counterpart(_previous, index, node.displayName()), _compares};
}

bool NodePair::isChanged() const noexcept {
  if (!_compares) return false;
  const std::string* before = _previous == nullptr ? nullptr : _previous->value();
  return before == nullptr || *before != *_node->value();
}

}  // namespace kestro
