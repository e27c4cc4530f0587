// SPDX-License-Identifier: MIT
// Which values of a drive-test log's packets are the log's.
#pragma once

#include "LogGenerator/Packets/Series.h"

namespace kestro {

/// Whether a drive-test log says the values of these series; all others of its packets are made up,
/// as Documentation/recordings.md tells. Of its IFX messages every value is the log's.
[[nodiscard]] bool isOfDriveTestLog(const SeriesGroup& group) noexcept;

}  // namespace kestro
