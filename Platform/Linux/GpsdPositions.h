// SPDX-License-Identifier: MIT
// Positions of a gpsd, by libgps.
#pragma once

#include "Platform/PositionService.h"

namespace kestro {

class GpsdPositions final : public PositionService {
 public:
  [[nodiscard]] std::unique_ptr<PositionFeed> follow(const PositionServer& server,
                                                     PositionHandlers handlers) override;
};

}  // namespace kestro
