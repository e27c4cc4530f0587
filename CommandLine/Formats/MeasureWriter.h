// SPDX-License-Identifier: MIT
// Measured values as lines, one class a format.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "CommandLine/MeasureFeed.h"
#include "CommandLine/Output.h"

namespace kestro {

/// Writes values as they come: the output's length costs no memory.
class MeasureWriter {
 public:
  MeasureWriter() = default;
  virtual ~MeasureWriter() = default;
  MeasureWriter(const MeasureWriter&) = delete;
  MeasureWriter& operator=(const MeasureWriter&) = delete;

  /// To be called first. `withPlaces` says that positions are wanted where the format leaves it
  /// open.
  virtual void begin(bool withPlaces) = 0;
  virtual void take(const ChosenValues& values) = 0;
  virtual void finish() {}
};

/// A format's name on the command line, what the help says of it, and its writer.
struct MeasureFormat {
  std::string_view name;
  std::string_view help;
  std::unique_ptr<MeasureWriter> (*makeWriter)(Output& output);
};

/// All formats, the default first.
[[nodiscard]] const std::vector<MeasureFormat>& measureFormats();

/// The writer of a format in that list.
[[nodiscard]] std::unique_ptr<MeasureWriter> makeMeasureWriter(std::string_view format,
                                                               Output& output);

}  // namespace kestro
