// SPDX-License-Identifier: MIT
// What some of the recorded forms need to be read.
#pragma once

#include <cstdint>
#include <functional>
#include <string_view>
#include <vector>

#include "Platform/PropertyListCoding.h"

namespace kestro {

/// The technologies that have a log code, as constant texts of Platform/TelephonyService.h.
using TechnologiesOfCode = std::function<std::vector<std::string_view>(std::uint16_t logCode)>;

struct RecordingContext {
  /// For snapshots. Must outlive the reader.
  const PropertyListCoding& coding;
  /// Decides what the packets of a form are that does not name their technology (DLF logs,
  /// snapshots): the only technology that has all their codes. Extra packets' codes are not asked
  /// for.
  TechnologiesOfCode technologiesOfCode = {};
  /// What such packets are taken for, a constant text of Platform/TelephonyService.h; empty to
  /// decide by their codes.
  std::string_view technology = {};
};

}  // namespace kestro
