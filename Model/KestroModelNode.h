// SPDX-License-Identifier: MIT
// The tree of nodes that the screens show, and the paths under which they find them again.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "Platform/PropertyList.h"

namespace kestro {

class KestroModelNode;

using NodePointer = std::shared_ptr<const KestroModelNode>;

/// Hashes paths so that they can be looked up without making a string.
struct PathHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view path) const noexcept {
    return std::hash<std::string_view>()(path);
  }
};

/// Every node of a tree under its path; the root is under "/".
using NodesByPath = std::unordered_map<std::string, NodePointer, PathHash, std::equal_to<>>;

/// One node of the display tree. Immutable; the parent's list of children and the path dictionary
/// both hold it.
class KestroModelNode {
 public:
  virtual ~KestroModelNode() = default;
  KestroModelNode(const KestroModelNode&) = delete;
  KestroModelNode& operator=(const KestroModelNode&) = delete;

  [[nodiscard]] const std::string& displayName() const noexcept { return _name; }

  /// The children in display order; a null pointer for a leaf, which is how the two kinds are told
  /// apart.
  [[nodiscard]] virtual const std::vector<NodePointer>* childNodes() const noexcept {
    return nullptr;
  }

  /// Whether the children are an array's elements; false for a dictionary's entries and for a leaf.
  [[nodiscard]] virtual bool isArray() const noexcept { return false; }

  /// A leaf's text; a null pointer for a tree node.
  [[nodiscard]] virtual const std::string* value() const noexcept { return nullptr; }

  /// Builds the tree of a display object, named "Kestro" and rooted at "/", and enters every node
  /// into `nodesByPath`. Dictionaries marked "_sorted" show their keys in ascending byte order,
  /// keys of the form "NN;Name" there as "Name"; other dictionaries keep their order. Array
  /// elements are named "0", "1", … Anything but a text, dictionary or array is the leaf
  /// "(unknown)". A later node with the path of an earlier one takes its place in `nodesByPath`.
  /// The array lock is held while an array is walked.
  [[nodiscard]] static NodePointer makeTreeFromObjectWithPathDictionary(const Value& object,
                                                                        NodesByPath& nodesByPath);

 protected:
  explicit KestroModelNode(std::string name) : _name(std::move(name)) {}

 private:
  std::string _name;
};

/// A name with a text.
class KestroModelLeafNode : public KestroModelNode {
 public:
  KestroModelLeafNode(std::string name, std::string value)
      : KestroModelNode(std::move(name)), _string(std::move(value)) {}

  [[nodiscard]] const std::string* value() const noexcept override { return &_string; }

 private:
  std::string _string;
};

/// A name with children.
class KestroModelTreeNode : public KestroModelNode {
 public:
  KestroModelTreeNode(std::string name, std::vector<NodePointer> children, bool isArray = false)
      : KestroModelNode(std::move(name)), _childNodes(std::move(children)), _isArray(isArray) {}

  [[nodiscard]] const std::vector<NodePointer>* childNodes() const noexcept override {
    return &_childNodes;
  }
  [[nodiscard]] bool isArray() const noexcept override { return _isArray; }

 private:
  std::vector<NodePointer> _childNodes;
  bool _isArray;
};

/// `path` extended by one component: "/" and "A" give "/A", "/A" and "B" give "/A/B". The component
/// is taken as it stands, slashes included.
[[nodiscard]] std::string pathByAppending(std::string_view path, std::string_view component);

}  // namespace kestro
