// SPDX-License-Identifier: MIT
// What a section takes from a packet that carries a serialised property list, as data.
#pragma once

#include <array>
#include <cstdint>
#include <span>
#include <string_view>

#include "LogGenerator/Packets/Field.h"
#include "LogGenerator/Packets/PacketKind.h"

namespace kestro {

/// A value of a property list: its key there, its key in the section, and how it is shown.
struct ListedValue {
  std::string_view listKey;
  std::string_view key;
  /// How a number is shown: `decimal`, perhaps `absentAt`, whose value is compared with the
  /// number's low 16 bits. `hidden` stands for values that are passed on as they are, whatever
  /// their type.
  TextRule text{};
  std::string_view failureLine{};  ///< the log line when there is no number; empty: none
};

/// Which part of a property list a section shows.
enum class ListedPart : std::uint8_t {
  Root,       ///< the values of the root, a dictionary
  Elements,   ///< the root itself, an array, element by element as they are
  FirstCell,  ///< the values of the first cell of the right kind in an array of dictionaries
  EachCell,   ///< those of every such cell: a row each, or one after the other in a dictionary
};

/// The cells that a section shows: of one of these technologies, and of this type.
struct CellKind {
  std::array<std::string_view, 2> technologies{};  ///< unused ones are empty
  std::string_view type{};
};

/// What a section takes from the property list of one packet.
struct PropertyListReading {
  const PacketKind& packet;  ///< a constant
  ListedPart part;
  CellKind cells{};  ///< for FirstCell and EachCell
  std::span<const ListedValue> values{};
  std::string_view
      missingListLine{};  ///< the log line when there is no array of cells; may be empty
  /// For a list of cells: the keys of those values that tell one cell from the others.
  std::span<const std::string_view> identity{};
};

}  // namespace kestro
