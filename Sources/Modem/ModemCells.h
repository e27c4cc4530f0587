// SPDX-License-Identifier: MIT
// Cells as a modem tells them, and as they are shown.
#pragma once

#include <string_view>

#include "Platform/PropertyList.h"
#include "Sources/Modem/BusFields.h"
#include "Sources/Modem/ModemLocation.h"

namespace kestro {

/// What the entries of a cell are: the radio's name, and the values that the modem has told, in the
/// technology's own numbers; band and frequency of its channel. Nothing when the type is unknown.
[[nodiscard]] Dictionary cellValues(const BusProperties& cell, BusFaults& faults);

/// Whether the cell serves; false, too, when it does not say so.
[[nodiscard]] bool isServingCell(const BusProperties& cell, BusFaults& faults);

/// Adds what GetLocation tells of the serving cell, as far as `cell` does not have it.
void addLocation(const LocationCell& location, Dictionary& cell);

/// "21034" as its two codes.
void addNetwork(std::string_view operatorCode, Dictionary& values);

}  // namespace kestro
