// SPDX-License-Identifier: MIT
// What measures the messages of the CDMA2000 channel.
#pragma once

#include <memory>
#include <vector>

#include "LogGenerator/C2K/C2KPacketMeasurers.h"
#include "LogGenerator/TechnologyMeasurer.h"

namespace kestro {

/// Names its series by the places of the template "C2KTemplate".
class C2KMeasurer : public TechnologyMeasurer {
 public:
  C2KMeasurer(const MeasurerServices& services, SeriesTable& series);

  LogCode measure(ByteView message, MeasuredValues& values) override;

 private:
  KeptErrorRate _errorRate;
  std::vector<std::unique_ptr<C2KPacketMeasurer>> _packets;
};

}  // namespace kestro
