// SPDX-License-Identifier: MIT
// A packet's layout as data for programs: places as numbers, how values are shown, conditions.
#pragma once

#include <span>

#include "CommandLine/Formats/JsonWriter.h"
#include "CommandLine/Formats/LuaWriter.h"
#include "LogGenerator/Packets/Outline.h"

namespace kestro {

/// An array with an element for each taker: an array of its readings. What their members mean is
/// told in Documentation/wireshark.md.
void writeTakers(JsonWriter& writer, std::span<const Outline> takers);
void writeTakers(LuaWriter& writer, std::span<const Outline> takers);

/// One place, which counts from the packet.
void writePlace(LuaWriter& writer, const Place& place);

}  // namespace kestro
