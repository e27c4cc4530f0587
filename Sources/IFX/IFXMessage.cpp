// SPDX-License-Identifier: MIT
#include "Sources/IFX/IFXMessage.h"

#include <fmt/format.h>

namespace kestro {
namespace {

constexpr std::string_view kSortedMarker = "_sorted";

}  // namespace

IFXMessage::IFXMessage() { _root.set(kSortedMarker, "yes"); }

// The marker counts as an entry, so that the first section has number 1.
Value IFXMessage::numbered(std::string_view name) const {
  return fmt::format("{:02};{}", _root.size(), name);
}

Dictionary IFXMessage::addSection(std::string_view name) {
  Dictionary section;
  _root.set(numbered(name), section);
  return section;
}

Array IFXMessage::addList(std::string_view name, std::string_view header) {
  Array list{header};
  _root.set(numbered(name), list);
  return list;
}

std::optional<Bytes> IFXMessage::bytes(const PropertyListCoding& coding) const {
  return coding.binary(_root);
}

}  // namespace kestro
