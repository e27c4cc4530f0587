// SPDX-License-Identifier: MIT
// A snapshot as people read it.
#pragma once

#include <functional>
#include <string_view>

#include "Platform/PropertyList.h"

namespace kestro {

/// Hands the snapshot's dictionary to `write`, piece by piece, in lines of any length without
/// terminal attributes: timestamp, description and what it holds, then each entry of the history
/// under its description, with the number of its packets and its display as `appendPlainTree`
/// writes displays.
void writeSnapshotText(const Dictionary& snapshot,
                       const std::function<void(std::string_view)>& write);

}  // namespace kestro
