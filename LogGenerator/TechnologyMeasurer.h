// SPDX-License-Identifier: MIT
// What measures the messages of one technology.
#pragma once

#include "LogGenerator/Packets/Measure.h"
#include "Platform/Bytes.h"

namespace kestro {

class Bundle;
class PropertyListCoding;

/// What a measurer asks of the platform. Both must outlive it; several threads may share them.
struct MeasurerServices {
  const Bundle& bundle;  ///< holds the display templates, which name places of the display
  const PropertyListCoding& propertyListCoding;
};

/// Measures one technology's messages of one recording, in their order. It keeps what earlier
/// messages said where a value needs it. One thread at a time.
class TechnologyMeasurer {
 public:
  TechnologyMeasurer() = default;
  virtual ~TechnologyMeasurer() = default;
  TechnologyMeasurer(const TechnologyMeasurer&) = delete;
  TechnologyMeasurer& operator=(const TechnologyMeasurer&) = delete;

  /// Appends what a message says, and returns its log code; 0 for one that has none. A message that
  /// the display ignores says nothing, and so does one that ends the application. Texts are valid
  /// until the next message.
  virtual LogCode measure(ByteView message, MeasuredValues& values) = 0;
};

}  // namespace kestro
