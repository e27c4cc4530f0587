// SPDX-License-Identifier: MIT
// Names for the children of a display node that tell all of them apart.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "Model/KestroModelNode.h"

namespace kestro {

/// The children's display names in order, where the second child named NAME is "NAME (2)", the
/// third "NAME (3)", and so on; a number whose name another child bears is passed over. Refers to
/// the node, which must have children and outlive this.
class SiblingNames {
 public:
  explicit SiblingNames(const KestroModelNode& parent);

  [[nodiscard]] const std::string& operator[](std::size_t index) const {
    return _names.empty() ? (*_children)[index]->displayName() : _names[index];
  }

 private:
  const std::vector<NodePointer>* _children;
  std::vector<std::string> _names;  ///< empty while the display names differ anyway
};

}  // namespace kestro
