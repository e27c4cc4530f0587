// SPDX-License-Identifier: MIT
// What `decode` writes while its inputs are replayed, one class a format.
#pragma once

#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

#include "CommandLine/Output.h"
#include "Model/Replay.h"

namespace kestro {

/// What is known when everything has been replayed.
struct DecodeResult {
  std::string_view technology;  ///< of the display
  std::uint64_t messages;       ///< all records, also those that could not be decoded
  const Value& display;         ///< after the last message
};

class DecodeWriter {
 public:
  DecodeWriter() = default;
  virtual ~DecodeWriter() = default;
  DecodeWriter(const DecodeWriter&) = delete;
  DecodeWriter& operator=(const DecodeWriter&) = delete;

  /// Called before the first message.
  virtual void begin() {}
  /// Called for every refresh, the last one after the last message included.
  virtual void refreshed(const ReplayRefresh&) {}
  /// Called once at the end.
  virtual void finish(const DecodeResult&) {}
};

/// A format's name on the command line, what the help says of it, and its writer.
struct DecodeFormat {
  std::string_view name;
  std::string_view help;  ///< one line or several
  /// `hasTechnology` says that every display is to be written with its technology, where there is
  /// one display for each refresh.
  std::unique_ptr<DecodeWriter> (*makeWriter)(Output& output, bool hasTechnology);
  bool isStreamed;  ///< whether it writes at every refresh
};

/// All formats, the default first.
[[nodiscard]] const std::vector<DecodeFormat>& decodeFormats();

}  // namespace kestro
