// SPDX-License-Identifier: MIT
#include "Model/NodePair.h"

#include <algorithm>

namespace kestro {

std::optional<std::size_t> childPlace(const KestroModelNode* parent, std::size_t index,
                                      std::string_view name) noexcept {
  const auto* children = parent == nullptr ? nullptr : parent->childNodes();
  if (children == nullptr) return std::nullopt;
  if (index < children->size() && (*children)[index]->displayName() == name) return index;
  const auto found = std::ranges::find(*children, name, &KestroModelNode::displayName);
  if (found == children->end()) return std::nullopt;
  return static_cast<std::size_t>(found - children->begin());
}

std::size_t NodePair::childCount() const noexcept {
  return isLeaf() ? 0 : _node->childNodes()->size();
}

NodePair NodePair::child(std::size_t index) const noexcept {
  const KestroModelNode& node = *(*_node->childNodes())[index];
  const auto before = childPlace(_previous, index, node.displayName());
  return {node, before ? (*_previous->childNodes())[*before].get() : nullptr, _compares};
}

bool NodePair::isNew() const noexcept {
  return _compares && isLeaf() && previousValue() == nullptr;
}

bool NodePair::isChanged() const noexcept {
  return isLeaf() && previousValue() != nullptr && *previousValue() != *_node->value();
}

}  // namespace kestro
