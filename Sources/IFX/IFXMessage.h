// SPDX-License-Identifier: MIT
// Messages of the IFX channel: property lists shaped for display.
#pragma once

#include <optional>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/PropertyList.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {

/// One message of the IFX channel while it is composed. The channel's receivers show the sections
/// in the order in which they are added here, drop the first element of every array, put the value
/// of a dictionary with one entry in the dictionary's place, and take texts only.
class IFXMessage {
 public:
  IFXMessage();

  /// Adds a section of named values. Entries may be added to it until `bytes`.
  [[nodiscard]] Dictionary addSection(std::string_view name);

  /// Adds a section that is a list; `header` becomes its first element, which receivers drop.
  [[nodiscard]] Array addList(std::string_view name, std::string_view header);

  /// The message as a property list.
  [[nodiscard]] const Dictionary& propertyList() const noexcept { return _root; }

  /// The message as it is sent, in binary form; absent when `coding` cannot serialise it.
  [[nodiscard]] std::optional<Bytes> bytes(const PropertyListCoding& coding) const;

 private:
  [[nodiscard]] Value numbered(std::string_view name) const;

  Dictionary _root;
};

}  // namespace kestro
