// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/SiblingNames.h"

#include <fmt/format.h>

#include <algorithm>
#include <string_view>
#include <unordered_map>
#include <unordered_set>

namespace kestro {
namespace {

/// Up to so many names are compared with each other, which is faster than hashing them.
constexpr std::size_t kFewNames = 16;

bool fewNamesDiffer(const std::vector<NodePointer>& children) {
  for (std::size_t i = 1; i < children.size(); ++i) {
    for (std::size_t j = 0; j < i; ++j) {
      if (children[i]->displayName() == children[j]->displayName()) return false;
    }
  }
  return true;
}

bool namesDiffer(const std::vector<NodePointer>& children) {
  if (children.size() <= kFewNames) return fewNamesDiffer(children);
  std::unordered_set<std::string_view> names;
  return std::ranges::all_of(children, [&](const NodePointer& child) {
    return names.insert(child->displayName()).second;
  });
}

std::vector<std::string> distinctNames(const std::vector<NodePointer>& children) {
  std::unordered_set<std::string> taken;
  for (const NodePointer& child : children) taken.insert(child->displayName());
  std::unordered_map<std::string_view, std::size_t> counts;
  std::vector<std::string> result;
  for (const NodePointer& child : children) {
    std::string name = child->displayName();
    std::size_t& count = counts[child->displayName()];
    if (++count > 1) {
      while (!taken.insert(name = fmt::format("{} ({})", child->displayName(), count)).second) {
        ++count;
      }
    }
    result.push_back(std::move(name));
  }
  return result;
}

}  // namespace

SiblingNames::SiblingNames(const KestroModelNode& parent) : _children(parent.childNodes()) {
  // Array elements are named by their numbers.
  if (!parent.isArray() && !namesDiffer(*_children)) _names = distinctNames(*_children);
}

}  // namespace kestro
