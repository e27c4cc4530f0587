// SPDX-License-Identifier: MIT
// Lists of pilots as the display shows them.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "LogGenerator/C2K/LookupTable.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// The dictionary that shows a list of pilots: one entry for each, from its number and its PN
/// offset ("3;168") to its energy, sorted by these keys.
class PilotList {
 public:
  PilotList() { clear(); }

  /// Each number may be used once.
  void add(std::size_t number, std::uint32_t pnOffset, Value energy);

  [[nodiscard]] bool empty() const noexcept { return _keys.size() == 1; }
  /// Shows the list at every place of the name; it is empty afterwards. An earlier list that
  /// nothing else refers to is written anew in its place.
  void store(LookupName& name, const LookupTable& lookup);

 private:
  void clear();

  std::vector<Value> _keys;
  std::vector<Value> _values;
};

/// What is shown for a list without pilots.
inline constexpr std::string_view kNoPilots = "(none)";

/// Keys of a pilot's fields.
inline constexpr std::string_view kPilotPNOffset = "PN Offset";
inline constexpr std::string_view kPilotEnergy = "Energy";

}  // namespace kestro
