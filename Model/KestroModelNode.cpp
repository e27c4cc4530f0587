// SPDX-License-Identifier: MIT
#include "Model/KestroModelNode.h"

#include <algorithm>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/DisplayKeys.h"

namespace kestro {
namespace {

/// The positions of the entries that are shown, in display order.
std::vector<std::size_t> shownEntries(const Dictionary& dictionary, bool sorted) {
  std::vector<std::size_t> entries;
  entries.reserve(dictionary.size());
  for (std::size_t i = 0; i < dictionary.size(); ++i) {
    const Value& key = dictionary.keyAt(i);
    if (key.isText() && key.text() != kSortedMarker && !dictionary.valueAt(i).isNull()) {
      entries.push_back(i);
    }
  }
  if (sorted) {
    // char_traits<char> compares as unsigned bytes.
    std::ranges::sort(entries, {}, [&](std::size_t i) { return dictionary.keyAt(i).text(); });
  }
  return entries;
}

class TreeBuilder {
 public:
  explicit TreeBuilder(NodesByPath& nodesByPath) : _nodesByPath(nodesByPath) {}

  NodePointer build(std::string_view name, const Value& object, const std::string& path) {
    NodePointer node;
    if (object.isText()) {
      node = leaf(name, object.text());
    } else if (object.isDictionary()) {
      node = tree(name, childrenOfDictionary(object.dictionary(), path), false);
    } else if (object.isArray()) {
      node = tree(name, childrenOfArray(object.array(), path), true);
    } else {
      node = leaf(name, "(unknown)");
    }
    _nodesByPath.insert_or_assign(path, node);
    return node;
  }

 private:
  static NodePointer leaf(std::string_view name, std::string_view value) {
    return std::make_shared<KestroModelLeafNode>(std::string(name), std::string(value));
  }

  static NodePointer tree(std::string_view name, std::vector<NodePointer> children, bool isArray) {
    return std::make_shared<KestroModelTreeNode>(std::string(name), std::move(children), isArray);
  }

  std::vector<NodePointer> childrenOfDictionary(const Dictionary& dictionary,
                                                const std::string& path) {
    const bool sorted = !dictionary[kSortedMarker].isNull();
    std::vector<NodePointer> children;
    children.reserve(dictionary.size());
    for (const std::size_t i : shownEntries(dictionary, sorted)) {
      const std::string_view key = dictionary.keyAt(i).text();
      const std::string_view name = sorted ? nameInSortedDictionary(key) : key;
      children.push_back(build(name, dictionary.valueAt(i), pathByAppending(path, name)));
    }
    return children;
  }

  std::vector<NodePointer> childrenOfArray(const Array& array, const std::string& path) {
    const ArrayLockScope lock;
    std::vector<NodePointer> children;
    children.reserve(array.size());
    for (const Value& element : array) {
      const std::string name = std::to_string(children.size());
      children.push_back(build(name, element, pathByAppending(path, name)));
    }
    return children;
  }

  NodesByPath& _nodesByPath;
};

}  // namespace

NodePointer KestroModelNode::makeTreeFromObjectWithPathDictionary(const Value& object,
                                                                  NodesByPath& nodesByPath) {
  return TreeBuilder(nodesByPath).build("Kestro", object, "/");
}

std::string pathByAppending(std::string_view path, std::string_view component) {
  std::string result(path);
  if (!result.ends_with('/')) result += '/';
  result += component;
  return result;
}

}  // namespace kestro
