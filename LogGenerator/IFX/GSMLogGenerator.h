// SPDX-License-Identifier: MIT
// The generator of the IFX channel, whose messages are property lists shaped for display.
#pragma once

#include "LogGenerator/LogGenerator.h"

namespace kestro {

/// Cleans each message for display and keeps a history of the displays. Messages that are no
/// property list, or hold anything but dictionaries, arrays and texts, raise an
/// InternalConsistencyFailure and leave the state as it was.
class GSMLogGenerator : public LogGenerator {
 public:
  [[nodiscard]] static std::unique_ptr<GSMLogGenerator> generator(
      const GeneratorServices& services);

  explicit GSMLogGenerator(const GeneratorServices& services);

  void updateStateWithData(Dictionary& state, ByteView data) override;
  /// Records the history and returns the display. Of a message and display of more than 16 MiB of
  /// texts the history's entry keeps nothing, and a line says so.
  Value generateLogUsingState(Dictionary& state) override;
  [[nodiscard]] Dictionary getStartCommand() const override;
  [[nodiscard]] Array getSaveContentsFromState(const Dictionary& state) override;

  /// The object as the display shows it: one-entry dictionaries below the top are replaced by their
  /// value (one level each), and every array loses its first element, which is a header in this
  /// channel's format.
  [[nodiscard]] static Value processObject(const Value& object);

  /// The one value of a dictionary with exactly one entry; null for everything else.
  [[nodiscard]] static Value canCollapse(const Value& object);
};

}  // namespace kestro
