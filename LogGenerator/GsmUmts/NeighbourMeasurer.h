// SPDX-License-Identifier: MIT
// What measures the GSM neighbours.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "LogGenerator/Ondrel/SectionMeasurer.h"

namespace kestro {

/// Gives each measured neighbour the BSIC that the last BSIC list has for its ARFCN.
class NeighbourMeasurer : public SectionMeasurer {
 public:
  using SectionMeasurer::SectionMeasurer;

 protected:
  void note(const PacketReading& reading, PacketView packet) override;
  [[nodiscard]] std::optional<std::int64_t> supply(const Field& field, PacketView packet,
                                                   const RecordPosition& position) const override;

 private:
  struct NotedCell {
    std::int64_t arfcn;
    std::int64_t bsic;
  };
  std::vector<NotedCell> _cells;  ///< the last list, in its order
};

}  // namespace kestro
