// SPDX-License-Identifier: MIT
// The property-list library's trees of nodes, and their conversion from and to values.
#pragma once

#include <plist/plist.h>

#include <memory>
#include <type_traits>

#include "Platform/Linux/PropertyListScan.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// Owns a node and all below it.
struct PlistDeleter {
  void operator()(void* node) const noexcept { plist_free(node); }
};
using PlistNode = std::unique_ptr<std::remove_pointer_t<plist_t>, PlistDeleter>;

/// The value of a whole tree that the library parsed from a list of which `facts` hold.
[[nodiscard]] Value valueOf(plist_t root, const PropertyListFacts& facts);

/// A tree for the value; null when it holds what no property list can (see PropertyListCoding).
[[nodiscard]] PlistNode nodeOf(const Value& value);

}  // namespace kestro
