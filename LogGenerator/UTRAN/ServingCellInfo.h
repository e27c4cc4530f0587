// SPDX-License-Identifier: MIT
// The UTRAN serving cell as its system information (0xD0E2) and the cell-monitor list describe it.
#pragma once

#include "LogGenerator/Ondrel/CellMonitor.h"

namespace kestro {

inline constexpr PacketKind kUTRANSystemInformationPacket = {
    .code = 0xD0E2, .name = "UTRAN system information", .minimumLength = 26};

extern const Section kUTRANServingCellInfoSection;

/// Of several serving cells in one list the last one's values remain.
using UTRANServingCellInfo = CellMonitorTableDecoder<kUTRANServingCellInfoSection>;

}  // namespace kestro
